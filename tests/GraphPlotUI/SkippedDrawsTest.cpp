#include "GraphPlotUI/Traces/VSubplotRenderType.h"
#include "PlotFixture.h"

#include <gtest/gtest.h>

#include <QtGui/QOpenGLFunctions>

#include <algorithm>
#include <cmath>
#include <random>
#include <utility>

using namespace GraphPlotUI;
using namespace TestGraphPlotUI;

namespace
{

constexpr int Width = 320;
constexpr int Height = 200;
constexpr int FramesPerSample = 1;

enum class EGaps
{
    None,
    Some, ///< short ones all over
    HeadAndTail,
    Long,      ///< most of the middle
    Everywhere ///< every other row
};

struct Scene
{
    const char* pName;
    int Level;
    int RowCount;
    EGaps Gaps;
    float Noise; ///< of a sine with amplitude 1
    std::uint32_t RingStart;
    bool bKnowsGaps;
};

struct View
{
    const char* pName;
    double First; ///< as a part of the rows: 0 the first, 1 the last
    double Last;
    double Bottom = -1.5;
    double Top = 1.5;
};

bool IsGap(EGaps i_Gaps, int i_Row, int i_RowCount)
{
    switch (i_Gaps)
    {
    case EGaps::Some:
        return i_Row % 37 < 5;
    case EGaps::HeadAndTail:
        return i_Row < i_RowCount / 4 || i_Row > i_RowCount * 3 / 4;
    case EGaps::Long:
        return i_Row > i_RowCount / 5 && i_Row < i_RowCount * 4 / 5;
    case EGaps::Everywhere:
        return i_Row % 2 == 1;
    case EGaps::None:
        break;
    }
    return false;
}

std::vector<Row> MakeRows(const Scene& i_rScene, double i_Phase)
{
    std::mt19937 generator(7);
    std::normal_distribution<float> noise(0.0f, i_rScene.Noise);
    std::vector<Row> rows;
    for (int i = 0; i < i_rScene.RowCount; ++i)
    {
        const float mean = std::sin(static_cast<float>(i) * 0.02f + static_cast<float>(i_Phase)) + noise(generator);
        if (IsGap(i_rScene.Gaps, i, i_rScene.RowCount))
            rows.push_back(i_rScene.Level == 0 ? Row::Sample(NoData) : Row{0.0f});
        else if (i_rScene.Level == 0)
            rows.push_back(Row::Sample(mean));
        else
            rows.push_back({mean, mean + std::abs(noise(generator)), mean - std::abs(noise(generator))});
    }
    return rows;
}

const Scene Scenes[] = {
    {"level 0", 0, 900, EGaps::None, 0.02f, 0, true},
    {"level 0, gaps", 0, 900, EGaps::Some, 0.1f, 0, true},
    {"level 0, gaps not known", 0, 900, EGaps::Some, 0.1f, 0, false},
    {"level 0, NaN head and tail", 0, 900, EGaps::HeadAndTail, 0.1f, 0, true},
    {"level 0, one long gap", 0, 900, EGaps::Long, 0.1f, 3900, true},
    {"level 0, every other row missing", 0, 900, EGaps::Everywhere, 0.1f, 0, true},
    {"level 0, ring wrapped", 0, 4096, EGaps::Some, 0.05f, 2000, true},
    {"level 3", 3, 900, EGaps::None, 0.1f, 0, true},
    {"level 3, gaps", 3, 900, EGaps::Some, 0.3f, 4000, true},
    {"level 3, every other row missing", 3, 900, EGaps::Everywhere, 0.3f, 0, true},
    {"level 9, smooth", 9, 2000, EGaps::None, 0.001f, 0, true},
    {"level 9, wild", 9, 4096, EGaps::HeadAndTail, 1.0f, 1234, false},
    {"one row", 0, 1, EGaps::None, 0.1f, 17, true},
    {"two rows", 2, 2, EGaps::None, 0.1f, 4095, true},
    {"no row", 0, 0, EGaps::None, 0.1f, 0, true},
};

const View Views[] = {
    {"all of it", 0.0, 1.0},
    {"with room on both sides", -0.5, 1.5},
    {"a third", 0.33, 0.66},
    {"the same, panned", 0.337, 0.667},
    {"deep in a gap", 0.49, 0.51},
    {"points appear", 0.4, 0.45},
    {"points, panned", 0.4013, 0.4513},
    {"between two rows", 0.50003, 0.50021},
    {"only the head", -1.0, 0.02},
    {"only the tail", 0.98, 2.0},
    {"before everything", -2.0, -1.0},
    {"after everything", 2.0, 3.0},
    {"from afar", -40.0, 40.0},
    {"values zoomed in", 0.2, 0.8, 0.3, 0.4},
    {"values out of sight", 0.2, 0.8, 50.0, 60.0},
};

} // namespace

class SkippedDrawsTest : public PlotTest
{
protected:
    void SetUp() override
    {
        PlotTest::SetUp();
        if (IsSkipped())
            return;
        SetSize(Width, Height);
        m_Subplot.SetScreenRect({0.0, 0.0, Width, Height});
        m_Subplot.SetLiveContext(false);
    }

    void Show(const Scene& i_rScene)
    {
        Ring ring({MakeRows(i_rScene, 0.0), MakeRows(i_rScene, 2.0)}, static_cast<std::uint8_t>(i_rScene.Level),
                  m_pProvider->TicksPerFrame * FramesPerSample);
        ring.bKnowsGaps = i_rScene.bKnowsGaps;
        ring.Info.CircularStart = i_rScene.RingStart;
        ring.Info.Colours = {{1.0f, 0.5f, 0.0f, 1.0f}, {0.0f, 0.7f, 1.0f, 1.0f}};
        m_pProvider->Add(MakeChannel("a"), ring);
        m_Subplot.SetTraceIds({});
        m_Subplot.SetTraceIds(ToVariant({TQL::ITraceId(MakeChannel("a"), 0), TQL::ITraceId(MakeChannel("a"), 1)}));
    }

    void Look(const Scene& i_rScene, const View& i_rView)
    {
        const double length = static_cast<double>(std::max(i_rScene.RowCount, 2)) * std::exp2(i_rScene.Level);
        m_Subplot.SetValueRangeX({i_rView.First * length, i_rView.Last * length});
        m_Subplot.SetValueRangeY({i_rView.Bottom, i_rView.Top});
    }

    QImage RenderWith(bool i_bSkip)
    {
        m_Subplot.SetSkipInvisibleDraws(i_bSkip);
        return Render({&m_Subplot});
    }

    /// Largest and mean difference of a colour channel.
    static std::pair<int, double> Difference(const QImage& i_rA, const QImage& i_rB)
    {
        int largest = 0;
        double sum = 0.0;
        for (int y = 0; y < i_rA.height(); ++y)
            for (int x = 0; x < i_rA.width(); ++x)
            {
                const QRgb a = i_rA.pixel(x, y);
                const QRgb b = i_rB.pixel(x, y);
                const int difference = std::max(
                    {std::abs(qRed(a) - qRed(b)), std::abs(qGreen(a) - qGreen(b)), std::abs(qBlue(a) - qBlue(b))});
                largest = std::max(largest, difference);
                sum += difference;
            }
        return {largest, sum / (i_rA.width() * i_rA.height())};
    }

    bool IsSoftwareRenderer()
    {
        const auto* pName = reinterpret_cast<const char*>(m_Gl.functions()->glGetString(GL_RENDERER));
        return QString::fromLatin1(pName).contains("llvmpipe");
    }

    VSubplotRenderType m_Subplot;
};

TEST_F(SkippedDrawsTest, ThePictureStaysTheSameToThePixel)
{
    int withTraces = 0;
    bool bFocus = false;
    for (const Scene& rScene : Scenes)
        for (const View& rView : Views)
        {
            SCOPED_TRACE(testing::Message() << rScene.pName << ", " << rView.pName);
            Show(rScene);
            Look(rScene, rView);
            bFocus = !bFocus;
            m_Subplot.setFocusChannelOrTraceId(bFocus ? QVariant::fromValue(TQL::ITraceId(MakeChannel("a"), 0))
                                                      : QVariant());
            for (const bool bMerge : {false, true})
            {
                m_Subplot.SetMergeDenseRows(bMerge);
                ASSERT_EQ(RenderWith(false), RenderWith(true)) << (bMerge ? "merged" : "single rows");
            }
            const QImage skipped = RenderWith(true);
            m_Subplot.SetTraceIds({});
            withTraces += RenderWith(true) != skipped;
        }
    EXPECT_GT(withTraces, 100); // most views show something to compare
}

TEST_F(SkippedDrawsTest, StripsShowWhatSingleRowsShowButForRounding)
{
    // Single rows are rounded to 8 bits after each of the several rows that cover a pixel, strips once.
    constexpr int rounding = 3;
    constexpr double meanRounding = 0.2;
    std::size_t different = 0;
    for (const QPointF& rCorner : {QPointF(0.0, 0.0), QPointF(7.0, 5.0), QPointF(-30.0, 10.0)})
    {
        m_Subplot.SetScreenRect(QRectF(rCorner, QSizeF(Width - 10, Height - 20)));
        for (const Scene& rScene : Scenes)
            for (const View& rView : Views)
            {
                SCOPED_TRACE(testing::Message() << rScene.pName << ", " << rView.pName << ", at " << rCorner.x());
                Show(rScene);
                Look(rScene, rView);
                m_Subplot.SetMergeDenseRows(false);
                const QImage rows = RenderWith(true);
                m_Subplot.SetMergeDenseRows(true);
                const QImage strips = RenderWith(true);
                const auto [largest, mean] = Difference(rows, strips);
                ASSERT_LE(largest, rounding);
                ASSERT_LE(mean, meanRounding);
                different += rows != strips;
            }
    }
    EXPECT_TRUE(different > 30u || !IsSoftwareRenderer()); // strips have been at work
}

TEST_F(SkippedDrawsTest, WhereTheRingStartsDoesNotShow)
{
    for (Scene scene : Scenes)
    {
        SCOPED_TRACE(scene.pName);
        Look(scene, Views[0]);
        scene.RingStart = 0;
        Show(scene);
        const QImage first = RenderWith(true);
        scene.RingStart = 4090;
        Show(scene);
        EXPECT_EQ(first, RenderWith(true));
    }
}

TEST_F(SkippedDrawsTest, WhatIsNotDrawnIsNotBound)
{
    const auto binds = [&](const Scene& i_rScene, const View& i_rView)
    {
        Show(i_rScene);
        Look(i_rScene, i_rView);
        m_pProvider->Binds = 0;
        RenderWith(true);
        return m_pProvider->Binds;
    };
    // Two traces: lines only; lines and bars; lines and points; nothing.
    EXPECT_EQ(binds(Scenes[0], Views[0]), 2);
    EXPECT_EQ(binds(Scenes[7], Views[0]), 4);
    EXPECT_EQ(binds(Scenes[0], Views[5]), 4);
    EXPECT_EQ(binds(Scenes[0], Views[10]), 0);
}

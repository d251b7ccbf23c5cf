#include "GraphPlotUI/Traces/VSubplotRenderType.h"
#include "PlotFixture.h"

#include <gtest/gtest.h>

#include <cstdlib>
#include <string>

using namespace GraphPlotUI;
using namespace TestGraphPlotUI;

namespace
{

constexpr int Size = 100;

} // namespace

/// A subplot of 100 x 100 pixels, one frame and one unit of value a pixel, without grid. A frame's own column has its
/// centre at the frame, since the range starts half a frame before 0; a value of 30.5 has its centre in row 69.
class TracePictureTest : public PlotTest
{
protected:
    void SetUp() override
    {
        PlotTest::SetUp();
        if (IsSkipped())
            return;
        SetSize(Size, Size);
        m_Subplot.SetScreenRect({0.0, 0.0, Size, Size});
        m_Subplot.SetValueRangeX({-0.5, Size - 0.5});
        m_Subplot.SetValueRangeY({0.0, Size});
        m_Subplot.SetLiveContext(false);
        for (const char* pProperty : {"drawMinorGrid", "drawMajorGrid", "drawZero"})
            m_Subplot.setProperty(pProperty, false);
    }

    /// Row 0 stands at frame 0; rows are i_FramesPerRow apart.
    Ring MakeRing(std::vector<Row> i_Rows, int i_FramesPerRow, std::uint8_t i_Level = 0)
    {
        Ring ring({std::move(i_Rows)}, i_Level, (m_pProvider->TicksPerFrame * i_FramesPerRow) >> i_Level);
        // A row of one frame is shown one frame later; so that all rings agree, it is moved here.
        const std::int64_t shift = m_pProvider->TicksPerFrame / ring.Info.TicksPerSample;
        ring.Info.OriginTick = -shift * ring.Info.TicksPerSample;
        return ring;
    }

    void Add(const char* pChannel, Ring i_Ring)
    {
        m_pProvider->Add(MakeChannel(pChannel), std::move(i_Ring));
        m_Traces.emplace_back(MakeChannel(pChannel), std::uint8_t{0});
        m_Subplot.SetTraceIds(ToVariant(m_Traces));
    }

    QImage Render() { return PlotTest::Render({&m_Subplot}); }

    /// The green values of one column over some rows.
    static std::vector<int> Column(const QImage& i_rImage, int i_X, int i_FirstRow, int i_LastRow)
    {
        std::vector<int> values;
        for (int y = i_FirstRow; y <= i_LastRow; ++y)
            values.push_back(qGreen(i_rImage.pixel(i_X, y)));
        return values;
    }

    static void ExpectNear(const std::vector<int>& i_rValues, const std::vector<int>& i_rExpected)
    {
        ASSERT_EQ(i_rValues.size(), i_rExpected.size());
        for (std::size_t i = 0; i < i_rValues.size(); ++i)
            EXPECT_NEAR(i_rValues[i], i_rExpected[i], 2) << "at " << i;
    }

    /// Where something is lit. The last row and column do not count: no centre of theirs lies in the background.
    static QRect LitArea(const QImage& i_rImage)
    {
        QRect area;
        for (int y = 0; y < i_rImage.height() - 1; ++y)
            for (int x = 0; x < i_rImage.width() - 1; ++x)
                if (i_rImage.pixelColor(x, y) != QColor(Qt::black))
                    area |= QRect(x, y, 1, 1);
        return area;
    }

    VSubplotRenderType m_Subplot;
    std::vector<TQL::ITraceId> m_Traces;
};

TEST_F(TracePictureTest, AHorizontalLineIsFullOnItsRowAndFallsOffOverThePixelsBeside)
{
    Add("a", MakeRing(Samples({30.5f, 30.5f, 30.5f}), 40));
    const QImage image = Render();
    ExpectNear(Column(image, 20, 66, 72), {0, 0, 85, 255, 85, 0, 0});
    ExpectNear(Column(image, 60, 66, 72), {0, 0, 85, 255, 85, 0, 0});
    ExpectNear(Column(image, 90, 66, 72), {0, 0, 0, 0, 0, 0, 0}); // beyond the last sample
}

TEST_F(TracePictureTest, ALineGoesFromSampleToSample)
{
    Add("a", MakeRing(Samples({10.5f, 90.5f}), 80)); // 45 degrees
    const QImage image = Render();
    for (int x = 10; x < 70; x += 7)
    {
        const std::vector<int> column = Column(image, x, 0, 99);
        const auto brightest = std::max_element(column.begin(), column.end()) - column.begin();
        EXPECT_EQ(brightest, 89 - x);
        EXPECT_GT(column[static_cast<std::size_t>(brightest)], 250);
    }
}

TEST_F(TracePictureTest, AGapIsDrawnAtTheGapOpacity)
{
    Add("a", MakeRing(Samples({30.5f, NoData, NoData, 30.5f, 30.5f}), 20));
    ExpectNear(Column(Render(), 30, 68, 70), {43, 128, 43});
    m_Subplot.SetGapOpacity(0.25f);
    const QImage image = Render();
    ExpectNear(Column(image, 30, 68, 70), {21, 64, 21});
    ExpectNear(Column(image, 70, 68, 70), {85, 255, 85}); // no gap there
    m_Subplot.SetGapOpacity(0.0f);
    ExpectNear(Column(Render(), 30, 68, 70), {0, 0, 0});
}

TEST_F(TracePictureTest, MissingSamplesAtTheHeadAreNotConnected)
{
    Add("a", MakeRing(Samples({NoData, NoData, NoData, 30.5f, 30.5f}), 20));
    const QImage image = Render();
    ExpectNear(Column(image, 30, 68, 70), {0, 0, 0});
    ExpectNear(Column(image, 70, 68, 70), {85, 255, 85});
}

TEST_F(TracePictureTest, BarsShowASpreadOfTwoPixelsOrMore)
{
    const Row none;
    Add("a", MakeRing({none, none, none, {50.5f, 80.5f, 20.5f}, none, {50.5f, 51.4f, 49.6f}}, 10, 2));
    m_Subplot.SetGapOpacity(0.0f);
    const QImage image = Render();
    ExpectNear(Column(image, 30, 16, 22), {0, 0, 85, 255, 255, 255, 255});
    ExpectNear(Column(image, 30, 76, 82), {255, 255, 255, 255, 85, 0, 0});
    ExpectNear(Column(image, 29, 17, 20), {0, 15, 85, 85}); // a distance of 1.41 and of 1
    ExpectNear(Column(image, 28, 40, 43), {0, 0, 0, 0});
    ExpectNear(Column(image, 50, 45, 55), std::vector<int>(11, 0));
}

TEST_F(TracePictureTest, PointsAppearFromFivePixelsAndAreFullFromSeven)
{
    struct Case
    {
        double PixelsPerSample;
        int Expected;
    };
    for (const Case& rCase : {Case{4.9, 0}, Case{5.0, 0}, Case{6.0, 128}, Case{7.0, 255}, Case{40.0, 255}})
    {
        SCOPED_TRACE(rCase.PixelsPerSample);
        // One sample: no line, but a point.
        Ring ring({Samples({30.5f})}, 0, static_cast<std::int64_t>(std::lround(1000.0 * rCase.PixelsPerSample)));
        ring.Info.OriginTick = 50000;
        m_pProvider->TicksPerFrame = 1000;
        m_pProvider->Add(MakeChannel("a"), ring);
        m_Subplot.SetTraceIds(ToVariant({TQL::ITraceId(MakeChannel("a"), 0)}));
        const QImage image = Render();
        EXPECT_NEAR(qGreen(image.pixel(50, 69)), rCase.Expected, 2);
        EXPECT_NEAR(qGreen(image.pixel(52, 69)), rCase.Expected, 2); // inside the radius of 3
        EXPECT_NEAR(qGreen(image.pixel(53, 69)), 0, 2);
    }
}

TEST_F(TracePictureTest, MissingSamplesHaveNoPoint)
{
    Add("a", MakeRing(Samples({NoData, 30.5f, NoData, NoData}), 20));
    const QImage image = Render();
    EXPECT_EQ(qGreen(image.pixel(20, 69)), 255);
    EXPECT_EQ(LitArea(image), QRect(18, 67, 5, 5));
}

TEST_F(TracePictureTest, TheFocusTraceIsThickAndOnTopAndTheOthersAreDimmed)
{
    Add("a", MakeRing(Samples({30.5f, 30.5f}), 90));
    Add("b", MakeRing(Samples({60.5f, 60.5f}), 90));
    m_Subplot.setFocusChannelOrTraceId(QVariant::fromValue(TQL::ITraceId(MakeChannel("a"), 0)));
    const QImage image = Render();
    ExpectNear(Column(image, 40, 66, 72), {0, 51, 153, 255, 153, 51, 0});
    ExpectNear(Column(image, 40, 37, 41), {0, 55, 166, 55, 0});
}

TEST_F(TracePictureTest, ALiveTraceMovesWithTheLatestFrame)
{
    std::vector<float> values(200, 10.5f);
    std::fill(values.begin() + 150, values.end(), 90.5f); // a step up at frame 150
    m_pProvider->Add(MakeChannel("a"), Ring({Samples(values)}, 0, m_pProvider->TicksPerFrame));
    m_Subplot.SetTraceIds(ToVariant({TQL::ITraceId(MakeChannel("a"), 0)}));
    m_Subplot.SetLiveContext(true);
    m_Subplot.SetValueRangeX({-100.0, 0.0});
    const auto stepColumn = [&](std::int64_t i_Latest)
    {
        m_pProvider->LatestFrame = i_Latest;
        const QImage image = Render();
        for (int x = 0; x < Size; ++x)
            if (qGreen(image.pixel(x, 9)) > 250)
                return x;
        return -1;
    };
    // Of a latest frame n + 1 sample n stands at the right edge, so sample 150 at column 100 - (n - 150).
    EXPECT_NEAR(stepColumn(201), 50, 1);
    EXPECT_EQ(stepColumn(211) - stepColumn(201), -10);
}

TEST_F(TracePictureTest, AComponentBeyondTheColoursKeepsTheColourBeforeIt)
{
    const auto line = [](float i_Value)
    {
        return Samples({i_Value, i_Value});
    };
    Ring ring({line(30.5f), line(60.5f)}, 0, m_pProvider->TicksPerFrame * 90);
    ring.Info.Colours = {{1.0f, 0.0f, 0.0f, 0.0f}}; // its own alpha does not count
    m_pProvider->Add(MakeChannel("a"), ring);
    m_Subplot.SetTraceIds(ToVariant({TQL::ITraceId(MakeChannel("a"), 0), TQL::ITraceId(MakeChannel("a"), 1)}));
    const QImage image = Render();
    EXPECT_EQ(image.pixelColor(40, 69), QColor(255, 0, 0));
    EXPECT_EQ(image.pixelColor(40, 39), QColor(255, 0, 0));
}

TEST_F(TracePictureTest, BackgroundGridAndZeroLines)
{
    m_Subplot.SetScreenRect({0.0, 0.0, Size, Size});
    m_Subplot.SetBackgroundColor(QColor(0, 0, 60));
    m_Subplot.SetValueRangeX({-20.0, 79.0}); // one unit a pixel, major divisions every 20 units
    m_Subplot.SetValueRangeY({-20.0, 79.0});
    EXPECT_EQ(Render().pixelColor(33, 33), QColor(0, 0, 60));

    m_Subplot.SetDrawMajorGrid(true);
    const QImage major = Render();
    EXPECT_EQ(major.pixelColor(60, 33), QColor(128, 128, 128)); // 40
    EXPECT_EQ(major.pixelColor(33, 39), QColor(128, 128, 128));
    EXPECT_EQ(major.pixelColor(33, 33), QColor(0, 0, 60));

    m_Subplot.SetDrawZero(true);
    const QImage zero = Render();
    EXPECT_EQ(zero.pixelColor(20, 33), QColor(255, 255, 255));
    EXPECT_EQ(zero.pixelColor(33, 79), QColor(255, 255, 255));

    m_Subplot.SetTraceDataProvider({}); // without a provider nothing but the background
    m_pFramebuffer->bind();
    m_Render.ResetState();
    m_Subplot.Render(m_Render);
    EXPECT_EQ(m_pFramebuffer->toImage(false).pixelColor(20, 33), QColor(0, 0, 60));
}

TEST_F(TracePictureTest, OverlaysBehindAndInFrontOfTheTraces)
{
    Add("a", MakeRing(Samples({30.5f, 30.5f}), 90));
    TQL::IGraphPlotOverlay behind;
    behind.XMin = 10.0f;
    behind.XMax = 30.0f;
    behind.YMin = -std::numeric_limits<float>::infinity();
    behind.YMax = std::numeric_limits<float>::infinity();
    behind.FillColour = {1.0f, 0.0f, 0.0f, 1.0f};
    TQL::IGraphPlotOverlay front = behind;
    front.XMin = 50.0f;
    front.XMax = 70.0f;
    front.bInFrontOfTraces = true;
    front.EdgeFlags = TQL::IGraphPlotOverlay::EdgeXMin;
    front.OutlineColour = {0.0f, 1.0f, 1.0f, 1.0f};
    m_Subplot.SetOverlays(QVariant::fromValue(std::vector<TQL::IGraphPlotOverlay>{behind, front}));
    const QImage image = Render();
    EXPECT_EQ(image.pixelColor(20, 5), QColor(255, 0, 0));
    EXPECT_EQ(image.pixelColor(20, 69), QColor(255, 255, 255));
    EXPECT_EQ(image.pixelColor(60, 69), QColor(255, 0, 0));
    EXPECT_EQ(image.pixelColor(40, 5), QColor(0, 0, 0));
    int outline = 0;
    for (int y = 0; y < Size; ++y)
        outline += image.pixelColor(50, y) == QColor(0, 255, 255) || image.pixelColor(49, y) == QColor(0, 255, 255);
    EXPECT_GT(outline, 20); // dashed
    EXPECT_LT(outline, 80);
}

TEST_F(TracePictureTest, DrawsInItsOwnRectangleOnly)
{
    Add("a", MakeRing(Samples({30.5f, 90.5f, 30.5f, 90.5f, 30.5f}), 40)); // goes on beyond the right edge
    SetSize(200, 200);
    m_Subplot.SetScreenRect({30.0, 50.0, Size, Size});
    const QImage image = Render();
    for (int y = 0; y < image.height(); ++y)
        for (int x = 0; x < image.width(); ++x)
        {
            const bool bInside = QRect(30, 50, Size, Size).contains(x, y);
            ASSERT_TRUE(bInside || image.pixelColor(x, y) == QColor(32, 32, 32)) << x << "," << y;
        }
    EXPECT_EQ(image.pixelColor(30 + 40, 50 + 9), QColor(255, 255, 255));

    m_Subplot.setVisible(false);
    EXPECT_EQ(Render().pixelColor(80, 80), QColor(32, 32, 32));
}

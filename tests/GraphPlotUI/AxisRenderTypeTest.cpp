#include "GraphPlotUI/Axes/VTimeAxisRenderType.h"
#include "GraphPlotUI/Axes/VValueAxisRenderType.h"
#include "PlotFixture.h"

#include <gtest/gtest.h>

#include <QtCore/QCoreApplication>
#include <QtTest/QSignalSpy>

#include <limits>

using namespace GraphPlotUI;
using namespace TestGraphPlotUI;

namespace
{

// 0..100 over 1000 pixels: minor 5, major 20.
constexpr QRectF HorizontalRect(30.0, 400.0, 1001.0, 40.0);
constexpr QRectF VerticalRect(30.0, 400.0, 40.0, 1001.0);

// The sorted, distinct coordinates of a vertex list.
template <typename TGet>
std::vector<float> Distinct(const VertexList& i_rVertices, TGet i_Get)
{
    std::vector<float> values;
    for (const QVector2D& rVertex : i_rVertices)
        values.push_back(i_Get(rVertex));
    std::sort(values.begin(), values.end());
    values.erase(std::unique(values.begin(), values.end()), values.end());
    return values;
}

std::vector<float> DistinctX(const VertexList& i_rVertices)
{
    return Distinct(i_rVertices, [](const QVector2D& i_rVertex) { return i_rVertex.x(); });
}

std::vector<float> DistinctY(const VertexList& i_rVertices)
{
    return Distinct(i_rVertices, [](const QVector2D& i_rVertex) { return i_rVertex.y(); });
}

} // namespace

TEST(AxisRenderTypeTest, ValueRangeRefusesWhatIsNoRange)
{
    constexpr double infinity = std::numeric_limits<double>::infinity();
    const double nan = std::numeric_limits<double>::quiet_NaN();
    VValueAxisRenderType axis;
    QSignalSpy spy(&axis, &VAxisRenderType::ValueRangeChanged);
    for (const QPointF& rRange : {QPointF(nan, 1), QPointF(0, nan), QPointF(-infinity, 1), QPointF(0, infinity),
                                  QPointF(1, 1), QPointF(2, 1), QPointF(0, 1)})
        axis.setProperty("valueRange", rRange);
    EXPECT_EQ(spy.count(), 0);
    axis.setProperty("valueRange", QPointF(-2, 5));
    axis.setProperty("valueRange", QPointF(-2, 5));
    EXPECT_EQ(spy.count(), 1);
    EXPECT_EQ(axis.GetValueRange(), QPointF(-2, 5));
}

TEST(AxisRenderTypeTest, EveryChangeThatMovesTicksRebuildsThem)
{
    VTimeAxisRenderType axis;
    QSignalSpy ticks(&axis, &VAxisRenderType::TicksChanged);
    const auto changes = [&](const char* pProperty, const QVariant& i_rValue)
    {
        ticks.clear();
        axis.setProperty(pProperty, i_rValue);
        return ticks.count();
    };
    EXPECT_EQ(changes("screenRect", HorizontalRect), 1);
    EXPECT_EQ(changes("valueRange", QPointF(0, 100)), 1);
    EXPECT_EQ(changes("majorTickLength", 10.0), 0);
    EXPECT_EQ(changes("majorTickLength", 12.0), 1);
    EXPECT_EQ(changes("ticksOnFarEdge", true), 0);
    EXPECT_EQ(changes("ticksOnFarEdge", false), 1);
    EXPECT_EQ(changes("devicePixelRatio", 2.0), 1);
    EXPECT_EQ(axis.property("pixelsPerUnit").toDouble(), 20.01);
}

TEST(AxisRenderTypeTest, ValueAxisDividesItsOwnRange)
{
    VValueAxisRenderType axis;
    QSignalSpy start(&axis, &VAxisRenderType::MajorTickStartChanged);
    axis.SetScreenRect(VerticalRect);
    axis.SetValueRange({7.0, 107.0});
    EXPECT_EQ(axis.GetMajorDivisionSize(), 20.0);
    EXPECT_EQ(axis.GetMinorDivisionSize(), 5.0);
    EXPECT_EQ(axis.GetMajorTickStart(), -20.0);
    EXPECT_EQ(axis.GetPixelsPerUnit(), 10.0);
    EXPECT_FLOAT_EQ(axis.GetMinorAlpha(), 1.0f);
    EXPECT_GE(start.count(), 1);

    const VertexList& rTicks = axis.GetTickVertices();
    ASSERT_GE(rTicks.size(), 12u);
    // The axis line comes first, on the last column but half a pixel.
    EXPECT_EQ(rTicks[0], QVector2D(69.5f, 7.0f));
    EXPECT_EQ(rTicks[1], QVector2D(69.5f, 107.0f));
    EXPECT_EQ(rTicks[2], QVector2D(60.0f, -20.0f)); // a major tick
    EXPECT_EQ(rTicks[3], QVector2D(69.5f, -20.0f));
    EXPECT_EQ(rTicks[4], QVector2D(65.0f, -15.0f)); // a minor one
    EXPECT_EQ(rTicks[10], QVector2D(60.0f, 0.0f));

    axis.SetTicksOnFarEdge(false);
    EXPECT_EQ(DistinctX(axis.GetTickVertices()), (std::vector<float>{30.0f, 35.0f, 40.0f}));
}

TEST(AxisRenderTypeTest, TimeAxisDividesFromZero)
{
    VTimeAxisRenderType axis;
    axis.SetScreenRect(HorizontalRect);
    axis.SetValueRange({5007.0, 5107.0});
    const VertexList& rTicks = axis.GetTickVertices();
    ASSERT_GE(rTicks.size(), 4u);
    EXPECT_EQ(rTicks[0], QVector2D(-20.0f, 410.0f));
    EXPECT_EQ(rTicks[1], QVector2D(-20.0f, 400.0f));
    EXPECT_EQ(rTicks[2], QVector2D(-15.0f, 405.0f));
    EXPECT_EQ(rTicks[rTicks.size() - 2], QVector2D(0.0f, 400.0f)); // the axis line comes last
    EXPECT_EQ(rTicks[rTicks.size() - 1], QVector2D(140.0f, 400.0f));

    axis.SetTicksOnFarEdge(false);
    EXPECT_EQ(DistinctY(axis.GetTickVertices()), (std::vector<float>{430.0f, 435.0f, 440.0f}));
}

TEST(AxisRenderTypeTest, ARangeThatCannotBeDividedKeepsTheDivisions)
{
    VValueAxisRenderType axis;
    axis.SetScreenRect(VerticalRect);
    axis.SetValueRange({0.0, 100.0});
    axis.SetScreenRect({0.0, 0.0, 40.0, 1.2}); // one pixel: length 0
    EXPECT_EQ(axis.GetTickVertices().size(), 2u);
    EXPECT_EQ(axis.GetMajorDivisionSize(), 20.0);
    EXPECT_EQ(axis.GetMinorDivisionSize(), 5.0);
    EXPECT_FLOAT_EQ(axis.GetMinorAlpha(), 1.0f);
}

class AxisPictureTest : public PlotTest
{
protected:
    /// Columns, or rows, with a bright pixel in one row, or column, of the picture.
    static std::vector<int> Bright(const QImage& i_rImage, bool i_bColumns, int i_At)
    {
        std::vector<int> found;
        for (int i = 0; i < (i_bColumns ? i_rImage.width() : i_rImage.height()); ++i)
            if (qGreen(i_bColumns ? i_rImage.pixel(i, i_At) : i_rImage.pixel(i_At, i)) > 200)
                found.push_back(i);
        return found;
    }
};

namespace
{

constexpr int TickRow = 31; // major ticks of the far edge reach over the last ten of forty rows, minor ones over five

} // namespace

TEST_F(AxisPictureTest, TimeAxisFollowsTheLatestFrameAndTellsQmlLater)
{
    SetSize(401, 40);
    VTimeAxisRenderType axis;
    axis.SetScreenRect({0.0, 0.0, 401.0, 40.0});
    axis.SetValueRange({-40.0, 0.0}); // ten pixels a frame: minor 5, major 20
    axis.SetRelativeTimeDisplay(false);
    QSignalSpy latest(&axis, &VTimeAxisRenderType::LatestFrameIndexChanged);
    QSignalSpy start(&axis, &VAxisRenderType::MajorTickStartChanged);

    m_pProvider->LatestFrame = 100;
    QImage image = Render({&axis});
    EXPECT_EQ(latest.count() + start.count(), 0); // not while a frame is drawn
    QCoreApplication::processEvents();
    EXPECT_EQ(latest.count(), 1);
    EXPECT_EQ(start.count(), 1);
    EXPECT_EQ(axis.GetLatestFrameIndex(), 100);
    EXPECT_EQ(axis.GetMajorTickStart(), -60.0);
    EXPECT_EQ(Bright(image, true, TickRow), (std::vector<int>{0, 200, 400}));

    m_pProvider->LatestFrame = 103; // ticks of absolute frames move three frames to the left
    image = Render({&axis});
    EXPECT_EQ(Bright(image, true, TickRow), (std::vector<int>{170, 370}));

    axis.SetRelativeTimeDisplay(true); // ticks of relative frames stand still
    image = Render({&axis});
    EXPECT_EQ(Bright(image, true, TickRow), (std::vector<int>{0, 200, 400}));

    axis.SetLiveContext(false);
    axis.SetValueRange({1003.0, 1043.0});
    image = Render({&axis});
    QCoreApplication::processEvents();
    EXPECT_EQ(axis.GetLatestFrameIndex(), 0);
    EXPECT_EQ(axis.GetMajorTickStart(), 980.0);
    EXPECT_EQ(Bright(image, true, TickRow), (std::vector<int>{170, 370}));
}

TEST_F(AxisPictureTest, ValueAxisGrowsUpwardsFromItsMinimum)
{
    SetSize(60, 401);
    VValueAxisRenderType axis;
    axis.SetScreenRect({0.0, 0.0, 60.0, 401.0});
    axis.SetValueRange({-7.0, 33.0}); // 0 and 20 are majors; the minimum is at the bottom
    const QImage image = Render({&axis});
    EXPECT_EQ(Bright(image, false, 51), (std::vector<int>{130, 330}));
    EXPECT_GE(Bright(image, false, 59).size(), 399u); // the axis line
}

TEST_F(AxisPictureTest, AnAxisInTheMiddleOfTheWindowDrawsInItsOwnRectangle)
{
    SetSize(200, 300);
    VValueAxisRenderType value;
    value.SetScreenRect({20.0, 50.0, 30.0, 101.0});
    VTimeAxisRenderType time;
    time.SetScreenRect({50.0, 151.0, 101.0, 30.0});
    time.SetLiveContext(false);
    time.SetTicksOnFarEdge(false);
    const QImage image = Render({&value, &time});
    for (int y = 0; y < image.height(); ++y)
        for (int x = 0; x < image.width(); ++x)
        {
            const bool bInside = QRect(20, 50, 30, 101).contains(x, y) || QRect(50, 151, 101, 30).contains(x, y);
            ASSERT_TRUE(bInside || qGreen(image.pixel(x, y)) == 32) << x << "," << y;
        }
    EXPECT_GE(Bright(image, false, 49).size(), 99u); // the line of the value axis, at the right edge
    EXPECT_GE(Bright(image, true, 151).size(), 99u); // and of the time axis, at the top
}

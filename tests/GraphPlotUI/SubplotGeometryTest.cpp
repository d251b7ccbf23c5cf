#include "GraphPlotUI/Geometry/SubplotGeometry.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <limits>

using namespace GraphPlotUI;
using TQL::IGraphPlotOverlay;

namespace
{

constexpr float Infinity = std::numeric_limits<float>::infinity();

VertexList Points(std::initializer_list<QVector2D> i_Points)
{
    return i_Points;
}

IGraphPlotOverlay Overlay(float i_XMin, float i_XMax, float i_YMin, float i_YMax, std::uint32_t i_Edges = 0)
{
    IGraphPlotOverlay overlay;
    overlay.XMin = i_XMin;
    overlay.XMax = i_XMax;
    overlay.YMin = i_YMin;
    overlay.YMax = i_YMax;
    overlay.EdgeFlags = i_Edges;
    return overlay;
}

const AxisRange RangeX{-100.0, 300.0, 800}; // 0.5 units a pixel
const AxisRange RangeY{-1.0, 3.0, 400};     // 0.01 units a pixel

} // namespace

TEST(SubplotGeometryTest, ViewMapsTheMinimumToTheFirstPixelCentre)
{
    const QMatrix4x4 view = SubplotViewMatrix(RangeX, RangeY);
    const auto near = [](const QVector3D& i_rA, const QVector3D& i_rB)
    {
        return (i_rA - i_rB).length() < 1e-3f;
    };
    EXPECT_TRUE(near(view.map(QVector3D(-100.0f, -1.0f, 0.0f)), QVector3D(0.5f, 0.5f, 0.0f)));
    EXPECT_TRUE(near(view.map(QVector3D(300.0f, 3.0f, 0.0f)), QVector3D(800.5f, 400.5f, 0.0f)));
}

TEST(SubplotGeometryTest, StripsOfBackgroundAndZeroLines)
{
    EXPECT_EQ(BackgroundStrip(RangeX, RangeY), Points({{-100, -1}, {-100, 3}, {300, -1}, {300, 3}}));
    EXPECT_EQ(ZeroLineStripX(RangeX, RangeY), Points({{-0.5f, -1}, {-0.5f, 3}, {0.5f, -1}, {0.5f, 3}}));
    EXPECT_EQ(ZeroLineStripY(RangeX, RangeY), Points({{-100, -0.01f}, {-100, 0.01f}, {300, -0.01f}, {300, 0.01f}}));

    struct Case
    {
        double Minimum;
        double Maximum;
        bool bDrawn;
    };
    for (const Case& rCase : {Case{0.0, 1.0, true}, Case{-1.0, 0.0, true}, Case{0.1, 1.0, false}, Case{-2, -1, false}})
    {
        const AxisRange range{rCase.Minimum, rCase.Maximum, 100};
        EXPECT_EQ(ZeroLineStripX(range, RangeY).size(), rCase.bDrawn ? 4u : 0u);
        EXPECT_EQ(ZeroLineStripY(RangeX, range).size(), rCase.bDrawn ? 4u : 0u);
    }
}

TEST(SubplotGeometryTest, VerticalGridLinesStartAtZeroAndHorizontalOnesReachOverAPan)
{
    double major = 0.0;
    const AxisRange x{5000.0, 5100.0, 1000}; // gap 1: minor 5, major 20
    const AxisRange y{7.0, 107.0, 1000};
    const SubplotGrid grid = BuildSubplotGrid(x, y, EDivisionMode::MajorAndMinor, major);
    EXPECT_EQ(major, 20.0);
    EXPECT_FLOAT_EQ(grid.MinorAlphaX, 1.0f);

    // 9 vertical majors from -20 to 140, then 9 horizontal ones from -20 to 140.
    ASSERT_EQ(grid.Major.size(), 36u);
    EXPECT_EQ(grid.Major[0], QVector2D(-20, 7));
    EXPECT_EQ(grid.Major[1], QVector2D(-20, 107));
    EXPECT_EQ(grid.Major[18], QVector2D(0, -20));
    EXPECT_EQ(grid.Major[19], QVector2D(140, -20));
    ASSERT_GE(grid.MinorX.size(), 2u);
    EXPECT_EQ(grid.MinorX[0], QVector2D(-15, 7));
    EXPECT_EQ(grid.MinorY[0], QVector2D(0, -15));
    EXPECT_EQ(grid.MinorY[1], QVector2D(140, -15));

    // A pan changes nothing but the translation.
    const AxisRange panned{5003.0, 5103.0, 1000};
    const SubplotGrid moved = BuildSubplotGrid(panned, y, EDivisionMode::MajorAndMinor, major);
    EXPECT_EQ(moved.Major, grid.Major);
    EXPECT_EQ(moved.MinorX, grid.MinorX);
}

TEST(SubplotGeometryTest, AGridThatCannotBeDividedIsEmptyAndKeepsTheMajor)
{
    double major = 42.0;
    const SubplotGrid grid = BuildSubplotGrid({0, 1, 0}, {0, 1, 0}, EDivisionMode::MajorAndMinor, major);
    EXPECT_TRUE(grid.Major.empty() && grid.MinorX.empty() && grid.MinorY.empty());
    EXPECT_EQ(major, 42.0);
}

TEST(SubplotGeometryTest, OverlayCoordinatesThatAreNotFiniteStandForTheEdge)
{
    EXPECT_EQ(OverlayFill(Overlay(-Infinity, Infinity, 1, 2), RangeX, RangeY),
              Points({{-100, 2}, {-100, 1}, {300, 2}, {300, 1}}));
    const float nan = std::numeric_limits<float>::quiet_NaN();
    EXPECT_EQ(OverlayFill(Overlay(nan, 5, nan, Infinity), RangeX, RangeY),
              Points({{300, 3}, {300, 3}, {5, 3}, {5, 3}}));
    EXPECT_EQ(OverlayFill(Overlay(-5000, 5000, -7, 7), RangeX, RangeY),
              Points({{-5000, 7}, {-5000, -7}, {5000, 7}, {5000, -7}}));
}

TEST(SubplotGeometryTest, OverlayOutlinesHaveFourVerticesAVerticalAndSixAHorizontalEdge)
{
    const auto outline = [](std::uint32_t i_Edges)
    {
        return OverlayOutline(Overlay(10, 20, 1, 2, i_Edges), RangeX, RangeY);
    };
    EXPECT_EQ(outline(0), VertexList());
    EXPECT_EQ(outline(IGraphPlotOverlay::EdgeXMin), Points({{9.5f, 2}, {9.5f, 1}, {10.5f, 2}, {10.5f, 1}}));
    EXPECT_EQ(outline(IGraphPlotOverlay::EdgeXMax), Points({{19.5f, 2}, {19.5f, 1}, {20.5f, 2}, {20.5f, 1}}));
    const auto horizontal = [](float i_Y)
    {
        return Points({{10, i_Y + 0.01f},
                       {10, i_Y - 0.01f},
                       {20, i_Y + 0.01f},
                       {20, i_Y - 0.01f},
                       {20, i_Y + 0.01f},
                       {10, i_Y - 0.01f}});
    };
    EXPECT_EQ(outline(IGraphPlotOverlay::EdgeYMin), horizontal(1));
    EXPECT_EQ(outline(IGraphPlotOverlay::EdgeYMax), horizontal(2));

    // All four: left, right, bottom, top.
    const VertexList all = outline(15);
    ASSERT_EQ(all.size(), 20u);
    EXPECT_EQ(all[0], QVector2D(9.5f, 2));
    EXPECT_EQ(all[4], QVector2D(19.5f, 2));
    EXPECT_EQ(all[8], QVector2D(10, 1.01f));
    EXPECT_EQ(all[14], QVector2D(10, 2.01f));
}

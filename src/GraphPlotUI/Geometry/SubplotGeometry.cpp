#include "GraphPlotUI/Geometry/SubplotGeometry.h"

#include <cmath>

namespace GraphPlotUI
{

namespace
{

struct FloatRange
{
    explicit FloatRange(const AxisRange& i_rRange)
        : Minimum(static_cast<float>(i_rRange.Minimum))
        , Maximum(static_cast<float>(i_rRange.Maximum))
        , UnitsPerPixel(static_cast<float>(i_rRange.UnitsPerPixel()))
    {
    }

    bool ContainsZero() const { return Minimum <= 0.0f && Maximum >= 0.0f; }

    // A finite value stays as it is, also outside the range.
    float Clamped(float i_Value) const
    {
        if (std::isfinite(i_Value))
            return i_Value;
        return std::isinf(i_Value) && i_Value < 0.0f ? Minimum : Maximum;
    }

    float Minimum;
    float Maximum;
    float UnitsPerPixel;
};

struct OverlayRectangle
{
    OverlayRectangle(const TQL::IGraphPlotOverlay& i_rOverlay, const FloatRange& i_rX, const FloatRange& i_rY)
        : XMin(i_rX.Clamped(i_rOverlay.XMin))
        , XMax(i_rX.Clamped(i_rOverlay.XMax))
        , YMin(i_rY.Clamped(i_rOverlay.YMin))
        , YMax(i_rY.Clamped(i_rOverlay.YMax))
    {
    }

    float XMin;
    float XMax;
    float YMin;
    float YMax;
};

void AppendVerticalEdge(VertexList& o_rVertices, float i_X, float i_HalfWidth, const OverlayRectangle& i_rRectangle)
{
    o_rVertices.insert(o_rVertices.end(), {{i_X - i_HalfWidth, i_rRectangle.YMax},
                                           {i_X - i_HalfWidth, i_rRectangle.YMin},
                                           {i_X + i_HalfWidth, i_rRectangle.YMax},
                                           {i_X + i_HalfWidth, i_rRectangle.YMin}});
}

void AppendHorizontalEdge(VertexList& o_rVertices, float i_Y, float i_HalfWidth, const OverlayRectangle& i_rRectangle)
{
    const float xMin = i_rRectangle.XMin;
    const float xMax = i_rRectangle.XMax;
    o_rVertices.insert(o_rVertices.end(), {{xMin, i_Y + i_HalfWidth},
                                           {xMin, i_Y - i_HalfWidth},
                                           {xMax, i_Y + i_HalfWidth},
                                           {xMax, i_Y - i_HalfWidth},
                                           {xMax, i_Y + i_HalfWidth},
                                           {xMin, i_Y - i_HalfWidth}});
}

} // namespace

QMatrix4x4 SubplotViewMatrix(const AxisRange& i_rX, const AxisRange& i_rY)
{
    QMatrix4x4 matrix;
    matrix.scale(static_cast<float>(i_rX.PixelsPerUnit()), static_cast<float>(i_rY.PixelsPerUnit()), 1.0f);
    const FloatRange x(i_rX);
    const FloatRange y(i_rY);
    matrix.translate(0.5f * x.UnitsPerPixel - x.Minimum, 0.5f * y.UnitsPerPixel - y.Minimum, 0.0f);
    return matrix;
}

VertexList BackgroundStrip(const AxisRange& i_rX, const AxisRange& i_rY)
{
    const FloatRange x(i_rX);
    const FloatRange y(i_rY);
    return {{x.Minimum, y.Minimum}, {x.Minimum, y.Maximum}, {x.Maximum, y.Minimum}, {x.Maximum, y.Maximum}};
}

VertexList ZeroLineStripX(const AxisRange& i_rX, const AxisRange& i_rY)
{
    const FloatRange x(i_rX);
    const FloatRange y(i_rY);
    if (!x.ContainsZero())
        return {};
    return {{-x.UnitsPerPixel, y.Minimum},
            {-x.UnitsPerPixel, y.Maximum},
            {x.UnitsPerPixel, y.Minimum},
            {x.UnitsPerPixel, y.Maximum}};
}

VertexList ZeroLineStripY(const AxisRange& i_rX, const AxisRange& i_rY)
{
    const FloatRange x(i_rX);
    const FloatRange y(i_rY);
    if (!y.ContainsZero())
        return {};
    return {{x.Minimum, -y.UnitsPerPixel},
            {x.Minimum, y.UnitsPerPixel},
            {x.Maximum, -y.UnitsPerPixel},
            {x.Maximum, y.UnitsPerPixel}};
}

SubplotGrid BuildSubplotGrid(const AxisRange& i_rX, const AxisRange& i_rY, EDivisionMode i_Mode, double& io_rMajorX)
{
    SubplotGrid grid;
    const FloatRange y(i_rY);
    const AxisRange fromZero{0.0, i_rX.Length(), i_rX.PixelLength};
    double minor = 0.0;
    double fade = 1.0;
    DivideRange(
        fromZero, i_Mode,
        [&](float i_Value, bool i_bIsMajor)
        {
            VertexList& rList = i_bIsMajor ? grid.Major : grid.MinorX;
            rList.insert(rList.end(), {{i_Value, y.Minimum}, {i_Value, y.Maximum}});
        },
        io_rMajorX, minor, fade);
    grid.MinorAlphaX = MinorAlpha(fade);

    const float spanX = static_cast<float>(2.0 * io_rMajorX + i_rX.Length());
    double majorY = 1.0;
    fade = 1.0;
    DivideRange(
        i_rY, i_Mode,
        [&](float i_Value, bool i_bIsMajor)
        {
            VertexList& rList = i_bIsMajor ? grid.Major : grid.MinorY;
            rList.insert(rList.end(), {{0.0f, i_Value}, {spanX, i_Value}});
        },
        majorY, minor, fade);
    grid.MinorAlphaY = MinorAlpha(fade);
    return grid;
}

VertexList OverlayFill(const TQL::IGraphPlotOverlay& i_rOverlay, const AxisRange& i_rX, const AxisRange& i_rY)
{
    const OverlayRectangle rectangle(i_rOverlay, FloatRange(i_rX), FloatRange(i_rY));
    return {{rectangle.XMin, rectangle.YMax},
            {rectangle.XMin, rectangle.YMin},
            {rectangle.XMax, rectangle.YMax},
            {rectangle.XMax, rectangle.YMin}};
}

VertexList OverlayOutline(const TQL::IGraphPlotOverlay& i_rOverlay, const AxisRange& i_rX, const AxisRange& i_rY)
{
    const FloatRange x(i_rX);
    const FloatRange y(i_rY);
    const OverlayRectangle rectangle(i_rOverlay, x, y);
    const auto has = [&](std::uint32_t i_Flag)
    {
        return (i_rOverlay.EdgeFlags & i_Flag) != 0;
    };
    VertexList vertices;
    if (has(TQL::IGraphPlotOverlay::EdgeXMin))
        AppendVerticalEdge(vertices, rectangle.XMin, x.UnitsPerPixel, rectangle);
    if (has(TQL::IGraphPlotOverlay::EdgeXMax))
        AppendVerticalEdge(vertices, rectangle.XMax, x.UnitsPerPixel, rectangle);
    if (has(TQL::IGraphPlotOverlay::EdgeYMin))
        AppendHorizontalEdge(vertices, rectangle.YMin, y.UnitsPerPixel, rectangle);
    if (has(TQL::IGraphPlotOverlay::EdgeYMax))
        AppendHorizontalEdge(vertices, rectangle.YMax, y.UnitsPerPixel, rectangle);
    return vertices;
}

} // namespace GraphPlotUI

#pragma once

#include "GraphPlotSystem/Common/IGraphPlotOverlay.h"
#include "GraphPlotUI/Geometry/AxisRange.h"
#include "GraphPlotUI/Geometry/TraceGeometry.h"

#include <QtGui/QMatrix4x4>

namespace GraphPlotUI
{

/// From axis units to pixels; the half pixel in it puts lines on pixel centres.
QMatrix4x4 SubplotViewMatrix(const AxisRange& i_rX, const AxisRange& i_rY);

/// Triangle strips in axis units. A zero line is two pixels wide and empty when zero is outside its range.
VertexList BackgroundStrip(const AxisRange& i_rX, const AxisRange& i_rY);
VertexList ZeroLineStripX(const AxisRange& i_rX, const AxisRange& i_rY);
VertexList ZeroLineStripY(const AxisRange& i_rX, const AxisRange& i_rY);

/// Grid lines in axis units, pairs of vertices. Vertical lines are laid out from zero, so that a pan of X changes only
/// a translation, and horizontal ones are long enough for any such translation.
struct SubplotGrid
{
    VertexList Major;
    VertexList MinorX; ///< vertical lines
    VertexList MinorY; ///< horizontal lines
    float MinorAlphaX = 1.0f;
    float MinorAlphaY = 1.0f;
};

/// io_rMajorX keeps its value when X cannot be divided.
SubplotGrid BuildSubplotGrid(const AxisRange& i_rX, const AxisRange& i_rY, EDivisionMode i_Mode, double& io_rMajorX);

/// The filled rectangle of an overlay as a triangle strip.
VertexList OverlayFill(const TQL::IGraphPlotOverlay& i_rOverlay, const AxisRange& i_rX, const AxisRange& i_rY);

/// The edges of an overlay that have a flag, as one list for GL_TRIANGLES: four vertices for a vertical edge, six for a
/// horizontal one. A list whose count is no multiple of three is drawn as far as it goes.
VertexList OverlayOutline(const TQL::IGraphPlotOverlay& i_rOverlay, const AxisRange& i_rX, const AxisRange& i_rY);

} // namespace GraphPlotUI

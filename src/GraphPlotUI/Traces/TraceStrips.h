#pragma once

#include "GraphPlotUI/Traces/TraceDrawList.h"

#include <QtCore/QRect>

namespace GraphPlotUI
{

/// Where rows stand closer together than a line is thick, a strip of some pixel columns with all rows that reach into
/// it is drawn as one primitive instead of one for each row. Strips start at framebuffer columns that are multiples of
/// four, since software renderers shade blocks of four by four pixels, so the first one may begin left of the viewport.

/// Width in pixels of the strips for rows i_RowDistance pixels apart and lines of the half width i_Thickness: as wide
/// as the shaders have room for rows. 0 where strips do not pay or do not fit.
int StripWidth(float i_RowDistance, float i_Thickness);

/// How strips lie in a viewport.
struct StripLayout
{
    int Width = 0;  ///< pixels
    int Origin = 0; ///< left edge of strip 0, relative to the viewport, -3 to 0
    int Count = 0;  ///< that cover the viewport

    /// Strips of i_rStrips that lie wholly inside the viewport.
    RowRange Inside(const RowRange& i_rStrips, int i_ViewportWidth) const;
};

StripLayout MakeStripLayout(const QRect& i_rViewport, int i_StripWidth);

/// The strips that the rows of a channel can reach, i_Reach pixels to each side.
RowRange VisibleStrips(const StripLayout& i_rLayout, const ChannelDraw& i_rChannel, float i_ViewportWidth,
                       float i_Reach);

} // namespace GraphPlotUI

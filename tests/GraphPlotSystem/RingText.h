#pragma once

#include "GraphPlotSystem/Traces/TraceTexelRing.h"

#include <cmath>
#include <sstream>
#include <string>
#include <utility>

namespace TestSupport
{

/// A ring's rows of one component: "value/distance" at level 0, "minimum..mean..maximum/distance" above, "-" for a row
/// without data. Rows are given by their number from the oldest.
inline std::string RowsText(const GraphPlotUI::TraceTexelRing& i_rRing, std::uint32_t i_Component,
                            std::uint32_t i_First, std::uint32_t i_End)
{
    std::ostringstream text;
    for (std::uint32_t row = i_First; row < i_End; ++row)
    {
        const GraphPlotUI::TraceTexel& rTexel = i_rRing.At(row, i_Component);
        if (row != i_First)
            text << ' ';
        if (std::isinf(rTexel.Maximum))
            text << '-';
        else if (i_rRing.Source.Level == 0)
            text << rTexel.Value;
        else
            text << rTexel.Minimum << ".." << rTexel.Value << ".." << rTexel.Maximum;
        text << '/' << rTexel.Distance;
    }
    return text.str();
}

/// "level 0 ticks [0, 50) valid [0, 40) rows 5 at 0": where the rows stand.
inline std::string ExtentText(const GraphPlotUI::TraceTexelRing& i_rRing)
{
    const GraphPlotUI::RingExtent& rExtent = i_rRing.Extent;
    std::ostringstream text;
    text << "level " << int{i_rRing.Source.Level} << " ticks [" << rExtent.FirstTick << ", " << rExtent.EndTick
         << ") valid [" << rExtent.ValidFirstTick << ", " << rExtent.ValidEndTick << ") rows " << rExtent.RowCount
         << " at " << rExtent.Start;
    return text.str();
}

/// Extent and all rows, a line each; for small rings.
inline std::string RingText(const GraphPlotUI::TraceTexelRing& i_rRing)
{
    std::string text = ExtentText(i_rRing) + "\n";
    for (std::uint32_t c = 0; c < i_rRing.Source.ComponentCount; ++c)
        text += RowsText(i_rRing, c, 0, i_rRing.Extent.RowCount) + "\n";
    return text;
}

/// "[3, 5)" or "none", with "head [1, 2)" before it for rows put before others; they count as uploaded then.
inline std::string TakeDirty(GraphPlotUI::TraceTexelRing& i_rRing)
{
    const auto text = [](const GraphPlotUI::DirtyRows& i_rRows)
    {
        return "[" + std::to_string(i_rRows.First) + ", " + std::to_string(i_rRows.End) + ")";
    };
    const auto head = std::exchange(i_rRing.DirtyHead, {});
    const auto dirty = std::exchange(i_rRing.Dirty, {});
    if (!head.IsEmpty())
        return "head " + text(head) + (dirty.IsEmpty() ? "" : " " + text(dirty));
    return dirty.IsEmpty() ? "none" : text(dirty);
}

} // namespace TestSupport

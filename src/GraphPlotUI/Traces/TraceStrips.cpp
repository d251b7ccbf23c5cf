#include "GraphPlotUI/Traces/TraceStrips.h"

#include <algorithm>
#include <array>
#include <cmath>

namespace GraphPlotUI
{

namespace
{

// Of the strip shaders: rows of a strip of bars, and segments less one of a strip of lines.
constexpr float RowsInStrip = 16.0f;

// Rows further apart are quicker one by one.
constexpr float LargestRowDistance = 2.0f;

constexpr int BlockSize = 4;

int Clamped(double i_Value, int i_Low, int i_High)
{
    return static_cast<int>(std::clamp(i_Value, static_cast<double>(i_Low), static_cast<double>(i_High)));
}

} // namespace

int StripWidth(float i_RowDistance, float i_Thickness)
{
    if (!(i_RowDistance > 0.0f) || i_RowDistance > LargestRowDistance)
        return 0;
    // Rows in reach lie between the outermost pixel centres and a thickness beyond them.
    constexpr std::array<int, 4> widths{16, 12, 8, 4};
    const auto fits = [&](int i_Width)
    {
        return static_cast<float>(i_Width - 1) + 2.0f * i_Thickness < RowsInStrip * i_RowDistance;
    };
    const auto found = std::find_if(widths.begin(), widths.end(), fits);
    return found == widths.end() ? 0 : *found;
}

RowRange StripLayout::Inside(const RowRange& i_rStrips, int i_ViewportWidth) const
{
    const int first = std::max(i_rStrips.First, Origin < 0 ? 1 : 0);
    const int end = std::min(i_rStrips.First + i_rStrips.Count, (i_ViewportWidth - Origin) / Width);
    return {first, std::max(end - first, 0)};
}

StripLayout MakeStripLayout(const QRect& i_rViewport, int i_StripWidth)
{
    StripLayout layout;
    layout.Width = i_StripWidth;
    layout.Origin = -(((i_rViewport.left() % BlockSize) + BlockSize) % BlockSize);
    layout.Count = (i_rViewport.width() - layout.Origin + i_StripWidth - 1) / i_StripWidth;
    return layout;
}

RowRange VisibleStrips(const StripLayout& i_rLayout, const ChannelDraw& i_rChannel, float i_ViewportWidth,
                       float i_Reach)
{
    const int count = static_cast<int>(i_rChannel.Info.SampleCount);
    if (count == 0)
        return {};
    const double pixelsPerSample = static_cast<double>(i_ViewportWidth) / static_cast<double>(i_rChannel.AxisLength);
    const double left = -static_cast<double>(i_rChannel.AxisStart) * pixelsPerSample;
    const double right = left + (count - 1) * static_cast<double>(i_rChannel.LodScale) * pixelsPerSample;
    const auto strip = [&](double i_Pixel)
    {
        return std::floor((i_Pixel - i_rLayout.Origin) / i_rLayout.Width);
    };
    const int first = Clamped(strip(left - static_cast<double>(i_Reach)), 0, i_rLayout.Count);
    const int end = Clamped(strip(right + static_cast<double>(i_Reach)) + 1.0, first, i_rLayout.Count);
    return {first, end - first};
}

} // namespace GraphPlotUI

#include "GraphPlotSystem/Traces/TracePalette.h"

#include <algorithm>
#include <array>
#include <cstdint>

namespace GraphPlotUI
{
namespace
{

constexpr Colour4f FromRgb(std::uint32_t i_Rgb)
{
    const auto channel = [i_Rgb](int i_Shift)
    {
        return static_cast<float>((i_Rgb >> i_Shift) & 0xff) / 255.0f;
    };
    return {channel(16), channel(8), channel(0), 1.0f};
}

constexpr std::array s_Standard{
    FromRgb(0xee1f1f), FromRgb(0x1fee1f), FromRgb(0x1f1fee), FromRgb(0xee1fee), FromRgb(0xeeee1f), FromRgb(0x1feeee),
    FromRgb(0xE25822), FromRgb(0x73a700), FromRgb(0x408073), FromRgb(0x8000b3), FromRgb(0xffbfcc), FromRgb(0xffb749),
    FromRgb(0xf7f2c0), FromRgb(0x9ff18a), FromRgb(0xce5fff), FromRgb(0x654522), FromRgb(0xA1CAF1), FromRgb(0x0067A5),
    FromRgb(0xF99379), FromRgb(0x604E97), FromRgb(0xB3446C), FromRgb(0x2B4D26)};

constexpr std::array s_LimitedTwelve{FromRgb(0x9F0162), FromRgb(0x009F81), FromRgb(0xFF5AAF), FromRgb(0x00FCCF),
                                     FromRgb(0x8400CD), FromRgb(0x008DF9), FromRgb(0x00C2F9), FromRgb(0xFFB2FD),
                                     FromRgb(0xA40122), FromRgb(0xE20134), FromRgb(0xFF6E3A), FromRgb(0xFFC33B)};

constexpr std::array s_LimitedNine{FromRgb(0x882255), FromRgb(0x117733), FromRgb(0x332288),
                                   FromRgb(0xCC6677), FromRgb(0xDDCC77), FromRgb(0x88CCEE),
                                   FromRgb(0x44AA99), FromRgb(0x999933), FromRgb(0xAA4499)};

constexpr std::array s_Sets{
    TraceColourSet{ETraceColourSet::TracesStandard, "TracesStandard", "Standard Color Vision (22 Colors)", s_Standard},
    TraceColourSet{ETraceColourSet::TracesColourDeficientMK, "TracesColourDeficientMK",
                   "Limited Color Vision (12 Colors)", s_LimitedTwelve},
    TraceColourSet{ETraceColourSet::TracesColourDeficientPT, "TracesColourDeficientPT",
                   "Limited Color Vision (9 Colors)", s_LimitedNine}};

} // namespace

std::span<const TraceColourSet> GetTraceColourSets()
{
    return s_Sets;
}

std::span<const Colour4f> GetTracePalette(std::int32_t i_Set)
{
    const auto found = std::ranges::find(s_Sets, static_cast<ETraceColourSet>(i_Set), &TraceColourSet::Set);
    return found == s_Sets.end() ? s_Standard : found->Colours;
}

} // namespace GraphPlotUI

#include "GraphPlotSystem/TracePalette.h"

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

} // namespace

std::span<const Colour4f> GetStandardTracePalette()
{
    return s_Standard;
}

} // namespace GraphPlotUI

#include "GraphPlotSystem/Traces/TracePalette.h"

#include <gtest/gtest.h>

#include <set>

using namespace GraphPlotUI;

namespace
{

TEST(ColourSets, HaveDistinctOpaqueColours)
{
    const std::size_t sizes[] = {22, 12, 9};
    const Colour4f lasts[] = {{0x2B, 0x4D, 0x26, 255}, {0xFF, 0xC3, 0x3B, 255}, {0xAA, 0x44, 0x99, 255}};
    ASSERT_EQ(GetTraceColourSets().size(), 3u);
    for (std::size_t set = 0; set < 3; ++set)
    {
        const auto colours = GetTracePalette(static_cast<std::int32_t>(set));
        ASSERT_EQ(colours.size(), sizes[set]);
        EXPECT_EQ(std::set<Colour4f>(colours.begin(), colours.end()).size(), sizes[set]);
        for (std::size_t channel = 0; channel < 4; ++channel)
            EXPECT_FLOAT_EQ(colours.back()[channel] * 255.0f, lasts[set][channel]) << set;
    }
    EXPECT_EQ(GetTracePalette(3).data(), GetTracePalette(0).data());
}

} // namespace

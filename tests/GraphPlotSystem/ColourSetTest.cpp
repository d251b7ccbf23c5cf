#include "GraphPlotSystem/FakePreferences.h"
#include "GraphPlotSystem/FakeTraceWindow.h"
#include "GraphPlotSystem/MemoryBlock.h"
#include "GraphPlotSystem/TracePalette.h"
#include "GraphPlotSystem/VPlainSubplotModel.h"
#include "GraphPlotSystem/VTraceDataProvider.h"
#include "support/ManualPostalService.h"

#include <gtest/gtest.h>

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

TEST(ColourSets, TracesFollowThePreference)
{
    const auto pUi = std::make_shared<TestSupport::ManualPostalService>();
    const auto pJournal = std::make_shared<FakeHost::Journal>();
    const auto pTexts =
        std::make_shared<FakeTraceWindow::TextProvider>(std::make_shared<FakeHost::Service>(pJournal), pUi);
    const auto pProvider = std::make_shared<VTraceDataProvider>(pUi);
    const auto pPreferences = std::make_shared<FakePreferences>();
    ASSERT_TRUE(pPreferences->SetValue(IGraphPlotPreferences::TraceColourSet, 1).IsSuccess());

    TestSupport::MemoryBlock block(1);
    block.Append({1, 2, 3});
    TQL::IChannelInstanceId id;
    id.First = 1;
    pProvider->UpdateTrace(id, block, {0, 3 * TQL::DefaultFramePeriod}, {0, 3 * TQL::DefaultFramePeriod}, 0);
    {
        VPlainSubplotModel model(pUi, pProvider, pTexts, pPreferences, nullptr);
        pUi->RunAll();
        const auto colour = [&]
        {
            Colour4f found{};
            pProvider->GetTraceColour(found, TQL::ITraceId(id, 0));
            return found;
        };
        EXPECT_EQ(colour(), GetTracePalette(1)[0]);
        ASSERT_TRUE(pPreferences->SetValue(IGraphPlotPreferences::TraceColourSet, 2).IsSuccess());
        pUi->RunAll();
        EXPECT_EQ(colour(), GetTracePalette(2)[0]);
        ASSERT_TRUE(pPreferences->SetValue(IGraphPlotPreferences::TraceColourSet, 0).IsSuccess());
    }
    pUi->RunAll(); // a notice for a model that is gone
}

} // namespace

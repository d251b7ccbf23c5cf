#pragma once

#include "GraphPlotSystem/Channels/VActiveChannelModel.h"
#include "GraphPlotSystem/FakePreferences.h"
#include "GraphPlotSystem/FakeTexts.h"
#include "GraphPlotSystem/MemoryBlock.h"
#include "GraphPlotSystem/ModelJournal.h"
#include "GraphPlotSystem/Texts/VChannelComponentControls.h"
#include "GraphPlotSystem/Traces/TracePalette.h"
#include "GraphPlotSystem/Traces/VTraceDataProvider.h"
#include "support/LogGuard.h"
#include "support/ManualPostalService.h"

#include <gtest/gtest.h>

#include <algorithm>

/// What stands around the models of one window: real storage, controls and channel list; texts that the
/// test writes down. Jobs for the user interface run when pUi says so.
class SubplotFixture : public ::testing::Test
{
protected:
    SubplotFixture() { pTexts->Types = MarkerAndEmgTypes(); }
    ~SubplotFixture() override { pUi->RunAll(); } // notices for models that are gone

    /// A trace for each component; the values are those of component 0, each further component is 100 higher.
    void Plot(const std::string& i_rType, const std::string& i_rName, const std::vector<float>& i_rValues = {1, 2, 3})
    {
        const auto components = static_cast<std::uint32_t>(pTexts->Types.at(i_rType).Components.size());
        TestSupport::MemoryBlock block(components);
        for (const float value : i_rValues)
            for (std::uint32_t component = 0; component < components; ++component)
                block.Append({value + 100.0f * static_cast<float>(component)});
        pStorage->UpdateTrace(FakeTexts::Id(i_rType, i_rName), block, block.Range(), block.Range(), 0);
    }
    void Unplot(const std::string& i_rType, const std::string& i_rName)
    {
        pStorage->RemoveTrace(FakeTexts::Id(i_rType, i_rName));
    }

    /// Which of a palette's colours a trace has; -1 for none of them.
    int ColourOf(const std::string& i_rType, const std::string& i_rName, std::uint8_t i_Component, int i_Set = 0) const
    {
        GraphPlotUI::Colour4f colour{};
        pStorage->GetTraceColour(colour, TQL::ITraceId(FakeTexts::Id(i_rType, i_rName), i_Component));
        const auto palette = GraphPlotUI::GetTracePalette(i_Set);
        const auto found = std::ranges::find(palette, colour);
        return found == palette.end() ? -1 : static_cast<int>(found - palette.begin());
    }

    TestSupport::LogGuard Log;
    const std::shared_ptr<TestSupport::ManualPostalService> pUi = std::make_shared<TestSupport::ManualPostalService>();
    const std::shared_ptr<FakeTexts> pTexts = std::make_shared<FakeTexts>();
    const std::shared_ptr<GraphPlotUI::VChannelComponentControls> pControls =
        std::make_shared<GraphPlotUI::VChannelComponentControls>(pTexts, pUi);
    const std::shared_ptr<GraphPlotUI::VTraceDataProvider> pStorage =
        std::make_shared<GraphPlotUI::VTraceDataProvider>(pUi);
    const std::shared_ptr<FakePreferences> pPreferences = std::make_shared<FakePreferences>();
    GraphPlotUI::VActiveChannelModel Channels{pUi, pTexts, nullptr, nullptr};
};

// What a window shows, as text.

#include "ChannelSystem/IChannelBlock.h"
#include "GraphPlotSystem/Channels/VActiveChannelModel.h"
#include "GraphPlotSystem/Subplots/VKeyModel.h"
#include "GraphPlotSystem/Subplots/VSubplotManager.h"
#include "GraphPlotSystem/Subplots/VSubplotModel.h"
#include "GraphPlotSystem/Subplots/VTraceModel.h"
#include "GraphPlotSystem/Texts/IChannelComponentControls.h"
#include "GraphPlotSystem/Texts/VBaseChannelTextProvider.h"
#include "GraphPlotSystem/Traces/ITraceDataStorage.h"
#include "GraphPlotSystem/Traces/TracePalette.h"
#include "Scenarios/PlotScenario.h"

#include <algorithm>
#include <cmath>
#include <cstdio>

using namespace GraphPlotUI;

namespace
{

/// Four decimals without the zeros at their end.
std::string NumberText(float i_Value)
{
    if (std::isnan(i_Value))
        return "-";
    char text[64];
    std::snprintf(text, sizeof text, "%.4f", std::abs(i_Value) < 5e-4f ? 0.0 : static_cast<double>(i_Value));
    std::string number(text);
    number.erase(number.find_last_not_of('0') + 1);
    return number.ends_with('.') ? number.substr(0, number.size() - 1) : number;
}

std::string Joined(const std::vector<std::string>& i_rTexts, const char* i_pSeparator)
{
    std::string joined;
    for (const std::string& rText : i_rTexts)
        joined += (&rText == &i_rTexts.front() ? "" : i_pSeparator) + rText;
    return joined;
}

} // namespace

std::string PlotScenario::Plotted()
{
    std::string text;
    for (const auto& rpChannel : Rows().GetChannels())
    {
        const TQL::IChannelInstanceId& rId = rpChannel->GetInstanceId();
        const std::uint64_t subType = m_pTexts->GetSubTypeId(rId);
        std::vector<std::string> names;
        std::vector<std::string> rich;
        for (std::uint64_t i = 0; i < m_pTexts->GetComponentCount(subType); ++i)
        {
            names.push_back(m_pTexts->GetComponentName(rId, i).toStdString());
            const QString units = m_pTexts->GetComponentUnits(subType, i, true);
            if (units != m_pTexts->GetComponentUnits(subType, i, false) &&
                std::ranges::find(rich, units.toStdString()) == rich.end())
                rich.push_back(units.toStdString());
        }
        text += m_pTexts->GetChannelDisplayName(rId).toStdString() + " | " + Joined(names, ",") + " | " +
                m_pTexts->GetSubTypeUnits(subType).toStdString() + (rich.empty() ? "" : " | " + Joined(rich, " ")) +
                "\n";
    }
    return text;
}

std::string PlotScenario::Values(std::int64_t i_Frame)
{
    std::string text;
    for (const auto& rpChannel : Rows().GetChannels())
    {
        text += m_pTexts->GetChannelDisplayName(rpChannel->GetInstanceId()).toStdString() + ":";
        const auto pOutput = rpChannel->GetOutput();
        const auto pBlock = pOutput ? pOutput->GetBlock() : nullptr;
        if (!pBlock)
        {
            text += " no data\n";
            continue;
        }
        const ChannelSystem::ChannelBlockShape& rShape = pBlock->GetShape();
        TQL::TickRange range;
        pBlock->GetRange(range); // what is computed is computed when somebody asks how much there is
        std::vector<float> row(rShape.pLayout->ComponentCount);
        const std::int64_t tick = i_Frame * TQL::DefaultFramePeriod;
        EXPECT_EQ(pBlock->ReadSamples({tick, tick + rShape.SamplePeriod}, row), TQL::Result::Ok);
        for (const float value : row)
            text += " " + NumberText(value);
        text += "\n";
    }
    return text;
}

std::string PlotScenario::ColourOf(const TQL::ITraceId& i_rTrace) const
{
    Colour4f colour{};
    m_pStorage->GetTraceColour(colour, i_rTrace);
    const auto palette = GetTracePalette(0);
    const auto found = std::ranges::find(palette, colour);
    return found == palette.end() ? "#none" : "#" + std::to_string(found - palette.begin());
}

std::string PlotScenario::Subplots()
{
    using namespace TQL::SubplotModelRoles;
    const VSubplotModel& rModel = *pSystem->GetSubplotManager()->GetSubplotModel();
    std::string text;
    for (int row = 0; row < rModel.rowCount(); ++row)
    {
        const QModelIndex index = rModel.index(row);
        const QString units = index.data(SubplotYAxisUnits).toString();
        text += (index.data(SubplotYAxisLabel).toString() + (units.isEmpty() ? "" : " ") + units).toStdString() + ":";
        const auto* const pTraces = static_cast<VTraceModel*>(index.data(SubplotTraceModel).value<QObject*>());
        for (std::size_t i = 0; i < pTraces->GetTraceIds().size(); ++i)
            text += (i == 0 ? " " : ", ") + pTraces->GetDisplayNames()[i].toStdString() +
                    ColourOf(pTraces->GetTraceIds()[i]);
        text += "\n";
    }
    return text;
}

std::string PlotScenario::Key()
{
    using namespace TQL::KeyModelRoles;
    const VKeyModel& rModel = *pSystem->GetKeyModel();
    std::string text;
    for (int row = 0; row < rModel.rowCount(); ++row)
    {
        const QModelIndex index = rModel.index(row);
        const QString component = index.data(KeyComponentName).toString();
        text += (index.data(KeyChannelName).toString() + (component.isEmpty() ? "" : " ") + component).toStdString() +
                ColourOf(index.data(KeyTraceId).value<TQL::ITraceId>()) + (index.data(KeyPinned).toBool() ? "*" : "") +
                (index.data(KeyMissingData).toBool() ? "?" : "") + "\n";
    }
    return text;
}

std::string PlotScenario::ToolTip(int i_Subplot)
{
    const VSubplotModel& rModel = *pSystem->GetSubplotManager()->GetSubplotModel();
    return rModel.index(i_Subplot).data(TQL::SubplotModelRoles::SubplotYAxisToolTip).toString().toStdString();
}

std::string PlotScenario::ErrorOf(const std::shared_ptr<TQL::IChannel>& i_rpChannel) const
{
    std::vector<std::string> errors;
    i_rpChannel->GetParameters()->GetErrors(errors);
    return Joined(errors, " | ");
}

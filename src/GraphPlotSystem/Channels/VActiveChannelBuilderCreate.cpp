#include "ChannelSystem/IChannelSelectionManager.h"
#include "ChannelSystemUtils/ApplyChannelOptions.h"
#include "GraphPlotSystem/Channels/VActiveChannelBuilder.h"
#include "GraphPlotSystem/Channels/VActiveChannelModel.h"
#include "TQL/Log.h"

#include <utility>

namespace GraphPlotUI
{
namespace
{

void LogChannelError(const std::string& i_rType, std::string_view i_Error)
{
    static const TQL::VLogCategory& rCategory = TQL::Log::GetCategory("GraphPlot");
    TQL::Log::Format(rCategory, TQL::ELogSeverity::Error, "Channel %1% Error %2%", i_rType, i_Error);
}

void LogErrorsOf(const TQL::IChannel& i_rChannel)
{
    const auto pParameters = i_rChannel.GetParameters();
    if (!pParameters)
        return;
    std::vector<std::string> errors;
    pParameters->GetErrors(errors);
    for (const std::string& rError : errors)
        LogChannelError(i_rChannel.GetInstanceId().TypeName, rError);
}

} // namespace

void VActiveChannelBuilder::Rebuild()
{
    m_bRebuildQueued = false;
    SourceList selected;
    SourceList global;
    for (const auto& [rId, rEntry] : m_Entries)
        if (rEntry.pOutput)
            (IsGlobal(*rEntry.pOutput) ? global : selected).push_back({rEntry.pChannel, rEntry.pOutput});
    SourceList built;
    Create(m_SelectedType, selected, built);
    if (!m_GlobalType.empty())
        Create(m_GlobalType, global, built);
    ChannelList plotted;
    plotted.reserve(built.size());
    for (const Source& rSource : built)
        if (auto pChannel = ApplyOptions(rSource))
            plotted.push_back(std::move(pChannel));
    if (m_pModel)
        (void)m_pModel->SetChannels(std::move(plotted)); // whether the rows changed is the model's to tell
}

bool VActiveChannelBuilder::IsGlobal(const TQL::IChannelOutput& i_rOutput) const
{
    const auto pManager = m_pChannelService->GetSelectionManager();
    const auto pChannel = i_rOutput.GetChannel();
    auto kind = TQL::ESelectionKind::None;
    return pManager && pChannel && pManager->GetSelectionKind(pChannel->GetInstanceId().TypeName, kind).IsSuccess() &&
           kind == TQL::ESelectionKind::Global;
}

std::shared_ptr<TQL::IChannel> VActiveChannelBuilder::ApplyOptions(const Source& i_rSource) const
{
    std::shared_ptr<TQL::IChannelOutput> pOutput;
    const TQL::IResult result =
        ChannelSystemUtils::ApplyChannelOptions(*m_pChannelService, i_rSource.pOutput, m_Options, pOutput);
    if (result.IsError() || !pOutput)
        pOutput = i_rSource.pOutput;
    return pOutput->GetChannel();
}

void VActiveChannelBuilder::Create(const std::string& i_rType, const SourceList& i_rInputs, SourceList& io_rBuilt) const
{
    TQL::VChannelSpecifier specifier;
    if (!m_pTypeRegistry || m_pTypeRegistry->GetSpecifier(i_rType, specifier).IsError())
    {
        io_rBuilt.insert(io_rBuilt.end(), i_rInputs.begin(), i_rInputs.end());
        return;
    }
    ChannelList created;
    if (specifier.RequiredInputCount == 0)
    {
        const TQL::IResult result = m_pTypeRegistry->CreateGlobalChannels(i_rType, m_ContextName, created);
        TakeCreated(i_rType, result, created, io_rBuilt);
        return;
    }
    ChannelList collected;
    const auto make = [&]
    {
        created.clear();
        const TQL::IResult result = m_pTypeRegistry->CreateChannels(i_rType, collected, created);
        TakeCreated(i_rType, result, created, io_rBuilt);
        collected.clear();
    };
    for (const Source& rInput : i_rInputs)
    {
        collected.push_back(rInput.pOutput->GetChannel());
        if (std::cmp_equal(collected.size(), specifier.RequiredInputCount))
            make();
    }
    if (specifier.RequiredInputCount == -1 && !collected.empty())
        make();
}

void VActiveChannelBuilder::TakeCreated(const std::string& i_rType, TQL::IResult i_Result,
                                        const ChannelList& i_rCreated, SourceList& io_rBuilt)
{
    if (i_Result.IsError() && i_rCreated.empty())
        LogChannelError(i_rType, i_Result.Description());
    for (const std::shared_ptr<TQL::IChannel>& rpChannel : i_rCreated)
    {
        if (!rpChannel)
            continue;
        if (auto pOutput = rpChannel->GetOutput())
            io_rBuilt.push_back({rpChannel, std::move(pOutput)});
        else
            LogErrorsOf(*rpChannel);
    }
}

} // namespace GraphPlotUI

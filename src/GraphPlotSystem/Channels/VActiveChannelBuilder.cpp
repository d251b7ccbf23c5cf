#include "GraphPlotSystem/Channels/VActiveChannelBuilder.h"

#include "ChannelSystem/IChannelSelectionManager.h"
#include "ChannelSystemUtils/ApplyChannelOptions.h"
#include "GraphPlotSystem/Channels/VActiveChannelModel.h"
#include "NotificationSystem/WeakCallback.h"
#include "TQL/Log.h"

#include <utility>

namespace GraphPlotUI
{

VActiveChannelBuilder::VActiveChannelBuilder(std::shared_ptr<TQL::IPostalService> i_pUiPostalService,
                                             std::shared_ptr<ChannelSystem::IChannelService> i_pChannelService,
                                             std::shared_ptr<TQL::IChannelTypeRegistry> i_pTypeRegistry,
                                             VActiveChannelModel* i_pModel)
    : m_pUiPostalService(std::move(i_pUiPostalService))
    , m_pChannelService(std::move(i_pChannelService))
    , m_pTypeRegistry(std::move(i_pTypeRegistry))
    , m_pModel(i_pModel)
{
}

VActiveChannelBuilder::~VActiveChannelBuilder() = default;

void VActiveChannelBuilder::SetContextName(const std::string& i_rName)
{
    if (std::exchange(m_ContextName, i_rName) != i_rName)
        Refresh(true);
}

void VActiveChannelBuilder::SetLinked(bool i_bLinked)
{
    if (std::exchange(m_bLinked, i_bLinked) != i_bLinked)
        Refresh(true);
}

void VActiveChannelBuilder::SetSelectedChannelType(const std::string& i_rType)
{
    if (std::exchange(m_SelectedType, i_rType) == i_rType)
        return;
    m_SelectionTypes = {i_rType};
    TQL::VChannelSpecifier specifier;
    if (m_pTypeRegistry && m_pTypeRegistry->GetSpecifier(i_rType, specifier).IsSuccess())
        m_SelectionTypes = {specifier.InputTypeNames.begin(), specifier.InputTypeNames.end()};
    Refresh(true);
}

void VActiveChannelBuilder::SetGlobalChannelType(const std::string& i_rType)
{
    if (std::exchange(m_GlobalType, i_rType) != i_rType)
        Refresh(true);
}

void VActiveChannelBuilder::SetOptions(const ChannelSystemUtils::VActiveChannelOptions& i_rOptions)
{
    if (m_Options == i_rOptions)
        return;
    m_Options = i_rOptions;
    Rebuild();
}

void VActiveChannelBuilder::Clear()
{
    m_Tracked.clear();
    m_Entries.clear();
    m_bRebuildQueued = false;
}

void VActiveChannelBuilder::Refresh(bool i_bForce)
{
    IdSet ids;
    ChannelList channels = FindChannels(FindSelectedIds(), ids);
    bool bChanged = channels != m_Tracked;
    if (bChanged)
        m_Tracked = std::move(channels);
    bChanged = DropEntriesBut(ids) || bChanged;
    for (const std::shared_ptr<TQL::IChannel>& rpChannel : m_Tracked)
        Follow(rpChannel);
    if (bChanged || i_bForce)
        Rebuild();
}

std::vector<TQL::IChannelInstanceId> VActiveChannelBuilder::FindSelectedIds() const
{
    std::vector<TQL::IChannelInstanceId> ids;
    const auto pManager = m_pChannelService->GetSelectionManager();
    if (!pManager)
        return ids;
    const auto append = [&](const std::string& i_rType)
    {
        std::vector<TQL::IChannelInstanceId> found;
        pManager->GetSelectedChannelIds(m_ContextName, i_rType, found);
        ids.insert(ids.end(), std::make_move_iterator(found.begin()), std::make_move_iterator(found.end()));
    };
    if (m_bLinked)
        for (const std::string& rType : m_SelectionTypes)
            append(rType);
    if (!m_GlobalType.empty())
        append(m_GlobalType);
    return ids;
}

VActiveChannelBuilder::ChannelList
VActiveChannelBuilder::FindChannels(const std::vector<TQL::IChannelInstanceId>& i_rIds, IdSet& o_rIds) const
{
    ChannelList channels;
    channels.reserve(i_rIds.size());
    for (const TQL::IChannelInstanceId& rId : i_rIds)
    {
        if (!o_rIds.insert(rId).second)
            continue;
        auto pChannel = m_pChannelService->GetChannel(rId);
        if (!pChannel)
            continue;
        // That of a global channel may name a context where the one asked for named none.
        const TQL::IChannelInstanceId& rOwnId = pChannel->GetInstanceId();
        if (TQL::IsSameChannel(rOwnId, rId) || o_rIds.insert(rOwnId).second)
            channels.push_back(std::move(pChannel));
    }
    return channels;
}

bool VActiveChannelBuilder::DropEntriesBut(const IdSet& i_rIds)
{
    return std::erase_if(m_Entries, [&](const auto& i_rEntry) { return !i_rIds.contains(i_rEntry.first); }) != 0;
}

void VActiveChannelBuilder::Follow(const std::shared_ptr<TQL::IChannel>& i_rpChannel)
{
    const TQL::IChannelInstanceId& rId = i_rpChannel->GetInstanceId();
    VSelectionEntry& rEntry = m_Entries[rId];
    if (rEntry.pChannel == i_rpChannel)
        return;
    rEntry = {i_rpChannel, nullptr, nullptr};
    const auto pParameters = i_rpChannel->GetParameters();
    if (const auto pNotifier = pParameters ? pParameters->GetChangeNotifier() : nullptr)
        rEntry.pCallback = pNotifier->AddOutputChangedCallback(
            NotificationSystem::MakeWeakFunction(
                WeakSelf(this), [rId, pChannel = std::weak_ptr(i_rpChannel)](VActiveChannelBuilder& i_rSelf)
                { i_rSelf.OnOutputChanged(rId, pChannel); }),
            m_pUiPostalService);
    rEntry.pOutput = i_rpChannel->GetOutput(); // after the subscription, so that no change is missed
}

void VActiveChannelBuilder::OnOutputChanged(const TQL::IChannelInstanceId& i_rId,
                                            const std::weak_ptr<TQL::IChannel>& i_rpChannel)
{
    const auto found = m_Entries.find(i_rId);
    const auto pChannel = i_rpChannel.lock();
    if (found == m_Entries.end() || !pChannel || found->second.pChannel != pChannel)
        return; // a notice of a channel that is followed no more
    auto pOutput = pChannel->GetOutput();
    if (pOutput == found->second.pOutput)
        return;
    found->second.pOutput = std::move(pOutput);
    QueueRebuild();
}

void VActiveChannelBuilder::QueueRebuild()
{
    // Channels lose and get their outputs together, a recording's worth at a time: one rebuild serves all notices that
    // wait now.
    if (std::exchange(m_bRebuildQueued, true))
        return;
    m_pUiPostalService->Post(
        [pSelf = WeakSelf(this)]
        {
            if (const auto pStrong = pSelf.lock(); pStrong && pStrong->m_bRebuildQueued)
                pStrong->Rebuild();
        });
}

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

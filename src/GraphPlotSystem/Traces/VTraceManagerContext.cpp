// The link of the trace manager to the host: its channel context, its channels and what is followed while the update
// loop runs. Time ranges, state and the tick itself stand in VTraceManager.cpp.

#include "ChannelSystem/IChannel.h"
#include "ChannelSystem/IChannelContext.h"
#include "ChannelSystem/IChannelService.h"
#include "GraphPlotSystem/Time/VBaseGraphPlotTime.h"
#include "GraphPlotSystem/Traces/ITraceDataStorage.h"
#include "GraphPlotSystem/Traces/TraceTimeRules.h"
#include "GraphPlotSystem/Traces/VTraceManager.h"
#include "NotificationSystem/VDispatchCollapsers.h"
#include "NotificationSystem/WeakCallback.h"

#include <utility>

namespace GraphPlotUI
{
namespace
{

/// Adds the data contexts of a channel and of everything that it is made from.
void CollectSourceNames(const TQL::IChannel& i_rChannel, std::set<const TQL::IChannel*>& o_rVisited,
                        std::set<std::string>& o_rNames)
{
    if (!o_rVisited.insert(&i_rChannel).second)
        return;
    if (const std::string& rName = i_rChannel.GetInstanceId().DataContextName; !rName.empty())
        o_rNames.insert(rName);
    std::vector<std::shared_ptr<TQL::IChannel>> inputs;
    i_rChannel.GetDependentChannels(inputs);
    for (const auto& rpInput : inputs)
        if (rpInput)
            CollectSourceNames(*rpInput, o_rVisited, o_rNames);
}

} // namespace

using NotificationSystem::MakeCollapserDontDispatch;
using NotificationSystem::MakeCollapserDontPost;
using NotificationSystem::MakeWeakCallback;

void VTraceManager::OnPostCreation()
{
    m_LifelongSubscriptions.Subscribe(m_pUpdater->RangeChanged(),
                                      MakeWeakCallback(WeakSelf(this), &VTraceManager::OnCacheRangeChanged),
                                      MakeCollapserDontDispatch(m_pUiPostalService));
    m_LifelongSubscriptions.Subscribe(m_pChannelService->ContextListChanged(),
                                      MakeWeakCallback(WeakSelf(this), &VTraceManager::OnContextListChanged),
                                      MakeCollapserDontPost(m_pUiPostalService));
}

void VTraceManager::SetContext(const std::string& i_rName)
{
    m_PendingContextName.clear();
    if (i_rName == m_ContextName)
        return;
    if (i_rName.empty())
    {
        DropContext();
        return;
    }
    if (auto pContext = m_pChannelService->GetContextByName(i_rName))
        UseContext(i_rName, std::move(pContext));
    else
        m_PendingContextName = i_rName;
}

void VTraceManager::DropContext()
{
    SetActive(false);
    ++m_ContextGeneration;
    m_ContextSubscriptions.Drain();
    m_ContextName.clear();
    m_pContext = nullptr;
}

void VTraceManager::UseContext(const std::string& i_rName, std::shared_ptr<ChannelSystem::IChannelContext> i_pContext)
{
    ++m_ContextGeneration;
    m_ContextSubscriptions.Drain();
    m_ContextName = i_rName;
    m_pContext = std::move(i_pContext);
    SetContextType(static_cast<std::int32_t>(m_pContext->GetType()));
    if (!m_Inputs.bLive)
        FollowRecordedRange();
    SetActive(true);
}

void VTraceManager::SetContextType(std::int32_t i_Type)
{
    if (i_Type == m_ContextType)
        return;
    m_ContextType = i_Type;
    SetInput(&UpdateInputs::bLive, i_Type == static_cast<std::int32_t>(ChannelSystem::EContextType::Live));
    Q_EMIT LiveContextChanged();

    FollowPreset();
}

void VTraceManager::FollowRecordedRange()
{
    const auto handler = [generation = m_ContextGeneration](VTraceManager& i_rManager)
    {
        if (generation != i_rManager.m_ContextGeneration)
            throw TQL::VDeregisterWeakCallbackException();
        i_rManager.OnRecordedRangeChanged();
    };
    m_ContextSubscriptions.Subscribe(m_pContext->RangeChanged(),
                                     NotificationSystem::MakeWeakFunction(WeakSelf(this), handler), m_pUiPostalService);
    OnRecordedRangeChanged();
}

void VTraceManager::OnRecordedRangeChanged()
{
    const TQL::TickRange range = m_pContext->GetTickRange();
    const std::int64_t period = m_pContext->GetFramePeriod();
    if (range.IsEmpty() || period == 0)
        return;
    SetTimeFrames({TQL::TicksToFrames(range.First, period), TQL::TicksToFrames(range.Last, period)});
    SetDefaultFrames(m_Inputs.TimeRange);
}

void VTraceManager::OnContextListChanged()
{
    if (!m_PendingContextName.empty())
    {
        SetContext(std::string(m_PendingContextName));
        return;
    }
    if (m_ContextName.empty() || m_pChannelService->GetContextByName(m_ContextName) == m_pContext)
        return;
    const std::string name = m_ContextName;
    SetContext(std::string());
    SetContext(name);
}

void VTraceManager::SetActive(bool i_bActive)
{
    m_ActiveSubscriptions.Drain();
    if (const auto token = std::exchange(m_PreferenceToken, 0); token != 0)
        (void)m_pPreferences->RemoveCallback(IGraphPlotPreferences::EnableRotationUnwrapping, token);
    SetInput(&UpdateInputs::bActive, i_bActive);
    if (i_bActive)
    {
        SubscribePreference();
        const auto pCollapser = MakeCollapserDontPost(m_pUiPostalService);
        const auto followPeriod = MakeWeakCallback(WeakSelf(this), &VTraceManager::OnFramePeriodChanged);
        m_ActiveSubscriptions.Subscribe(m_pPlotTime->FramePeriodChanged(), followPeriod, pCollapser);
        pCollapser->Post(followPeriod);
        m_pUpdatePostalService->Post(MakeWeakCallback(WeakSelf(this), &VTraceManager::UpdateTick));
    }
    if (m_ContextType == static_cast<std::int32_t>(ChannelSystem::EContextType::None))
        m_pUpdater->Clear();
}

void VTraceManager::SubscribePreference()
{
    const auto pSelf = WeakSelf(this);
    const TQL::IResult result = m_pPreferences->AddCallback(
        m_PreferenceToken, IGraphPlotPreferences::EnableRotationUnwrapping,
        MakeWeakCallback(pSelf, &VTraceManager::OnRotationUnwrappingPreference), m_pUiPostalService);
    if (result.IsError())
        m_PreferenceToken = 0; // without notices the value at the start holds
    m_pUiPostalService->Post(
        [pSelf]
        {
            if (const auto pManager = pSelf.lock())
                pManager->OnRotationUnwrappingPreference();
        });
}

void VTraceManager::OnRotationUnwrappingPreference()
{
    IGraphPlotPreferences::Value value;
    const TQL::IResult result = m_pPreferences->GetValue(IGraphPlotPreferences::EnableRotationUnwrapping, value);
    if (const bool* const pbEnabled = std::get_if<bool>(&value); result.IsSuccess() && pbEnabled)
        m_pUpdater->SetRotationUnwrapping(*pbEnabled);
}

void VTraceManager::OnFramePeriodChanged()
{
    const std::int64_t period = m_pPlotTime->GetFramePeriod();
    if (period == 0 || period == m_Inputs.FramePeriod)
        return;
    SetInput(&UpdateInputs::FramePeriod, period);
    FollowPreset();
    m_pStorage->SetTicksPerFrame(period);
    Q_EMIT ContextFramePeriodChanged();
}

void VTraceManager::SetChannels(const std::vector<std::shared_ptr<TQL::IChannel>>& i_rChannels)
{
    VTraceDataUpdater::IdSet ids;
    std::set<const TQL::IChannel*> visited;
    std::set<std::string> sourceNames;
    for (const auto& rpChannel : i_rChannels)
    {
        ids.insert(rpChannel->GetInstanceId());
        CollectSourceNames(*rpChannel, visited, sourceNames);
    }
    m_pUpdater->SetChannels(i_rChannels, ids);
    // A context that spans others has channels but no time, and must not draw the plot away from the time on show.
    std::erase_if(sourceNames, [this](const std::string& i_rName) { return !m_pPlotTime->HasSource(i_rName); });
    m_pPlotTime->SetPreferredSources(sourceNames);
}

} // namespace GraphPlotUI

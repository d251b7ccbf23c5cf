// The records of the updater: which channels it keeps, saves and gives away. The tick itself stands in
// VTraceDataUpdater.cpp.

#include "ChannelSystem/IChannel.h"
#include "ChannelSystem/IChannelService.h"
#include "GraphPlotSystem/Texts/IChannelComponentControls.h"
#include "GraphPlotSystem/Texts/IChannelTextProvider.h"
#include "GraphPlotSystem/Time/VBaseGraphPlotTime.h"
#include "GraphPlotSystem/Traces/ITraceDataStorage.h"
#include "GraphPlotSystem/Traces/VTraceDataUpdater.h"

#include <utility>

namespace GraphPlotUI
{

// Host objects that an operation lets go of are kept in a local until the mutex is free: their destructors are the
// host's business.

VTraceDataUpdater::VTraceDataUpdater(std::shared_ptr<ChannelSystem::IChannelService> i_pChannelService,
                                     std::shared_ptr<TQL::IChannelTextProvider> i_pTextProvider,
                                     std::shared_ptr<TQL::IChannelComponentControls> i_pComponentControls,
                                     std::shared_ptr<VBaseGraphPlotTime> i_pPlotTime,
                                     std::shared_ptr<TQL::ITraceDataStorage> i_pStorage)
    : m_pChannelService(std::move(i_pChannelService))
    , m_pTextProvider(std::move(i_pTextProvider))
    , m_pComponentControls(std::move(i_pComponentControls))
    , m_pPlotTime(std::move(i_pPlotTime))
    , m_pStorage(std::move(i_pStorage))
    , m_pRangeChanged(std::make_shared<NotificationSystem::VMultiCallbackPostal<void(TQL::TickRange)>>())
{
}

VTraceDataUpdater::~VTraceDataUpdater() = default;

void VTraceDataUpdater::SetChannels(const std::vector<std::shared_ptr<TQL::IChannel>>& i_rChannels,
                                    const IdSet& i_rKeepIds)
{
    std::vector<CacheRecord> dropped;
    const std::lock_guard lock(m_Mutex);
    for (auto it = m_Records.begin(); it != m_Records.end();)
    {
        if (i_rKeepIds.contains(it->first))
        {
            ++it;
            continue;
        }
        dropped.push_back(std::move(it->second));
        it = m_Records.erase(it);
    }
    for (const auto& rpChannel : i_rChannels)
    {
        const auto [it, bInserted] = m_Records.try_emplace(rpChannel->GetInstanceId());
        if (!bInserted && it->second.pSource == rpChannel)
            continue;
        if (!bInserted)
        {
            // The host has built the channel anew under its old id: what hangs on the old object is stale for ever.
            dropped.push_back(std::exchange(it->second, CacheRecord()));
            m_pStorage->RemoveTrace(it->first);
        }
        it->second.pSource = rpChannel;
    }
    m_pStorage->RemoveTraces([&i_rKeepIds](const TQL::IChannelInstanceId& i_rId)
                             { return !i_rKeepIds.contains(i_rId); });
}

void VTraceDataUpdater::SetRotationUnwrapping(bool i_bEnabled)
{
    std::vector<CacheRecord> dropped;
    const std::lock_guard lock(m_Mutex);
    if (m_bRotationUnwrapping == i_bEnabled)
        return;
    m_bRotationUnwrapping = i_bEnabled;
    for (Records* pRecords : {&m_Records, &m_SavedRecords})
    {
        for (auto& [rId, rRecord] : *pRecords)
        {
            dropped.push_back(rRecord);
            rRecord.pCache = nullptr;
            rRecord.pCacheView = nullptr;
            m_pStorage->RemoveTrace(rId);
        }
    }
}

void VTraceDataUpdater::Clear()
{
    Records dropped;
    {
        const std::lock_guard lock(m_Mutex);
        m_pStorage->Clear();
        m_Records.swap(dropped);
        m_CachedRange = {};
    }
    m_pRangeChanged->Invoke(TQL::TickRange());
}

void VTraceDataUpdater::SaveRecords()
{
    Records dropped;
    const std::lock_guard lock(m_Mutex);
    dropped = std::exchange(m_SavedRecords, m_Records);
}

void VTraceDataUpdater::RestoreRecords()
{
    Records dropped;
    const std::lock_guard lock(m_Mutex);
    if (m_SavedRecords.empty())
        return;
    dropped = std::exchange(m_Records, std::exchange(m_SavedRecords, Records()));
    for (auto& [rId, rRecord] : m_Records)
        rRecord.bMayHaveTrace = true;
}

bool VTraceDataUpdater::HasSavedRecords() const
{
    const std::lock_guard lock(m_Mutex);
    return !m_SavedRecords.empty();
}

QVariant VTraceDataUpdater::GetExportData() const
{
    ExportMap exported;
    const std::lock_guard lock(m_Mutex);
    for (const auto& [rId, rRecord] : m_Records)
    {
        if (!rRecord.pCacheView || !rRecord.pCache)
            continue;
        const std::uint64_t subType = m_pTextProvider->GetSubTypeId(rId);
        std::vector<std::uint64_t> enabled;
        m_pComponentControls->GetEnabledComponents(subType, enabled);
        QStringList names;
        for (const std::uint64_t component : enabled)
            names.push_back(m_pTextProvider->GetComponentName(subType, component));
        exported.emplace(rRecord.pCache->GetInstanceId(), std::move(names));
    }
    return QVariant::fromValue(exported);
}

} // namespace GraphPlotUI

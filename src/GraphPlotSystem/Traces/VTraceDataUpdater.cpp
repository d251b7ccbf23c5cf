#include "GraphPlotSystem/Traces/VTraceDataUpdater.h"

#include "ChannelSystem/IChannel.h"
#include "ChannelSystem/IChannelBlock.h"
#include "ChannelSystem/IChannelService.h"
#include "GraphPlotSystem/Texts/IChannelComponentControls.h"
#include "GraphPlotSystem/Texts/IChannelTextProvider.h"
#include "GraphPlotSystem/Time/VBaseGraphPlotTime.h"
#include "GraphPlotSystem/Traces/ITraceDataStorage.h"
#include "GraphPlotSystem/Traces/TraceLevelChoice.h"
#include "GraphPlotSystem/Traces/TraceTimeRules.h"
#include "TQL/Log.h"

#include <algorithm>
#include <utility>

namespace GraphPlotUI
{
namespace
{

TQL::VLogCategory& LogCategory()
{
    static TQL::VLogCategory& rCategory = TQL::Log::GetCategory("GraphPlot");
    return rCategory;
}

template <typename... Args>
void LogError(const TQL::LogText& i_rFormat, const Args&... i_rArgs)
{
    TQL::Log::Format(LogCategory(), TQL::ELogSeverity::Error, i_rFormat, i_rArgs...);
}

void SetParameter(TQL::IChannel& i_rChannel, const char* i_pName, const TQL::ParameterValue& i_rValue)
{
    const TQL::IResult result = i_rChannel.GetParameters()->SetParameter(i_pName, i_rValue);
    if (result.IsError())
        LogError("Failed to set cache channel parameter %1%: %2%", i_pName, result.Description());
}

/// Clears the flag of a running update on every way out.
class InProgressGuard
{
public:
    explicit InProgressGuard(std::atomic<std::uint64_t>& i_rFlag) : m_rFlag(i_rFlag) {}
    ~InProgressGuard() { m_rFlag.exchange(0); }
    InProgressGuard(const InProgressGuard&) = delete;
    InProgressGuard& operator=(const InProgressGuard&) = delete;

private:
    std::atomic<std::uint64_t>& m_rFlag;
};

} // namespace

/// What one tick works with and what it finds out.
struct VTraceDataUpdater::Tick
{
    bool bLive = false;
    TQL::FrameRange TimeRange{};
    TQL::FrameRange DefaultRange{};
    int SubplotWidth = 0;
    std::int64_t FramePeriod = 0;
    std::int64_t LatestTick = 0;
    TQL::TickRange Read{};
    TQL::TickRange Cached{};
    bool bTextChanged = false;
};

void VTraceDataUpdater::Update(bool i_bLive, const TQL::FrameRange& i_rTimeRange,
                               const TQL::FrameRange& i_rDefaultTimeRange, int i_SubplotWidth,
                               std::int64_t i_FramePeriod)
{
    if (i_SubplotWidth <= 0 || i_FramePeriod <= 0 || m_UpdateInProgress.exchange(1) != 0)
        return;
    const InProgressGuard guard(m_UpdateInProgress);

    std::int64_t latestFrame = m_pPlotTime->GetLatestFrameIndex();
    Tick tick{i_bLive, i_rTimeRange, i_rDefaultTimeRange, i_SubplotWidth, i_FramePeriod};
    tick.LatestTick = SaturatedFramesToTicks(static_cast<double>(latestFrame), i_FramePeriod);
    tick.Read = ReadRange(i_rTimeRange, i_rDefaultTimeRange, i_bLive ? latestFrame : 0, i_FramePeriod);
    tick.Cached = {tick.LatestTick, tick.LatestTick};

    bool bRangeChanged = false;
    {
        const std::lock_guard lock(m_Mutex);
        for (auto& [rId, rRecord] : m_Records)
            TryUpdateRecordLocked(rRecord, rId, tick);
        bRangeChanged = std::exchange(m_CachedRange, tick.Cached) != tick.Cached;
    }
    if (tick.bTextChanged)
        m_pTextProvider->NotifyTextChanged();
    if (bRangeChanged)
        m_pRangeChanged->Invoke(tick.Cached);
    if (i_bLive)
        latestFrame = std::max(latestFrame, -TQL::FloorDivide(-tick.Cached.Last, i_FramePeriod));
    m_pStorage->SetLatestFrame(latestFrame);
}

void VTraceDataUpdater::TryUpdateRecordLocked(CacheRecord& o_rRecord, const TQL::IChannelInstanceId& i_rId,
                                              Tick& o_rTick)
{
    try
    {
        UpdateRecordLocked(o_rRecord, i_rId, o_rTick);
        o_rRecord.bFailing = false;
    }
    catch (const std::exception& rException)
    {
        if (!std::exchange(o_rRecord.bFailing, true))
            LogError("Failed to update trace data of channel: %1% %2%: %3%", i_rId.DataContextName, i_rId.TypeName,
                     rException.what());
    }
}

void VTraceDataUpdater::UpdateRecordLocked(CacheRecord& o_rRecord, const TQL::IChannelInstanceId& i_rId, Tick& o_rTick)
{
    const auto pBlock = EnsureCacheLocked(o_rRecord, i_rId, o_rTick);
    if (!pBlock || pBlock->GetShape().SamplePeriod <= 0)
    {
        RemoveTraceLocked(o_rRecord, i_rId);
        return;
    }
    if (o_rRecord.pSourceView->IsStale() || m_pTextProvider->Update(o_rRecord.pSource).IsError())
        return;

    const ChannelSystem::ChannelBlockShape& rShape = pBlock->GetShape();
    TQL::TickRange available;
    pBlock->GetRange(available);
    const TQL::TickRange read{TQL::AlignDown(o_rTick.Read.First, rShape.SamplePeriod, available.First),
                              TQL::AlignUp(o_rTick.Read.Last, rShape.SamplePeriod, available.First)};
    const std::uint8_t level =
        RaiseLevelToFit(ChooseLevel(o_rTick.FramePeriod, rShape.SamplePeriod, o_rTick.TimeRange, o_rTick.SubplotWidth),
                        read, rShape.SamplePeriod, rShape.GridOffset);

    o_rRecord.bMayHaveTrace = true;
    m_pStorage->UpdateTrace(i_rId, *pBlock, read, read, level);
    m_pStorage->InspectTrace(i_rId, *pBlock, o_rTick.bLive ? o_rTick.LatestTick : 0, o_rRecord.WindowSamples);
    o_rTick.Cached.First = std::min(o_rTick.Cached.First, available.First);
    o_rTick.Cached.Last = std::max(o_rTick.Cached.Last, available.Last);
}

std::shared_ptr<ChannelSystem::IChannelBlock>
VTraceDataUpdater::EnsureCacheLocked(CacheRecord& o_rRecord, const TQL::IChannelInstanceId& i_rId, Tick& o_rTick)
{
    if (!o_rRecord.pSource)
        return nullptr;
    if (!o_rRecord.pSourceView || o_rRecord.pSourceView->IsStale())
        o_rRecord.pSourceView = o_rRecord.pSource->GetOutput();
    if (!o_rRecord.pSourceView || (!o_rRecord.pCache && !CreateCacheLocked(o_rRecord, i_rId)))
        return nullptr;

    if (!TQL::NearlyEqual(o_rRecord.CachedFrames, o_rTick.DefaultRange))
    {
        SetParameter(*o_rRecord.pCache, "CacheRangeTicks", CacheTicks(o_rTick.DefaultRange, o_rTick.FramePeriod));
        o_rRecord.CachedFrames = o_rTick.DefaultRange;
    }
    const bool bStale = o_rRecord.pCacheView && o_rRecord.pCacheView->IsStale();
    if (bStale)
    {
        RemoveTraceLocked(o_rRecord, i_rId);
        o_rTick.bTextChanged = true; // told when the lock is free
    }
    if (!o_rRecord.pCacheView || bStale)
        o_rRecord.pCacheView = o_rRecord.pCache->GetOutput();
    if (!o_rRecord.pCacheView)
        return nullptr;

    auto pBlock = o_rRecord.pCacheView->GetBlock();
    if (pBlock && pBlock->GetShape().SamplePeriod > 0)
        o_rRecord.WindowSamples =
            CacheTicks(o_rTick.DefaultRange, o_rTick.FramePeriod) / pBlock->GetShape().SamplePeriod;
    return pBlock;
}

bool VTraceDataUpdater::CreateCacheLocked(CacheRecord& o_rRecord, const TQL::IChannelInstanceId& i_rId)
{
    static const ChannelSystem::VDerivedChannelParameters asItStands;
    if (!o_rRecord.pSourceView->GetBlock())
        return false;
    auto pCache = m_pChannelService->CreateDerivedChannel("Cache", asItStands, {o_rRecord.pSource});
    if (!pCache)
    {
        LogError("Failed to create cache channel: %1% %2%", i_rId.DataContextName, i_rId.TypeName);
        return false;
    }
    SetParameter(*pCache, "SupportLodding", true);
    SetParameter(*pCache, "EnableRotationUnwrapping", m_bRotationUnwrapping);
    o_rRecord.pCache = std::move(pCache);
    o_rRecord.pCacheView = nullptr;
    o_rRecord.CachedFrames = {0.0, 0.0}; // a new cache has to be told its length
    return true;
}

void VTraceDataUpdater::RemoveTraceLocked(CacheRecord& o_rRecord, const TQL::IChannelInstanceId& i_rId)
{
    if (std::exchange(o_rRecord.bMayHaveTrace, false))
        m_pStorage->RemoveTrace(i_rId);
}

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

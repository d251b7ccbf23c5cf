#include "GraphPlotSystem/Traces/VTraceDataUpdater.h"

#include "ChannelSystem/IChannel.h"
#include "ChannelSystem/IChannelBlock.h"
#include "ChannelSystem/IChannelService.h"
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

} // namespace GraphPlotUI

#pragma once

#include "NotificationSystem/VMultiCallbackPostal.h"
#include "TQL/IChannelInstanceId.h"
#include "TQL/ITick.h"
#include "TQL/NearlyEqual.h"
#include "TQL/VShared.h"

#include <QtCore/QStringList>
#include <QtCore/QVariant>

#include <atomic>
#include <cstdint>
#include <map>
#include <memory>
#include <mutex>
#include <set>
#include <vector>

namespace ChannelSystem
{
class IChannelBlock;
class IChannelService;
} // namespace ChannelSystem

namespace TQL
{
class IChannel;
class IChannelComponentControls;
class IChannelOutput;
class IChannelTextProvider;
class ITraceDataStorage;
} // namespace TQL

namespace GraphPlotUI
{

class VBaseGraphPlotTime;

/// The pump between the host's channels and the trace storage. Keeps one cache channel of the host alive for each
/// plotted channel, as long as the default time range, and on each tick brings the storage's rings to the visible
/// range at the level of detail that the plot's width asks for. Owned by its trace manager.
/// Update runs on the update strand, everything else on the UI thread; one mutex serialises them and is held while the
/// storage is called, never the other way round. Nothing is allocated by an Update that finds everything in place.
class VTraceDataUpdater : public TQL::VShared
{
public:
    using RangeSignal = TQL::IMultiCallbackPostal<void(TQL::TickRange)>;
    using IdSet = std::set<TQL::IChannelInstanceId>;
    /// The cache channel's id and the names of its enabled components; what GetExportData wraps.
    using ExportMap = std::map<TQL::IChannelInstanceId, QStringList>;

    VTraceDataUpdater(std::shared_ptr<ChannelSystem::IChannelService> i_pChannelService,
                      std::shared_ptr<TQL::IChannelTextProvider> i_pTextProvider,
                      std::shared_ptr<TQL::IChannelComponentControls> i_pComponentControls,
                      std::shared_ptr<VBaseGraphPlotTime> i_pPlotTime,
                      std::shared_ptr<TQL::ITraceDataStorage> i_pStorage);
    ~VTraceDataUpdater() override;

    /// Forgets the channels that are not in i_rKeepIds and takes up those that are new. Another object under a known id
    /// starts afresh.
    void SetChannels(const std::vector<std::shared_ptr<TQL::IChannel>>& i_rChannels, const IdSet& i_rKeepIds);

    /// One tick. Ranges are in frames of i_FramePeriod ticks, in live relative to the latest frame; the width is in
    /// pixels. Does nothing for a width or period that is not positive, or while another Update is under way. A host
    /// object that throws costs its own channel this tick and a line in the log.
    void Update(bool i_bLive, const TQL::FrameRange& i_rTimeRange, const TQL::FrameRange& i_rDefaultTimeRange,
                int i_SubplotWidth, std::int64_t i_FramePeriod);

    /// Whether cache channels keep rotations continuous. A change makes every cache channel anew.
    void SetRotationUnwrapping(bool i_bEnabled);

    void Clear();
    /// Keeps a copy of the records, with their cache channels and so their history, over a Clear.
    void SaveRecords();
    void RestoreRecords();
    bool HasSavedRecords() const;

    QVariant GetExportData() const;

    /// Raised, with no lock held, with the ticks that the caches hold when they have changed; (0, 0) for nothing.
    std::shared_ptr<RangeSignal> RangeChanged() const { return m_pRangeChanged; }

private:
    struct CacheRecord
    {
        std::shared_ptr<TQL::IChannel> pSource;
        std::shared_ptr<TQL::IChannelOutput> pSourceView;
        std::shared_ptr<TQL::IChannel> pCache;
        std::shared_ptr<TQL::IChannelOutput> pCacheView;
        TQL::FrameRange CachedFrames{0.0, 0.0}; ///< what "CacheRangeTicks" was last set for
        std::int64_t WindowSamples = 1;
        bool bMayHaveTrace = true; ///< false spares the storage a search
        bool bFailing = false;     ///< the last tick threw, and the log has it
    };
    using Records = std::map<TQL::IChannelInstanceId, CacheRecord>;
    struct Tick;

    std::shared_ptr<ChannelSystem::IChannelBlock>
    EnsureCacheLocked(CacheRecord& o_rRecord, const TQL::IChannelInstanceId& i_rId, Tick& o_rTick);
    bool CreateCacheLocked(CacheRecord& o_rRecord, const TQL::IChannelInstanceId& i_rId);
    void UpdateRecordLocked(CacheRecord& o_rRecord, const TQL::IChannelInstanceId& i_rId, Tick& o_rTick);
    void TryUpdateRecordLocked(CacheRecord& o_rRecord, const TQL::IChannelInstanceId& i_rId, Tick& o_rTick);
    void RemoveTraceLocked(CacheRecord& o_rRecord, const TQL::IChannelInstanceId& i_rId);

    const std::shared_ptr<ChannelSystem::IChannelService> m_pChannelService;
    const std::shared_ptr<TQL::IChannelTextProvider> m_pTextProvider;
    const std::shared_ptr<TQL::IChannelComponentControls> m_pComponentControls;
    const std::shared_ptr<VBaseGraphPlotTime> m_pPlotTime;
    const std::shared_ptr<TQL::ITraceDataStorage> m_pStorage;
    std::atomic<std::uint64_t> m_UpdateInProgress{0};
    mutable std::mutex m_Mutex;
    Records m_Records;                 // guarded by m_Mutex
    Records m_SavedRecords;            // guarded by m_Mutex
    TQL::TickRange m_CachedRange;      // guarded by m_Mutex
    bool m_bRotationUnwrapping = true; // guarded by m_Mutex
    const std::shared_ptr<NotificationSystem::VMultiCallbackPostal<void(TQL::TickRange)>> m_pRangeChanged;
};

} // namespace GraphPlotUI

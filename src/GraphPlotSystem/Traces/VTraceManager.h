#pragma once

#include "GraphPlotSystem/Common/ESubplotLayoutModes.h"
#include "GraphPlotSystem/Common/IGraphPlotPreferences.h"
#include "GraphPlotSystem/Traces/TraceState.h"
#include "GraphPlotSystem/Traces/VTraceDataUpdater.h"
#include "NotificationSystem/IAsioPostalService.h"
#include "NotificationSystem/VSubscriptions.h"
#include "TQL/IResult.h"

#include <QtCore/QObject>
#include <QtCore/QPointF>
#include <QtCore/QVariant>

namespace ChannelSystem
{
class IChannelContext;
}

namespace TQL::IO
{
class VEnumListModel;
}

namespace GraphPlotUI
{

/// The time axis of one graph window and the driver of its trace pipeline: owns the update loop, the shown and the
/// default time range, the live presets and the link to the host's channel context. QML sees it as
/// "contextTraceManager". Made by MakeSharedObject, held by the window's graph plot system; UI thread, but for the tick
/// of the update loop, which runs every 20 ms on a strand of the host's workers and reads only a guarded snapshot.
/// Times are in frames of the context; in a live context frame 0 is the latest and the past is negative. A range has
/// its minimum in x and its maximum in y; one that is not finite or not ascending is ignored.
class VTraceManager : public QObject, public TQL::VShared
{
    Q_OBJECT
    Q_PROPERTY(bool haveTraceData READ HaveTraceData NOTIFY HaveTraceDataChanged)
    Q_PROPERTY(bool liveContext READ IsLiveContext NOTIFY LiveContextChanged)
    Q_PROPERTY(bool relativeTimeDisplay READ GetRelativeTimeDisplay WRITE SetRelativeTimeDisplay NOTIFY
                   RelativeTimeDisplayChanged)
    Q_PROPERTY(bool lockTimeRange READ GetLockTimeRange WRITE SetLockTimeRange NOTIFY LockTimeRangeChanged)
    Q_PROPERTY(bool fitTimeRange READ GetFitTimeRange WRITE SetFitTimeRange NOTIFY FitTimeRangeChanged)
    Q_PROPERTY(QPointF timeRange READ GetTimeRange WRITE SetTimeRange NOTIFY TimeRangeChanged)
    Q_PROPERTY(
        QPointF defaultTimeRange READ GetDefaultTimeRange WRITE SetDefaultTimeRange NOTIFY DefaultTimeRangeChanged)
    Q_PROPERTY(QObject* liveTimePresetsModel READ GetLiveTimePresetsModel CONSTANT)
    Q_PROPERTY(int liveTimePresetIndex READ GetLiveTimePresetIndex WRITE SetLiveTimePresetIndex NOTIFY
                   LiveTimePresetIndexChanged)
    Q_PROPERTY(int subplotWidth READ GetSubplotWidth WRITE SetSubplotWidth NOTIFY SubplotWidthChanged)
    Q_PROPERTY(double gapOpacity READ GetGapOpacity WRITE SetGapOpacity NOTIFY GapOpacityChanged)
    Q_PROPERTY(qlonglong contextFramePeriod READ GetContextFramePeriod NOTIFY ContextFramePeriodChanged)
    Q_PROPERTY(int displayUpdatePeriodMillis READ GetDisplayUpdatePeriodMillis WRITE SetDisplayUpdatePeriodMillis NOTIFY
                   DisplayUpdatePeriodMillisChanged)

public:
    VTraceManager(std::shared_ptr<TQL::IPostalService> i_pUiPostalService,
                  std::shared_ptr<TQL::IAsioPostalService> i_pWorkerPostalService,
                  std::shared_ptr<ChannelSystem::IChannelService> i_pChannelService,
                  std::shared_ptr<IGraphPlotPreferences> i_pPreferences,
                  std::shared_ptr<TQL::IChannelTextProvider> i_pTextProvider,
                  std::shared_ptr<TQL::IChannelComponentControls> i_pComponentControls,
                  std::shared_ptr<VBaseGraphPlotTime> i_pPlotTime, std::shared_ptr<TQL::ITraceDataStorage> i_pStorage,
                  bool i_bRelativeTimeDisplay, bool i_bForceDefaultRange);
    ~VTraceManager() override;

    /// The data context to follow. A name that no context bears yet stays pending until one appears; the present
    /// context stays meanwhile. The empty name stops the update loop.
    void SetContext(const std::string& i_rName);

    /// The channels that shall have traces.
    void SetChannels(const std::vector<std::shared_ptr<TQL::IChannel>>& i_rChannels);

    /// Takes all colours away when the mode changes, so that they are assigned anew in the way of that mode.
    void SetSubplotLayoutMode(ESubplotLayoutModes i_Mode);
    ESubplotLayoutModes GetSubplotLayoutMode() const { return m_SubplotLayoutMode; }

    void BuildState(TraceState& o_rState);
    void ApplyState(TQL::IResult& o_rResult, const TraceState& i_rState);

    /// Stops the update loop and forgets all channels.
    void Reset();

    std::shared_ptr<TQL::ITraceDataStorage> GetTraceDataStorage() const { return m_pStorage; }

    bool HaveTraceData() const { return m_bHaveTraceData; }
    bool IsLiveContext() const { return m_Inputs.bLive; }
    bool GetRelativeTimeDisplay() const { return m_bRelativeTimeDisplay; }
    void SetRelativeTimeDisplay(bool i_bRelative);
    bool GetLockTimeRange() const { return m_bLockTimeRange; }
    void SetLockTimeRange(bool i_bLock);
    bool GetFitTimeRange() const { return m_bFitTimeRange; }
    void SetFitTimeRange(bool i_bFit);
    QPointF GetTimeRange() const { return {m_Inputs.TimeRange.first, m_Inputs.TimeRange.second}; }
    void SetTimeRange(const QPointF& i_rRange);
    QPointF GetDefaultTimeRange() const { return {m_Inputs.DefaultTimeRange.first, m_Inputs.DefaultTimeRange.second}; }
    void SetDefaultTimeRange(const QPointF& i_rRange);
    QObject* GetLiveTimePresetsModel() const;
    int GetLiveTimePresetIndex() const { return m_LiveTimePresetIndex; }
    /// A negative index stands for the standard preset; one beyond the list is kept and has no effect on the range.
    void SetLiveTimePresetIndex(int i_Index);
    int GetSubplotWidth() const { return m_Inputs.SubplotWidth; }
    void SetSubplotWidth(int i_Width); ///< pixels
    double GetGapOpacity() const { return m_GapOpacity; }
    void SetGapOpacity(double i_Opacity);
    qlonglong GetContextFramePeriod() const { return m_Inputs.FramePeriod; } ///< ticks
    int GetDisplayUpdatePeriodMillis() const { return m_DisplayUpdatePeriodMillis; }
    void SetDisplayUpdatePeriodMillis(int i_Milliseconds);

Q_SIGNALS:
    void LiveTimePresetIndexChanged();
    void HaveTraceDataChanged();
    void LiveContextChanged();
    void RelativeTimeDisplayChanged();
    void LockTimeRangeChanged();
    void FitTimeRangeChanged();
    void TimeRangeChanged();
    void DefaultTimeRangeChanged();
    void SubplotWidthChanged();
    void GapOpacityChanged();
    void ContextFramePeriodChanged();
    void DisplayUpdatePeriodMillisChanged();

public:
    /// A VTraceDataUpdater::ExportMap.
    Q_INVOKABLE QVariant channelExportData();
    Q_INVOKABLE void forceUpdateXAxis();

protected:
    void OnPostCreation() override;

private:
    /// What a tick of the update loop needs. Written by the UI thread under the mutex, which therefore reads it
    /// without; the strand reads it under the mutex.
    struct UpdateInputs
    {
        bool bActive = false;
        bool bLive = true;
        TQL::FrameRange TimeRange{0.0, 0.0};
        TQL::FrameRange DefaultTimeRange{0.0, 0.0};
        int SubplotWidth = 1;
        std::int64_t FramePeriod = TQL::DefaultFramePeriod;
    };

    template <typename T>
    void SetInput(T UpdateInputs::*i_pMember, const T& i_rValue)
    {
        const std::lock_guard lock(m_Mutex);
        m_Inputs.*i_pMember = i_rValue;
    }
    UpdateInputs GetInputs() const;

    void SetTimeFrames(const TQL::FrameRange& i_rRange);
    void SetDefaultFrames(const TQL::FrameRange& i_rRange);
    void UpdateDefaultRangeFromPreset();
    /// The default range anew, for another kind of context or another frame period. A shown range that was the default
    /// one goes with it.
    void FollowPreset();
    void UseContext(const std::string& i_rName, std::shared_ptr<ChannelSystem::IChannelContext> i_pContext);
    void DropContext();
    void SetContextType(std::int32_t i_Type);
    void FollowRecordedRange();
    void OnRecordedRangeChanged();
    void OnContextListChanged();
    void SetActive(bool i_bActive);
    void SubscribePreference();
    void OnRotationUnwrappingPreference();
    void OnFramePeriodChanged();
    void OnCacheRangeChanged(TQL::TickRange i_Range);
    void FitTimeRangeTo(const TQL::TickRange& i_rRange);
    void UpdateTick();

    const std::shared_ptr<TQL::IPostalService> m_pUiPostalService;
    const std::shared_ptr<ChannelSystem::IChannelService> m_pChannelService;
    const std::shared_ptr<IGraphPlotPreferences> m_pPreferences;
    const std::shared_ptr<VBaseGraphPlotTime> m_pPlotTime;
    const std::shared_ptr<TQL::ITraceDataStorage> m_pStorage;
    const std::shared_ptr<VTraceDataUpdater> m_pUpdater;
    const std::shared_ptr<TQL::IPostalService> m_pUpdatePostalService;
    TQL::IO::VEnumListModel* const m_pLiveTimePresetsModel; ///< a child of this object

    mutable std::mutex m_Mutex;
    UpdateInputs m_Inputs; // written under m_Mutex

    int m_LiveTimePresetIndex = -1;
    bool m_bRelativeTimeDisplay;
    bool m_bHaveTraceData = false;
    bool m_bLockTimeRange = false;
    bool m_bFitTimeRange;
    const bool m_bForceDefaultRange;
    double m_GapOpacity = 0.5;
    int m_DisplayUpdatePeriodMillis = 20;
    ESubplotLayoutModes m_SubplotLayoutMode = ESubplotLayoutModes::SubplotPerTraceType;

    std::string m_ContextName;
    std::string m_PendingContextName;
    std::shared_ptr<ChannelSystem::IChannelContext> m_pContext;
    std::int32_t m_ContextType = 1; ///< ChannelSystem::EContextType
    std::int32_t m_ContextGeneration = 0;
    TQL::TickRange m_CachedTicks;

    NotificationSystem::VSubscriptions m_LifelongSubscriptions;
    NotificationSystem::VSubscriptions m_ContextSubscriptions; ///< of the context in use
    NotificationSystem::VSubscriptions m_ActiveSubscriptions;  ///< while the loop runs
    IGraphPlotPreferences::Token m_PreferenceToken = 0;        ///< 0 for none
};

} // namespace GraphPlotUI

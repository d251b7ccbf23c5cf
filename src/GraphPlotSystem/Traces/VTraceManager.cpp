#include "GraphPlotSystem/Traces/VTraceManager.h"

#include "ChannelSystem/IChannelContext.h"
#include "GraphPlotSystem/Time/VBaseGraphPlotTime.h"
#include "GraphPlotSystem/Traces/ITraceDataStorage.h"
#include "GraphPlotSystem/Traces/TraceTimeRules.h"
#include "IOInterfaceQt/VEnumListModel.h"
#include "NotificationSystem/VAsioPostalServiceStrand.h"
#include "NotificationSystem/VDelayedPostalService.h"
#include "NotificationSystem/VDispatchCollapsers.h"
#include "NotificationSystem/WeakCallback.h"

#include <limits>
#include <utility>

namespace GraphPlotUI
{
namespace
{

constexpr int UpdateDelayMilliseconds = 20;

TQL::FrameRange ToFrameRange(const QPointF& i_rRange)
{
    return {i_rRange.x(), i_rRange.y()};
}

TQL::IO::VEnumListModel* MakePresetsModel(QObject* i_pParent)
{
    std::vector<TQL::IO::VEnumListModel::Row> rows;
    for (const std::string_view preset : LiveTimePresets)
    {
        const auto text = QString::fromUtf8(preset.data(), static_cast<qsizetype>(preset.size()));
        rows.push_back({text, static_cast<int>(rows.size()), QString()});
    }
    return new TQL::IO::VEnumListModel(std::move(rows), i_pParent);
}

std::shared_ptr<TQL::IPostalService> MakeUpdateLoop(std::shared_ptr<TQL::IAsioPostalService> i_pWorkers)
{
    auto pStrand = NotificationSystem::MakeStrand(std::move(i_pWorkers));
    const auto pContext = pStrand->GetContext();
    return NotificationSystem::MakeDelayedCollapsed(std::move(pStrand), pContext, UpdateDelayMilliseconds);
}

} // namespace

VTraceManager::VTraceManager(std::shared_ptr<TQL::IPostalService> i_pUiPostalService,
                             std::shared_ptr<TQL::IAsioPostalService> i_pWorkerPostalService,
                             std::shared_ptr<ChannelSystem::IChannelService> i_pChannelService,
                             std::shared_ptr<IGraphPlotPreferences> i_pPreferences,
                             std::shared_ptr<TQL::IChannelTextProvider> i_pTextProvider,
                             std::shared_ptr<TQL::IChannelComponentControls> i_pComponentControls,
                             std::shared_ptr<VBaseGraphPlotTime> i_pPlotTime,
                             std::shared_ptr<TQL::ITraceDataStorage> i_pStorage, bool i_bRelativeTimeDisplay,
                             bool i_bForceDefaultRange)
    : m_pUiPostalService(std::move(i_pUiPostalService))
    , m_pChannelService(std::move(i_pChannelService))
    , m_pPreferences(std::move(i_pPreferences))
    , m_pPlotTime(std::move(i_pPlotTime))
    , m_pStorage(std::move(i_pStorage))
    , m_pUpdater(TQL::MakeShared<VTraceDataUpdater>(m_pChannelService, std::move(i_pTextProvider),
                                                    std::move(i_pComponentControls), m_pPlotTime, m_pStorage))
    , m_pUpdatePostalService(MakeUpdateLoop(std::move(i_pWorkerPostalService)))
    , m_pLiveTimePresetsModel(MakePresetsModel(this))
    , m_bRelativeTimeDisplay(i_bRelativeTimeDisplay)
    , m_bFitTimeRange(!i_bRelativeTimeDisplay)
    , m_bForceDefaultRange(i_bForceDefaultRange)
{
    SetLiveTimePresetIndex(StandardLiveTimePreset);
    SetTimeFrames(m_Inputs.DefaultTimeRange);
}

VTraceManager::~VTraceManager()
{
    if (m_PreferenceToken != 0)
        (void)m_pPreferences->RemoveCallback(IGraphPlotPreferences::EnableRotationUnwrapping, m_PreferenceToken);
}

QObject* VTraceManager::GetLiveTimePresetsModel() const
{
    return m_pLiveTimePresetsModel;
}

VTraceManager::UpdateInputs VTraceManager::GetInputs() const
{
    const std::lock_guard lock(m_Mutex);
    return m_Inputs;
}

void VTraceManager::SetTimeRange(const QPointF& i_rRange)
{
    SetTimeFrames(ToFrameRange(i_rRange));
}

void VTraceManager::SetDefaultTimeRange(const QPointF& i_rRange)
{
    SetDefaultFrames(ToFrameRange(i_rRange));
}

void VTraceManager::SetTimeFrames(const TQL::FrameRange& i_rRange)
{
    if (TQL::NearlyEqual(i_rRange, m_Inputs.TimeRange) || !IsUsableRange(i_rRange))
        return;
    SetInput(&UpdateInputs::TimeRange, i_rRange);
    Q_EMIT TimeRangeChanged();
    SetDisplayUpdatePeriodMillis(::GraphPlotUI::DisplayUpdatePeriodMillis(m_Inputs.TimeRange, m_Inputs.FramePeriod));
}

void VTraceManager::SetDefaultFrames(const TQL::FrameRange& i_rRange)
{
    if (TQL::NearlyEqual(i_rRange, m_Inputs.DefaultTimeRange) || !IsUsableRange(i_rRange))
        return;
    SetInput(&UpdateInputs::DefaultTimeRange, i_rRange);
    Q_EMIT DefaultTimeRangeChanged();
}

void VTraceManager::UpdateDefaultRangeFromPreset()
{
    if (!m_Inputs.bLive || m_LiveTimePresetIndex < 0 || m_LiveTimePresetIndex >= std::ssize(LiveTimePresets))
        return;
    const auto preset = LiveTimePresets[static_cast<std::size_t>(m_LiveTimePresetIndex)];
    const auto range = PresetRange(preset, m_Inputs.FramePeriod);
    if (!range)
        return;
    SetDefaultFrames(*range);
    if (m_bForceDefaultRange || (m_bFitTimeRange && !m_bLockTimeRange))
        SetTimeFrames(*range);
}

void VTraceManager::FollowPreset()
{
    const TQL::FrameRange oldDefault = m_Inputs.DefaultTimeRange;
    UpdateDefaultRangeFromPreset();
    // Who looked at the whole of a recording looks at the whole live window next; the recording's frames lie ahead of
    // the latest one, where nothing ever is. And who looks at ten seconds goes on doing so when frames turn out to be
    // longer or shorter: their number is another then.
    if (m_Inputs.bLive && TQL::NearlyEqual(m_Inputs.TimeRange, oldDefault))
        SetTimeFrames(m_Inputs.DefaultTimeRange);
}

void VTraceManager::SetLiveTimePresetIndex(int i_Index)
{
    if (i_Index == m_LiveTimePresetIndex)
        return;
    m_LiveTimePresetIndex = i_Index < 0 ? StandardLiveTimePreset : i_Index;
    Q_EMIT LiveTimePresetIndexChanged();
    UpdateDefaultRangeFromPreset();
}

void VTraceManager::SetRelativeTimeDisplay(bool i_bRelative)
{
    if (std::exchange(m_bRelativeTimeDisplay, i_bRelative) != i_bRelative)
        Q_EMIT RelativeTimeDisplayChanged();
}

void VTraceManager::SetLockTimeRange(bool i_bLock)
{
    if (std::exchange(m_bLockTimeRange, i_bLock) == i_bLock)
        return;
    Q_EMIT LockTimeRangeChanged();
    OnCacheRangeChanged(m_CachedTicks);
}

void VTraceManager::SetFitTimeRange(bool i_bFit)
{
    if (std::exchange(m_bFitTimeRange, i_bFit) == i_bFit)
        return;
    Q_EMIT FitTimeRangeChanged();
    OnCacheRangeChanged(m_CachedTicks);
}

void VTraceManager::SetSubplotWidth(int i_Width)
{
    if (m_Inputs.SubplotWidth == i_Width)
        return;
    SetInput(&UpdateInputs::SubplotWidth, i_Width);
    Q_EMIT SubplotWidthChanged();
}

void VTraceManager::SetGapOpacity(double i_Opacity)
{
    if (std::exchange(m_GapOpacity, i_Opacity) != i_Opacity)
        Q_EMIT GapOpacityChanged();
}

void VTraceManager::SetDisplayUpdatePeriodMillis(int i_Milliseconds)
{
    if (std::exchange(m_DisplayUpdatePeriodMillis, i_Milliseconds) != i_Milliseconds)
        Q_EMIT DisplayUpdatePeriodMillisChanged();
}

void VTraceManager::SetSubplotLayoutMode(ESubplotLayoutModes i_Mode)
{
    if (std::exchange(m_SubplotLayoutMode, i_Mode) != i_Mode)
        m_pStorage->ResetColours();
}

void VTraceManager::OnCacheRangeChanged(TQL::TickRange i_Range)
{
    const bool bHaveTraceData = m_pStorage->GetTraceCount() != 0;
    if (std::exchange(m_bHaveTraceData, bHaveTraceData) != bHaveTraceData)
        Q_EMIT HaveTraceDataChanged();
    m_CachedTicks = i_Range;
    if (!m_bLockTimeRange && m_bFitTimeRange && m_bHaveTraceData)
        FitTimeRangeTo(i_Range);
}

void VTraceManager::FitTimeRangeTo(const TQL::TickRange& i_rRange)
{
    if (m_Inputs.bLive)
        SetTimeFrames(FitLiveRange(i_rRange, m_Inputs.FramePeriod, m_Inputs.DefaultTimeRange));
    else if (const auto fit = m_pPlotTime->GetFitRange())
        SetTimeFrames({static_cast<double>(fit->First), static_cast<double>(fit->Last) + 2.0});
    else
        SetTimeFrames(m_Inputs.DefaultTimeRange);
}

void VTraceManager::UpdateTick()
{
    const UpdateInputs inputs = GetInputs();
    if (!inputs.bActive)
        return;
    m_pUpdater->Update(inputs.bLive, inputs.TimeRange, inputs.DefaultTimeRange, inputs.SubplotWidth,
                       inputs.FramePeriod);
    m_pUpdatePostalService->Post(NotificationSystem::MakeWeakCallback(WeakSelf(this), &VTraceManager::UpdateTick));
}

QVariant VTraceManager::channelExportData()
{
    return m_pUpdater->GetExportData();
}

void VTraceManager::forceUpdateXAxis()
{
    OnCacheRangeChanged(m_CachedTicks);
}

void VTraceManager::BuildState(TraceState& o_rState)
{
    const bool bKnown = m_LiveTimePresetIndex >= 0 && m_LiveTimePresetIndex < std::ssize(LiveTimePresets);
    o_rState.LiveTimePreset =
        LiveTimePresets[static_cast<std::size_t>(bKnown ? m_LiveTimePresetIndex : StandardLiveTimePreset)];
    o_rState.bRelativeTimeDisplay = m_bRelativeTimeDisplay;
    o_rState.bLockTimeRange = m_bLockTimeRange;
    o_rState.bFitTimeRange = m_bFitTimeRange;
    o_rState.TimeRange = m_Inputs.TimeRange;
    o_rState.GapOpacity = m_GapOpacity;
    if (m_Inputs.bLive)
        m_pUpdater->SaveRecords();
}

void VTraceManager::ApplyState(TQL::IResult& o_rResult, const TraceState& i_rState)
{
    // The channels that survive the load keep their history, also when nothing has saved it beforehand.
    if (m_Inputs.bLive && !m_pUpdater->HasSavedRecords())
        m_pUpdater->SaveRecords();
    m_pUpdater->Clear();
    if (m_ContextType != 0)
        SetLiveTimePresetIndex(PresetIndex(i_rState.LiveTimePreset));
    SetRelativeTimeDisplay(i_rState.bRelativeTimeDisplay);
    SetLockTimeRange(i_rState.bLockTimeRange);
    SetFitTimeRange(i_rState.bFitTimeRange);
    constexpr double extreme = std::numeric_limits<double>::max();
    const auto [minimum, maximum] = i_rState.TimeRange;
    const bool bSaved = minimum > -extreme && maximum < extreme && minimum < maximum;
    SetTimeFrames(bSaved ? i_rState.TimeRange : m_Inputs.DefaultTimeRange);
    SetGapOpacity(i_rState.GapOpacity);
    if (m_Inputs.bLive)
        m_pUpdater->RestoreRecords();
    o_rResult = TQL::Result::Ok;
}

void VTraceManager::Reset()
{
    SetActive(false);
    m_pUpdater->Clear();
}

} // namespace GraphPlotUI

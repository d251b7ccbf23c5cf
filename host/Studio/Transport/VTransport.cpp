#include "Studio/Transport/VTransport.h"

#include "Channels/Contexts/VRecordedContext.h"
#include "Channels/VChannelService.h"
#include "Recordings/Common/FrameNumbers.h"
#include "Services/Postal/VUiPostalService.h"
#include "Services/Time/TimeRules.h"
#include "Services/Time/VTimeController.h"
#include "Services/Time/VTimeSource.h"
#include "Studio/Session/ContextNames.h"
#include "Studio/Session/VStudioSession.h"
#include "Studio/Transport/TransportRules.h"

#include <algorithm>
#include <chrono>

namespace Studio
{

namespace
{

namespace ETimeMode = OrvanePluginInterface::ETimeMode;

constexpr std::chrono::milliseconds tellPeriod{40};

TQL::TickRange RangeOf(const TransportState& i_rState)
{
    return {Recordings::TickOfFrame(i_rState.First, i_rState.FramePeriod),
            Recordings::TickOfFrame(i_rState.Last + 1, i_rState.FramePeriod)};
}

} // namespace

VTransport::VTransport(VStudioSession& i_rSession, QObject* i_pParent)
    : QObject(i_pParent)
    , m_rSession(i_rSession)
    , m_pController(i_rSession.Host().TimeController())
    , m_Subscriptions(i_rSession.Host().Ledger())
    , m_SourceSubscription(i_rSession.Host().Ledger())
{
    m_Tell.setSingleShot(true);
    m_Tell.setInterval(tellPeriod);
    connect(&m_Tell, &QTimer::timeout, this, &VTransport::Changed);
    const auto& rpUi = m_rSession.Host().Ui();
    m_Subscriptions.Subscribe(
        m_pController->CurrentSourceChanged(), [this] { FollowCurrent(); }, rpUi);
    m_Subscriptions.Subscribe(
        m_pController->SourceListChanged(), [this] { FollowCurrent(); }, rpUi);
    m_Subscriptions.Subscribe(
        m_pController->PlayChanged(), [this] { Q_EMIT Changed(); }, rpUi);
    FollowCurrent();
}

VTransport::~VTransport() = default;

void VTransport::FollowCurrent()
{
    m_SourceSubscription.Drain();
    if (const auto pSource = m_pController->GetCurrentSource())
        m_SourceSubscription.Subscribe(
            pSource->StateChanged(), [this] { TellSoon(); }, m_rSession.Host().Ui());
    ReadEvents();
    Q_EMIT Changed();
}

void VTransport::ReadEvents()
{
    std::vector<EventRow> events;
    if (const auto pRecorded = std::dynamic_pointer_cast<Channels::VRecordedContext>(m_rSession.CurrentContext()))
        events = ListEvents(*pRecorded->GetRecording());
    if (events == m_Events)
        return;
    m_Events = std::move(events);
    m_EventFrames.clear();
    for (const EventRow& rEvent : m_Events)
        m_EventFrames.push_back(rEvent.Frame);
    Q_EMIT EventsChanged();
}

void VTransport::TellSoon()
{
    if (!m_Tell.isActive())
        m_Tell.start();
}

TransportState VTransport::State() const
{
    TransportState state;
    const auto pContext = m_rSession.CurrentContext();
    const auto pSource = m_pController->GetCurrentSource();
    state.bSource = pSource != nullptr;
    state.bLiveData = pContext && pContext->GetType() == ChannelSystem::EContextType::Live;
    state.bLive = pSource && pSource->GetMode() == ETimeMode::Live;
    state.bRunning = state.bLive ? !m_rSession.IsLivePaused() : m_pController->IsPlaying();
    state.bLooping = m_pController->IsLooping();
    state.Speed = m_pController->Rate();
    state.Marks = m_pController->Marks();
    OrvanePluginInterface::TimeState time;
    state.bRange = pSource && pSource->GetTimeState(time) && time.FramePeriodTicks > 0;
    if (!state.bRange)
        return state;
    state.FramePeriod = time.FramePeriodTicks;
    state.First = Recordings::FrameAt(time.FirstTick, state.FramePeriod);
    state.Last = state.First + std::max<std::int64_t>(1, time.LengthTicks / state.FramePeriod) - 1;
    state.Frame = Recordings::FrameAt(time.CurrentTick, state.FramePeriod);
    state.Tick = time.CurrentTick;
    return state;
}

void VTransport::TogglePlay()
{
    if (State().bLive)
        m_rSession.SetLivePaused(!m_rSession.IsLivePaused());
    else if (m_pController->IsPlaying())
        m_pController->Pause();
    else
        m_pController->Play(m_pController->Rate());
    Q_EMIT Changed();
}

void VTransport::SetSpeed(double i_Speed)
{
    m_pController->SetRate(i_Speed);
}

void VTransport::ChangeSpeed(int i_Direction)
{
    SetSpeed(NextSpeed(m_pController->Rate(), i_Direction));
}

void VTransport::SeekToFrame(std::int64_t i_Frame)
{
    const TransportState state = State();
    if (state.bRange && !state.bLive)
        m_pController->SeekTo(Recordings::TickOfFrame(i_Frame, state.FramePeriod));
}

void VTransport::StepBy(std::int64_t i_Frames)
{
    const TransportState state = State();
    SeekToFrame(StepFrame(state.Frame, i_Frames, state.First, state.Last));
}

void VTransport::GoToStart()
{
    SeekToFrame(State().First);
}

void VTransport::GoToEnd()
{
    SeekToFrame(State().Last);
}

void VTransport::GoToEvent(int i_Direction)
{
    const std::int64_t frame = State().Frame;
    const auto found =
        i_Direction > 0 ? NextEventFrame(m_EventFrames, frame) : PreviousEventFrame(m_EventFrames, frame);
    if (found)
        SeekToFrame(*found);
}

void VTransport::SetLooping(bool i_bLooping)
{
    m_pController->SetLooping(i_bLooping);
}

void VTransport::MarkLoopStart()
{
    const TransportState state = State();
    if (!state.bRange || state.bLive)
        return;
    const TQL::TickRange range = RangeOf(state);
    m_pController->SetMarks(Services::MoveFirstMark(state.Marks, state.Tick, range, state.FramePeriod));
    SetLooping(true);
}

void VTransport::MarkLoopEnd()
{
    const TransportState state = State();
    if (!state.bRange || state.bLive)
        return;
    const TQL::TickRange range = RangeOf(state);
    m_pController->SetMarks(Services::MoveLastMark(state.Marks, state.Tick, range, state.FramePeriod));
    SetLooping(true);
}

void VTransport::ClearMarks()
{
    m_pController->SetMarks({});
}

bool VTransport::HasCapture() const
{
    return m_rSession.Channels().FindContext(LiveContextName) != nullptr;
}

void VTransport::SetLive(bool i_bLive)
{
    if (i_bLive && !State().bLiveData)
        m_rSession.ShowContext(LiveContextName);
    if (State().bLiveData)
        if (const auto pSource = m_pController->FindSource(m_rSession.CurrentContextName()))
            pSource->SetMode(i_bLive ? ETimeMode::Live : ETimeMode::Review);
    Q_EMIT Changed();
}

} // namespace Studio

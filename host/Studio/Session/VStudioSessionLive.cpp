#include "Channels/Contexts/VLiveContext.h"
#include "Channels/Contexts/VLiveMonitors.h"
#include "Channels/Contexts/VRecordedContext.h"
#include "Channels/VChannelService.h"
#include "OrvanePluginInterface/ITimeController.h"
#include "Services/Postal/VUiPostalService.h"
#include "Streaming/VReplayFeed.h"
#include "Studio/Session/ContextNames.h"
#include "Studio/Session/VLiveCapture.h"
#include "Studio/Session/VOscCapture.h"
#include "Studio/Session/VSimulatedFeed.h"
#include "Studio/Session/VStudioSession.h"
#include "TQL/Log.h"

#include <algorithm>

// The live inputs of the session: simulated, over Open Sound Control, replayed.
namespace Studio
{

namespace
{

constexpr double slowestReplay = 0.01;
constexpr double fastestReplay = 100.0;

template <typename TText>
void Log(TQL::ELogSeverity i_Severity, const TQL::LogText& i_rFormat, const TText& i_rText)
{
    TQL::Log::Format(TQL::Log::GetCategory("Studio"), i_Severity, i_rFormat, i_rText);
}

std::shared_ptr<const Recordings::VRecording> RecordingOf(const Channels::VChannelService& i_rChannels,
                                                          const std::string& i_rContextName)
{
    const auto pContext =
        std::dynamic_pointer_cast<Channels::VRecordedContext>(i_rChannels.FindContext(i_rContextName));
    return pContext ? pContext->GetRecording() : nullptr;
}

double RateOf(const Channels::VLiveContext& i_rContext)
{
    return static_cast<double>(TQL::DefaultTickRate) / static_cast<double>(i_rContext.GetFramePeriod());
}

} // namespace

/// Shows a live input in place of another, and its monitors.
void VStudioSession::AddLive(const std::shared_ptr<Channels::VLiveContext>& i_rpContext, double i_FramesPerSecond)
{
    const auto pMonitors =
        std::make_shared<Channels::VLiveMonitors>(*i_rpContext, m_pChannels->GetSubTypes(), i_FramesPerSecond);
    m_pChannels->SetGlobalChannels(pMonitors->GetContext());
    i_rpContext->SetMeter(pMonitors);
    AddContext(i_rpContext, OrvanePluginInterface::ETimeMode::Live);
}

void VStudioSession::StartLive(std::uint32_t i_Subjects, std::int64_t i_HistoryFrames)
{
    StopLive();
    m_LastInput = {ELiveInput::Simulation, m_LastInput.Number + 1};
    const auto pContext = std::make_shared<Channels::VLiveContext>(LiveContextName, m_pChannels->GetSubTypes(),
                                                                   Channels::VLiveContext::Options());
    Simulation::VWalkSimulator::Options options;
    options.Subjects = i_Subjects;
    const auto pFeed = std::make_shared<VSimulatedFeed>(options, pContext);
    if (i_HistoryFrames > 0)
        if (const TQL::IResult result = pFeed->Produce(0, i_HistoryFrames); result.IsError())
            Log(TQL::ELogSeverity::Error, "The live capture has no history: %1%", result.Description());
    AddLive(pContext, Simulation::VWalkSimulator::FrameRate);
    m_pCapture = std::make_unique<VLiveCapture>([pFeed](std::int64_t i_First, std::int64_t i_Count)
                                                { return pFeed->Produce(i_First, i_Count); },
                                                Simulation::VWalkSimulator::FrameRate, i_HistoryFrames);
}

TQL::IResult VStudioSession::StartOsc(const Streaming::VOscInput::Options& i_rOptions, std::string& o_rError)
{
    const auto show = [this](const std::shared_ptr<Channels::VLiveContext>& i_rpContext)
    {
        if (m_pChannels->FindContext(LiveContextName) == i_rpContext)
            m_pChannels->AddContext(i_rpContext); // tells that it has other channels now
        else
        {
            AddLive(i_rpContext, RateOf(*i_rpContext));
            m_pCaptured = i_rpContext;
            m_SavedUntil = i_rpContext->GetTickRange().First;
        }
    };
    const auto warn = [this](const std::string& i_rText)
    {
        if (m_LiveWarning)
            m_LiveWarning(i_rText);
    };
    m_pOsc.reset(); // it may listen at the same port
    auto pOsc = std::make_unique<VOscCapture>(i_rOptions, m_pChannels->GetSubTypes(), m_pHost->Ui(), show, warn);
    if (const TQL::IResult result = pOsc->Start(o_rError); result.IsError())
        return result;
    StopLive();
    // Something to show until the messages come.
    const auto pEmpty = std::make_shared<Channels::VLiveContext>(LiveContextName, m_pChannels->GetSubTypes(),
                                                                 Channels::VLiveContext::Options());
    AddLive(pEmpty, RateOf(*pEmpty));
    m_pOsc = std::move(pOsc);
    m_LastInput = {ELiveInput::Osc, m_LastInput.Number + 1, false, false, i_rOptions.Receiver.Address, OscPort()};
    return TQL::Result::Ok;
}

std::uint16_t VStudioSession::OscPort() const
{
    return m_pOsc ? m_pOsc->Port() : std::uint16_t{0};
}

bool VStudioSession::CanReplay(const std::string& i_rContextName) const
{
    return RecordingOf(*m_pChannels, i_rContextName) != nullptr;
}

TQL::IResult VStudioSession::StartReplay(const std::string& i_rContextName, double i_Speed, bool i_bLoop,
                                         std::string& o_rError)
{
    const auto pRecording = RecordingOf(*m_pChannels, i_rContextName);
    if (!pRecording || pRecording->FramePeriod <= 0 || pRecording->Range.IsEmpty())
    {
        o_rError = "\"" + i_rContextName + "\" is no recording with frames; show one that has";
        return TQL::Result::InvalidArgument;
    }
    if (!(i_Speed >= slowestReplay && i_Speed <= fastestReplay))
    {
        o_rError = "a replay can be from 0.01 to 100 times as fast as the recording";
        return TQL::Result::InvalidArgument;
    }
    StopLive();
    const auto pContext = std::make_shared<Channels::VLiveContext>(LiveContextName, m_pChannels->GetSubTypes(),
                                                                   Streaming::VReplayFeed::ContextOptions(*pRecording));
    const auto pFeed =
        std::make_shared<Streaming::VReplayFeed>(pRecording, pContext, Streaming::VReplayFeed::Options{i_bLoop});
    for (const std::string& rWarning : pFeed->Warnings())
        Log(TQL::ELogSeverity::Warning, "%1%", rWarning);
    AddLive(pContext, pFeed->FramesPerSecond() * i_Speed);
    m_LastInput = {ELiveInput::Replay, m_LastInput.Number + 1};
    m_pCapture = std::make_unique<VLiveCapture>([pFeed](std::int64_t i_First, std::int64_t i_Count)
                                                { return pFeed->Produce(i_First, i_Count); },
                                                pFeed->FramesPerSecond() * i_Speed, pFeed->FirstFrame());
    return TQL::Result::Ok;
}

bool VStudioSession::IsLive() const
{
    return m_pOsc || (m_pCapture && !m_pCapture->HasEnded());
}

LiveInput VStudioSession::GetLiveInput() const
{
    LiveInput input = m_LastInput;
    input.bRunning = IsLive();
    input.bPaused = IsLivePaused();
    if (m_pOsc)
        input.Messages = m_pOsc->MessageCount();
    return input;
}

bool VStudioSession::HasUnsavedLive() const
{
    const auto pCaptured = m_pCaptured.lock();
    return pCaptured && pCaptured == m_pChannels->FindContext(LiveContextName) &&
           !pCaptured->GetTickRange().IsEmpty() && pCaptured->GetTickRange().Last > m_SavedUntil;
}

void VStudioSession::NoteSaved(const std::shared_ptr<const Channels::VChannelContext>& i_rpContext,
                               std::int64_t i_EndTick)
{
    if (i_rpContext && i_rpContext == m_pCaptured.lock())
        m_SavedUntil = std::max(m_SavedUntil, i_EndTick);
}

void VStudioSession::StopLive()
{
    m_LastInput = GetLiveInput();
    m_pCapture.reset();
    m_pOsc.reset();
}

void VStudioSession::SetLivePaused(bool i_bPaused)
{
    if (m_pCapture)
        m_pCapture->SetPaused(i_bPaused);
    if (m_pOsc)
        m_pOsc->SetPaused(i_bPaused);
}

bool VStudioSession::IsLivePaused() const
{
    return (m_pCapture && m_pCapture->IsPaused()) || (m_pOsc && m_pOsc->IsPaused());
}

} // namespace Studio

#include "Studio/Commands/CommandLive.h"

#include "Channels/Common/VSubTypeTable.h"
#include "Channels/Contexts/VLiveContext.h"
#include "Streaming/SaveLive.h"
#include "Streaming/VOscInput.h"
#include "Studio/Commands/CommandLine.h"
#include "Studio/Commands/Commands.h"
#include "Studio/Common/Paths.h"
#include "Studio/Session/ContextNames.h"
#include "Studio/Session/VStudioSession.h"

#include <atomic>
#include <chrono>
#include <csignal>
#include <cstdio>
#include <memory>
#include <thread>
#include <vector>

namespace Studio
{

namespace
{

std::atomic<bool> s_bInterrupted{false};
static_assert(std::atomic<bool>::is_always_lock_free, "the handler of a signal may not wait");

/// While it lives an interrupt from the keyboard only ends the recording.
class InterruptGuard
{
public:
    InterruptGuard() : m_pBefore(std::signal(SIGINT, [](int) { s_bInterrupted = true; })) {}
    ~InterruptGuard() { std::signal(SIGINT, m_pBefore); }
    InterruptGuard(const InterruptGuard&) = delete;
    InterruptGuard& operator=(const InterruptGuard&) = delete;

private:
    void (*m_pBefore)(int);
};

std::string ListeningText(const std::string& i_rAddress, std::uint16_t i_Port)
{
    return "Listening for OSC messages at " + i_rAddress + ", port " + std::to_string(i_Port);
}

Streaming::VOscInput::Options OscOptions(const CommandLine& i_rCommandLine)
{
    Streaming::VOscInput::Options options;
    options.Receiver.Address = i_rCommandLine.OscAddress;
    options.Receiver.Port = i_rCommandLine.OscPort;
    options.Rate = i_rCommandLine.OscRate;
    return options;
}

void Print(const std::string& i_rText)
{
    std::fprintf(stderr, "graphplots-studio: %s\n", i_rText.c_str());
}

/// Listens for the time that the command line says. The context is null when no message came.
bool Listen(const CommandLine& i_rCommandLine, std::shared_ptr<Channels::VLiveContext>& o_rpContext,
            std::uint64_t& o_rMessages, std::string& o_rError)
{
    using Clock = std::chrono::steady_clock;
    Streaming::VOscInput::Callbacks callbacks;
    callbacks.MakeContext = [&](double, std::int64_t i_FramePeriod)
    {
        Channels::VLiveContext::Options options;
        options.FramePeriod = i_FramePeriod;
        options.HistoryTicks = static_cast<std::int64_t>((i_rCommandLine.Seconds + 10.0) * TQL::DefaultTickRate);
        o_rpContext = std::make_shared<Channels::VLiveContext>(LiveContextName,
                                                               std::make_shared<Channels::VSubTypeTable>(), options);
        return o_rpContext;
    };
    callbacks.Note = Print;
    callbacks.Trouble = Print;
    Streaming::VOscInput input(OscOptions(i_rCommandLine), callbacks);
    const InterruptGuard guard;
    if (input.Start(o_rError).IsError())
        return false;
    Print(ListeningText(i_rCommandLine.OscAddress, input.Port()));
    const auto end = Clock::now() +
                     std::chrono::duration_cast<Clock::duration>(std::chrono::duration<double>(i_rCommandLine.Seconds));
    while (!s_bInterrupted && Clock::now() < end)
        std::this_thread::sleep_until(std::min(end, Clock::now() + std::chrono::milliseconds(50)));
    o_rMessages = input.MessageCount();
    return true;
}

} // namespace

int RunRecord(const CommandLine& i_rCommandLine, std::string& o_rError)
{
    std::shared_ptr<Channels::VLiveContext> pContext;
    std::uint64_t messages = 0;
    if (!Listen(i_rCommandLine, pContext, messages, o_rError))
        return StatusFailed;
    if (messages == 0 || !pContext)
    {
        o_rError = "no message came that could be recorded; send numbers to port " +
                   std::to_string(i_rCommandLine.OscPort) + " of " + i_rCommandLine.OscAddress;
        return StatusFailed;
    }
    std::vector<std::string> remarks;
    if (Streaming::SaveAsC3d(*pContext, PathFromText(i_rCommandLine.Files.front()), remarks, o_rError).IsError())
        return StatusFailed;
    for (const std::string& rRemark : remarks)
        Print(rRemark);
    const auto frames = (pContext->GetTickRange().Last - pContext->GetTickRange().First) / pContext->GetFramePeriod();
    std::printf("%s: %llu messages, %zu channels, %lld frames\n", i_rCommandLine.Files.front().c_str(),
                static_cast<unsigned long long>(messages), pContext->GetChannels()->size(),
                static_cast<long long>(frames));
    return StatusOk;
}

bool StartListening(VStudioSession& o_rSession, const CommandLine& i_rCommandLine, std::string& o_rMessage,
                    std::string& o_rError)
{
    if (o_rSession.StartOsc(OscOptions(i_rCommandLine), o_rError).IsError())
        return false;
    o_rMessage = ListeningText(i_rCommandLine.OscAddress, o_rSession.OscPort());
    o_rSession.ShowContext(LiveContextName);
    return true;
}

} // namespace Studio

#include "Studio/Commands/CommandLive.h"

#include "Channels/Common/VSubTypeTable.h"
#include "Channels/Contexts/VLiveContext.h"
#include "Streaming/SaveLive.h"
#include "Streaming/VC3dRecorder.h"
#include "Streaming/VOscInput.h"
#include "Studio/Commands/CommandLine.h"
#include "Studio/Commands/Commands.h"
#include "Studio/Common/OutputTarget.h"
#include "Studio/Common/Paths.h"
#include "Studio/Session/ContextNames.h"
#include "Studio/Session/VStudioSession.h"

#include <atomic>
#include <chrono>
#include <csignal>
#include <cstdio>
#include <iterator>
#include <memory>
#include <thread>
#include <vector>

namespace Studio
{

namespace
{

std::atomic<bool> s_bInterrupted{false};
static_assert(std::atomic<bool>::is_always_lock_free, "the handler of a signal may not wait");

#ifdef SIGHUP
constexpr int EndingSignals[] = {SIGINT, SIGTERM, SIGHUP};
#else
constexpr int EndingSignals[] = {SIGINT, SIGTERM};
#endif

/// While it lives the signals that ask a program to end only end the recording. Those that were ignored before (a
/// terminal that may go) still are.
class InterruptGuard
{
public:
    InterruptGuard()
    {
        for (std::size_t i = 0; i < std::size(EndingSignals); ++i)
        {
            m_Before[i] = std::signal(EndingSignals[i], [](int) { s_bInterrupted = true; });
            if (m_Before[i] == SIG_IGN)
                std::signal(EndingSignals[i], SIG_IGN);
        }
    }
    ~InterruptGuard()
    {
        for (std::size_t i = 0; i < std::size(EndingSignals); ++i)
            std::signal(EndingSignals[i], m_Before[i]);
    }
    InterruptGuard(const InterruptGuard&) = delete;
    InterruptGuard& operator=(const InterruptGuard&) = delete;

private:
    void (*m_Before[std::size(EndingSignals)])(int) = {};
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

Streaming::LocalTime Now()
{
    return std::chrono::duration_cast<Streaming::LocalTime>(std::chrono::steady_clock::now().time_since_epoch());
}

/// What comes in is written by the recorder, which lags behind by two seconds; the context holds that several times.
constexpr std::int64_t HistoryTicks = 10 * TQL::DefaultTickRate;

/// Listens for the time that the command line says, or until the disk is full: then o_rStopped is a sentence.
bool Listen(const CommandLine& i_rCommandLine, Streaming::VC3dRecorder& io_rRecorder, std::uint64_t& o_rMessages,
            std::string& o_rStopped, std::string& o_rError)
{
    Streaming::VOscInput::Callbacks callbacks;
    callbacks.MakeContext = [&](double i_Rate, std::int64_t i_FramePeriod)
    {
        Channels::VLiveContext::Options options;
        options.FramePeriod = i_FramePeriod;
        options.HistoryTicks = HistoryTicks;
        auto pContext = std::make_shared<Channels::VLiveContext>(LiveContextName,
                                                                 std::make_shared<Channels::VSubTypeTable>(), options);
        io_rRecorder.SetContext(pContext, i_Rate);
        return pContext;
    };
    callbacks.Note = Print;
    callbacks.Trouble = Print;
    Streaming::VOscInput input(OscOptions(i_rCommandLine), callbacks);
    if (input.Start(o_rError).IsError())
        return false;
    Print(ListeningText(i_rCommandLine.OscAddress, input.Port()));
    const auto end =
        Now() + std::chrono::duration_cast<Streaming::LocalTime>(std::chrono::duration<double>(i_rCommandLine.Seconds));
    while (!s_bInterrupted && o_rStopped.empty() && Now() < end)
    {
        std::this_thread::sleep_for(std::min<Streaming::LocalTime>(end - Now(), std::chrono::milliseconds(50)));
        (void)io_rRecorder.Work(Now(), o_rStopped); // that it failed is told when the rest is saved
    }
    o_rMessages = input.MessageCount();
    return true;
}

} // namespace

int RunRecord(const CommandLine& i_rCommandLine, std::string& o_rError)
{
    const std::string& rPath = i_rCommandLine.Files.front();
    if (!MayWrite(PathFromText(rPath), {}, i_rCommandLine.bForce, o_rError))
        return StatusFailed;
    Streaming::VC3dRecorder recorder(PathFromText(rPath));
    if (recorder.Open(o_rError).IsError())
        return StatusFailed;
    const InterruptGuard guard; // until the file is in its place
    std::uint64_t messages = 0;
    std::string stopped;
    if (!Listen(i_rCommandLine, recorder, messages, stopped, o_rError))
        return StatusFailed;
    if (messages == 0)
    {
        o_rError = "no message came that could be recorded; send numbers to port " +
                   std::to_string(i_rCommandLine.OscPort) + " of " + i_rCommandLine.OscAddress;
        return StatusFailed;
    }
    std::vector<std::string> remarks;
    if (recorder.Finish(remarks, stopped, o_rError).IsError())
        return StatusFailed;
    for (const std::string& rRemark : remarks)
        Print(rRemark);
    std::printf("%s: %llu messages, %zu channels, %lld frames\n", rPath.c_str(),
                static_cast<unsigned long long>(messages), recorder.ChannelCount(),
                static_cast<long long>(recorder.FrameCount()));
    if (stopped.empty())
        return StatusOk;
    char seconds[32];
    std::snprintf(seconds, sizeof(seconds), "%.3f", recorder.Seconds());
    o_rError = stopped + " The first " + seconds + " s are saved.";
    return StatusFailed;
}

bool StartListening(VStudioSession& o_rSession, const CommandLine& i_rCommandLine, std::string& o_rError)
{
    if (o_rSession.StartOsc(OscOptions(i_rCommandLine), o_rError).IsError())
        return false;
    o_rSession.ShowContext(LiveContextName);
    return true;
}

} // namespace Studio

#include "Bench.h"

#include "Channels/Common/VSubTypeTable.h"
#include "Channels/Contexts/VLiveContext.h"
#include "Streaming/VOscInput.h"

#include <atomic>
#include <chrono>
#include <cstdio>
#include <cstdlib>
#include <fstream>
#include <stdexcept>
#include <string>
#include <thread>

#include <lo/lo.h>
#include <sys/resource.h>
#include <sys/wait.h>
#include <unistd.h>

// Open Sound Control from another process, through the loopback, into a live context.
namespace Bench
{

void RunOsc(Table& o_rTable);

namespace
{

constexpr int Channels300 = 300;
constexpr int MessagesASecond = 10'000;
constexpr double UsualSeconds = 5.0;      // GRAPHPLOTS_OSC_SECONDS says otherwise
constexpr double SettleShare = 1.0 / 3.0; // of the run; memory must not grow behind it: 10 of 30 s

/// The sender, in a process of its own: one message after the other, each when it is due, as the library sends them.
[[noreturn]] void SendAll(std::uint16_t i_Port, std::int64_t i_Messages)
{
    const lo_address target = lo_address_new_with_proto(LO_UDP, "127.0.0.1", std::to_string(i_Port).c_str());
    const auto start = std::chrono::steady_clock::now();
    for (std::int64_t i = 0; i < i_Messages; ++i)
    {
        const auto due = start + std::chrono::nanoseconds(i * (1'000'000'000 / MessagesASecond));
        if (due > std::chrono::steady_clock::now())
            std::this_thread::sleep_until(due);
        char path[32];
        std::snprintf(path, sizeof(path), "/bench/%d", static_cast<int>(i % Channels300));
        if (lo_send(target, path, "f", static_cast<double>(i)) < 0)
            _exit(1);
    }
    _exit(0);
}

double CpuSeconds()
{
    rusage usage{};
    ::getrusage(RUSAGE_SELF, &usage);
    const auto seconds = [](const timeval& i_rTime)
    {
        return static_cast<double>(i_rTime.tv_sec) + static_cast<double>(i_rTime.tv_usec) * 1e-6;
    };
    return seconds(usage.ru_utime) + seconds(usage.ru_stime);
}

double ResidentMegabytes()
{
    std::ifstream file("/proc/self/statm");
    double all = 0.0;
    double resident = 0.0;
    file >> all >> resident;
    return resident * static_cast<double>(::sysconf(_SC_PAGESIZE)) / 1048576.0;
}

double WantedSeconds()
{
    const char* pText = std::getenv("GRAPHPLOTS_OSC_SECONDS");
    const double seconds = pText ? std::atof(pText) : 0.0;
    return seconds > 0.0 ? seconds : UsualSeconds;
}

/// What one run showed.
struct OscRun
{
    double Seconds = 0.0;
    double Sent = 0.0;
    double Received = 0.0; ///< became samples
    double Kept = 0.0;     ///< got a frame of their own in the context
    double CpuShare = 0.0; ///< of one core
    double Settled = 0.0;  ///< resident megabytes after the first third
    double AtEnd = 0.0;
};

OscRun RunOnce(double i_Seconds)
{
    Streaming::VOscInput::Options options;
    options.Rate = static_cast<double>(MessagesASecond) / Channels300;
    Streaming::VOscInput::Callbacks callbacks;
    callbacks.MakeContext = [&](double, std::int64_t i_FramePeriod)
    {
        Channels::VLiveContext::Options contextOptions;
        contextOptions.FramePeriod = i_FramePeriod;
        // Full after the first third: what is kept does not grow behind it.
        contextOptions.HistoryTicks = static_cast<std::int64_t>(i_Seconds * SettleShare * TQL::DefaultTickRate);
        return std::make_shared<Channels::VLiveContext>("Live", std::make_shared<Channels::VSubTypeTable>(),
                                                        contextOptions);
    };
    callbacks.Trouble = [](const std::string& i_rText)
    {
        std::printf("    %s\n", i_rText.c_str());
    };
    auto pInput = std::make_unique<Streaming::VOscInput>(options, callbacks);
    std::string error;
    if (pInput->Start(error).IsError())
        throw std::runtime_error(error);

    OscRun run;
    const auto messages = static_cast<std::int64_t>(i_Seconds * MessagesASecond);
    const auto start = std::chrono::steady_clock::now();
    const double cpu = CpuSeconds();
    const ::pid_t sender = ::fork();
    if (sender == 0)
        SendAll(pInput->Port(), messages);
    std::this_thread::sleep_for(std::chrono::duration<double>(i_Seconds * SettleShare));
    run.Settled = ResidentMegabytes();
    int status = 1;
    ::waitpid(sender, &status, 0);
    run.Seconds = std::chrono::duration<double>(std::chrono::steady_clock::now() - start).count();
    run.CpuShare = (CpuSeconds() - cpu) / run.Seconds;
    run.AtEnd = ResidentMegabytes();
    if (status != 0)
        throw std::runtime_error("the sender could not send");
    const auto deadline = std::chrono::steady_clock::now() + std::chrono::seconds(2);
    while (pInput->MessageCount() < static_cast<std::uint64_t>(messages) && std::chrono::steady_clock::now() < deadline)
        std::this_thread::sleep_for(std::chrono::milliseconds(5));
    run.Sent = static_cast<double>(messages);
    run.Received = static_cast<double>(pInput->MessageCount());
    const auto lost = pInput->Troubles().Count(Streaming::EOscTrouble::SharedFrame) +
                      pInput->Troubles().Count(Streaming::EOscTrouble::TooLate);
    run.Kept = run.Received - static_cast<double>(lost);
    return run;
}

} // namespace

void RunOsc(Table& o_rTable)
{
    const OscRun run = RunOnce(WantedSeconds());
    char name[96];
    std::snprintf(name, sizeof(name), "OSC, 300 channels, %.3g s: messages received / sent", run.Seconds);
    o_rTable.push_back(
        {name, run.Received, "", "messages sent", run.Sent, run.Received / run.Sent, EGoal::AtLeast, 1.0});
    o_rTable.push_back({"OSC: samples that stand in a frame of their own / sent", run.Kept, "", "messages sent",
                        run.Sent, run.Kept / run.Sent, EGoal::Report, 0.0});
    o_rTable.push_back({"OSC: CPU of the receiving process, share of one core", run.CpuShare * run.Seconds, "s",
                        "time of the run", run.Seconds, run.CpuShare, EGoal::Report, 0.0});
    o_rTable.push_back({"OSC: memory at the end / after the first third", run.AtEnd, "MB", "after the first third",
                        run.Settled, run.AtEnd / run.Settled, EGoal::Report, 0.0});
}

} // namespace Bench

#include "Studio/Session/LiveInput.h"

#include <cmath>

namespace Studio
{

namespace
{

constexpr VLiveStatus::Time rateOver = std::chrono::seconds(3);

std::string CountText(std::uint64_t i_Messages)
{
    return std::to_string(i_Messages) + (i_Messages == 1 ? " message" : " messages");
}

std::string DurationText(VLiveStatus::Time i_Time)
{
    const auto seconds = std::chrono::duration_cast<std::chrono::seconds>(i_Time).count();
    if (seconds < 60)
        return std::to_string(seconds) + " s";
    if (seconds < 3600)
        return std::to_string(seconds / 60) + " min " + std::to_string(seconds % 60) + " s";
    return std::to_string(seconds / 3600) + " h " + std::to_string(seconds / 60 % 60) + " min";
}

std::string EndText(const LiveInput& i_rInput)
{
    switch (i_rInput.Kind)
    {
    case ELiveInput::Replay:
        return "The replay has ended";
    case ELiveInput::Simulation:
        return "The simulation has ended";
    case ELiveInput::Osc:
        return "Stopped after " + CountText(i_rInput.Messages);
    case ELiveInput::None:
        break;
    }
    return {};
}

} // namespace

void VLiveStatus::Restart(const LiveInput& i_rInput, Time i_Now)
{
    m_Number = i_rInput.Number;
    m_bWasRunning = i_rInput.bRunning;
    m_LastAt = i_Now;
    m_Counts.clear();
}

LiveStatusText VLiveStatus::Tell(const LiveInput& i_rInput, Time i_Now)
{
    if (i_rInput.Number != m_Number)
        Restart(i_rInput, i_Now);
    LiveStatusText status;
    status.bEnded = std::exchange(m_bWasRunning, i_rInput.bRunning) && !i_rInput.bRunning;
    if (!i_rInput.bRunning)
        status.Text = EndText(i_rInput);
    else if (i_rInput.Kind == ELiveInput::Osc)
        status.Text = TellMessages(i_rInput, i_Now, status.bWarning);
    return status;
}

std::string VLiveStatus::TellMessages(const LiveInput& i_rInput, Time i_Now, bool& o_rbWarning)
{
    const std::string place = i_rInput.Address + ":" + std::to_string(i_rInput.Port) + ": ";
    if (m_Counts.empty() || m_Counts.back().second != i_rInput.Messages || i_rInput.bPaused)
        m_LastAt = i_Now;
    m_Counts.emplace_back(i_Now, i_rInput.Messages);
    while (i_Now - m_Counts.front().first > rateOver)
        m_Counts.pop_front();
    if (i_rInput.bPaused)
        return place + CountText(i_rInput.Messages) + ", paused";
    o_rbWarning = i_Now - m_LastAt >= LongestSilence;
    if (o_rbWarning)
        return place + "no message for " + DurationText(i_Now - m_LastAt);
    if (i_rInput.Messages == 0)
        return place + "no message yet";
    const auto elapsed = std::chrono::duration<double>(i_Now - m_Counts.front().first).count();
    const auto came = static_cast<double>(i_rInput.Messages - m_Counts.front().second);
    const std::string rate = elapsed >= 1.0 ? ", " + std::to_string(std::lround(came / elapsed)) + " a second" : "";
    return place + CountText(i_rInput.Messages) + rate;
}

} // namespace Studio

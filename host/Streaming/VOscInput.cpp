#include "Streaming/VOscInput.h"

#include "Channels/Contexts/VLiveContext.h"
#include "Recordings/Common/VRecording.h"
#include "Recordings/Time/TimeGrid.h"
#include "Streaming/OscRate.h"

#include <cstdio>
#include <utility>

namespace Streaming
{

namespace
{

constexpr std::chrono::milliseconds TakeEvery(20);
constexpr LocalTime AnnounceEvery = std::chrono::milliseconds(500);

// How long the rate is measured: enough samples, but not for ever.
constexpr LocalTime ShortMeasurement = std::chrono::seconds(2);
constexpr LocalTime LongMeasurement = std::chrono::seconds(5);
constexpr std::size_t EnoughSamples = 8;

LocalTime Now()
{
    return std::chrono::duration_cast<LocalTime>(std::chrono::steady_clock::now().time_since_epoch());
}

std::string RateText(double i_Rate)
{
    char text[32];
    std::snprintf(text, sizeof(text), "%.6g Hz", i_Rate);
    return text;
}

} // namespace

VOscInput::VOscInput(const Options& i_rOptions, Callbacks i_Callbacks)
    : m_Options(i_rOptions), m_Callbacks(std::move(i_Callbacks)), m_Receiver(i_rOptions.Receiver)
{
}

VOscInput::~VOscInput()
{
    if (!m_Thread.joinable())
        return;
    {
        const std::lock_guard lock(m_Mutex);
        m_bStopping = true;
    }
    m_Wake.notify_one();
    m_Thread.join();
}

TQL::IResult VOscInput::Start(std::string& o_rError)
{
    if (m_Options.Rate != 0.0 && !(m_Options.Rate >= LowestRate && m_Options.Rate <= HighestRate))
    {
        o_rError = "the rate of the messages has to be from 0.1 to 100000 Hz";
        return TQL::Result::InvalidArgument;
    }
    if (const TQL::IResult result = m_Receiver.Start(o_rError); result.IsError())
        return result;
    if (m_Options.Rate != 0.0)
        MakeFeed(m_Options.Rate);
    m_Thread = std::thread([this] { Work(); });
    return TQL::Result::Ok;
}

void VOscInput::MakeFeed(double i_Rate)
{
    auto pContext = m_Callbacks.MakeContext(i_Rate, Recordings::PeriodOfRate(i_Rate));
    m_pFeed = std::make_unique<VOscFeed>(std::move(pContext), i_Rate, Troubles(), m_Options.Rate != 0.0);
}

void VOscInput::TellTroubles(LocalTime i_Now)
{
    for (const std::string& rText : Troubles().TakeNews(i_Now))
        if (m_Callbacks.Trouble)
            m_Callbacks.Trouble(rText);
}

void VOscInput::Work()
{
    std::unique_lock lock(m_Mutex);
    while (!m_bStopping)
    {
        lock.unlock();
        const TQL::IResult result = Step(Now());
        TellTroubles(Now());
        if (result.IsError())
        {
            if (m_Callbacks.Trouble)
                m_Callbacks.Trouble("The live input has stopped: " + std::string(result.Description()));
            return;
        }
        lock.lock();
        m_Wake.wait_for(lock, TakeEvery, [this] { return m_bStopping; });
    }
    lock.unlock();
    // What waits still belongs to the data.
    LocalTime oldest{0};
    std::size_t most = 0;
    if (!m_pFeed && m_Receiver.Waiting(oldest, most))
        (void)Step(oldest + LongMeasurement);
    if (m_pFeed && Step(Now()).IsSuccess())
        (void)m_pFeed->Finish();
    TellTroubles(LocalTime::max());
}

bool VOscInput::IsRateKnown(LocalTime i_Now) const
{
    LocalTime oldest{0};
    std::size_t most = 0;
    if (!m_Receiver.Waiting(oldest, most))
        return false;
    const LocalTime elapsed = i_Now - oldest;
    return (elapsed >= ShortMeasurement && most >= EnoughSamples) || elapsed >= LongMeasurement ||
           most >= m_Options.Receiver.MostWaiting / 2;
}

TQL::IResult VOscInput::Begin()
{
    m_Receiver.Take(m_Samples, m_Channels);
    const double measured = MeasureRate(m_Samples, m_Channels.size());
    const double rate = measured > 0.0 ? measured : Recordings::AssumedRate;
    if (m_Callbacks.Note)
        m_Callbacks.Note(measured > 0.0
                             ? "The messages come at " + RateText(rate)
                             : "The rate of the messages could not be measured; " + RateText(rate) + " is assumed");
    MakeFeed(rate);
    return m_pFeed->AddChannels(m_Channels);
}

TQL::IResult VOscInput::Step(LocalTime i_Now)
{
    if (m_pFeed)
    {
        const std::size_t channels = m_Channels.size();
        m_Receiver.Take(m_Samples, m_Channels);
        if (m_Channels.size() != channels)
            if (const TQL::IResult result = m_pFeed->AddChannels(m_Channels); result.IsError())
                return result;
    }
    else if (!IsRateKnown(i_Now))
        return TQL::Result::Ok;
    else if (const TQL::IResult result = Begin(); result.IsError())
        return result;

    if (m_Announced != m_Channels.size() && i_Now - m_AnnouncedAt >= AnnounceEvery)
    {
        m_Announced = m_Channels.size();
        m_AnnouncedAt = i_Now;
        if (m_Callbacks.ChannelsAdded)
            m_Callbacks.ChannelsAdded();
    }
    if (!IsPaused())
        return m_pFeed->Take(m_Samples, i_Now);
    m_pFeed->SkipTime();
    return m_pFeed->Finish();
}

} // namespace Streaming

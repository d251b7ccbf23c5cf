#include "Streaming/VOscFeed.h"

#include "Channels/Common/ChannelTypes.h"
#include "Channels/Contexts/VLiveContext.h"

#include <algorithm>
#include <cmath>
#include <limits>
#include <numeric>
#include <span>
#include <utility>

namespace Streaming
{

namespace
{

constexpr double WaitingSeconds = 0.5;
constexpr std::int64_t FewestWaiting = 32;
constexpr double MostLateFrames = 0.75; ///< that a sample may be behind the frame that follows the last
constexpr double MostEarlySeconds = 0.1;

constexpr float Missing = std::numeric_limits<float>::quiet_NaN();

} // namespace

void VOscFeed::Lane::Reach(std::size_t i_Frames)
{
    if (Taken.size() >= i_Frames)
        return;
    Taken.resize(i_Frames);
    Rows.resize(i_Frames * Components, Missing);
}

void VOscFeed::Lane::Drop(std::size_t i_Frames, std::int64_t i_FirstFrame, std::int64_t i_LongestRest)
{
    const auto dropped = static_cast<std::ptrdiff_t>(std::min(i_Frames, Taken.size()));
    Taken.erase(Taken.begin(), Taken.begin() + dropped);
    Rows.erase(Rows.begin(), Rows.begin() + dropped * static_cast<std::ptrdiff_t>(Components));
    if (Taken.empty() && NextFrame < i_FirstFrame - i_LongestRest)
    {
        Taken = {};
        Rows = {};
    }
}

VOscFeed::VOscFeed(std::shared_ptr<Channels::VLiveContext> i_pContext, double i_Rate, VOscTroubles& i_rTroubles,
                   bool i_bRateStated)
    : m_pContext(std::move(i_pContext))
    , m_Rate(i_Rate)
    , m_Capacity(std::max(static_cast<std::int64_t>(i_Rate * WaitingSeconds), FewestWaiting))
    , m_rTroubles(i_rTroubles)
    , m_Shared(i_bRateStated ? EOscTrouble::BeyondRate : EOscTrouble::SharedFrame)
    , m_FirstSeen(static_cast<std::size_t>(m_Capacity))
    , m_FirstFrame(m_pContext->GetTickRange().Last / m_pContext->GetFramePeriod())
    , m_EndFrame(m_FirstFrame)
{
}

TQL::IResult VOscFeed::AddChannels(const std::vector<OscChannel>& i_rChannels)
{
    for (std::size_t i = m_Lanes.size(); i < i_rChannels.size(); ++i)
    {
        const OscChannel& rChannel = i_rChannels[i];
        Channels::ChannelDefinition definition;
        definition.Name = rChannel.Name.Name;
        if (rChannel.Name.bMarker)
        {
            definition.TypeName = Channels::LabelledReconstructionType;
            definition.First = m_Subjects.emplace(rChannel.Name.Subject, m_Subjects.size()).first->second;
            definition.Second = m_MarkerCounts[definition.First]++;
        }
        else
        {
            definition.TypeName = Channels::ModelOutputType;
            definition.TypeText = Channels::ColumnText;
            definition.First = m_ColumnCount++;
            definition.Text = rChannel.Name.Name;
            definition.ComponentNames = ComponentNamesOfColumn(rChannel.Components);
        }
        Lane lane;
        lane.Components = rChannel.Components;
        if (const auto result = m_pContext->AddChannel(definition, 0, lane.Channel); result.IsError())
            return result;
        m_Lanes.push_back(std::move(lane));
    }
    return TQL::Result::Ok;
}

TQL::IResult VOscFeed::Take(const OscSamples& i_rSamples, LocalTime i_Now)
{
    const auto& rSamples = i_rSamples.Samples;
    m_Order.resize(rSamples.size());
    std::iota(m_Order.begin(), m_Order.end(), std::size_t{0});
    std::ranges::stable_sort(m_Order, {}, [&](std::size_t i_Index) { return rSamples[i_Index].Time; });
    for (const std::size_t index : m_Order)
    {
        const OscSamples::Sample& rSample = rSamples[index];
        if (const auto result = Place(rSample, i_rSamples.Values.data() + rSample.FirstValue, i_Now); result.IsError())
            return result;
    }
    std::int64_t end = m_EndFrame;
    const auto waits = [&](std::int64_t i_Frame)
    {
        const LocalTime seen = m_FirstSeen[static_cast<std::size_t>(i_Frame - m_FirstFrame)];
        return seen == LocalTime(0) || i_Now - seen < Hold;
    };
    while (end > m_FirstFrame && waits(end - 1))
        --end;
    return HandOn(end);
}

TQL::IResult VOscFeed::Finish()
{
    return HandOn(m_EndFrame);
}

std::int64_t VOscFeed::FrameOf(const Lane& i_rLane, LocalTime i_Time) const
{
    const double place =
        static_cast<double>(m_OriginFrame) + std::chrono::duration<double>(i_Time - m_Origin).count() * m_Rate;
    const auto nearest = static_cast<std::int64_t>(std::floor(place + 0.5));
    const std::int64_t next = std::max(i_rLane.NextFrame, m_FirstFrame);
    if (i_rLane.NextFrame == NoFrame && nearest >= m_FirstFrame)
        return nearest;
    const double early = static_cast<double>(next) - place;
    if (early <= -MostLateFrames)
        return nearest;
    return early < std::max(1.0, MostEarlySeconds * m_Rate) ? next : next - 1;
}

/// Makes a frame one of those that can wait, handing on older ones where they are too many.
TQL::IResult VOscFeed::MakeRoomFor(std::int64_t i_Frame)
{
    if (i_Frame < m_FirstFrame + m_Capacity)
        return TQL::Result::Ok;
    // Room for half as many again, so that this does not come with every sample.
    const std::int64_t first = i_Frame - m_Capacity / 2;
    const TQL::IResult result = HandOn(std::min(first, m_EndFrame));
    if (m_FirstFrame == m_EndFrame)
        m_FirstFrame = m_EndFrame = std::max(first, m_FirstFrame);
    return result;
}

TQL::IResult VOscFeed::Place(const OscSamples::Sample& i_rSample, const float* i_pValues, LocalTime i_Now)
{
    if (!m_bHasOrigin)
    {
        m_bHasOrigin = true;
        m_Origin = i_rSample.Time;
        m_OriginFrame = m_EndFrame;
    }
    Lane& rLane = m_Lanes[i_rSample.Channel];
    const std::int64_t frame = FrameOf(rLane, i_rSample.Time);
    if (frame < m_FirstFrame)
    {
        m_rTroubles.Add(EOscTrouble::TooLate);
        return TQL::Result::Ok;
    }
    if (const TQL::IResult result = MakeRoomFor(frame); result.IsError())
        return result;
    const auto place = static_cast<std::size_t>(frame - m_FirstFrame);
    rLane.Reach(place + 1);
    if (std::exchange(rLane.Taken[place], 1))
        m_rTroubles.Add(m_Shared);
    std::copy_n(i_pValues, rLane.Components,
                rLane.Rows.begin() + static_cast<std::ptrdiff_t>(place * rLane.Components));
    rLane.NextFrame = std::max(rLane.NextFrame, frame + 1);
    if (m_FirstSeen[place] == LocalTime(0))
        m_FirstSeen[place] = i_Now;
    m_EndFrame = std::max(m_EndFrame, frame + 1);
    return TQL::Result::Ok;
}

/// Appends the frames up to i_EndFrame, which is at most m_EndFrame, to the context.
TQL::IResult VOscFeed::HandOn(std::int64_t i_EndFrame)
{
    const std::int64_t frames = i_EndFrame - m_FirstFrame;
    if (frames <= 0)
        return TQL::Result::Ok;
    const auto count = static_cast<std::size_t>(frames);
    const auto used = static_cast<std::size_t>(m_EndFrame - m_FirstFrame);
    m_Rows.clear();
    for (Lane& rLane : m_Lanes)
    {
        const auto some = static_cast<std::ptrdiff_t>(std::min(count, rLane.Taken.size()));
        if (std::none_of(rLane.Taken.begin(), rLane.Taken.begin() + some, [](char i_bTaken) { return i_bTaken != 0; }))
            continue;
        rLane.Reach(count);
        m_Rows.push_back({rLane.Channel, std::span<const float>(rLane.Rows).first(count * rLane.Components), 0});
    }
    const TQL::IResult result = m_pContext->AppendFrames(m_FirstFrame, frames, m_Rows);
    for (Lane& rLane : m_Lanes)
        rLane.Drop(count, i_EndFrame, m_Capacity);
    const auto seen = m_FirstSeen.begin();
    const auto seenEnd = seen + static_cast<std::ptrdiff_t>(used);
    std::fill(std::copy(seen + static_cast<std::ptrdiff_t>(count), seenEnd, seen), seenEnd, LocalTime(0));
    m_FirstFrame = i_EndFrame;
    return result;
}

} // namespace Streaming

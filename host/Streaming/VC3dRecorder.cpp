#include "Streaming/VC3dRecorder.h"

#include "Channels/Common/ChannelTypes.h"
#include "Channels/Contexts/VLiveContext.h"

#include <algorithm>
#include <cmath>
#include <limits>
#include <span>

namespace Streaming
{

namespace
{

constexpr float Missing = std::numeric_limits<float>::quiet_NaN();
constexpr LocalTime HeadEvery = std::chrono::seconds(5);
constexpr std::size_t NumbersAtOnce = 1 << 18; // frames are written in pieces of about so many
constexpr std::size_t NamesTold = 5;

Recordings::C3dStreamChannel Describe(const Channels::VSourceChannel& i_rChannel)
{
    const Channels::ChannelDefinition& rDefinition = i_rChannel.GetDefinition();
    const Channels::ChannelType* pType = Channels::FindChannelType(rDefinition.TypeName);
    const bool bMarker = pType && pType->RecordedKind == Recordings::EChannelKind::Marker;
    return {bMarker, rDefinition.Name, rDefinition.Units, Channels::ComponentNamesOf(rDefinition)};
}

bool IsMissing(std::span<const float> i_Row)
{
    return std::ranges::all_of(i_Row, [](float i_Value) { return std::isnan(i_Value); });
}

} // namespace

void VC3dRecorder::SetContext(std::shared_ptr<const Channels::VLiveContext> i_pContext, double i_FramesPerSecond)
{
    const std::lock_guard lock(m_Mutex);
    m_pGiven = std::move(i_pContext);
    m_GivenRate = i_FramesPerSecond;
}

bool VC3dRecorder::FindContext()
{
    if (m_pContext)
        return true;
    const std::lock_guard lock(m_Mutex);
    m_pContext = m_pGiven;
    if (!m_pContext)
        return false;
    m_Rate = m_GivenRate;
    m_Stream.SetRate(m_Rate, m_pContext->GetFramePeriod());
    m_FirstFrame = m_NextFrame = m_SeenEnd = m_pContext->GetTickRange().First / m_pContext->GetFramePeriod();
    return true;
}

double VC3dRecorder::Seconds() const
{
    return m_Rate > 0.0 ? static_cast<double>(FrameCount()) / m_Rate : 0.0;
}

TQL::IResult VC3dRecorder::Work(LocalTime i_Now, std::string& o_rError)
{
    if (!FindContext())
        return TQL::Result::Ok;
    const std::int64_t end = m_pContext->GetTickRange().Last / m_pContext->GetFramePeriod();
    if (end != m_SeenEnd)
    {
        m_SeenEnd = end;
        m_SeenAt = i_Now;
    }
    const auto lag = static_cast<std::int64_t>(std::chrono::duration<double>(Lag).count() * m_Rate);
    const bool bDue = end - m_NextFrame >= std::min(lag, m_pContext->GetHistoryFrames() / 2);
    if (end == m_NextFrame || (!bDue && i_Now - m_SeenAt < Quiet))
        return TQL::Result::Ok;
    if (const TQL::IResult result = WriteUpTo(end, o_rError); result.IsError())
        return result;
    if (i_Now - m_HeadAt < HeadEvery)
        return TQL::Result::Ok;
    m_HeadAt = i_Now;
    return m_Stream.SaveHead(o_rError);
}

TQL::IResult VC3dRecorder::WriteUpTo(std::int64_t i_EndFrame, std::string& o_rError)
{
    AddEntries();
    const auto pChannels = m_pContext->GetChannels();
    for (std::size_t i = 0; i < m_Entries.size(); ++i)
        if (m_Entries[i].Place == NoPlace && !m_Entries[i].bLeftOut)
            Look(*(*pChannels)[i], i_EndFrame - m_NextFrame, m_Entries[i]);
    GivePlaces(2);
    const auto most =
        std::max<std::int64_t>(1, static_cast<std::int64_t>(NumbersAtOnce / (m_Stream.NumberCount() + 1)));
    while (m_NextFrame < i_EndFrame && !m_bFailed)
    {
        const std::int64_t frames = std::min(i_EndFrame - m_NextFrame, most);
        const TQL::IResult result = WriteFrames(frames, o_rError);
        m_bFailed = result.IsError();
        if (m_bFailed)
            return result;
        m_NextFrame += frames;
    }
    return TQL::Result::Ok;
}

TQL::IResult VC3dRecorder::WriteFrames(std::int64_t i_Frames, std::string& o_rError)
{
    const auto pChannels = m_pContext->GetChannels();
    const std::size_t width = m_Stream.NumberCount();
    m_Values.resize(width * static_cast<std::size_t>(i_Frames));
    std::size_t at = 0;
    for (const std::size_t index : m_Places)
    {
        const std::size_t numbers = m_Entries[index].Channel.NumberCount();
        ReadRows(*(*pChannels)[index], i_Frames, numbers);
        for (std::size_t frame = 0; frame < static_cast<std::size_t>(i_Frames); ++frame)
            std::copy_n(m_Rows.begin() + static_cast<std::ptrdiff_t>(frame * numbers), numbers,
                        m_Values.begin() + static_cast<std::ptrdiff_t>(frame * width + at));
        at += numbers;
    }
    return m_Stream.Append(i_Frames, m_Values, o_rError);
}

void VC3dRecorder::AddEntries()
{
    const auto pChannels = m_pContext->GetChannels();
    for (std::size_t i = m_Entries.size(); i < pChannels->size(); ++i)
        m_Entries.emplace_back().Channel = Describe(*(*pChannels)[i]);
}

/// The rows of the next frames; missing where the context has none.
void VC3dRecorder::ReadRows(const Channels::VSourceChannel& i_rChannel, std::int64_t i_Frames, std::size_t i_Numbers)
{
    const std::int64_t period = m_pContext->GetFramePeriod();
    m_Rows.assign(i_Numbers * static_cast<std::size_t>(i_Frames), Missing);
    const TQL::TickRange held = i_rChannel.GetSamples()->GetRange();
    const std::int64_t first = std::max(m_NextFrame * period, held.First);
    const std::int64_t last = std::min((m_NextFrame + i_Frames) * period, held.Last);
    if (first >= last)
        return;
    const auto skipped = static_cast<std::size_t>(first / period - m_NextFrame) * i_Numbers;
    const auto count = static_cast<std::size_t>((last - first) / period) * i_Numbers;
    // Rows that were forgotten in this moment stay missing.
    (void)i_rChannel.GetSamples()->ReadSamples({first, last}, std::span(m_Rows).subspan(skipped, count));
}

/// Counts the samples of a channel that has no place yet, and keeps the first.
void VC3dRecorder::Look(const Channels::VSourceChannel& i_rChannel, std::int64_t i_Frames, Entry& io_rEntry)
{
    const std::size_t numbers = io_rEntry.Channel.NumberCount();
    ReadRows(i_rChannel, i_Frames, numbers);
    for (std::int64_t frame = 0; frame < i_Frames; ++frame)
    {
        const auto row = std::span(m_Rows).subspan(static_cast<std::size_t>(frame) * numbers, numbers);
        if (IsMissing(row) || io_rEntry.Samples++ > 0)
            continue;
        io_rEntry.SingleFrame = m_NextFrame + frame;
        io_rEntry.Single.assign(row.begin(), row.end());
    }
}

/// Gives the channels that have so many samples a place in the file, as far as it has room.
void VC3dRecorder::GivePlaces(std::int64_t i_FewestSamples)
{
    std::vector<std::size_t> waiting;
    std::vector<Recordings::C3dStreamChannel> channels;
    for (std::size_t i = 0; i < m_Entries.size(); ++i)
        if (const Entry& r = m_Entries[i]; r.Place == NoPlace && !r.bLeftOut && r.Samples >= i_FewestSamples)
        {
            waiting.push_back(i);
            channels.push_back(r.Channel);
        }
    if (waiting.empty())
        return;
    const std::size_t taken = m_Stream.AddChannels(channels);
    for (std::size_t i = 0; i < waiting.size(); ++i)
    {
        Entry& rEntry = m_Entries[waiting[i]];
        rEntry.bLeftOut = i >= taken;
        if (rEntry.bLeftOut)
            continue;
        rEntry.Place = m_Places.size();
        m_Places.push_back(waiting[i]);
        if (rEntry.SingleFrame < m_NextFrame) // else it is among the rows
            m_Stream.Put(rEntry.SingleFrame - m_FirstFrame, rEntry.Place, rEntry.Single);
    }
}

TQL::IResult VC3dRecorder::Finish(std::vector<std::string>& o_rRemarks, std::string& io_rStopped, std::string& o_rError)
{
    // Where the disk is full, what fitted becomes a file all the same.
    if (FindContext() && !m_bFailed)
        (void)WriteUpTo(m_pContext->GetTickRange().Last / m_pContext->GetFramePeriod(), io_rStopped);
    GivePlaces(1);
    if (const TQL::IResult result = m_Stream.Finish(o_rError); result.IsError())
        return result;
    AddRemarks(o_rRemarks);
    return TQL::Result::Ok;
}

void VC3dRecorder::AddRemarks(std::vector<std::string>& o_rRemarks) const
{
    std::size_t columns = 0;
    std::size_t leftOut = 0;
    std::string names;
    for (const Entry& rEntry : m_Entries)
    {
        if (rEntry.Place < m_Stream.ChannelCount())
            columns += rEntry.Channel.bMarker ? 0 : 1;
        else if (rEntry.Samples > 0 && leftOut++ < NamesTold)
            names += (names.empty() ? "" : ", ") + rEntry.Channel.Name;
    }
    if (columns > 0)
        o_rRemarks.push_back(std::to_string(columns) + (columns == 1 ? " column was written as analog channels"
                                                                     : " columns were written as analog channels"));
    if (leftOut == 0)
        return;
    if (leftOut > NamesTold)
        names += " and " + std::to_string(leftOut - NamesTold) + " others";
    o_rRemarks.push_back(std::to_string(leftOut) +
                         (leftOut == 1 ? " channel was left out, for which the file or the disk has no room: "
                                       : " channels were left out, for which the file or the disk has no room: ") +
                         names);
}

} // namespace Streaming

#include "Streaming/VOscTroubles.h"

namespace Streaming
{

namespace
{

constexpr LocalTime TellEvery = std::chrono::seconds(5);

/// The sentence of a kind, around the number.
struct Wording
{
    EOscTrouble Trouble;
    std::string_view One;
    std::string_view Many;
    std::string_view Rest;
};

constexpr std::array<Wording, static_cast<std::size_t>(EOscTrouble::Count)> Wordings{{
    {EOscTrouble::Malformed, "packet is", "packets are", "no Open Sound Control and left out in whole or in part"},
    {EOscTrouble::BadAddress, "message is", "messages are",
     "left out: an address has at most 255 printable ASCII characters"},
    {EOscTrouble::WrongKind, "message is", "messages are", "left out: an argument is no number"},
    {EOscTrouble::NoValues, "message is", "messages are", "left out: a channel has from 1 to 64 numbers"},
    {EOscTrouble::ComponentsChanged, "message is", "messages are",
     "left out: the number of values is not that of the channel's first message"},
    {EOscTrouble::TooManyChannels, "message is", "messages are", "left out: there are too many channels already"},
    {EOscTrouble::LostBefore, "packet was", "packets were",
     "lost: they came faster than this program could read them. Send fewer messages, or several in a bundle"},
    {EOscTrouble::QueueFull, "sample was", "samples were", "lost: they came faster than they were taken"},
    {EOscTrouble::TooLate, "sample is", "samples are", "left out: later samples had been taken already"},
    {EOscTrouble::SharedFrame, "sample", "samples",
     "came while there was one for the same frame, which it replaced. State the rate at which the messages come"},
    {EOscTrouble::BeyondRate, "sample", "samples",
     "came while there was one for the same frame, which it replaced. Do two programs send to one address, or more "
     "often than at the stated rate?"},
    {EOscTrouble::OutOfRange, "number is", "numbers are",
     "missing: infinite, or too large for a single precision number"},
    {EOscTrouble::ClockSet, "time tag", "time tags",
     "lay more than 2 s from the arrival; the sender's clock was taken anew"},
}};

std::string Sentence(EOscTrouble i_Trouble, std::uint64_t i_Count, const std::string& i_rDetail)
{
    const Wording& rWording = Wordings[static_cast<std::size_t>(i_Trouble)];
    std::string text = std::to_string(i_Count) + " ";
    text.append(i_Count == 1 ? rWording.One : rWording.Many).append(" ").append(rWording.Rest);
    if (!i_rDetail.empty())
        text.append(" (the last: ").append(i_rDetail).append(")");
    return text;
}

} // namespace

void VOscTroubles::Add(EOscTrouble i_Trouble, std::uint64_t i_Count, std::string_view i_Detail)
{
    if (i_Count == 0)
        return;
    const std::lock_guard lock(m_Mutex);
    Entry& rEntry = m_Entries[static_cast<std::size_t>(i_Trouble)];
    rEntry.Count += i_Count;
    if (!i_Detail.empty())
        rEntry.Detail = i_Detail;
}

std::uint64_t VOscTroubles::Count(EOscTrouble i_Trouble) const
{
    const std::lock_guard lock(m_Mutex);
    return m_Entries[static_cast<std::size_t>(i_Trouble)].Count;
}

std::vector<std::string> VOscTroubles::TakeNews(LocalTime i_Now)
{
    std::vector<std::string> news;
    const std::lock_guard lock(m_Mutex);
    for (std::size_t i = 0; i < m_Entries.size(); ++i)
    {
        Entry& rEntry = m_Entries[i];
        if (rEntry.Count == rEntry.Told || (rEntry.Told != 0 && i_Now - rEntry.ToldAt < TellEvery))
            continue;
        news.push_back(Sentence(static_cast<EOscTrouble>(i), rEntry.Count - rEntry.Told, rEntry.Detail));
        rEntry.Told = rEntry.Count;
        rEntry.ToldAt = i_Now;
    }
    return news;
}

std::vector<std::string> VOscTroubles::Summary() const
{
    std::vector<std::string> sentences;
    const std::lock_guard lock(m_Mutex);
    for (std::size_t i = 0; i < m_Entries.size(); ++i)
        if (m_Entries[i].Count != 0)
            sentences.push_back(Sentence(static_cast<EOscTrouble>(i), m_Entries[i].Count, m_Entries[i].Detail));
    return sentences;
}

} // namespace Streaming

#include "Recordings/Tables/TableRecording.h"

#include <algorithm>
#include <cmath>
#include <cstddef>
#include <cstdint>
#include <functional>
#include <limits>
#include <map>
#include <new>
#include <numeric>
#include <string>
#include <utility>

namespace Recordings
{

namespace
{

constexpr float Missing = std::numeric_limits<float>::quiet_NaN();
constexpr std::size_t FreePlacesOfTable = 1 << 20;
constexpr std::size_t FreePlaces = 4096;

/// The places of a grid at which a channel has samples: First, First + Step, ...
struct Stride
{
    std::size_t Step = 1;
    std::size_t First = 0;

    bool Holds(const Stride& i_rOther) const
    {
        return i_rOther.Step % Step == 0 && i_rOther.First % Step == First % Step;
    }
};

/// Where a channel has samples, as far as its values tell.
struct Presence
{
    std::size_t Samples = 0;
    Stride Places; ///< Step 0: at one place only
};

Presence FindPresence(const RecordedChannel& i_rChannel, const TimeGrid& i_rGrid)
{
    const std::size_t components = i_rChannel.ComponentCount();
    Presence presence;
    presence.Places.Step = 0;
    for (std::size_t row = 0; row < i_rChannel.RowCount() && presence.Places.Step != 1; ++row)
    {
        const auto first = i_rChannel.Samples.begin() + static_cast<std::ptrdiff_t>(row * components);
        const std::size_t place = i_rGrid.PlaceOf(row);
        if (place == TimeGrid::NoPlace || std::all_of(first, first + static_cast<std::ptrdiff_t>(components),
                                                      [](float i_Value) { return std::isnan(i_Value); }))
            continue;
        if (presence.Samples++ == 0)
            presence.Places.First = place;
        else
            presence.Places.Step = std::gcd(presence.Places.Step, place - presence.Places.First);
    }
    return presence;
}

// The rates of their own that channels have. A few values that happen to stand evenly are no rate: a channel must fill
// a good part of its places. Channels with fewer samples take the widest of the others' that suits them.
std::vector<Stride> FindStrides(const std::vector<RecordedChannel>& i_rChannels, const TimeGrid& i_rGrid)
{
    constexpr std::size_t fewest = 8;
    std::vector<Presence> presences;
    std::map<std::size_t, Stride, std::greater<>> known; // by step, the widest first
    for (const RecordedChannel& rChannel : i_rChannels)
    {
        const Presence presence = FindPresence(rChannel, i_rGrid);
        presences.push_back(presence);
        const Stride& rPlaces = presence.Places;
        if (rPlaces.Step > 1 && presence.Samples >= fewest &&
            presence.Samples * 4 >= (i_rGrid.Places - rPlaces.First) / rPlaces.Step)
            known.emplace(rPlaces.Step, Stride{rPlaces.Step, rPlaces.First % rPlaces.Step});
    }
    std::vector<Stride> strides;
    for (const Presence& rPresence : presences)
    {
        const auto found = std::find_if(known.begin(), known.end(),
                                        [&](const auto& i_rKnown) { return i_rKnown.second.Holds(rPresence.Places); });
        strides.push_back(found == known.end() || rPresence.Samples == 0 ? Stride{} : found->second);
    }
    return strides;
}

// Moves the samples of the rows to their places.
void LaySamples(const TimeGrid& i_rGrid, const Stride& i_rStride, RecordedChannel& io_rChannel)
{
    const std::size_t components = io_rChannel.ComponentCount();
    const std::size_t rows = io_rChannel.RowCount();
    if (i_rGrid.PlaceOfRow.empty() && i_rStride.Step == 1)
        return;
    const std::size_t places = (i_rGrid.Places - i_rStride.First + i_rStride.Step - 1) / i_rStride.Step;
    std::vector<float> samples(places * components, Missing);
    for (std::size_t row = 0; row < rows; ++row)
    {
        const std::size_t place = i_rGrid.PlaceOf(row);
        if (place == TimeGrid::NoPlace || place % i_rStride.Step != i_rStride.First)
            continue;
        std::copy_n(io_rChannel.Samples.begin() + static_cast<std::ptrdiff_t>(row * components), components,
                    samples.begin() + static_cast<std::ptrdiff_t>(place / i_rStride.Step * components));
    }
    io_rChannel.Samples = std::move(samples);
}

void Resample(const std::vector<ResampleStep>& i_rSteps, RecordedChannel& io_rChannel)
{
    const std::size_t components = io_rChannel.ComponentCount();
    std::vector<float> samples;
    samples.reserve(i_rSteps.size() * components);
    for (const ResampleStep& rStep : i_rSteps)
        for (std::size_t i = 0; i < components; ++i)
        {
            const double before = static_cast<double>(io_rChannel.Samples[rStep.Before * components + i]);
            const double after = static_cast<double>(io_rChannel.Samples[rStep.After * components + i]);
            const double value = rStep.Before == rStep.After ? before : before + (after - before) * rStep.Share;
            samples.push_back(rStep.bGap ? Missing : static_cast<float>(value));
        }
    io_rChannel.Samples = std::move(samples);
}

void TimeChannel(const TimeGrid& i_rGrid, const Stride& i_rStride, RecordedChannel& io_rChannel)
{
    io_rChannel.SamplePeriod = i_rGrid.Period * static_cast<std::int64_t>(i_rStride.Step);
    io_rChannel.FirstTick = i_rGrid.FirstTick + i_rGrid.Period * static_cast<std::int64_t>(i_rStride.First);
    const double rate = i_rGrid.Rate / static_cast<double>(i_rStride.Step);
    const double round = RoundRate(rate * (1.0 - 1e-6), rate * (1.0 + 1e-6), rate);
    io_rChannel.Rate = PeriodOfRate(round) == io_rChannel.SamplePeriod ? round : rate;
}

void FillTimeChannel(const TableTimes& i_rTimes, RecordedChannel& io_rChannel)
{
    const double unit = i_rTimes.Unit > 0.0 ? i_rTimes.Unit : 1.0;
    io_rChannel.ComponentNames = {""};
    io_rChannel.Samples.reserve(i_rTimes.Seconds.size());
    for (const double time : i_rTimes.Seconds)
        io_rChannel.Samples.push_back(static_cast<float>(time / unit));
}

// Motion frames are those of the first marker or segment; without any they are the rows.
void SetFrames(const TimeGrid& i_rGrid, VRecording& io_rRecording)
{
    io_rRecording.FramePeriod = i_rGrid.Period;
    io_rRecording.Range = {i_rGrid.FirstTick,
                           i_rGrid.FirstTick + static_cast<std::int64_t>(i_rGrid.Places) * i_rGrid.Period};
    const auto motion =
        std::find_if(io_rRecording.Channels.begin(), io_rRecording.Channels.end(),
                     [](const RecordedChannel& i_rChannel) {
                         return i_rChannel.Kind == EChannelKind::Marker || i_rChannel.Kind == EChannelKind::SegmentPose;
                     });
    if (motion == io_rRecording.Channels.end())
        return;
    io_rRecording.FramePeriod = motion->SamplePeriod;
    io_rRecording.Range = motion->GetTickRange();
}

} // namespace

void LayTable(const TableTimes& i_rTimes, const ReadOptions& i_rOptions, bool i_bOwnRates,
              std::optional<RecordedChannel> i_TimeChannel, VRecording& io_rRecording)
{
    std::vector<RecordedChannel>& rChannels = io_rRecording.Channels;
    const std::size_t free = std::min(FreePlaces, FreePlacesOfTable / std::max<std::size_t>(1, rChannels.size()));
    TimeGrid grid = FindTimeGrid(i_rTimes, free, io_rRecording.Warnings);
    const bool bResample = i_rOptions.bResample && grid.bUneven;
    if (i_TimeChannel && !grid.bExact && !bResample)
    {
        FillTimeChannel(i_rTimes, *i_TimeChannel);
        rChannels.insert(rChannels.begin(), std::move(*i_TimeChannel));
    }
    if (!grid.Remark.empty())
        io_rRecording.Remarks.push_back(grid.Remark);
    std::vector<ResampleStep> steps;
    if (bResample)
        grid = ResampleGrid(i_rTimes, grid, steps, io_rRecording.Warnings);
    if (!steps.empty()) // what was said of the uneven grid no longer holds
        io_rRecording.Warnings.erase(io_rRecording.Warnings.end() - 2);
    std::vector<Stride> strides(rChannels.size());
    if (i_bOwnRates && steps.empty())
        strides = FindStrides(rChannels, grid);
    for (std::size_t i = 0; i < rChannels.size(); ++i)
    {
        if (steps.empty())
            LaySamples(grid, strides[i], rChannels[i]);
        else
            Resample(steps, rChannels[i]);
        TimeChannel(grid, strides[i], rChannels[i]);
    }
    SetFrames(grid, io_rRecording);
}

TQL::IResult ReadTextFile(std::span<const std::byte> i_File, const TextReader& i_rRead, VRecording& o_rRecording,
                          std::string& o_rError)
{
    const std::string_view text = TextOfBytes(i_File);
    if (IsWideText(text))
        return RefuseFormat("the file is written in 16-bit characters. Save it as UTF-8 text and open that.", o_rError);
    try
    {
        VRecording recording;
        const TQL::IResult result = i_rRead(text, recording, o_rError);
        if (result.IsSuccess())
            o_rRecording = std::move(recording);
        return result;
    }
    catch (const std::bad_alloc&)
    {
        o_rError = "the recording does not fit into memory. Close other programs or choose a shorter one.";
        return TQL::Result::AllocationFailure;
    }
}

TQL::IResult RefuseFormat(std::string i_Sentence, std::string& o_rError)
{
    o_rError = std::move(i_Sentence);
    return TQL::Result::InvalidFormat;
}

void TellCount(const char* i_pWhat, std::uint64_t i_Promised, std::size_t i_Held,
               std::vector<std::string>& io_rWarnings)
{
    if (i_Promised != i_Held)
        io_rWarnings.push_back("The head of the file promises " + std::to_string(i_Promised) + " " + i_pWhat +
                               "; it holds " + std::to_string(i_Held) + ".");
}

} // namespace Recordings

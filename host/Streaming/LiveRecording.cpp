#include "Streaming/LiveRecording.h"

#include "Channels/Contexts/VChannelContext.h"
#include "Recordings/C3d/VC3dStream.h"

#include <algorithm>
#include <cmath>
#include <iterator>
#include <limits>
#include <memory>
#include <span>
#include <utility>

namespace Streaming
{

namespace
{

using Recordings::EChannelKind;
using Recordings::RecordedChannel;
using Recordings::VRecording;

constexpr std::int64_t RowsAtOnce = 16384; ///< a reader keeps the writer waiting when that needs memory

/// Recordings have no place for everything that a capture shows.
bool IsRecorded(const std::string& i_rTypeName)
{
    const Channels::ChannelType* pType = Channels::FindChannelType(i_rTypeName);
    return !pType || pType->RecordedKind;
}

EChannelKind KindOf(const std::string& i_rTypeName)
{
    const Channels::ChannelType* pType = Channels::FindChannelType(i_rTypeName);
    return pType ? pType->RecordedKind.value_or(EChannelKind::Column) : EChannelKind::Column;
}

/// Whether it is one of three components that a recording holds as such; other columns stand one beside another.
bool IsModelOutput(const Channels::ChannelDefinition& i_rDefinition)
{
    return i_rDefinition.TypeName == Channels::ModelOutputType &&
           Channels::ComponentNamesOf(i_rDefinition).size() == 3 && !i_rDefinition.TypeText.empty() &&
           i_rDefinition.TypeText != Channels::ColumnText && i_rDefinition.TypeText != Channels::JointAnglesText;
}

/// Reads what the store has of the channel's range. The channel's rows are missing before.
void ReadRows(const Channels::VSampleStore& i_rSamples, const TQL::TickRange& i_rRange, RecordedChannel& io_rChannel)
{
    const std::int64_t period = io_rChannel.SamplePeriod;
    const std::size_t components = io_rChannel.ComponentCount();
    std::int64_t tick = i_rRange.First;
    while (tick < i_rRange.Last)
    {
        // Asked each time: the oldest samples go while newer ones come.
        const TQL::TickRange held = i_rSamples.GetRange();
        tick = std::max(tick, held.First);
        const std::int64_t end = std::min({tick + RowsAtOnce * period, held.Last, i_rRange.Last});
        if (end <= tick)
            return;
        const auto first = static_cast<std::size_t>((tick - i_rRange.First) / period) * components;
        const auto count = static_cast<std::size_t>((end - tick) / period) * components;
        if (i_rSamples.ReadSamples({tick, end}, std::span(io_rChannel.Samples).subspan(first, count)).IsSuccess())
            tick = end;
        else if (i_rSamples.GetRange().First <= tick)
            return; // not trimmed but replaced
    }
}

/// Drops the rows before a tick.
void CropBefore(std::int64_t i_Tick, RecordedChannel& io_rChannel)
{
    const auto rows = (i_Tick - io_rChannel.FirstTick) / io_rChannel.SamplePeriod;
    const auto values = rows * static_cast<std::int64_t>(io_rChannel.ComponentCount());
    io_rChannel.Samples.erase(io_rChannel.Samples.begin(), io_rChannel.Samples.begin() + values);
    io_rChannel.FirstTick = i_Tick;
}

RecordedChannel CopyChannel(const Channels::VSourceChannel& i_rChannel, const TQL::TickRange& i_rRange)
{
    const Channels::ChannelDefinition& rDefinition = i_rChannel.GetDefinition();
    RecordedChannel channel;
    channel.Kind = rDefinition.RotationOrder.empty() ? KindOf(rDefinition.TypeName) : EChannelKind::JointAngles;
    if (IsModelOutput(rDefinition))
    {
        channel.Kind = EChannelKind::ModelOutput;
        channel.Quantity = rDefinition.TypeText;
    }
    channel.Name = rDefinition.Name;
    const std::size_t colon = channel.Name.find(':');
    if (colon != std::string::npos && channel.Kind != EChannelKind::Column)
        channel.Subject = channel.Name.substr(0, colon);
    channel.ComponentNames = channel.Kind == EChannelKind::Marker ? std::vector<std::string>{"X", "Y", "Z"}
                                                                  : Channels::ComponentNamesOf(rDefinition);
    channel.Units = rDefinition.Units;
    channel.RotationOrder = rDefinition.RotationOrder;
    channel.SamplePeriod = i_rChannel.GetSamples()->Period();
    channel.Rate = static_cast<double>(TQL::DefaultTickRate) / static_cast<double>(channel.SamplePeriod);
    channel.FirstTick = i_rRange.First;
    const auto rows = static_cast<std::size_t>((i_rRange.Last - i_rRange.First) / channel.SamplePeriod);
    channel.Samples.assign(rows * channel.ComponentCount(), std::numeric_limits<float>::quiet_NaN());
    ReadRows(*i_rChannel.GetSamples(), i_rRange, channel);
    return channel;
}

} // namespace

VRecording CopyContext(const Channels::VChannelContext& i_rContext,
                       const std::function<bool(const Channels::VSourceChannel&)>& i_rTakes)
{
    VRecording recording;
    recording.Name = i_rContext.GetName();
    recording.FramePeriod = i_rContext.GetFramePeriod();
    recording.Range = i_rContext.GetTickRange();
    const auto pChannels = i_rContext.GetChannels();
    for (const auto& rpChannel : *pChannels)
        if (!rpChannel->GetSamples()->IsEmpty() && IsRecorded(rpChannel->GetInstanceId().TypeName) &&
            (!i_rTakes || i_rTakes(*rpChannel)))
            recording.Channels.push_back(CopyChannel(*rpChannel, recording.Range));
    const std::int64_t first =
        std::min(std::max(i_rContext.GetTickRange().First, recording.Range.First), recording.Range.Last);
    for (RecordedChannel& rChannel : recording.Channels)
        CropBefore(first, rChannel);
    recording.Range.First = first;
    return recording;
}

namespace
{

constexpr std::size_t NamesTold = 5;
constexpr std::size_t LongestName = 255; ///< bytes; longer ones lose their end

/// Whether a channel has more than one row with a sample.
bool SpeaksOften(const Channels::VSampleStore& i_rSamples)
{
    const std::size_t components = i_rSamples.Components();
    const TQL::TickRange held = i_rSamples.GetRange();
    std::vector<float> rows;
    int found = 0;
    for (std::int64_t tick = held.First; tick < held.Last; tick += RowsAtOnce * i_rSamples.Period())
    {
        const std::int64_t end = std::min(tick + RowsAtOnce * i_rSamples.Period(), held.Last);
        rows.resize(static_cast<std::size_t>((end - tick) / i_rSamples.Period()) * components);
        if (i_rSamples.ReadSamples({tick, end}, rows).IsError())
            continue; // forgotten meanwhile
        for (std::size_t at = 0; at < rows.size(); at += components)
            if (std::any_of(rows.begin() + static_cast<std::ptrdiff_t>(at),
                            rows.begin() + static_cast<std::ptrdiff_t>(at + components),
                            [](float i_Value) { return !std::isnan(i_Value); }) &&
                ++found > 1)
                return true;
    }
    return false;
}

Recordings::C3dStreamChannel NamesOf(const Channels::VSourceChannel& i_rChannel)
{
    const Channels::ChannelDefinition& rDefinition = i_rChannel.GetDefinition();
    return {KindOf(rDefinition.TypeName) == EChannelKind::Marker, rDefinition.Name, rDefinition.Units,
            Channels::ComponentNamesOf(rDefinition)};
}

} // namespace

std::set<const Channels::VSourceChannel*> ChooseForC3d(const Channels::VChannelContext& i_rContext,
                                                       std::vector<std::string>& o_rRemarks)
{
    std::vector<const Channels::VSourceChannel*> channels;
    const auto pChannels = i_rContext.GetChannels();
    for (const auto& rpChannel : *pChannels)
        channels.push_back(rpChannel.get());
    std::vector<Recordings::C3dStreamChannel> names;
    const auto fit = [&]
    {
        names.clear();
        std::ranges::transform(channels, std::back_inserter(names), [](const auto* i_p) { return NamesOf(*i_p); });
        return Recordings::VC3dStream({}).AddChannels(names);
    };
    std::size_t taken = fit();
    if (taken < channels.size()) // it takes reading to know which are strays
    {
        std::ranges::stable_partition(channels, [](const auto* i_p) { return SpeaksOften(*i_p->GetSamples()); });
        taken = fit();
    }
    if (const std::size_t leftOut = channels.size() - taken; leftOut > 0)
    {
        std::string text = std::to_string(leftOut) + (leftOut == 1 ? " channel was" : " channels were") +
                           " left out, for which a C3D file has no room: ";
        for (std::size_t i = 0; i < std::min(leftOut, NamesTold); ++i)
            text += (i == 0 ? "" : ", ") + names[taken + i].Name;
        o_rRemarks.push_back(leftOut > NamesTold ? text + " and " + std::to_string(leftOut - NamesTold) + " others"
                                                 : text);
    }
    return {channels.begin(), channels.begin() + static_cast<std::ptrdiff_t>(taken)};
}

namespace
{

bool BecomesAnalog(const RecordedChannel& i_rChannel)
{
    return i_rChannel.Kind == EChannelKind::Column || i_rChannel.Kind == EChannelKind::JointAngles ||
           i_rChannel.Kind == EChannelKind::Analog;
}

void Say(std::size_t i_Count, const char* i_pOne, const char* i_pMany, std::vector<std::string>& o_rRemarks)
{
    if (i_Count != 0)
        o_rRemarks.push_back(std::to_string(i_Count) + " " + (i_Count == 1 ? i_pOne : i_pMany));
}

/// One component of a channel as an analog channel of its own, each sample i_Repeats times.
RecordedChannel TakeComponent(const RecordedChannel& i_rChannel, std::size_t i_Component, std::int64_t i_Repeats)
{
    const std::string& rComponent = i_rChannel.ComponentNames[i_Component];
    RecordedChannel analog = {EChannelKind::Analog,
                              i_rChannel.Name,
                              {},
                              {""},
                              i_rChannel.Units,
                              i_rChannel.Rate,
                              i_rChannel.SamplePeriod / i_Repeats,
                              i_rChannel.FirstTick,
                              {}};
    analog.Rate *= static_cast<double>(i_Repeats);
    const std::string end = rComponent.empty() ? rComponent : "." + rComponent;
    analog.Name = analog.Name.substr(0, LongestName - std::min(LongestName, end.size())) + end;
    analog.Samples.reserve(i_rChannel.RowCount() * static_cast<std::size_t>(i_Repeats));
    for (std::size_t row = 0; row < i_rChannel.RowCount(); ++row)
        analog.Samples.insert(analog.Samples.end(), static_cast<std::size_t>(i_Repeats),
                              i_rChannel.Samples[row * i_rChannel.ComponentCount() + i_Component]);
    return analog;
}

/// What was changed, counted.
struct Changes
{
    std::size_t Poses = 0;
    std::size_t OtherUnits = 0;
    std::size_t MisfitRates = 0;
    std::size_t Converted = 0;
    std::size_t Repeated = 0;

    void Say(std::vector<std::string>& o_rRemarks) const
    {
        Streaming::Say(Converted, "column or joint angle was written as analog channels",
                       "columns and joint angles were written as analog channels", o_rRemarks);
        Streaming::Say(Repeated, "analog channel was brought to the rate of the fastest by repeating its samples",
                       "analog channels were brought to the rate of the fastest by repeating their samples",
                       o_rRemarks);
        Streaming::Say(Poses, "segment pose was left out: a C3D file has no place for it",
                       "segment poses were left out: a C3D file has no place for them", o_rRemarks);
        Streaming::Say(OtherUnits, "marker was left out: all have to have the unit of the first",
                       "markers or model outputs were left out: all of a kind have to have the unit of the first",
                       o_rRemarks);
        Streaming::Say(MisfitRates, "channel was left out: its rate does not fit the others",
                       "channels were left out: their rates do not fit the others", o_rRemarks);
    }
};

/// Moves one channel over, as what it becomes.
void FitChannel(RecordedChannel&& i_rChannel, std::int64_t i_FramePeriod, std::int64_t i_AnalogPeriod,
                std::vector<RecordedChannel>& o_rChannels, Changes& o_rChanges)
{
    if (i_rChannel.Kind == EChannelKind::SegmentPose)
        ++o_rChanges.Poses;
    else if (i_rChannel.Kind == EChannelKind::Marker || i_rChannel.Kind == EChannelKind::ModelOutput)
    {
        const auto first = std::ranges::find_if(
            o_rChannels, [&](const RecordedChannel& i_rBefore)
            { return i_rBefore.Kind == i_rChannel.Kind && i_rBefore.Quantity == i_rChannel.Quantity; });
        if (first != o_rChannels.end() && first->Units != i_rChannel.Units)
            ++o_rChanges.OtherUnits;
        else if (i_rChannel.SamplePeriod != i_FramePeriod)
            ++o_rChanges.MisfitRates;
        else
            o_rChannels.push_back(std::move(i_rChannel));
    }
    else if (i_rChannel.SamplePeriod % i_AnalogPeriod != 0)
        ++o_rChanges.MisfitRates;
    else
    {
        const std::int64_t repeats = i_rChannel.SamplePeriod / i_AnalogPeriod;
        o_rChanges.Repeated += repeats > 1 ? 1 : 0;
        o_rChanges.Converted += i_rChannel.Kind == EChannelKind::Analog ? 0 : 1;
        if (i_rChannel.ComponentCount() == 1 && repeats == 1)
        {
            i_rChannel.Kind = EChannelKind::Analog;
            i_rChannel.ComponentNames = {""};
            o_rChannels.push_back(std::move(i_rChannel));
            return;
        }
        for (std::size_t component = 0; component < i_rChannel.ComponentCount(); ++component)
            o_rChannels.push_back(TakeComponent(i_rChannel, component, repeats));
    }
}

} // namespace

void FitToC3d(VRecording& io_rRecording, std::vector<std::string>& o_rRemarks)
{
    std::int64_t analogPeriod = io_rRecording.FramePeriod;
    for (const RecordedChannel& rChannel : io_rRecording.Channels)
        if (BecomesAnalog(rChannel) && io_rRecording.FramePeriod % rChannel.SamplePeriod == 0)
            analogPeriod = std::min(analogPeriod, rChannel.SamplePeriod);
    Changes changes;
    std::vector<RecordedChannel> channels;
    for (RecordedChannel& rChannel : io_rRecording.Channels)
    {
        FitChannel(std::move(rChannel), io_rRecording.FramePeriod, analogPeriod, channels, changes);
        rChannel.Samples = {}; // the copy stands instead
    }
    for (RecordedChannel& rChannel : channels)
        rChannel.Name.resize(std::min(rChannel.Name.size(), LongestName));
    io_rRecording.Channels = std::move(channels);
    changes.Say(o_rRemarks);
}

} // namespace Streaming

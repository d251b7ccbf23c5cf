#include "Recordings/C3d/C3dWritePlan.h"

#include <algorithm>
#include <cstddef>
#include <cstdint>
#include <limits>

namespace Recordings
{

namespace
{

constexpr std::size_t LongestText = 255; // bytes; the width of a list of texts is one byte

void SortChannels(const VRecording& i_rRecording, C3dWritePlan& o_rPlan)
{
    for (const RecordedChannel& rChannel : i_rRecording.Channels)
    {
        const bool bPoint = rChannel.Kind == EChannelKind::Marker || rChannel.Kind == EChannelKind::ModelOutput;
        if (bPoint && rChannel.ComponentCount() == 3)
            o_rPlan.Points.push_back(&rChannel);
        else if (rChannel.Kind == EChannelKind::Analog && rChannel.ComponentCount() == 1)
            o_rPlan.Analog.push_back(&rChannel);
        else
            ++o_rPlan.LeftOut;
    }
}

void FindShape(const VRecording& i_rRecording, C3dWritePlan& o_rPlan)
{
    if (!o_rPlan.Analog.empty())
    {
        const RecordedChannel& rAnalog = *o_rPlan.Analog.front();
        const std::int64_t period = std::max<std::int64_t>(1, rAnalog.SamplePeriod);
        o_rPlan.AnalogSamplesPerFrame = static_cast<std::size_t>((i_rRecording.FramePeriod + period / 2) / period);
        const std::size_t perFrame = std::max<std::size_t>(1, o_rPlan.AnalogSamplesPerFrame);
        o_rPlan.Frames = rAnalog.RowCount() / perFrame;
        o_rPlan.Rate = rAnalog.Rate / static_cast<double>(perFrame);
    }
    if (!o_rPlan.Points.empty())
    {
        o_rPlan.Frames = o_rPlan.Points.front()->RowCount();
        o_rPlan.Rate = o_rPlan.Points.front()->Rate;
    }
    if (!(o_rPlan.Rate > 0.0))
        o_rPlan.Rate = static_cast<double>(TQL::DefaultTickRate) / static_cast<double>(i_rRecording.FramePeriod);
    const RecordedChannel* pFirst = !o_rPlan.Points.empty() ? o_rPlan.Points.front() : o_rPlan.Analog.front();
    o_rPlan.FirstFrame = static_cast<std::uint64_t>(pFirst->FirstTick / i_rRecording.FramePeriod + 1);
}

bool IsOnGrid(const RecordedChannel& i_rChannel, std::int64_t i_FirstTick, std::size_t i_Rows)
{
    return i_rChannel.FirstTick == i_FirstTick && i_rChannel.RowCount() == i_Rows;
}

bool HasTooLongText(const VRecording& i_rRecording)
{
    const auto isChannelTooLong = [](const RecordedChannel& i_rChannel)
    {
        return i_rChannel.Name.size() > LongestText || i_rChannel.Units.size() > LongestText;
    };
    const auto isEventTooLong = [](const RecordedEvent& i_rEvent)
    {
        return std::max({i_rEvent.Label.size(), i_rEvent.Subject.size(), i_rEvent.Context.size()}) > LongestText;
    };
    return std::any_of(i_rRecording.Channels.begin(), i_rRecording.Channels.end(), isChannelTooLong) ||
           std::any_of(i_rRecording.Events.begin(), i_rRecording.Events.end(), isEventTooLong);
}

} // namespace

C3dWritePlan PlanC3d(const VRecording& i_rRecording)
{
    C3dWritePlan plan;
    SortChannels(i_rRecording, plan);
    if (i_rRecording.FramePeriod > 0 && (!plan.Points.empty() || !plan.Analog.empty()))
        FindShape(i_rRecording, plan);
    return plan;
}

const RecordedChannel* C3dWritePlan::FirstOf(std::string_view i_Quantity) const
{
    const auto first =
        std::find_if(Points.begin(), Points.end(),
                     [&](const RecordedChannel* i_pChannel) { return i_pChannel->Quantity == i_Quantity; });
    return first == Points.end() ? nullptr : *first;
}

const char* FindC3dObstacle(const VRecording& i_rRecording, const C3dWritePlan& i_rPlan)
{
    if (i_rPlan.Frames == 0)
        return "there are no frames to write. Choose a recording with samples.";
    if (i_rPlan.LastFrame() > std::numeric_limits<std::uint32_t>::max() || i_rPlan.Points.size() > LargestC3dWord ||
        i_rPlan.Analog.size() * i_rPlan.AnalogSamplesPerFrame > LargestC3dWord)
        return "a C3D file cannot hold so many frames or channels. Choose fewer.";
    const std::int64_t firstTick = (static_cast<std::int64_t>(i_rPlan.FirstFrame) - 1) * i_rRecording.FramePeriod;
    const auto isPointWrong = [&](const RecordedChannel* i_pChannel)
    {
        return !IsOnGrid(*i_pChannel, firstTick, i_rPlan.Frames) ||
               i_pChannel->SamplePeriod != i_rRecording.FramePeriod ||
               i_pChannel->Units != i_rPlan.FirstOf(i_pChannel->Quantity)->Units;
    };
    if (std::any_of(i_rPlan.Points.begin(), i_rPlan.Points.end(), isPointWrong))
        return "the markers, or the outputs of one kind, differ in units, rate or length, which a C3D file cannot "
               "hold.";
    const auto isAnalogWrong = [&](const RecordedChannel* i_pChannel)
    {
        return !IsOnGrid(*i_pChannel, firstTick, i_rPlan.Frames * i_rPlan.AnalogSamplesPerFrame) ||
               i_pChannel->SamplePeriod != i_rPlan.Analog.front()->SamplePeriod;
    };
    if (std::any_of(i_rPlan.Analog.begin(), i_rPlan.Analog.end(), isAnalogWrong))
        return "the analog channels do not have the same whole number of samples in every frame, "
               "which a C3D file cannot hold.";
    if (HasTooLongText(i_rRecording))
        return "a name is longer than the 255 bytes that a C3D file can hold.";
    return i_rRecording.Events.size() > LargestC3dWord ? "a C3D file cannot hold more than 65535 events." : nullptr;
}

} // namespace Recordings

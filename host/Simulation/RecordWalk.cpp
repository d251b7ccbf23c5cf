#include "Simulation/RecordWalk.h"

#include "Simulation/VWalkSimulator.h"

#include <algorithm>
#include <cstddef>
#include <utility>

namespace Simulation
{

namespace
{

using Recordings::RecordedChannel;

void RecordMarkers(const VWalkSimulator& i_rSimulator, std::uint32_t i_Subject, std::int64_t i_FirstFrame,
                   std::int64_t i_Frames, std::vector<RecordedChannel>& o_rChannels)
{
    const auto& names = VWalkSimulator::MarkerNames();
    const std::size_t firstChannel = o_rChannels.size();
    const std::string subject = i_rSimulator.SubjectName(i_Subject);
    for (const std::string& rName : names)
    {
        RecordedChannel channel;
        channel.Kind = Recordings::EChannelKind::Marker;
        channel.Name = subject + ":" + rName;
        channel.Subject = subject;
        channel.ComponentNames = {"X", "Y", "Z"};
        channel.Units = "mm";
        channel.Rate = VWalkSimulator::FrameRate;
        channel.SamplePeriod = Recordings::PeriodOfRate(channel.Rate);
        channel.Samples.reserve(static_cast<std::size_t>(i_Frames) * 3);
        o_rChannels.push_back(std::move(channel));
    }
    std::vector<float> positions(names.size() * 3);
    for (std::int64_t frame = 0; frame < i_Frames; ++frame)
    {
        i_rSimulator.ReadMarkers(i_FirstFrame + frame, i_Subject, positions);
        for (std::size_t marker = 0; marker < names.size(); ++marker)
        {
            const auto first = positions.begin() + static_cast<std::ptrdiff_t>(marker * 3);
            auto& rSamples = o_rChannels[firstChannel + marker].Samples;
            rSamples.insert(rSamples.end(), first, first + 3);
        }
    }
}

void RecordAnalog(const VWalkSimulator& i_rSimulator, std::int64_t i_FirstFrame, std::int64_t i_Frames,
                  std::vector<RecordedChannel>& o_rChannels)
{
    constexpr std::size_t outputs = VWalkSimulator::AnalogOutputs;
    const std::size_t firstChannel = o_rChannels.size();
    for (std::uint32_t output = 0; output < outputs; ++output)
    {
        RecordedChannel channel;
        channel.Kind = Recordings::EChannelKind::Analog;
        channel.Name = i_rSimulator.AnalogName(output);
        channel.ComponentNames = {""};
        channel.Units = i_rSimulator.AnalogUnits(output);
        channel.Rate = VWalkSimulator::FrameRate * VWalkSimulator::AnalogSamplesPerFrame;
        channel.SamplePeriod = Recordings::PeriodOfRate(channel.Rate);
        channel.Samples.reserve(static_cast<std::size_t>(i_Frames) * VWalkSimulator::AnalogSamplesPerFrame);
        o_rChannels.push_back(std::move(channel));
    }
    std::vector<float> samples(outputs * VWalkSimulator::AnalogSamplesPerFrame);
    for (std::int64_t frame = 0; frame < i_Frames; ++frame)
    {
        i_rSimulator.ReadAnalog(i_FirstFrame + frame, samples);
        for (std::size_t i = 0; i < samples.size(); ++i)
            o_rChannels[firstChannel + i % outputs].Samples.push_back(samples[i]);
    }
}

} // namespace

Recordings::VRecording RecordWalk(const VWalkSimulator& i_rSimulator, std::int64_t i_FirstFrame, std::int64_t i_Frames)
{
    const std::int64_t frames = std::max<std::int64_t>(0, i_Frames);
    Recordings::VRecording recording;
    recording.Name = "walk";
    recording.Format = "C3D";
    recording.FramePeriod = Recordings::PeriodOfRate(VWalkSimulator::FrameRate);
    recording.Range = {0, frames * recording.FramePeriod};
    for (std::uint32_t subject = 0; subject < i_rSimulator.GetOptions().Subjects; ++subject)
        RecordMarkers(i_rSimulator, subject, i_FirstFrame, frames, recording.Channels);
    RecordAnalog(i_rSimulator, i_FirstFrame, frames, recording.Channels);

    const double start = static_cast<double>(i_FirstFrame) / VWalkSimulator::FrameRate;
    for (const auto& rEvent : i_rSimulator.ReadEvents(i_FirstFrame, frames))
        recording.Events.push_back({i_rSimulator.SubjectName(rEvent.Subject), rEvent.pLabel, rEvent.Seconds - start});
    return recording;
}

} // namespace Simulation

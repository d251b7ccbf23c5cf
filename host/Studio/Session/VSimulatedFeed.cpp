#include "Studio/Session/VSimulatedFeed.h"

#include "Channels/Common/ChannelTypes.h"
#include "Channels/Contexts/VLiveContext.h"
#include "Simulation/CameraRing.h"
#include "TQL/ITick.h"

#include <algorithm>
#include <cmath>
#include <functional>
#include <span>
#include <stdexcept>
#include <string>

namespace Studio
{

using Simulation::VWalkSimulator;

struct VSimulatedFeed::Source
{
    std::function<void(std::int64_t, std::span<float>)> Read; ///< one frame
    std::size_t ValuesPerFrame = 0;
    std::size_t Stride = 0;              ///< values of one row of all its channels
    std::size_t ValuesPerChannel = 0;    ///< of one row
    std::vector<std::uint32_t> Channels; ///< as the context numbers them, in the order of the array
    bool bMarkers = false;
    std::vector<float> Values;
};

namespace
{

constexpr std::int64_t longestBatch = 120; // frames

/// The simulator's names are unique, so that adding cannot fail.
std::uint32_t AddTo(Channels::VLiveContext& o_rContext, const Channels::ChannelDefinition& i_rDefinition,
                    std::int64_t i_SamplePeriod)
{
    std::uint32_t channel = 0;
    const TQL::IResult result = o_rContext.AddChannel(i_rDefinition, i_SamplePeriod, channel);
    if (result.IsError())
        throw std::logic_error("cannot add the channel " + i_rDefinition.Name + ": " +
                               std::string(result.Description()));
    return channel;
}

} // namespace

VSimulatedFeed::VSimulatedFeed(const VWalkSimulator::Options& i_rOptions,
                               std::shared_ptr<Channels::VLiveContext> i_pContext)
    : m_Simulator(i_rOptions), m_pContext(std::move(i_pContext))
{
    for (std::uint32_t subject = 0; subject < i_rOptions.Subjects; ++subject)
        AddSubject(subject);
    AddAnalog();
    AddCameras();
    AddSampleCount();
}

VSimulatedFeed::~VSimulatedFeed() = default;

void VSimulatedFeed::AddSubject(std::uint32_t i_Subject)
{
    const std::string prefix = m_Simulator.SubjectName(i_Subject) + ":";
    const auto add = [&](std::string_view i_Type, const std::vector<std::string>& i_rNames, std::size_t i_Components)
    {
        Source source;
        source.ValuesPerChannel = i_Components;
        source.Stride = source.ValuesPerFrame = i_rNames.size() * i_Components;
        for (std::size_t i = 0; i < i_rNames.size(); ++i)
        {
            Channels::ChannelDefinition definition;
            definition.TypeName = i_Type;
            definition.First = i_Subject;
            definition.Second = i;
            definition.Name = prefix + i_rNames[i];
            definition.Units = "mm";
            source.Channels.push_back(AddTo(*m_pContext, definition, 0));
        }
        return source;
    };

    Source markers = add(Channels::LabelledReconstructionType, VWalkSimulator::MarkerNames(), 3);
    markers.bMarkers = true;
    markers.Read = [this, i_Subject](std::int64_t i_Frame, std::span<float> o_Values)
    {
        m_Simulator.ReadMarkers(i_Frame, i_Subject, o_Values);
    };
    m_Sources.push_back(std::move(markers));

    Source segments = add(Channels::SegmentPoseType, VWalkSimulator::SegmentNames(), 6);
    segments.Read = [this, i_Subject](std::int64_t i_Frame, std::span<float> o_Values)
    {
        m_Simulator.ReadSegments(i_Frame, i_Subject, o_Values);
    };
    m_Sources.push_back(std::move(segments));
}

void VSimulatedFeed::AddAnalog()
{
    Source analog;
    analog.ValuesPerChannel = 1;
    analog.Stride = VWalkSimulator::AnalogOutputs;
    analog.ValuesPerFrame = analog.Stride * VWalkSimulator::AnalogSamplesPerFrame;
    for (std::uint32_t output = 0; output < VWalkSimulator::AnalogOutputs; ++output)
    {
        Channels::ChannelDefinition definition;
        definition.TypeName = Channels::DeviceOutputType;
        definition.Second = output;
        definition.Name = m_Simulator.AnalogName(output);
        definition.Units = m_Simulator.AnalogUnits(output);
        definition.ComponentNames = {""};
        analog.Channels.push_back(
            AddTo(*m_pContext, definition, TQL::DefaultFramePeriod / VWalkSimulator::AnalogSamplesPerFrame));
    }
    analog.Read = [this](std::int64_t i_Frame, std::span<float> o_Values)
    {
        m_Simulator.ReadAnalog(i_Frame, o_Values);
    };
    m_Sources.push_back(std::move(analog));
}

void VSimulatedFeed::AddCameras()
{
    Source cameras;
    std::vector<float> poses;
    for (std::uint32_t camera = 0; camera < Simulation::CameraCount; ++camera)
    {
        Channels::ChannelDefinition definition;
        definition.TypeName = Channels::CameraPoseType;
        definition.First = camera;
        definition.Name = Simulation::CameraName(camera);
        definition.Units = "mm";
        cameras.Channels.push_back(AddTo(*m_pContext, definition, 0));
        const auto pose = Simulation::CameraPoseOf(camera);
        poses.insert(poses.end(), pose.begin(), pose.end());
    }
    cameras.ValuesPerChannel = poses.size() / Simulation::CameraCount;
    cameras.Stride = cameras.ValuesPerFrame = poses.size();
    cameras.Read = [poses = std::move(poses)](std::int64_t, std::span<float> o_Values)
    {
        std::ranges::copy(poses, o_Values.begin());
    };
    m_Sources.push_back(std::move(cameras));
}

/// Behind the markers, for it counts what they are in the same batch.
void VSimulatedFeed::AddSampleCount()
{
    Source count;
    count.ValuesPerChannel = count.Stride = count.ValuesPerFrame = 1;
    Channels::ChannelDefinition definition;
    definition.TypeName = Channels::SampleCountType;
    definition.ComponentNames = {""};
    count.Channels.push_back(AddTo(*m_pContext, definition, 0));
    count.Read = [this](std::int64_t i_Frame, std::span<float> o_Values)
    {
        o_Values.front() = CountSamples(static_cast<std::size_t>(i_Frame - m_BatchFirst));
    };
    m_Sources.push_back(std::move(count));
}

/// The markers that are there in one row of the batch.
float VSimulatedFeed::CountSamples(std::size_t i_Row) const
{
    std::size_t count = 0;
    for (const Source& rSource : m_Sources)
    {
        if (!rSource.bMarkers)
            continue;
        const auto row =
            std::span<const float>(rSource.Values).subspan(i_Row * rSource.ValuesPerFrame, rSource.ValuesPerFrame);
        for (std::size_t i = 0; i < row.size(); i += rSource.ValuesPerChannel)
            count += std::isnan(row[i]) ? 0u : 1u;
    }
    return static_cast<float>(count);
}

TQL::IResult VSimulatedFeed::Produce(std::int64_t i_FirstFrame, std::int64_t i_FrameCount)
{
    const std::int64_t end = i_FirstFrame + i_FrameCount;
    for (std::int64_t first = i_FirstFrame; first < end; first += longestBatch)
        if (const TQL::IResult result = ProduceBatch(first, std::min(longestBatch, end - first)); result.IsError())
            return result;
    return TQL::Result::Ok;
}

TQL::IResult VSimulatedFeed::ProduceBatch(std::int64_t i_FirstFrame, std::int64_t i_FrameCount)
{
    m_Rows.clear();
    m_BatchFirst = i_FirstFrame;
    for (Source& rSource : m_Sources)
    {
        rSource.Values.resize(rSource.ValuesPerFrame * static_cast<std::size_t>(i_FrameCount));
        const std::span<float> values(rSource.Values);
        for (std::int64_t frame = 0; frame < i_FrameCount; ++frame)
            rSource.Read(i_FirstFrame + frame, values.subspan(static_cast<std::size_t>(frame) * rSource.ValuesPerFrame,
                                                              rSource.ValuesPerFrame));
        for (std::size_t i = 0; i < rSource.Channels.size(); ++i)
            m_Rows.push_back({rSource.Channels[i], values.subspan(i * rSource.ValuesPerChannel), rSource.Stride});
    }
    return m_pContext->AppendFrames(i_FirstFrame, i_FrameCount, m_Rows);
}

} // namespace Studio

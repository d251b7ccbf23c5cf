#include "Scenarios/SmallTake.h"

#include <algorithm>
#include <functional>
#include <limits>
#include <stdexcept>
#include <tuple>
#include <utility>
#include <vector>

namespace SmallTake
{
namespace
{

using Recordings::EChannelKind;
using Recordings::RecordedChannel;
using Values = std::vector<float>;

/// Rows at the frame rate, or i_RowsPerFrame times as many; i_rRow gets the number of the row.
RecordedChannel MakeChannel(EChannelKind i_Kind, const std::string& i_rName, const std::string& i_rUnits,
                            std::vector<std::string> i_Components, const std::function<Values(float)>& i_rRow,
                            std::int64_t i_RowsPerFrame = 1)
{
    RecordedChannel channel;
    channel.Kind = i_Kind;
    channel.Name = i_rName;
    channel.Subject = i_rName.substr(0, i_rName.find(':') == std::string::npos ? 0 : i_rName.find(':'));
    channel.ComponentNames = std::move(i_Components);
    channel.Units = i_rUnits;
    channel.Rate = 120.0 * static_cast<double>(i_RowsPerFrame);
    channel.SamplePeriod = TQL::DefaultFramePeriod / i_RowsPerFrame;
    for (std::int64_t row = 0; row < Frames * i_RowsPerFrame; ++row)
    {
        const Values values = i_rRow(static_cast<float>(row));
        channel.Samples.insert(channel.Samples.end(), values.begin(), values.end());
    }
    return channel;
}

std::vector<RecordedChannel> MakeMarkers(const std::string& i_rSubject)
{
    const std::vector<std::string> xyz{"X", "Y", "Z"};
    std::vector<RecordedChannel> markers;
    for (const auto& [rName, rY, rZ] :
         {std::tuple{"LASI", 100.0f, 300.0f}, {"RASI", 60.0f, 330.0f}, {"C7", 90.0f, 370.0f}})
        markers.push_back(MakeChannel(EChannelKind::Marker, i_rSubject + ":" + rName, "mm", xyz,
                                      [y = rY, z = rZ](float i_Frame) {
                                          return Values{10.0f * i_Frame, y, z};
                                      }));
    std::fill(markers[0].Samples.begin() + FirstLost * 3, markers[0].Samples.begin() + EndLost * 3,
              std::numeric_limits<float>::quiet_NaN());
    return markers;
}

RecordedChannel MakeSegment(const std::string& i_rName, float i_Turn, float i_Height)
{
    return MakeChannel(EChannelKind::SegmentPose, i_rName, "mm", {"RX", "RY", "RZ", "TX", "TY", "TZ"},
                       [=](float i_Frame)
                       { return Values{0.0f, 0.0f, 0.1f * i_Frame + i_Turn, 100.0f, 0.0f, i_Height}; });
}

} // namespace

std::shared_ptr<Recordings::VRecording> MakeRecording(const std::string& i_rSubject)
{
    auto pRecording = std::make_shared<Recordings::VRecording>();
    pRecording->Name = "Take";
    pRecording->Range = {0, Frames * TQL::DefaultFramePeriod};
    std::vector<RecordedChannel>& rChannels = pRecording->Channels;
    rChannels = MakeMarkers(i_rSubject);
    rChannels.push_back(MakeSegment(i_rSubject + ":Pelvis", 0.0f, 900.0f));
    rChannels.push_back(MakeSegment(i_rSubject + ":Femur", 0.2f, 500.0f));
    rChannels.push_back(MakeChannel(EChannelKind::JointAngles, "Knee", "deg", {"Z", "X", "Y"},
                                    [](float i_Frame) {
                                        return Values{10.0f + i_Frame, 20.0f, -5.0f};
                                    }));
    rChannels.back().RotationOrder = "ZXY";
    const auto count = [](float i_Row)
    {
        return Values{i_Row};
    };
    rChannels.push_back(MakeChannel(EChannelKind::Analog, "Force.Fz", "N", {""}, count, 10));
    rChannels.push_back(MakeChannel(EChannelKind::Column, "Torque", "N.m", {""}, count));
    rChannels.push_back(MakeChannel(EChannelKind::Column, "Ratio", "", {""}, count));
    for (const auto& [rName, pQuantity, pUnits] :
         {std::tuple{"KneeAngles", "Angle", "deg"}, {"KneeMoment", "Moment", "Nmm"}})
    {
        rChannels.push_back(MakeChannel(EChannelKind::ModelOutput, i_rSubject + ":" + rName, pUnits, {"X", "Y", "Z"},
                                        [](float i_Frame) {
                                            return Values{i_Frame, 2.0f, 3.0f};
                                        }));
        rChannels.back().Quantity = pQuantity;
    }
    rChannels.push_back(MakeSegment("Root", 0.0f, 90.0f));
    rChannels.back().Units.clear();
    return pRecording;
}

std::shared_ptr<Channels::VLiveContext> MakeCapture(const std::string& i_rName,
                                                    const std::shared_ptr<Channels::VSubTypeTable>& i_rpSubTypes)
{
    using namespace Channels;
    auto pContext = std::make_shared<VLiveContext>(i_rName, i_rpSubTypes, VLiveContext::Options());
    std::vector<RecordedChannel> channels = MakeMarkers("Anna");
    std::vector<ChannelRows> rows;
    const auto add = [&](ChannelDefinition i_Definition)
    {
        std::uint32_t number = 0;
        if (pContext->AddChannel(i_Definition, 0, number).IsError())
            throw std::runtime_error("the capture refuses " + i_Definition.Name);
        rows.push_back({number, {}, 0});
    };
    for (std::uint64_t marker = 0; marker < 3; ++marker)
        add({std::string(LabelledReconstructionType), 0, marker, "", channels[marker].Name, "mm", {}});
    add({std::string(CameraPoseType), 7, 0, "", "Camera7", "mm", {}});
    add({std::string(ModelOutputType), 0, 0, "Knee", "Knee", "deg", {""}, "", "Angle"});
    add({std::string(SampleCountType), 0, 0, "", "", "", {}});
    channels.push_back(MakeSegment("Camera7", 0.0f, 2500.0f));
    for (int i = 0; i < 2; ++i)
        channels.push_back(MakeChannel(EChannelKind::Column, "", "", {""}, [](float i_Row) { return Values{i_Row}; }));
    for (std::size_t i = 0; i < rows.size(); ++i)
        rows[i].Values = channels[i].Samples;
    if (pContext->AppendFrames(0, Frames, rows).IsError())
        throw std::runtime_error("the capture refuses its frames");
    return pContext;
}

} // namespace SmallTake

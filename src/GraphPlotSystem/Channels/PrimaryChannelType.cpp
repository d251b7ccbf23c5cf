#include "GraphPlotSystem/Channels/PrimaryChannelType.h"

#include "ChannelSystemUtils/RelativeMeasurements.h"
#include "ChannelSystemUtils/WalkChannels.h"

#include <algorithm>
#include <array>

namespace GraphPlotUI
{
namespace
{

constexpr std::array<std::string_view, 11> s_PrimaryTypes = {"CentroidCount",
                                                             "SampleCount",
                                                             "DeviceOutput",
                                                             "SubjectSegmentPose",
                                                             "Labelled Reconstructions",
                                                             "Unlabelled Reconstructions",
                                                             "SubjectSegmentPoseSolve",
                                                             "SubjectSegmentPoseRetarget",
                                                             "Joint Kinematics",
                                                             "Monitor",
                                                             "ModelSetSamplesOutput"};

bool IsPrimary(const std::string& i_rType)
{
    return std::ranges::find(s_PrimaryTypes, i_rType) != s_PrimaryTypes.end();
}

} // namespace

std::string PrimaryChannelType(const std::set<std::string>& i_rSelectedTypes)
{
    if (i_rSelectedTypes.empty())
        return {};
    const auto primary = std::ranges::find_if(i_rSelectedTypes, IsPrimary);
    const std::string& rType = primary == i_rSelectedTypes.end() ? *i_rSelectedTypes.begin() : *primary;
    if (rType.starts_with("SubjectSegmentPose"))
        return std::string(ChannelSystemUtils::PositionAndRotationType);
    if (rType.starts_with("CalibratedCameraPose"))
        return std::string(ChannelSystemUtils::CameraPositionType);
    return rType;
}

bool IsMadeOfType(const std::shared_ptr<TQL::IChannel>& i_rpChannel, std::string_view i_TypeName)
{
    return ChannelSystemUtils::VisitChannels(i_rpChannel, [i_TypeName](const TQL::IChannel& i_rChannel)
                                             { return i_rChannel.GetInstanceId().TypeName == i_TypeName; });
}

} // namespace GraphPlotUI

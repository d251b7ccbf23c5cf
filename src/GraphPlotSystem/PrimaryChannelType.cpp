#include "GraphPlotSystem/PrimaryChannelType.h"

#include "ChannelSystem/IChannel.h"

#include <algorithm>
#include <array>
#include <vector>

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
        return "_PositionAndRotation";
    if (rType.starts_with("CalibratedCameraPose"))
        return "_CameraPosition";
    return rType;
}

bool IsMadeOfType(const std::shared_ptr<TQL::IChannel>& i_rpChannel, std::string_view i_TypeName)
{
    std::vector<std::shared_ptr<TQL::IChannel>> open{i_rpChannel};
    std::set<const TQL::IChannel*> seen;
    while (!open.empty())
    {
        const std::shared_ptr<TQL::IChannel> pChannel = std::move(open.back());
        open.pop_back();
        if (!pChannel || !seen.insert(pChannel.get()).second)
            continue;
        if (pChannel->GetInstanceId().TypeName == i_TypeName)
            return true;
        std::vector<std::shared_ptr<TQL::IChannel>> inputs;
        pChannel->GetDependentChannels(inputs);
        open.insert(open.end(), inputs.begin(), inputs.end());
    }
    return false;
}

} // namespace GraphPlotUI

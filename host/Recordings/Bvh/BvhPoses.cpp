#include "Recordings/Bvh/BvhPoses.h"

#include <cmath>
#include <numbers>

namespace Recordings
{

namespace
{

Eigen::Vector3d AxisOf(EBvhChannel i_Channel)
{
    return Eigen::Vector3d::Unit(static_cast<Eigen::Index>(i_Channel) % 3);
}

void WritePose(const Eigen::Isometry3d& i_rWorld, std::span<float> o_Pose)
{
    const Eigen::AngleAxisd turn(Eigen::Quaterniond(i_rWorld.linear()).normalized());
    const Eigen::Vector3d rotation = turn.axis() * turn.angle();
    for (Eigen::Index axis = 0; axis < 3; ++axis)
    {
        o_Pose[static_cast<std::size_t>(axis)] = static_cast<float>(rotation[axis]);
        o_Pose[static_cast<std::size_t>(axis) + 3] = static_cast<float>(i_rWorld.translation()[axis]);
    }
}

} // namespace

VBvhPoses::VBvhPoses(const BvhHierarchy& i_rHierarchy) : m_rHierarchy(i_rHierarchy)
{
    // Of every joint: the link that it moves with, and where it stands from there.
    std::vector<Link> anchors;
    for (std::size_t i = 0; i < i_rHierarchy.Joints.size(); ++i)
    {
        const BvhJoint& rJoint = i_rHierarchy.Joints[i];
        Link link{BvhJoint::NoParent, rJoint.Offset};
        if (rJoint.Parent != BvhJoint::NoParent)
        {
            link.Parent = anchors[rJoint.Parent].Parent;
            link.Offset += anchors[rJoint.Parent].Offset;
        }
        if (!rJoint.Channels.empty())
        {
            m_Joints.push_back(i);
            m_Links.push_back(link);
            link = {m_Links.size() - 1, Eigen::Vector3d::Zero()};
        }
        anchors.push_back(link);
    }
    m_Worlds.resize(m_Links.size());
}

void VBvhPoses::Solve(std::span<const double> i_Frame, std::span<float> o_Poses)
{
    for (std::size_t i = 0; i < m_Links.size(); ++i)
    {
        const Link& rLink = m_Links[i];
        m_Worlds[i] = LocalTransform(m_rHierarchy.Joints[m_Joints[i]], rLink, i_Frame);
        if (rLink.Parent != BvhJoint::NoParent)
            m_Worlds[i] = m_Worlds[rLink.Parent] * m_Worlds[i];
        WritePose(m_Worlds[i], o_Poses.subspan(i * ComponentCount, ComponentCount));
    }
}

Eigen::Isometry3d VBvhPoses::LocalTransform(const BvhJoint& i_rJoint, const Link& i_rLink,
                                            std::span<const double> i_Frame) const
{
    Eigen::Vector3d position = i_rLink.Offset;
    Eigen::Quaterniond rotation = Eigen::Quaterniond::Identity();
    for (std::size_t i = 0; i < i_rJoint.Channels.size(); ++i)
    {
        const EBvhChannel channel = i_rJoint.Channels[i];
        const double value = i_Frame[i_rJoint.FirstColumn + i];
        if (IsRotation(channel))
            rotation = rotation * Eigen::AngleAxisd(value * std::numbers::pi / 180.0, AxisOf(channel));
        else if (IsPosition(channel))
        {
            const auto axis = static_cast<Eigen::Index>(channel);
            const bool bRoot = i_rJoint.Parent == BvhJoint::NoParent;
            // What stands between the parent's link and the parent itself stays where it is.
            position[axis] += bRoot ? value : value - i_rJoint.Offset[axis];
        }
    }
    return Eigen::Translation3d(position) * rotation;
}

} // namespace Recordings

#pragma once

#include "Recordings/Bvh/BvhHierarchy.h"

#include <Eigen/Geometry>

#include <cstddef>
#include <span>
#include <vector>

namespace Recordings
{

/// Forward kinematics: from the numbers of one frame to where the joints are in the world. Joints without channels of
/// their own move with their parent and get no pose. One thread at a time.
///
/// A joint's rotation turns about its own axes in the order in which its channels are written, so the matrix is their
/// product from left to right. A root's position channels are added to its offset; those of other joints stand in its
/// place, as programs write them that give every joint six channels.
class VBvhPoses
{
public:
    static constexpr std::size_t ComponentCount = 6;

    /// The hierarchy must outlive this.
    explicit VBvhPoses(const BvhHierarchy& i_rHierarchy);

    /// The joints that get a pose, in the order of their poses.
    std::span<const std::size_t> GetJoints() const { return m_Joints; }

    /// o_Poses: for each such joint RX, RY, RZ (the axis of rotation times its angle, radians, at most pi) and TX, TY,
    /// TZ in the file's unit. A missing number (NaN) leaves the joint and all that hang from it without a pose.
    void Solve(std::span<const double> i_Frame, std::span<float> o_Poses);

private:
    struct Link
    {
        std::size_t Parent = BvhJoint::NoParent; ///< index into m_Links
        Eigen::Vector3d Offset; ///< from the parent's link, joints without channels between them included
    };

    Eigen::Isometry3d LocalTransform(const BvhJoint& i_rJoint, const Link& i_rLink,
                                     std::span<const double> i_Frame) const;

    const BvhHierarchy& m_rHierarchy;
    std::vector<std::size_t> m_Joints;
    std::vector<Link> m_Links;
    std::vector<Eigen::Isometry3d> m_Worlds;
};

} // namespace Recordings

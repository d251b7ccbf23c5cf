#pragma once

#include "Recordings/Text/TextScan.h"
#include "TQL/IResult.h"

#include <Eigen/Core>

#include <cstddef>
#include <string>
#include <vector>

namespace Recordings
{

/// What one column of the motion moves.
enum class EBvhChannel
{
    XPosition,
    YPosition,
    ZPosition,
    XRotation, ///< degrees, about the axis as turned by the rotations written before it
    YRotation,
    ZRotation,
    Other ///< a column of no known meaning
};

constexpr bool IsPosition(EBvhChannel i_Channel)
{
    return i_Channel <= EBvhChannel::ZPosition;
}

constexpr bool IsRotation(EBvhChannel i_Channel)
{
    return i_Channel >= EBvhChannel::XRotation && i_Channel <= EBvhChannel::ZRotation;
}

/// One joint of a skeleton.
struct BvhJoint
{
    static constexpr std::size_t NoParent = static_cast<std::size_t>(-1);

    std::string Name;                                 ///< as in the file
    std::size_t Parent = NoParent;                    ///< index of a joint before this one
    Eigen::Vector3d Offset = Eigen::Vector3d::Zero(); ///< from the parent, in the file's unit of length
    std::vector<EBvhChannel> Channels;                ///< in the order of the columns, which is that of the turns
    std::vector<std::string> ChannelNames;            ///< as in the file
    std::size_t FirstColumn = 0;
};

/// The skeletons of a file, parents before their children.
struct BvhHierarchy
{
    std::vector<BvhJoint> Joints;
    std::size_t ColumnCount = 0; ///< numbers a frame
};

/// Reads from the first line up to the line "MOTION". On failure o_rError is one sentence that names the line. The
/// hierarchy may be nested as deep as it likes.
[[nodiscard]] TQL::IResult ReadBvhHierarchy(VLineScanner& io_rLines, BvhHierarchy& o_rHierarchy,
                                            std::vector<std::string>& io_rWarnings, std::string& o_rError);

} // namespace Recordings

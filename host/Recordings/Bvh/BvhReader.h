#pragma once

#include "Recordings/Common/ReadOptions.h"
#include "Recordings/Common/VRecording.h"
#include "TQL/IResult.h"

#include <cstddef>
#include <span>
#include <string>

namespace Recordings
{

/// Reads a BVH file (Biovision hierarchy; text). Each joint gives a JointAngles channel with its rotations as written,
/// in degrees and in the order of the file, a Column channel "NAME position" where it has position channels, and a
/// SegmentPose channel with its pose in the world. The format tells no unit of length, so positions have none.
/// A missing or unreadable number is NaN, as are the poses that hang from it. The rate is the round one that the
/// written frame time stands for; the frames run from tick 0.
/// On failure o_rError is one sentence that says what is wrong and what to do, without the name of the file, and
/// o_rRecording is untouched. Memory stays in proportion to the file. Any thread.
[[nodiscard]] TQL::IResult ReadBvh(std::span<const std::byte> i_File, const ReadOptions& i_rOptions,
                                   VRecording& o_rRecording, std::string& o_rError);

/// Whether the first word of the content is HIERARCHY.
bool LooksLikeBvh(std::span<const std::byte> i_File);

} // namespace Recordings

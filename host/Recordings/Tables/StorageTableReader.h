#pragma once

#include "Recordings/Common/ReadOptions.h"
#include "Recordings/Common/VRecording.h"
#include "TQL/IResult.h"

#include <cstddef>
#include <span>
#include <string>

namespace Recordings
{

/// Reads a MOT or STO file, a table of values over time below a head that ends with "endheader": each column becomes a
/// Column channel; a column whose cells hold several numbers ("1,0,0,0") becomes one channel with that many components.
/// The rows rule, not the counts in the head. Only columns whose names are those of joint angles get units, from the
/// line inDegrees. A file that cannot be understood gives an error, one sentence in o_rError without the file's name,
/// and leaves o_rRecording untouched. Any thread. Memory stays in proportion to the file.
[[nodiscard]] TQL::IResult ReadStorageTable(std::span<const std::byte> i_File, const ReadOptions& i_rOptions,
                                            VRecording& o_rRecording, std::string& o_rError);

/// Whether the content has the head of such a file.
bool LooksLikeStorageTable(std::span<const std::byte> i_File);

/// "deg" or "rad" for a column that holds a joint angle by its name, per second for its speed; empty for all others.
std::string UnitsOfAngle(const std::string& i_rColumn, bool i_bDegrees);

} // namespace Recordings

#pragma once

#include "Recordings/Common/ReadOptions.h"
#include "Recordings/Common/VRecording.h"
#include "TQL/IResult.h"

#include <cstddef>
#include <span>
#include <string>

namespace Recordings
{

/// Reads a table of numbers as text: cells between commas, semicolons, tabs, bars or blanks, decimal points or commas,
/// lines of other things above it, a row of names, a row of units, times in any of the usual units, frame numbers, or
/// neither. How the file is written is found by looking at its first lines. Columns become Column channels; three that
/// are clearly the X, Y and Z of one marker become a Marker channel, six that are those of a pose a SegmentPose one.
/// A file without a row of numbers gives an error, one sentence in o_rError without the file's name, and leaves
/// o_rRecording untouched. Any thread. Memory stays in proportion to the file.
[[nodiscard]] TQL::IResult ReadCsv(std::span<const std::byte> i_File, const ReadOptions& i_rOptions,
                                   VRecording& o_rRecording, std::string& o_rError);

/// Whether the content is text whose first lines hold rows of numbers.
bool LooksLikeCsv(std::span<const std::byte> i_File);

} // namespace Recordings

#pragma once

#include "Recordings/Common/ReadOptions.h"
#include "Recordings/Common/VRecording.h"
#include "TQL/IResult.h"

#include <cstddef>
#include <span>
#include <string>

namespace Recordings
{

/// Reads a TRC file, a table of marker trajectories: each marker becomes a Marker channel (X, Y, Z; a cell without a
/// number is NaN). The rows rule, not the counts in the head; times come from the Time column, or from the frame
/// numbers and the rate in the head where there are none. A file that cannot be understood gives an error, one sentence
/// in o_rError without the file's name, and leaves o_rRecording untouched. Any thread. Memory stays in proportion to
/// the file.
[[nodiscard]] TQL::IResult ReadTrc(std::span<const std::byte> i_File, const ReadOptions& i_rOptions,
                                   VRecording& o_rRecording, std::string& o_rError);

/// Whether the content begins as TRC files do.
bool LooksLikeTrc(std::span<const std::byte> i_File);

} // namespace Recordings

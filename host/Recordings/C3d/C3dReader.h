#pragma once

#include "Recordings/Common/ReadOptions.h"
#include "Recordings/Common/VRecording.h"
#include "TQL/IResult.h"

#include <cstddef>
#include <span>
#include <string>

namespace Recordings
{

/// Reads a C3D file: points become Marker channels (X, Y, Z; a missing sample is NaN in all three), analog channels
/// become Analog channels. All three processors, integer and real storage.
/// A file that is cut short gives the whole frames that are there and a warning. A file that cannot be understood gives
/// an error, one sentence in o_rError that says what is wrong and what to do, and leaves o_rRecording untouched.
/// Any thread. Memory stays in proportion to the size of the file, whatever the file claims.
/// The recording's name stays empty; o_rError does not name the file. The options' progress is heeded.
[[nodiscard]] TQL::IResult ReadC3d(std::span<const std::byte> i_File, const ReadOptions& i_rOptions,
                                   VRecording& o_rRecording, std::string& o_rError);

/// Whether the content is that of a C3D file: its mark, and a known processor where the header points to.
bool LooksLikeC3d(std::span<const std::byte> i_File);

} // namespace Recordings

#pragma once

#include "Recordings/Common/VRecording.h"
#include "TQL/IResult.h"

#include <filesystem>
#include <string>

namespace Recordings
{

/// Writes the Marker and Analog channels and the events of a recording as a C3D file (Intel, real storage). Reading it
/// back gives the same float values, gaps, names, grid and events.
/// All markers must lie on the frame grid of the recording and share one unit; all analog channels must share one grid
/// with a whole number of samples a frame. Channels of other kinds cannot be held by the format: they are left out, the
/// result is then OkButPartial and o_rError says how many. On failure the file that was there before stays as it was.
/// Any thread.
[[nodiscard]] TQL::IResult WriteC3d(const VRecording& i_rRecording, const std::filesystem::path& i_rPath,
                                    std::string& o_rError);

} // namespace Recordings

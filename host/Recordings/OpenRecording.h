#pragma once

#include "Recordings/VRecording.h"
#include "TQL/IResult.h"

#include <filesystem>
#include <string>

namespace Recordings
{

/// Reads a motion file of any kind that is known here. The kind is told by the content first, then by the ending of the
/// name. On failure o_rError is one line that names the file, says what is wrong and what to do, and o_rRecording is
/// untouched. What a reader had to guess or leave out stands in the recording's warnings. Any thread.
[[nodiscard]] TQL::IResult OpenRecording(const std::filesystem::path& i_rPath, VRecording& o_rRecording,
                                         std::string& o_rError);

} // namespace Recordings

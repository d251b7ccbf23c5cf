#pragma once

#include "Recordings/Common/ReadOptions.h"
#include "Recordings/Common/VRecording.h"
#include "TQL/IResult.h"

#include <filesystem>
#include <string>

namespace Recordings
{

/// Reads a motion file of any kind that FileFormats lists. The kind is told by the content
/// first, then by the ending of the name; text with rows of numbers and an unknown ending is read as CSV. On failure
/// o_rError is one line that names the file, says what is wrong and what to do, and o_rRecording is untouched. What a
/// reader had to guess or leave out stands in the recording's warnings. The options' progress is told how far it is;
/// when it says stop the result is Canceled. Beside the samples it needs little memory: large files are mapped. Any
/// thread.
[[nodiscard]] TQL::IResult OpenRecording(const std::filesystem::path& i_rPath, VRecording& o_rRecording,
                                         std::string& o_rError, const ReadOptions& i_rOptions = {});

/// Whether there is a file whose content says that it is a recording. Tables of which only the ending says so are not
/// told: nobody is surprised when one is replaced by another.
bool IsRecordingFile(const std::filesystem::path& i_rPath);

} // namespace Recordings

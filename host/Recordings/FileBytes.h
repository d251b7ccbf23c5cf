#pragma once

#include "TQL/IResult.h"

#include <cstddef>
#include <filesystem>
#include <string>
#include <string_view>
#include <vector>

namespace Recordings
{

/// Reads a whole file into memory. A folder, a device, an empty file and a file that may not be read are errors, told
/// in one sentence without the name of the file. Any thread.
[[nodiscard]] TQL::IResult ReadFileBytes(const std::filesystem::path& i_rPath, std::vector<std::byte>& o_rBytes,
                                         std::string& o_rError);

/// "walk.c3d: sentence", on one line whatever the name holds.
std::string FileMessage(const std::filesystem::path& i_rPath, std::string_view i_Sentence);

} // namespace Recordings

#pragma once

#include <filesystem>
#include <string>
#include <string_view>

namespace Recordings
{

/// "walk.c3d: sentence", on one line whatever the name holds.
std::string FileMessage(const std::filesystem::path& i_rPath, std::string_view i_Sentence);

} // namespace Recordings

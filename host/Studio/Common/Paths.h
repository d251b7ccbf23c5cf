#pragma once

#include <filesystem>
#include <string>

namespace Studio
{

/// From and to UTF-8.
std::filesystem::path PathFromText(const std::string& i_rText);
std::string TextFromPath(const std::filesystem::path& i_rPath);

/// The module that lies beside the program, whether it is there or not.
std::filesystem::path DefaultModulePath(const std::filesystem::path& i_rProgramFolder);

/// The recording that comes with the studio: as installed, with the program in lib/graphplots, or in the tree that it
/// was built in. Empty when it is nowhere.
std::filesystem::path FindSample(const std::filesystem::path& i_rProgramFolder);

} // namespace Studio

#pragma once

#include <filesystem>
#include <string>

namespace Studio
{

/// Whether a command may write to a path. Never over the file that it reads, under whatever name (empty: it reads
/// none); over another recording only when forced; other files are replaced. When not, o_rError is one line that says
/// what to do.
bool MayWrite(const std::filesystem::path& i_rTarget, const std::filesystem::path& i_rSource, bool i_bForce,
              std::string& o_rError);

} // namespace Studio

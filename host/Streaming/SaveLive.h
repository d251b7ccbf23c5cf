#pragma once

#include "TQL/IResult.h"

#include <filesystem>
#include <string>
#include <vector>

namespace Channels
{
class VChannelContext;
}

namespace Streaming
{

/// Writes what a context has kept as a C3D file, while its capture may go on. o_rRemarks says what the format could not
/// hold as it is. On failure o_rError is one line, and the file that was there before stays as it was. Takes as long as
/// copying and writing the samples: not for the UI thread.
[[nodiscard]] TQL::IResult SaveAsC3d(const Channels::VChannelContext& i_rContext, const std::filesystem::path& i_rPath,
                                     std::vector<std::string>& o_rRemarks, std::string& o_rError);

} // namespace Streaming

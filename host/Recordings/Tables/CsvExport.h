#pragma once

#include "Recordings/Common/VRecording.h"
#include "TQL/IResult.h"

#include <filesystem>
#include <span>
#include <string>

namespace Recordings
{

/// Writes channels of a recording as a table: a column `frame` with the number of the motion frame that the row lies
/// in, as the file and the plots count, a column `time` in seconds, then a column for each component, headed `channel
/// name.component name`, or the channel name alone where its only component has no name. There is a row for every time
/// at which one of the channels has a sample; an empty cell means no data. Values are in the units of the
/// recording, with as many digits as give the same float back. Names with a comma, quote or line break are quoted.
/// Patterns choose channels by name (see MatchesPattern); none means all. A pattern that matches nothing is an error.
/// On failure o_rError says why in one line, and a file that was there before stays as it was. Any thread.
[[nodiscard]] TQL::IResult ExportCsv(const VRecording& i_rRecording, const std::filesystem::path& i_rPath,
                                     std::span<const std::string> i_Patterns, std::string& o_rError);

} // namespace Recordings

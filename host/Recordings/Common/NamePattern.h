#pragma once

#include <string_view>

namespace Recordings
{

/// Whether the whole name fits the pattern: `*` stands for any number of characters, `?` for one (a UTF-8 character),
/// anything else for itself. Case matters. Takes at most name x pattern steps.
bool MatchesPattern(std::string_view i_Name, std::string_view i_Pattern);

} // namespace Recordings

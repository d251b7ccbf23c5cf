#pragma once

#include <functional>
#include <string>

namespace Studio
{

/// The name of the context and time source of the live capture.
inline constexpr const char* LiveContextName = "Live";

/// A context name for a recording that nothing bears yet: its own, or with a number behind it. Names with a meaning of
/// their own ("Live", "GlobalItems", "DataStore", any that begins with # or *) get "Recording " in front.
std::string MakeContextName(const std::string& i_rRecordingName,
                            const std::function<bool(const std::string&)>& i_rIsTaken);

} // namespace Studio

#pragma once

#include "Recordings/Common/VRecording.h"

#include <string>

namespace Studio
{

/// The channels of a recording as columns for a person: name, type, components, units, rate, samples, missing.
std::string FormatChannelTable(const Recordings::VRecording& i_rRecording);

/// The same as a JSON array with an object for each channel; components are an array of names.
std::string FormatChannelJson(const Recordings::VRecording& i_rRecording);

} // namespace Studio

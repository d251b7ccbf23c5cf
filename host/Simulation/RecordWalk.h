#pragma once

#include "Recordings/Common/VRecording.h"

#include <cstdint>

namespace Simulation
{

class VWalkSimulator;

/// A recording of the frames [i_FirstFrame, i_FirstFrame + i_Frames) as a capture file would hold it: a channel
/// "Subject:MARKER" for each marker (millimetres, a gap NaN), the analog outputs, and the foot events in seconds from
/// the first frame on. The first recorded frame stands at tick 0.
Recordings::VRecording RecordWalk(const VWalkSimulator& i_rSimulator, std::int64_t i_FirstFrame, std::int64_t i_Frames);

} // namespace Simulation

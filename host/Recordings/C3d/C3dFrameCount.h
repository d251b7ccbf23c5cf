#pragma once

#include "Recordings/C3d/C3dHeader.h"
#include "Recordings/C3d/C3dParameters.h"

#include <cstdint>
#include <vector>

namespace Recordings
{

/// One answer to the question which frames a C3D file holds.
struct C3dFrameSpan
{
    std::int64_t First = 1; ///< number of the first frame, from 1
    std::uint64_t Count = 0;
};

/// The answers that a C3D file gives, the most trustworthy first, none with 0 frames. Header and POINT:FRAMES hold 16
/// bits, so longer recordings say it elsewhere as well: as two words in TRIAL, or as a real in POINT:LONG_FRAMES. An
/// answer that is the first one cut to 16 bits is left out.
std::vector<C3dFrameSpan> C3dFrameSpans(const C3dHeader& i_rHeader, const VC3dParameters& i_rParameters);

} // namespace Recordings

#pragma once

#include "Recordings/C3dLayout.h"
#include "Recordings/C3dParameters.h"
#include "Recordings/VRecording.h"

#include <cstddef>
#include <span>
#include <string>
#include <vector>

namespace Recordings
{

/// A C3D file whose structure is known. References what its maker holds.
struct C3dSource
{
    std::span<const std::byte> File;
    const C3dHeader& Header;
    const VC3dParameters& Parameters;
    const C3dLayout& Layout;
};

/// Adds a Marker channel for each point: its units, its label, samples x (X, Y, Z).
/// A point is missing (NaN in all three) where its fourth word, as a 16-bit integer, is negative.
void AddC3dPoints(const C3dSource& i_rSource, VRecording& io_rRecording);

/// Adds an Analog channel for each analog channel: (raw - OFFSET) x SCALE x GEN_SCALE, whatever the storage.
void AddC3dAnalog(const C3dSource& i_rSource, VRecording& io_rRecording);

/// Adds the events of the EVENT group, then those of the header that are not among them.
void AddC3dEvents(const C3dSource& i_rSource, VRecording& io_rRecording);

} // namespace Recordings

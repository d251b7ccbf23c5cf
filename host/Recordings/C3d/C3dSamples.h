#pragma once

#include "Recordings/C3d/C3dLayout.h"
#include "Recordings/C3d/C3dParameters.h"
#include "Recordings/Common/VRecording.h"

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

/// Frames of a file, counted from its first one.
struct C3dFrames
{
    std::size_t First = 0;
    std::size_t Count = 0;
};

struct C3dCalibration
{
    double Offset = 0.0;
    double Scale = 1.0;
};

/// How the analog words of a file become values.
struct C3dAnalogRules
{
    EWordKind Kind = EWordKind::Signed;
    std::vector<C3dCalibration> Calibrations; ///< of each channel
};

/// Adds a Marker channel, or a ModelOutput channel, for each point: its units, its label, room for its samples.
void AddC3dPoints(const C3dSource& i_rSource, VRecording& io_rRecording);

/// Adds an Analog channel for each analog channel, with room for its samples.
C3dAnalogRules AddC3dAnalog(const C3dSource& i_rSource, VRecording& io_rRecording);

/// Appends the samples of some frames to the channels, which are those of the points: X, Y, Z. A point is missing (NaN
/// in all three) where its fourth word, as a 16-bit integer, is negative. The scratch is for use again and again.
void ReadC3dPoints(const C3dSource& i_rSource, const C3dFrames& i_rFrames, std::span<RecordedChannel> io_Channels,
                   std::vector<float>& io_rScratch);

/// The same for the analog channels: (raw - OFFSET) x SCALE x GEN_SCALE, whatever the storage.
void ReadC3dAnalog(const C3dSource& i_rSource, const C3dAnalogRules& i_rRules, const C3dFrames& i_rFrames,
                   std::span<RecordedChannel> io_Channels, std::vector<float>& io_rScratch);

/// Adds the events of the EVENT group, then those of the header that are not among them.
void AddC3dEvents(const C3dSource& i_rSource, VRecording& io_rRecording);

} // namespace Recordings

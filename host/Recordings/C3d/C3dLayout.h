#pragma once

#include "Recordings/C3d/C3dHeader.h"
#include "Recordings/C3d/C3dParameters.h"
#include "TQL/IResult.h"

#include <cstddef>
#include <cstdint>
#include <string>
#include <vector>

namespace Recordings
{

/// Where the samples of a C3D file lie and how many of them there are. A value.
/// A frame is all points (four words each) and then, for each analog sample of the frame, one word a channel.
struct C3dLayout
{
    bool bReal = false; ///< words are 32-bit reals, else 16-bit integers
    std::size_t Points = 0;
    std::size_t AnalogChannels = 0;
    std::size_t AnalogSamplesPerFrame = 0;
    std::size_t DataOffset = 0;     ///< bytes from the start of the file
    std::size_t DeclaredFrames = 0; ///< what the file says
    std::size_t Frames = 0;         ///< whole frames that are in the file, at most DeclaredFrames
    std::int64_t FirstFrame = 1;    ///< its number, from 1
    double Rate = 0.0;              ///< frames a second; between 0.1 and 1,000,000
    double PointScale = 1.0;        ///< units of one integer count

    std::size_t WordBytes() const { return bReal ? 4 : 2; }
    std::size_t FrameBytes() const { return (Points * 4 + AnalogChannels * AnalogSamplesPerFrame) * WordBytes(); }
};

/// Finds the layout from header and parameters. Where the two disagree, the parameters hold unless the file's size
/// speaks for the header; that and whatever else had to be guessed adds a sentence to o_rWarnings.
/// Fails when there is no frame to read, with one sentence in o_rError.
[[nodiscard]] TQL::IResult FindC3dLayout(std::size_t i_FileBytes, const C3dHeader& i_rHeader,
                                         const VC3dParameters& i_rParameters, C3dLayout& o_rLayout,
                                         std::vector<std::string>& o_rWarnings, std::string& o_rError);

} // namespace Recordings

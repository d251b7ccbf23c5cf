#pragma once

#include "Recordings/Text/ByteDecoder.h"
#include "TQL/IResult.h"

#include <cstddef>
#include <cstdint>
#include <span>
#include <string>

namespace Recordings
{

inline constexpr std::size_t C3dBlockBytes = 512; ///< the sections of a C3D file start at multiples of it

/// The numbers at the start of a C3D file, as they stand there, and the processor that rules the file. A value.
struct C3dHeader
{
    VByteDecoder Decoder{EProcessor::Intel};
    std::size_t ParameterOffset = 0; ///< bytes from the start of the file; inside the file
    std::size_t ParameterBytes = 0;  ///< length that the parameter section gives itself; may go past the file's end
    std::size_t DataOffset = 0;      ///< bytes from the start of the file; 0 when the header points nowhere
    std::uint16_t Points = 0;
    std::uint16_t AnalogPerFrame = 0; ///< channels x samples of one channel in a frame
    std::uint16_t AnalogSamplesPerFrame = 0;
    std::uint16_t FirstFrame = 0;
    std::uint16_t LastFrame = 0;
    float Scale = 0.0f; ///< negative: real storage
    float Rate = 0.0f;  ///< frames a second
};

/// Reads the header. On failure o_rError is one sentence that says what is wrong and what to do.
[[nodiscard]] TQL::IResult ReadC3dHeader(std::span<const std::byte> i_File, C3dHeader& o_rHeader,
                                         std::string& o_rError);

/// Whether the file carries the mark of a C3D file.
bool HasC3dMark(std::span<const std::byte> i_File);

} // namespace Recordings

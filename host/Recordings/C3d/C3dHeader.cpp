#include "Recordings/C3d/C3dHeader.h"

#include <optional>

namespace Recordings
{

namespace
{

constexpr std::byte Mark{0x50};
constexpr std::size_t ParameterHeadBytes = 4; // two bytes of no use, number of blocks, processor

std::size_t OffsetOfBlock(std::size_t i_Block)
{
    return i_Block == 0 ? 0 : (i_Block - 1) * C3dBlockBytes;
}

TQL::IResult FindProcessor(std::span<const std::byte> i_File, C3dHeader& o_rHeader, std::string& o_rError)
{
    const auto block = std::to_integer<std::size_t>(i_File[0]);
    if (block < 2)
    {
        o_rError = "the header does not point to the parameters. Export the file again from the program that made it.";
        return TQL::Result::InvalidFormat;
    }
    o_rHeader.ParameterOffset = OffsetOfBlock(block);
    if (o_rHeader.ParameterOffset + ParameterHeadBytes > i_File.size())
    {
        o_rError = "the file ends before its parameters. Copy it again from where it came.";
        return TQL::Result::EndOfData;
    }
    const auto head = i_File.subspan(o_rHeader.ParameterOffset, ParameterHeadBytes);
    const std::optional<EProcessor> processor = ProcessorOfByte(head[3]);
    if (!processor)
    {
        o_rError = "the parameter section names an unknown processor (" +
                   std::to_string(std::to_integer<unsigned>(head[3])) +
                   "). Export the file again from the program that made it.";
        return TQL::Result::InvalidFormat;
    }
    o_rHeader.Decoder = VByteDecoder(*processor);
    o_rHeader.ParameterBytes = std::to_integer<std::size_t>(head[2]) * C3dBlockBytes;
    return TQL::Result::Ok;
}

} // namespace

bool HasC3dMark(std::span<const std::byte> i_File)
{
    return i_File.size() >= 2 && i_File[1] == Mark;
}

TQL::IResult ReadC3dHeader(std::span<const std::byte> i_File, C3dHeader& o_rHeader, std::string& o_rError)
{
    if (!HasC3dMark(i_File))
    {
        o_rError = "this is not a C3D file: its mark is missing. Choose a file that a motion capture program exported.";
        return TQL::Result::InvalidFormat;
    }
    if (i_File.size() < C3dBlockBytes)
    {
        o_rError = "the file ends inside its header. Copy it again from where it came.";
        return TQL::Result::EndOfData;
    }
    if (const TQL::IResult result = FindProcessor(i_File, o_rHeader, o_rError); result.IsError())
        return result;

    const auto word = [&](std::size_t i_Number)
    {
        return o_rHeader.Decoder.Word(i_File.subspan((i_Number - 1) * 2));
    };
    const auto real = [&](std::size_t i_Number)
    {
        return o_rHeader.Decoder.Real(i_File.subspan((i_Number - 1) * 2));
    };
    o_rHeader.Points = word(2);
    o_rHeader.AnalogPerFrame = word(3);
    o_rHeader.FirstFrame = word(4);
    o_rHeader.LastFrame = word(5);
    o_rHeader.Scale = real(7);
    o_rHeader.DataOffset = OffsetOfBlock(word(9));
    o_rHeader.AnalogSamplesPerFrame = word(10);
    o_rHeader.Rate = real(11);
    return TQL::Result::Ok;
}

} // namespace Recordings

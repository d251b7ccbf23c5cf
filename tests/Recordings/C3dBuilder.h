#pragma once

#include "Recordings/Text/ByteDecoder.h"

#include <array>
#include <cstddef>
#include <cstdint>
#include <string>
#include <vector>

namespace TestRecordings
{

/// One parameter as it shall stand in a file.
struct ParameterSpec
{
    std::string Group;
    std::string Name;
    int Type = 2; ///< -1 characters, 1 bytes, 2 integers, 4 reals
    std::vector<int> Dimensions;
    std::vector<double> Numbers; ///< data of the numeric types
    std::string Characters;      ///< data of type -1
};

ParameterSpec Integers(std::string i_Group, std::string i_Name, std::vector<double> i_Numbers);
ParameterSpec Reals(std::string i_Group, std::string i_Name, std::vector<double> i_Numbers);
ParameterSpec Texts(std::string i_Group, std::string i_Name, const std::vector<std::string>& i_rTexts);

struct HeaderEventSpec
{
    std::string Label;
    double Seconds = 0.0;
    bool bOn = true;
};

/// A C3D file as a table of what stands in it, written by BuildC3d without any of the code under test. Frames hold raw
/// words: four a point, then the analog samples.
struct C3dSpec
{
    Recordings::EProcessor Processor = Recordings::EProcessor::Intel;
    bool bReal = true;
    unsigned Points = 0;
    unsigned AnalogChannels = 0;
    unsigned AnalogSamplesPerFrame = 0;
    unsigned FirstFrame = 1;
    unsigned LastFrame = 0; ///< as the header says it; 0: FirstFrame and the number of frames
    double Scale = 1.0;     ///< of the header; its sign is set by bReal
    double Rate = 100.0;
    std::vector<std::vector<double>> Frames;
    std::vector<ParameterSpec> Parameters;
    std::vector<HeaderEventSpec> Events;

    unsigned ParameterBlock = 2;
    unsigned EmptyBlocksBeforeData = 0;
    bool bEndMark = true;            ///< without it the last record points far behind the section
    bool bLocked = false;            ///< names with negative lengths
    bool bGroupsLast = false;        ///< parameters come before the records of their groups
    std::string Description;         ///< behind every record
    bool bPointToData = true;        ///< whether the header says where the data begin
    bool bSayParameterLength = true; ///< whether the section says how long it is

    /// The word in the data that stands for a number.
    std::vector<std::byte> Encode(double i_Value) const;
};

/// Where things lie in the built file, in bytes.
struct BuiltC3d
{
    std::vector<std::byte> Bytes;
    std::size_t ParameterOffset = 0;
    std::size_t DataOffset = 0;
};

BuiltC3d BuildC3d(const C3dSpec& i_rSpec);

/// Two subjects' worth of little: 2 points, 2 analog channels x 2, 3 frames, the second point missing in frame 2.
/// Every storage and processor gives the same recording.
C3dSpec SmallSpec(Recordings::EProcessor i_Processor, bool i_bReal);

} // namespace TestRecordings

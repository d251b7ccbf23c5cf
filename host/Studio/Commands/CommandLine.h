#pragma once

#include "TQL/IResult.h"

#include <cstdint>
#include <optional>
#include <span>
#include <string>
#include <utility>
#include <vector>

namespace Studio
{

enum class ECommand
{
    Window,     ///< open the studio
    Channels,   ///< list the channels of a file
    Export,     ///< write channels as a table
    Snapshot,   ///< write a picture of a Graph Plots window
    CheckStore, ///< print what a store file holds and what is wrong with it
    Record,     ///< write what comes in over the network as a recording
    Help,
    Version
};

/// What the words after the program's name ask for. Paths are UTF-8, as given.
struct CommandLine
{
    ECommand Command = ECommand::Window;
    std::vector<std::string> Files;
    bool bLive = false;
    std::uint32_t Subjects = 2;           ///< of the simulated capture
    std::string OscAddress = "127.0.0.1"; ///< where to listen for Open Sound Control messages
    std::uint16_t OscPort = 0;            ///< 0: not at all
    double OscRate = 0.0;                 ///< frames a second; 0: measured
    std::string ReplayPath;               ///< a recording to replay as live; empty: none
    double Speed = 1.0;                   ///< of the replay
    bool bLoop = false;                   ///< replay again and again
    double Seconds = 0.0;                 ///< how long to record
    bool bResample = false;               ///< rows at uneven times are laid on an even rate
    bool bJson = false;
    bool bForce = false; ///< another recording may be replaced
    std::string CsvPath;
    std::string PicturePath;
    std::vector<std::string> Patterns;               ///< of channel names; empty: the command's own choice
    std::optional<std::pair<int, int>> Size;         ///< of the picture, pixels
    std::optional<std::pair<double, double>> Range;  ///< of the time axis, frames
    std::optional<std::pair<double, double>> Values; ///< of the value axes, in the channels' units
    std::optional<int> AfterMilliseconds;            ///< to wait before the picture is taken
    std::string ModulePath;                          ///< empty: the module beside the program
    bool bCheck = false;                             ///< watch how the module keeps the rules of a host
};

inline constexpr std::uint32_t MostSubjects = 16;
inline constexpr int LargestPicture = 16384; ///< pixels, width or height

/// Reads the words after the program's name. On failure o_rError says in one line what is wrong and what to do.
[[nodiscard]] TQL::IResult ParseCommandLine(std::span<const std::string> i_Words, CommandLine& o_rCommandLine,
                                            std::string& o_rError);

/// The text of --help, several lines.
std::string HelpText();

} // namespace Studio

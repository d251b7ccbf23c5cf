#pragma once

#include <string>

namespace Studio
{

struct CommandLine;
class VStudioSession;

/// Whether the command line names a live input other than the simulated one.
bool NamesLiveInput(const CommandLine& i_rCommandLine);

/// Starts the one that it names, and shows it. o_rMessage is a line for the operator, or empty. On failure o_rError is
/// one line.
bool StartLiveInput(VStudioSession& o_rSession, const CommandLine& i_rCommandLine, std::string& o_rMessage,
                    std::string& o_rError);

} // namespace Studio

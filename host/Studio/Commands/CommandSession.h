#pragma once

#include <filesystem>
#include <string>

namespace Studio
{

struct CommandLine;
class VStudioSession;

/// The module that the command line names, else the one beside the program.
std::filesystem::path ModulePathOf(const CommandLine& i_rCommandLine);

/// Closes the session and returns the exit status: StatusFailed, with all faults in the one line, when the strict host
/// found any.
int EndSession(VStudioSession& o_rSession, std::string& o_rError);

} // namespace Studio

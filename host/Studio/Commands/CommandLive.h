#pragma once

#include <string>

namespace Studio
{

struct CommandLine;
class VStudioSession;

/// Starts to listen where the command line says and shows what comes. On failure o_rError is one line.
bool StartListening(VStudioSession& o_rSession, const CommandLine& i_rCommandLine, std::string& o_rError);

} // namespace Studio

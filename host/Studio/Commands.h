#pragma once

#include <string>

namespace Studio
{

struct CommandLine;

inline constexpr int StatusOk = 0;
inline constexpr int StatusFailed = 2;

/// Each runs one command of the program and returns its exit status; o_rError is the one line for standard error when
/// that is StatusFailed. The first two need no display and no application object.
int RunChannels(const CommandLine& i_rCommandLine, std::string& o_rError);
int RunExport(const CommandLine& i_rCommandLine, std::string& o_rError);

/// Need the application object. The window runs until the operator closes it.
int RunSnapshot(const CommandLine& i_rCommandLine, std::string& o_rError);
int RunWindow(const CommandLine& i_rCommandLine, std::string& o_rError);

} // namespace Studio

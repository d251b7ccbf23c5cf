#pragma once

#include <string>

namespace Studio
{

struct CommandLine;

inline constexpr int StatusOk = 0;
inline constexpr int StatusProblems = 1; ///< what was checked has problems, which are in the output
inline constexpr int StatusFailed = 2;

/// Each runs one command of the program and returns its exit status; o_rError is the one line for standard error when
/// that is StatusFailed. The first four need no display and no application object.
int RunChannels(const CommandLine& i_rCommandLine, std::string& o_rError);
int RunExport(const CommandLine& i_rCommandLine, std::string& o_rError);
int RunRecord(const CommandLine& i_rCommandLine, std::string& o_rError); ///< until its time is over, or an interrupt
int RunCheckStore(const CommandLine& i_rCommandLine, std::string& o_rError);

/// Need the application object. The window runs until the operator closes it.
int RunSnapshot(const CommandLine& i_rCommandLine, std::string& o_rError);
int RunWindow(const CommandLine& i_rCommandLine, std::string& o_rError);

} // namespace Studio

#pragma once

#include <cerrno>
#include <functional>
#include <set>
#include <string>

/// Stands between the file services and the C library (the linker's --wrap): the calls that a save or a load makes can
/// be counted, made to fail or to end the process. For one thread.
namespace FaultLayer
{

struct Plan
{
    std::set<std::string> Refused; ///< these calls always fail: "link" with EPERM, "renameat2" with EINVAL
    int StopAt = 0;                ///< the process ends instead of the n-th call
    int FailAt = 0;                ///< the n-th call fails
    int FailWith = EIO;
    std::string Only;                  ///< only calls of this name are counted; all when empty
    std::function<void()> Before = {}; ///< what another program does before each call
};

/// The plan holds while i_rWork runs.
void With(const Plan& i_rPlan, const std::function<void()>& i_rWork);

/// How many calls the last With has counted.
int GetCount();

constexpr int StoppedCode = 77;

/// Runs i_rWork in a child process and gives its answer, or StoppedCode, or minus the signal that ended it.
int InChild(const std::function<int()>& i_rWork);

} // namespace FaultLayer

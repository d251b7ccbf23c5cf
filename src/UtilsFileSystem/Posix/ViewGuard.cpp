#include "UtilsFileSystem/SystemCalls.h"

#include <algorithm>
#include <array>
#include <atomic>
#include <csignal>
#include <cstddef>
#include <mutex>

#include <sys/mman.h>
#include <unistd.h>

// Reading a mapped page behind the end of its file raises SIGBUS. The handler here puts zeros in the place of the rest
// of a guarded view and lets the read go on; a fault anywhere else goes to whoever handled the signal before. It is
// there only while views are guarded: this code may be part of a module that is unloaded.
namespace UtilsFileSystem::System
{
namespace
{

struct Range
{
    std::atomic<std::uintptr_t> First{0}; ///< 0: the place is free
    std::atomic<std::uintptr_t> End{0};
    std::atomic<bool> bActed{false};
};

constexpr std::size_t s_Places = 32;

// Read by the signal handler, so plain atomics that live as long as the process.
std::array<Range, s_Places> s_Ranges;
std::mutex s_Mutex;        // held while places are taken and freed
bool s_bInstalled = false; // guarded by s_Mutex
struct sigaction s_Before;
std::uintptr_t s_PageSize = 0;

bool FillWithZeros(std::uintptr_t i_Address)
{
    for (Range& rRange : s_Ranges)
    {
        const std::uintptr_t first = rRange.First.load();
        const std::uintptr_t end = rRange.End.load();
        if (first == 0 || i_Address < first || i_Address >= end)
            continue;
        const std::uintptr_t page = i_Address - i_Address % s_PageSize;
        rRange.bActed.store(true);
        return ::mmap(reinterpret_cast<void*>(page), end - page, PROT_READ, MAP_PRIVATE | MAP_ANONYMOUS | MAP_FIXED, -1,
                      0) != MAP_FAILED;
    }
    return false;
}

void HandleFault(int i_Signal, siginfo_t* i_pInfo, void* i_pContext)
{
    if (FillWithZeros(reinterpret_cast<std::uintptr_t>(i_pInfo->si_addr)))
        return;
    if ((s_Before.sa_flags & SA_SIGINFO) != 0)
        s_Before.sa_sigaction(i_Signal, i_pInfo, i_pContext);
    else if (s_Before.sa_handler != SIG_DFL && s_Before.sa_handler != SIG_IGN)
        s_Before.sa_handler(i_Signal);
    else
        ::sigaction(SIGBUS, &s_Before, nullptr); // the fault comes again and ends the process as it always would
}

/// Under the mutex, as the one below.
bool Install()
{
    if (s_bInstalled)
        return true;
    s_PageSize = static_cast<std::uintptr_t>(::sysconf(_SC_PAGESIZE));
    struct sigaction action = {};
    action.sa_sigaction = HandleFault;
    action.sa_flags = SA_SIGINFO;
    ::sigemptyset(&action.sa_mask);
    s_bInstalled = ::sigaction(SIGBUS, &action, &s_Before) == 0;
    return s_bInstalled;
}

/// Whoever came after hands faults on to here, so it stays where there is somebody.
void Uninstall()
{
    struct sigaction now = {};
    const bool bLast = ::sigaction(SIGBUS, nullptr, &now) == 0 && now.sa_sigaction == HandleFault;
    if (bLast && ::sigaction(SIGBUS, &s_Before, nullptr) == 0)
        s_bInstalled = false;
}

} // namespace

int GuardView(void* i_pView, std::uint64_t i_Length)
{
    const std::lock_guard lock(s_Mutex);
    if (!Install())
        return -1;
    for (std::size_t place = 0; place < s_Places; ++place)
    {
        Range& rRange = s_Ranges[place];
        if (rRange.First.load() != 0)
            continue;
        const auto first = reinterpret_cast<std::uintptr_t>(i_pView);
        const std::uintptr_t end = first + i_Length;
        rRange.bActed.store(false);
        rRange.End.store(end + (s_PageSize - end % s_PageSize) % s_PageSize);
        rRange.First.store(first);
        return static_cast<int>(place);
    }
    return -1;
}

bool HasGuardActed(int i_Guard)
{
    return s_Ranges[static_cast<std::size_t>(i_Guard)].bActed.load();
}

void ReleaseGuard(int i_Guard)
{
    const std::lock_guard lock(s_Mutex);
    s_Ranges[static_cast<std::size_t>(i_Guard)].First.store(0);
    if (std::ranges::all_of(s_Ranges, [](const Range& i_rRange) { return i_rRange.First.load() == 0; }))
        Uninstall();
}

} // namespace UtilsFileSystem::System

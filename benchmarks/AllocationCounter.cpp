#include "AllocationCounter.h"

#include <cstddef>

namespace
{

constinit thread_local std::uint64_t t_Allocations = 0;

} // namespace

namespace Bench
{

std::uint64_t AllocationsOfThisThread()
{
    return t_Allocations;
}

} // namespace Bench

// The names under which the C library keeps its own functions. operator new goes through malloc, so it is counted once.
extern "C"
{
    void* __libc_malloc(std::size_t);
    void* __libc_calloc(std::size_t, std::size_t);
    void* __libc_realloc(void*, std::size_t);
    void* __libc_memalign(std::size_t, std::size_t);

    void* malloc(std::size_t i_Size)
    {
        ++t_Allocations;
        return __libc_malloc(i_Size);
    }

    void* calloc(std::size_t i_Count, std::size_t i_Size)
    {
        ++t_Allocations;
        return __libc_calloc(i_Count, i_Size);
    }

    void* realloc(void* i_pMemory, std::size_t i_Size)
    {
        ++t_Allocations;
        return __libc_realloc(i_pMemory, i_Size);
    }

    void* aligned_alloc(std::size_t i_Alignment, std::size_t i_Size)
    {
        ++t_Allocations;
        return __libc_memalign(i_Alignment, i_Size);
    }
}

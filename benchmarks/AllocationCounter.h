#pragma once

#include <cstdint>

namespace Bench
{

/// How often the calling thread has asked the heap for memory since it began: operator new, and the malloc family,
/// which Qt's containers use directly. The program that links AllocationCounter.cpp has its heap functions replaced.
std::uint64_t AllocationsOfThisThread();

} // namespace Bench

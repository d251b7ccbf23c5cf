#pragma once

#include <cstdint>
#include <functional>

namespace TQL
{

/// What a postal service promises of its jobs.
struct DispatchTraits
{
    static constexpr std::uint32_t KindSerial = 1;  ///< jobs run one at a time
    static constexpr std::uint32_t FlagOrdered = 1; ///< jobs run in the order of posting

    std::uint32_t Kind = 0;
    std::uint32_t Flags = 0;

    bool IsStrand() const noexcept { return Kind == KindSerial && (Flags & FlagOrdered) != 0; }
};

/// Runs a job later, on a thread that it decides. Every hand-off between threads goes through this interface.
/// Thread-safe. A service never runs a job inside Post: callers post while they hold a mutex that the job takes.
class IPostalService
{
public:
    using Job = std::function<void()>;

    /// Queues i_Job. The tag is an opaque word, handed on unchanged through stacked services.
    virtual void Post(Job i_Job, std::uint64_t i_Tag = 0) = 0;
    virtual void GetDispatchTraits(DispatchTraits& o_rTraits) const = 0;
    virtual ~IPostalService() = default;
};

} // namespace TQL

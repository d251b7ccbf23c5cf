#pragma once

#include "TQL/IMultiCallback.h"
#include "TQL/ITick.h"

#include <cstdint>
#include <memory>
#include <string>

namespace ChannelSystem
{

enum class EContextType : std::int32_t
{
    None = 0,
    Live = 1,
    Recorded = 2
};

/// A set of channels that share one time: the live capture, or one recording. Its name is also the name of its time
/// source. Thread-safe.
class IChannelContext
{
public:
    virtual const std::string& GetName() const = 0;
    virtual EContextType GetType() const = 0;        ///< never None
    virtual TQL::TickRange GetTickRange() const = 0; ///< N frames from frame f: [f P, (f + N) P)
    virtual std::int64_t GetFramePeriod() const = 0; ///< ticks
    virtual std::shared_ptr<TQL::IChangeSignal> RangeChanged() const = 0;
    virtual ~IChannelContext() = default;
};

} // namespace ChannelSystem

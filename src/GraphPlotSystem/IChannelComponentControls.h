#pragma once

#include "TQL/IMultiCallback.h"

#include <cstdint>
#include <memory>
#include <vector>

namespace TQL
{

/// Which components of a channel subtype are switched on. Thread-safe.
class IChannelComponentControls
{
public:
    virtual ~IChannelComponentControls() = default;

    virtual bool IsComponentEnabled(std::uint64_t i_SubType, std::uint64_t i_Component) const = 0;
    virtual void SetComponentEnabled(std::uint64_t i_SubType, std::uint64_t i_Component, bool i_bEnabled) = 0;
    virtual void GetEnabledComponents(std::uint64_t i_SubType, std::vector<std::uint64_t>& o_rComponents) const = 0;
    virtual std::shared_ptr<IChangeSignal> Changed() const = 0;
};

} // namespace TQL

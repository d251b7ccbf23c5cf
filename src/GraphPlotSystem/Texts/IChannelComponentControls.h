#pragma once

#include "TQL/IMultiCallback.h"
#include "TQL/IResult.h"

#include <cstddef>
#include <cstdint>
#include <memory>
#include <unordered_map>
#include <unordered_set>
#include <vector>

namespace TQL
{

class ITraceId;

/// FNV-1a over the bytes of the key, the lowest first: subtype ids and small indexes spread alike.
struct ComponentKeyHash
{
    std::size_t operator()(std::uint64_t i_Key) const noexcept
    {
        std::uint64_t hash = 0xcbf29ce484222325ull;
        for (int byte = 0; byte < 8; ++byte, i_Key >>= 8)
            hash = (hash ^ (i_Key & 0xff)) * 0x100000001b3ull;
        return hash;
    }
};

/// The components of one channel subtype that are switched off, by index.
using VDisabledComponents = std::unordered_set<std::uint64_t, ComponentKeyHash>;
/// By subtype id, which is never 0.
using DisabledComponentsTable = std::unordered_map<std::uint64_t, VDisabledComponents, ComponentKeyHash>;

/// Which components of a channel subtype are switched on: all that were not switched off. The choice holds for all
/// channels of the subtype. Thread-safe.
class IChannelComponentControls
{
public:
    virtual ~IChannelComponentControls() = default;

    virtual bool IsComponentEnabled(std::uint64_t i_SubType, std::uint64_t i_Component) const = 0;
    /// InvalidId for the subtype 0, which stands for an unknown one.
    virtual IResult SetComponentEnabled(std::uint64_t i_SubType, std::uint64_t i_Component, bool i_bEnabled) = 0;
    /// All components of the subtype at once; InvalidId as above.
    virtual IResult SetChannelComponentsEnabled(std::uint64_t i_SubType, bool i_bEnabled) = 0;
    virtual VDisabledComponents GetDisabledComponents(std::uint64_t i_SubType) const = 0;
    /// Ascending; none for a subtype whose component count is not known.
    virtual void GetEnabledComponents(std::uint64_t i_SubType, std::vector<std::uint64_t>& o_rComponents) const = 0;
    virtual DisabledComponentsTable GetDisabledTable() const = 0;
    /// Removes the traces whose component is switched off.
    virtual void FilterTraces(std::vector<ITraceId>& io_rTraces) const = 0;
    virtual void SetDisabledTable(DisabledComponentsTable i_Table) = 0;

    /// Raised, without a lock held, after any change.
    virtual std::shared_ptr<IChangeSignal> Changed() const = 0;
};

} // namespace TQL

#pragma once

#include "TQL/IChannelInstanceId.h"
#include "TQL/IMultiCallback.h"
#include "TQL/IResult.h"

#include <QtCore/QString>

#include <cstdint>
#include <memory>
#include <span>

namespace TQL
{

class IChannel;
class ITraceId;

/// The texts of channels: names, and the names and units of components. Channels that look the same (same type text,
/// same components, same units) share a subtype, named by a 64-bit id. Thread-safe; unknown keys give "Unknown", 0 or
/// the empty text.
class IChannelTextProvider
{
public:
    virtual ~IChannelTextProvider() = default;

    virtual QString GetChannelTypeName(const IChannelInstanceId& i_rChannel) const = 0;
    virtual QString GetChannelDisplayName(const IChannelInstanceId& i_rChannel) const = 0;
    virtual std::uint64_t GetSubTypeId(const IChannelInstanceId& i_rChannel) const = 0;
    virtual QString GetSubTypeDisplayName(std::uint64_t i_SubType) const = 0;
    virtual QString GetSubTypeUnits(std::uint64_t i_SubType) const = 0;
    virtual std::uint64_t GetComponentCount(std::uint64_t i_SubType) const = 0;
    virtual QString GetComponentName(const IChannelInstanceId& i_rChannel, std::uint64_t i_Component) const = 0;
    virtual QString GetComponentName(std::uint64_t i_SubType, std::uint64_t i_Component) const = 0;
    /// Rich text may hold "<sup>" tags, plain text writes exponents behind "^".
    virtual QString GetComponentUnits(std::uint64_t i_SubType, std::uint64_t i_Component,
                                      bool i_bRich = false) const = 0;
    virtual QString GetCategory(const IChannelInstanceId& i_rChannel) const = 0;

    /// Reads a channel whose revision has moved. A failure code tells that its texts cannot be used now.
    virtual IResult Update(const std::shared_ptr<IChannel>& i_rpChannel) = 0;

    /// The same for the channels of traces; a trace of an unknown channel is passed over.
    virtual void Update(std::span<const ITraceId> i_Traces) = 0;

    /// Raised, without a lock held, when any text has changed.
    virtual std::shared_ptr<IChangeSignal> TextChanged() const = 0;
    virtual void NotifyTextChanged() = 0;
};

} // namespace TQL

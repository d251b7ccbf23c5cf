#pragma once

#include "ChannelSystem/ComponentDescription.h"
#include "ChannelSystem/VDerivedChannelParameters.h"
#include "TQL/IChannelInstanceId.h"
#include "TQL/IMultiCallback.h"
#include "TQL/IResult.h"

#include <memory>
#include <string>
#include <string_view>
#include <vector>

namespace TQL
{
class IChannel;
class IChannelParameters;
class IChannelSelectionManager;
} // namespace TQL

namespace ChannelSystem
{

class IChannelContext;

/// The host's channels. Called on the UI thread but for CreateDerivedChannel of "Cache", GetChannel and
/// GetSubTypeTable, which any thread may call.
class IChannelService
{
public:
    /// Null when no context bears the name.
    virtual std::shared_ptr<IChannelContext> GetContextByName(std::string_view i_Name) const = 0;

    /// A context was added, removed or replaced.
    virtual std::shared_ptr<TQL::IChangeSignal> ContextListChanged() const = 0;

    /// What GetChannelTypes answers may differ.
    virtual std::shared_ptr<TQL::IChangeSignal> TypeListChanged() const = 0;

    /// Type names in the host's order. A type is left out when the mask is not 0 and shares a bit with its flags.
    virtual std::vector<std::string> GetChannelTypes(std::uint64_t i_Mask, std::string_view i_Context) const = 0;

    /// The parameters of a listed type; null for an unknown one.
    virtual std::shared_ptr<TQL::IChannelParameters> GetTypeParameters(std::string_view i_TypeName) const = 0;

    /// Makes a channel from others: operations "Cache", "AlgebraicExpression", "Derivative". Null when it cannot. The
    /// same live object comes back for an equal derivation, but every "Cache" is new.
    virtual std::shared_ptr<TQL::IChannel>
    CreateDerivedChannel(std::string_view i_Operation, const VDerivedChannelParameters& i_rParameters,
                         const std::vector<std::shared_ptr<TQL::IChannel>>& i_rInputs) = 0;

    /// By the exact id, its context included; one without a context names a global channel, whose own id may have one.
    /// Null when unknown.
    virtual std::shared_ptr<TQL::IChannel> GetChannel(const TQL::IChannelInstanceId& i_rId) const = 0;

    /// What the selection means in channels; null in a host without selection.
    virtual std::shared_ptr<TQL::IChannelSelectionManager> GetSelectionManager() const = 0;

    virtual TQL::IResult GetSubTypeTable(std::uint16_t i_SubTypeId, TQL::SubTypeRecord& o_rRecord) const = 0;

    virtual ~IChannelService() = default;
};

} // namespace ChannelSystem

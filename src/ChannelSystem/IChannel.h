#pragma once

#include "ChannelSystem/ComponentDescription.h"
#include "ChannelSystem/ParameterValue.h"
#include "TQL/IChannelInstanceId.h"
#include "TQL/IMultiCallback.h"
#include "TQL/IResult.h"

#include <cstdint>
#include <memory>
#include <string>
#include <string_view>
#include <vector>

namespace ChannelSystem
{
class IChannelBlock;
}

namespace TQL
{

class IChannel;

/// Tells of a change of a channel's output. Thread-safe.
class IChannelChangeNotifier
{
public:
    /// Releasing the returned handle ends the subscription.
    [[nodiscard]] virtual std::shared_ptr<void>
    AddOutputChangedCallback(std::function<void()> i_Callback, std::shared_ptr<IPostalService> i_pPostalService) = 0;
    virtual ~IChannelChangeNotifier() = default;
};

/// The named parameters of a channel. Names in use: "TypeDisplayName", "InstanceDisplayName", "ComponentDisplayNames"
/// (separated by commas), "CategoryDisplayName", "SupportMagnitude"; on a Cache channel "SupportLodding" (bool),
/// "EnableRotationUnwrapping" (bool), "CacheRangeTicks" (i64). Thread-safe.
class IChannelParameters
{
public:
    /// An empty group stands for any. NotFound when the parameter is absent.
    virtual IResult Read(std::string_view i_Group, std::string_view i_Name, ParameterValue& o_rValue) const = 0;
    virtual IResult SetParameter(std::string_view i_Name, const ParameterValue& i_rValue) = 0;
    virtual std::shared_ptr<IChannelChangeNotifier> GetChangeNotifier() = 0;
    virtual void GetErrors(std::vector<std::string>& o_rErrors) const = 0;
    virtual ~IChannelParameters() = default;
};

/// The data of a channel at one time; also called its view. Stale for ever once the data behind it was replaced.
/// Thread-safe.
class IChannelOutput
{
public:
    virtual std::shared_ptr<IChannel> GetChannel() const = 0;
    virtual bool IsStale() const = 0;
    virtual std::shared_ptr<ChannelSystem::IChannelBlock> GetBlock() const = 0; ///< null while there are no data
    virtual ComponentDescription GetDescription() const = 0;
    virtual ~IChannelOutput() = default;
};

/// One channel of the host. Thread-safe, and no operation calls back into the caller.
class IChannel
{
public:
    virtual std::shared_ptr<IChannelParameters> GetParameters() const = 0; ///< never null
    virtual void GetDependentChannels(std::vector<std::shared_ptr<IChannel>>& o_rChannels) const = 0;
    virtual std::shared_ptr<IChannelOutput> GetOutput() const = 0; ///< null while the channel has no data
    virtual ComponentDescription GetDescription() const = 0;
    virtual const IChannelInstanceId& GetInstanceId() const = 0;
    virtual std::uint64_t GetRevision() const = 0; ///< at least 1; moves when names, components or units change
    virtual ~IChannel() = default;
};

} // namespace TQL

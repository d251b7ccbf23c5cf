#pragma once

#include "TQL/IMultiCallback.h"
#include "TQL/IResult.h"

#include <cstdint>
#include <memory>
#include <set>
#include <string>
#include <string_view>
#include <vector>

namespace TQL
{

class IChannel;
class IChannelParameters;

/// What a creatable channel type needs.
struct VChannelSpecifier
{
    static constexpr std::uint32_t FlagDeveloperOnly = 4;

    std::shared_ptr<IChannelParameters> pTypeParameters;
    std::uint32_t Flags = 0;
    std::int64_t RequiredInputCount = 1; ///< 0: global, -1: any number, n: each n inputs make one channel
    std::set<std::string> InputTypeNames;
};

/// The types that the operator can create channels of. UI thread.
class IChannelTypeRegistry
{
public:
    virtual void GetTypes(std::uint64_t i_Mask, std::vector<std::string>& o_rTypes) const = 0;
    virtual IResult GetSpecifier(std::string_view i_Type, VChannelSpecifier& o_rSpecifier) const = 0;
    virtual IResult CreateChannels(std::string_view i_Type, const std::vector<std::shared_ptr<IChannel>>& i_rInputs,
                                   std::vector<std::shared_ptr<IChannel>>& o_rChannels) = 0;
    virtual IResult CreateGlobalChannels(std::string_view i_Type, std::string_view i_Context,
                                         std::vector<std::shared_ptr<IChannel>>& o_rChannels) = 0;
    virtual bool CanComputeMagnitude(std::string_view i_Context, std::string_view i_Type) const = 0;
    virtual std::shared_ptr<IChangeSignal> TypeListChanged() const = 0;
    virtual ~IChannelTypeRegistry() = default;
};

} // namespace TQL

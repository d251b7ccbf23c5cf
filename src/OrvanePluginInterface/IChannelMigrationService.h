#pragma once

#include "TQL/IResult.h"

#include <memory>
#include <string_view>
#include <vector>

namespace TQL
{
class IChannel;
}

namespace OrvanePluginInterface
{

/// Finds what stands for a channel in another data context: the same marker of another recording. Asked for the context
/// that the channel is of, it finds what stands there since the context was replaced. UI thread.
class IChannelMigrationService
{
public:
    /// o_rMigrated gets what is the same channel there; o_rFallbacks what may be plotted in its place. A failure code
    /// tells why there is neither.
    virtual TQL::IResult Migrate(const std::shared_ptr<TQL::IChannel>& i_rpChannel, std::string_view i_NewContext,
                                 std::vector<std::shared_ptr<TQL::IChannel>>& o_rMigrated,
                                 std::vector<std::shared_ptr<TQL::IChannel>>& o_rFallbacks) = 0;
    virtual ~IChannelMigrationService() = default;
};

} // namespace OrvanePluginInterface

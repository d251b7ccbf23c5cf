#pragma once

#include "OrvanePluginInterface/IChannelMigrationService.h"
#include "Services/Common/VThreadCheck.h"

#include <memory>
#include <string>

namespace ChannelSystem
{
class IChannelService;
}

namespace Services
{

class VCheckedChannels;

/// Finds the same marker, segment, device output or model output in another context. One that bears the same name, its
/// subject's included, is the same. Where there is none, what has the same name without the subject, first that of the
/// subject of the same number, and then what has the same numbers, may stand in its place. A derived channel is derived
/// anew from where its inputs went, and is the same when they are. Owned by the host services. UI thread.
class VChannelMigrationService : public OrvanePluginInterface::IChannelMigrationService
{
public:
    /// i_pService, which may be null, is the host's own; names are only looked for where it is of this host's kind.
    /// i_pChecked stands checked channels before those that are given out; null in a host that does not check.
    VChannelMigrationService(std::shared_ptr<ChannelSystem::IChannelService> i_pService,
                             std::shared_ptr<VCheckedChannels> i_pChecked, ThreadCheckPointer i_pCheck);

    /// InvalidArgument for a null channel; NotFound when the context, or anything like the channel in it, is missing;
    /// NotSupported for a channel derived by an operation that cannot be repeated.
    TQL::IResult Migrate(const std::shared_ptr<TQL::IChannel>& i_rpChannel, std::string_view i_NewContext,
                         std::vector<std::shared_ptr<TQL::IChannel>>& o_rMigrated,
                         std::vector<std::shared_ptr<TQL::IChannel>>& o_rFallbacks) override;

private:
    /// A channel and whether it is the same one.
    struct Found
    {
        std::shared_ptr<TQL::IChannel> pChannel;
        bool bSame = false;
    };

    TQL::IResult Find(const std::shared_ptr<TQL::IChannel>& i_rpChannel, const std::string& i_rContext,
                      Found& o_rFound) const;
    TQL::IResult DeriveAnew(const std::shared_ptr<TQL::IChannel>& i_rpChannel, const std::string& i_rContext,
                            Found& o_rFound) const;
    Found FindSource(const TQL::IChannel& i_rChannel, const std::string& i_rContext) const;

    const std::shared_ptr<ChannelSystem::IChannelService> m_pService;
    const std::shared_ptr<VCheckedChannels> m_pChecked;
    const ThreadCheckPointer m_pCheck;
};

} // namespace Services

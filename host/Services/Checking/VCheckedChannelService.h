#pragma once

#include "ChannelSystem/IChannelService.h"
#include "Services/Checking/VCheckedChannels.h"
#include "Services/Common/VThreadCheck.h"

#include <memory>

namespace Services
{

/// Hands every operation on to the host's channel service, notes those that were called on a thread that may not, and
/// gives out checked channels. What a plug-in gets from a checking host. It works before any channel service. UI thread
/// but for the operations that any thread may call.
class VCheckedChannelService : public ChannelSystem::IChannelService
{
public:
    VCheckedChannelService(std::shared_ptr<ChannelSystem::IChannelService> i_pService, ThreadCheckPointer i_pCheck,
                           std::shared_ptr<VCheckedChannels> i_pChannels);

    std::shared_ptr<ChannelSystem::IChannelContext> GetContextByName(std::string_view i_Name) const override;
    std::shared_ptr<TQL::IChangeSignal> ContextListChanged() const override;
    std::shared_ptr<TQL::IChangeSignal> TypeListChanged() const override;
    std::vector<std::string> GetChannelTypes(std::uint64_t i_Mask, std::string_view i_Context) const override;
    std::shared_ptr<TQL::IChannelParameters> GetTypeParameters(std::string_view i_TypeName) const override;
    std::shared_ptr<TQL::IChannel>
    CreateDerivedChannel(std::string_view i_Operation, const ChannelSystem::VDerivedChannelParameters& i_rParameters,
                         const std::vector<std::shared_ptr<TQL::IChannel>>& i_rInputs) override;
    std::shared_ptr<TQL::IChannel> GetChannel(const TQL::IChannelInstanceId& i_rId) const override;
    std::shared_ptr<TQL::IChannelSelectionManager> GetSelectionManager() const override;
    TQL::IResult GetSubTypeTable(std::uint16_t i_SubTypeId, TQL::SubTypeRecord& o_rRecord) const override;

private:
    const std::shared_ptr<ChannelSystem::IChannelService> m_pService;
    const ThreadCheckPointer m_pCheck;
    const std::shared_ptr<VCheckedChannels> m_pChannels;
};

} // namespace Services

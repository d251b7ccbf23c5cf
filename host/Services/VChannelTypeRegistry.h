#pragma once

#include "ChannelSystem/IChannelTypeRegistry.h"
#include "NotificationSystem/VMultiCallbackPostal.h"
#include "Services/VThreadCheck.h"

namespace Services
{

/// The channel types that an operator can create in this host: none so far. Owned by the host services. UI thread.
class VChannelTypeRegistry : public TQL::IChannelTypeRegistry
{
public:
    explicit VChannelTypeRegistry(ThreadCheckPointer i_pCheck = nullptr);

    void GetTypes(std::uint64_t i_Mask, std::vector<std::string>& o_rTypes) const override;
    TQL::IResult GetSpecifier(std::string_view i_Type,
                              TQL::VChannelSpecifier& o_rSpecifier) const override; ///< NotFound
    TQL::IResult CreateChannels(std::string_view i_Type, const std::vector<std::shared_ptr<TQL::IChannel>>& i_rInputs,
                                std::vector<std::shared_ptr<TQL::IChannel>>& o_rChannels) override; ///< NotFound
    TQL::IResult CreateGlobalChannels(std::string_view i_Type, std::string_view i_Context,
                                      std::vector<std::shared_ptr<TQL::IChannel>>& o_rChannels) override; ///< NotFound
    bool CanComputeMagnitude(std::string_view i_Context, std::string_view i_Type) const override;
    std::shared_ptr<TQL::IChangeSignal> TypeListChanged() const override;

private:
    const ThreadCheckPointer m_pCheck;
    const std::shared_ptr<NotificationSystem::VChangeSignal> m_pTypeListChanged;
};

} // namespace Services

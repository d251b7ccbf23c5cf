#pragma once

#include "ChannelSystem/IChannelTypeRegistry.h"
#include "NotificationSystem/VMultiCallbackPostal.h"
#include "Services/Common/VThreadCheck.h"
#include "Services/Selection/CreatableChannelTypes.h"

namespace ChannelSystem
{
class IChannelService;
}

namespace Services
{

class VSelectionSource;

/// The channel types that an operator can create in this host: what the table of creatable types holds. Channels are
/// made through the channel service that the plug-in itself has, so that in a checking host they are checked ones. The
/// inputs of one channel are laid in the order in which they were selected, so that the operator says what is measured
/// against what. Owned by the host services. UI thread.
class VChannelTypeRegistry : public TQL::IChannelTypeRegistry
{
public:
    explicit VChannelTypeRegistry(ThreadCheckPointer i_pCheck = nullptr);

    /// Without one nothing can be created.
    void SetChannelService(std::shared_ptr<ChannelSystem::IChannelService> i_pService);
    /// Without one the inputs stay in the order in which they are given.
    void SetSelection(std::shared_ptr<const VSelectionSource> i_pSelection);

    void GetTypes(std::uint64_t i_Mask, std::vector<std::string>& o_rTypes) const override;
    TQL::IResult GetSpecifier(std::string_view i_Type,
                              TQL::VChannelSpecifier& o_rSpecifier) const override; ///< NotFound
    /// NotFound for an unknown type, InvalidArgument for another number of inputs or one that is null, NotAvailable
    /// without a channel service. A channel that makes no sense is given with its errors.
    TQL::IResult CreateChannels(std::string_view i_Type, const std::vector<std::shared_ptr<TQL::IChannel>>& i_rInputs,
                                std::vector<std::shared_ptr<TQL::IChannel>>& o_rChannels) override;
    /// NotFound for an unknown type; InvalidArgument, for no creatable type is global.
    TQL::IResult CreateGlobalChannels(std::string_view i_Type, std::string_view i_Context,
                                      std::vector<std::shared_ptr<TQL::IChannel>>& o_rChannels) override;
    /// Of a creatable type what its table says, of a type of the channel service what its parameters say; false for
    /// any other.
    bool CanComputeMagnitude(std::string_view i_Context, std::string_view i_Type) const override;
    std::shared_ptr<TQL::IChangeSignal> TypeListChanged() const override;

private:
    std::vector<std::shared_ptr<TQL::IChannel>> InOrder(std::vector<std::shared_ptr<TQL::IChannel>> i_Inputs) const;

    const ThreadCheckPointer m_pCheck;
    const std::shared_ptr<NotificationSystem::VChangeSignal> m_pTypeListChanged;
    const std::vector<CreatableChannelType> m_Types;
    std::shared_ptr<ChannelSystem::IChannelService> m_pService;
    std::shared_ptr<const VSelectionSource> m_pSelection;
};

} // namespace Services

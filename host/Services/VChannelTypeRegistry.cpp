#include "Services/VChannelTypeRegistry.h"

namespace Services
{

VChannelTypeRegistry::VChannelTypeRegistry(ThreadCheckPointer i_pCheck)
    : m_pCheck(std::move(i_pCheck)), m_pTypeListChanged(std::make_shared<NotificationSystem::VChangeSignal>())
{
}

void VChannelTypeRegistry::GetTypes(std::uint64_t, std::vector<std::string>& o_rTypes) const
{
    CheckThread(m_pCheck, "IChannelTypeRegistry::GetTypes");
    o_rTypes.clear();
}

TQL::IResult VChannelTypeRegistry::GetSpecifier(std::string_view, TQL::VChannelSpecifier&) const
{
    CheckThread(m_pCheck, "IChannelTypeRegistry::GetSpecifier");
    return TQL::Result::NotFound;
}

TQL::IResult VChannelTypeRegistry::CreateChannels(std::string_view, const std::vector<std::shared_ptr<TQL::IChannel>>&,
                                                  std::vector<std::shared_ptr<TQL::IChannel>>& o_rChannels)
{
    CheckThread(m_pCheck, "IChannelTypeRegistry::CreateChannels");
    o_rChannels.clear();
    return TQL::Result::NotFound;
}

TQL::IResult VChannelTypeRegistry::CreateGlobalChannels(std::string_view, std::string_view,
                                                        std::vector<std::shared_ptr<TQL::IChannel>>& o_rChannels)
{
    CheckThread(m_pCheck, "IChannelTypeRegistry::CreateGlobalChannels");
    o_rChannels.clear();
    return TQL::Result::NotFound;
}

bool VChannelTypeRegistry::CanComputeMagnitude(std::string_view, std::string_view) const
{
    CheckThread(m_pCheck, "IChannelTypeRegistry::CanComputeMagnitude");
    return false;
}

std::shared_ptr<TQL::IChangeSignal> VChannelTypeRegistry::TypeListChanged() const
{
    CheckThread(m_pCheck, "IChannelTypeRegistry::TypeListChanged");
    return m_pTypeListChanged;
}

} // namespace Services

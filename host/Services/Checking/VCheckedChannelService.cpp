#include "Services/Checking/VCheckedChannelService.h"

#include "Services/Checking/VCheckedSelectionManager.h"

namespace Services
{

VCheckedChannelService::VCheckedChannelService(std::shared_ptr<ChannelSystem::IChannelService> i_pService,
                                               ThreadCheckPointer i_pCheck,
                                               std::shared_ptr<VCheckedChannels> i_pChannels)
    : m_pService(std::move(i_pService)), m_pCheck(std::move(i_pCheck)), m_pChannels(std::move(i_pChannels))
{
}

std::shared_ptr<ChannelSystem::IChannelContext> VCheckedChannelService::GetContextByName(std::string_view i_Name) const
{
    CheckThread(m_pCheck, "IChannelService::GetContextByName");
    return m_pService->GetContextByName(i_Name);
}

std::shared_ptr<TQL::IChangeSignal> VCheckedChannelService::ContextListChanged() const
{
    CheckThread(m_pCheck, "IChannelService::ContextListChanged");
    return m_pService->ContextListChanged();
}

std::shared_ptr<TQL::IChangeSignal> VCheckedChannelService::TypeListChanged() const
{
    CheckThread(m_pCheck, "IChannelService::TypeListChanged");
    return m_pService->TypeListChanged();
}

std::vector<std::string> VCheckedChannelService::GetChannelTypes(std::uint64_t i_Mask, std::string_view i_Context) const
{
    CheckThread(m_pCheck, "IChannelService::GetChannelTypes");
    return m_pService->GetChannelTypes(i_Mask, i_Context);
}

std::shared_ptr<TQL::IChannelParameters> VCheckedChannelService::GetTypeParameters(std::string_view i_TypeName) const
{
    CheckThread(m_pCheck, "IChannelService::GetTypeParameters");
    return m_pService->GetTypeParameters(i_TypeName);
}

std::shared_ptr<TQL::IChannel>
VCheckedChannelService::CreateDerivedChannel(std::string_view i_Operation,
                                             const ChannelSystem::VDerivedChannelParameters& i_rParameters,
                                             const std::vector<std::shared_ptr<TQL::IChannel>>& i_rInputs)
{
    if (i_Operation == "Cache")
        CheckThread(m_pCheck, "IChannelService::CreateDerivedChannel of \"Cache\"");
    else
        CheckThread(m_pCheck, "IChannelService::CreateDerivedChannel");
    return m_pChannels->Wrap(
        m_pService->CreateDerivedChannel(i_Operation, i_rParameters, VCheckedChannels::UnwrapAll(i_rInputs)));
}

std::shared_ptr<TQL::IChannel> VCheckedChannelService::GetChannel(const TQL::IChannelInstanceId& i_rId) const
{
    CheckThread(m_pCheck, "IChannelService::GetChannel");
    return m_pChannels->Wrap(m_pService->GetChannel(i_rId));
}

std::shared_ptr<TQL::IChannelSelectionManager> VCheckedChannelService::GetSelectionManager() const
{
    CheckThread(m_pCheck, "IChannelService::GetSelectionManager");
    auto pManager = m_pService->GetSelectionManager();
    return pManager ? std::make_shared<VCheckedSelectionManager>(std::move(pManager), m_pCheck) : nullptr;
}

TQL::IResult VCheckedChannelService::GetSubTypeTable(std::uint16_t i_SubTypeId, TQL::SubTypeRecord& o_rRecord) const
{
    CheckThread(m_pCheck, "IChannelService::GetSubTypeTable");
    return m_pService->GetSubTypeTable(i_SubTypeId, o_rRecord);
}

} // namespace Services

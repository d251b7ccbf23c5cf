#include "Services/Checking/VCheckedSelectionManager.h"

#include "Services/Checking/VCheckedChannels.h"

namespace Services
{

VCheckedSelectionManager::VCheckedSelectionManager(std::shared_ptr<TQL::IChannelSelectionManager> i_pManager,
                                                   ThreadCheckPointer i_pCheck)
    : m_pManager(std::move(i_pManager)), m_pCheck(std::move(i_pCheck))
{
}

void VCheckedSelectionManager::GetSelectedChannelIds(std::string_view i_Context, std::string_view i_Type,
                                                     std::vector<TQL::IChannelInstanceId>& o_rIds) const
{
    CheckThread(m_pCheck, "IChannelSelectionManager::GetSelectedChannelIds");
    m_pManager->GetSelectedChannelIds(i_Context, i_Type, o_rIds);
}

void VCheckedSelectionManager::GetSelectedTypeCounts(std::uint64_t i_Mask,
                                                     std::map<std::string, std::uint64_t>& o_rCounts) const
{
    CheckThread(m_pCheck, "IChannelSelectionManager::GetSelectedTypeCounts");
    m_pManager->GetSelectedTypeCounts(i_Mask, o_rCounts);
}

void VCheckedSelectionManager::GetSelectedChannelTypes(std::uint64_t i_Mask, std::set<std::string>& o_rTypes) const
{
    CheckThread(m_pCheck, "IChannelSelectionManager::GetSelectedChannelTypes");
    m_pManager->GetSelectedChannelTypes(i_Mask, o_rTypes);
}

void VCheckedSelectionManager::GetGlobalChannelTypes(std::uint64_t i_Mask, std::set<std::string>& o_rTypes) const
{
    CheckThread(m_pCheck, "IChannelSelectionManager::GetGlobalChannelTypes");
    m_pManager->GetGlobalChannelTypes(i_Mask, o_rTypes);
}

std::shared_ptr<TQL::IMultiCallbackPostal<void(bool)>> VCheckedSelectionManager::SelectionChanged() const
{
    CheckThread(m_pCheck, "IChannelSelectionManager::SelectionChanged");
    return m_pManager->SelectionChanged();
}

TQL::IResult VCheckedSelectionManager::GetSelectionKind(std::string_view i_Type, TQL::ESelectionKind& o_rKind) const
{
    CheckThread(m_pCheck, "IChannelSelectionManager::GetSelectionKind");
    return m_pManager->GetSelectionKind(i_Type, o_rKind);
}

void VCheckedSelectionManager::SelectThingsOf(const std::shared_ptr<TQL::IChannel>& i_rpChannel, bool i_bExtend)
{
    CheckThread(m_pCheck, "IChannelSelectionManager::SelectThingsOf");
    m_pManager->SelectThingsOf(VCheckedChannels::Unwrap(i_rpChannel), i_bExtend);
}

void VCheckedSelectionManager::RegisterChannelType(std::string_view i_Type, TQL::ESelectionKind i_Kind,
                                                   std::uint32_t i_Flags)
{
    CheckThread(m_pCheck, "IChannelSelectionManager::RegisterChannelType");
    m_pManager->RegisterChannelType(i_Type, i_Kind, i_Flags);
}

} // namespace Services

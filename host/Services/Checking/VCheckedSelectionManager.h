#pragma once

#include "ChannelSystem/IChannelSelectionManager.h"
#include "Services/Common/VThreadCheck.h"

#include <memory>

namespace Services
{

/// Hands every operation on to the host's selection manager and notes those that were called on a thread that may not.
/// Given out by the checked channel service. UI thread but for the operations that any thread may call.
class VCheckedSelectionManager : public TQL::IChannelSelectionManager
{
public:
    VCheckedSelectionManager(std::shared_ptr<TQL::IChannelSelectionManager> i_pManager, ThreadCheckPointer i_pCheck);

    void GetSelectedChannelIds(std::string_view i_Context, std::string_view i_Type,
                               std::vector<TQL::IChannelInstanceId>& o_rIds) const override;
    void GetSelectedTypeCounts(std::uint64_t i_Mask, std::map<std::string, std::uint64_t>& o_rCounts) const override;
    void GetSelectedChannelTypes(std::uint64_t i_Mask, std::set<std::string>& o_rTypes) const override;
    void GetGlobalChannelTypes(std::uint64_t i_Mask, std::set<std::string>& o_rTypes) const override;
    std::shared_ptr<TQL::IMultiCallbackPostal<void(bool)>> SelectionChanged() const override;
    TQL::IResult GetSelectionKind(std::string_view i_Type, TQL::ESelectionKind& o_rKind) const override;
    void SelectThingsOf(const std::shared_ptr<TQL::IChannel>& i_rpChannel, bool i_bExtend) override;
    void RegisterChannelType(std::string_view i_Type, TQL::ESelectionKind i_Kind, std::uint32_t i_Flags) override;

private:
    const std::shared_ptr<TQL::IChannelSelectionManager> m_pManager;
    const ThreadCheckPointer m_pCheck;
};

} // namespace Services

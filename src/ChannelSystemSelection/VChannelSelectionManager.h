#pragma once

#include "ChannelSystem/IChannelSelectionManager.h"
#include "NotificationSystem/VMultiCallbackPostal.h"
#include "NotificationSystem/VSubscriptions.h"
#include "TQL/VShared.h"

#include <mutex>

namespace ChannelSystemSelection
{

/// Translates the host's selection into channel ids, by a table of channel types that the host fills. Made by the host
/// with TQL::MakeShared; follows the selection source from its post-creation hook on and forwards its notices.
class VChannelSelectionManager : public TQL::IChannelSelectionManager, public TQL::VShared
{
public:
    explicit VChannelSelectionManager(std::shared_ptr<TQL::ISelectionSource> i_pSource);

    void GetSelectedChannelIds(std::string_view i_Context, std::string_view i_Type,
                               std::vector<TQL::IChannelInstanceId>& o_rIds) const override;
    void GetSelectedTypeCounts(std::uint64_t i_Mask, std::map<std::string, std::uint64_t>& o_rCounts) const override;
    void GetSelectedChannelTypes(std::uint64_t i_Mask, std::set<std::string>& o_rTypes) const override;
    void GetGlobalChannelTypes(std::uint64_t i_Mask, std::set<std::string>& o_rTypes) const override;
    std::shared_ptr<TQL::IMultiCallbackPostal<void(bool)>> SelectionChanged() const override { return m_pChanged; }
    TQL::IResult GetSelectionKind(std::string_view i_Type, TQL::ESelectionKind& o_rKind) const override;
    void SelectThingsOf(const std::shared_ptr<TQL::IChannel>& i_rpChannel, bool i_bExtend) override;
    void RegisterChannelType(std::string_view i_Type, TQL::ESelectionKind i_Kind, std::uint32_t i_Flags) override;

protected:
    void OnPostCreation() override;

private:
    struct TypeRecord
    {
        TQL::ESelectionKind Kind = TQL::ESelectionKind::None;
        std::uint32_t Flags = 0;
    };
    using TypeTable = std::map<std::string, TypeRecord, std::less<>>;

    TypeTable GetTypes(std::uint64_t i_Mask) const;
    void OnSelectionChanged(bool i_bForce);

    const std::shared_ptr<TQL::ISelectionSource> m_pSource;
    const std::shared_ptr<NotificationSystem::VMultiCallbackPostal<void(bool)>> m_pChanged;
    NotificationSystem::VSubscriptions m_Subscriptions;
    mutable std::mutex m_Mutex; // held only while the table is read or written, never across a call of the host
    TypeTable m_Types;          // guarded by m_Mutex
};

/// The id that a selected thing stands for in a context; only the kinds that name channels one by one.
TQL::IChannelInstanceId MakeChannelId(std::string_view i_Context, std::string_view i_Type,
                                      const TQL::SelectionItem& i_rItem);

/// The thing that an id stands for; the kind None for an id whose kind names no thing.
TQL::SelectionItem MakeSelectionItem(TQL::ESelectionKind i_Kind, const TQL::IChannelInstanceId& i_rId);

} // namespace ChannelSystemSelection

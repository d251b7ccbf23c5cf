#include "ChannelSystemSelection/VChannelSelectionManager.h"

#include "ChannelSystem/IChannel.h"
#include "NotificationSystem/WeakCallback.h"

#include <algorithm>
#include <unordered_set>

namespace ChannelSystemSelection
{

using TQL::ESelectionKind;
using TQL::SelectionItem;

namespace
{

bool IsSegmentKind(ESelectionKind i_Kind)
{
    return i_Kind == ESelectionKind::Segment || i_Kind == ESelectionKind::SegmentSolve ||
           i_Kind == ESelectionKind::SegmentRetarget;
}

/// Which fields of a selected thing go into the channel's id.
struct KindRule
{
    bool bListed = false; ///< the kind names channels one by one
    bool bFirst = false;
    bool bSecond = false;
    bool bText = false;
    bool bContext = true;
};

KindRule RuleOf(ESelectionKind i_Kind)
{
    switch (i_Kind)
    {
    case ESelectionKind::Camera:
    case ESelectionKind::Net:
    case ESelectionKind::AnalogueDeviceOutput:
    case ESelectionKind::Label:
    case ESelectionKind::ReconstructionTrack:
    case ESelectionKind::Segment:
    case ESelectionKind::SegmentSolve:
    case ESelectionKind::SegmentRetarget:
        return {true, true, true, false, true};
    case ESelectionKind::Subject:
        return {true, true, false, false, true};
    case ESelectionKind::CentroidTrack:
        return {true, true, true, true, true};
    case ESelectionKind::Monitor:
        return {true, true, false, false, false};
    case ESelectionKind::ModelOutput:
        return {true, true, false, true, true};
    default:
        return {};
    }
}

/// The selected things of a kind. For segments a selected subject stands for its root segment.
std::vector<SelectionItem> ThingsOf(const TQL::ISelectionSource& i_rSource, const TQL::ISelection& i_rSelection,
                                    ESelectionKind i_Kind)
{
    std::vector<SelectionItem> things = i_rSelection.Items(i_Kind);
    if (!IsSegmentKind(i_Kind))
        return things;
    for (const SelectionItem& rSubject : i_rSelection.Items(ESelectionKind::Subject))
    {
        const SelectionItem root{i_Kind, rSubject.First, i_rSource.RootSegment(rSubject.First), {}};
        if (std::ranges::find(things, root) == things.end())
            things.push_back(root);
    }
    return things;
}

} // namespace

TQL::IChannelInstanceId MakeChannelId(std::string_view i_Context, std::string_view i_Type, const SelectionItem& i_rItem)
{
    const KindRule rule = RuleOf(i_rItem.Kind);
    TQL::IChannelInstanceId id;
    id.DataContextName = rule.bContext ? i_Context : std::string_view{};
    id.TypeName = i_Type;
    id.First = rule.bFirst ? i_rItem.First : 0;
    id.Second = rule.bSecond ? i_rItem.Second : 0;
    id.Text = rule.bText ? i_rItem.Text : std::string{};
    return id;
}

SelectionItem MakeSelectionItem(ESelectionKind i_Kind, const TQL::IChannelInstanceId& i_rId)
{
    const KindRule rule = RuleOf(i_Kind);
    if (!rule.bListed)
        return {};
    return {i_Kind, rule.bFirst ? i_rId.First : 0, rule.bSecond ? i_rId.Second : 0,
            rule.bText ? i_rId.Text : std::string{}};
}

VChannelSelectionManager::VChannelSelectionManager(std::shared_ptr<TQL::ISelectionSource> i_pSource)
    : m_pSource(std::move(i_pSource))
    , m_pChanged(std::make_shared<NotificationSystem::VMultiCallbackPostal<void(bool)>>())
{
}

void VChannelSelectionManager::OnPostCreation()
{
    m_Subscriptions.Subscribe<void(bool)>(
        m_pSource->Changed(),
        NotificationSystem::MakeWeakCallback(WeakSelf(this), &VChannelSelectionManager::OnSelectionChanged), nullptr);
}

void VChannelSelectionManager::OnSelectionChanged(bool i_bForce)
{
    m_pChanged->Invoke(i_bForce);
}

void VChannelSelectionManager::GetSelectedChannelIds(std::string_view i_Context, std::string_view i_Type,
                                                     std::vector<TQL::IChannelInstanceId>& o_rIds) const
{
    o_rIds.clear();
    auto kind = ESelectionKind::None;
    if (GetSelectionKind(i_Type, kind).IsError() || kind == ESelectionKind::None)
        return;
    if (kind == ESelectionKind::Global)
    {
        o_rIds.push_back({std::string(i_Context), std::string(i_Type), 0, 0, {}});
        return;
    }
    if (!RuleOf(kind).bListed)
        return;
    for (const SelectionItem& rThing : ThingsOf(*m_pSource, *m_pSource->GetSelection(), kind))
        o_rIds.push_back(MakeChannelId(i_Context, i_Type, rThing));
}

void VChannelSelectionManager::GetSelectedTypeCounts(std::uint64_t i_Mask,
                                                     std::map<std::string, std::uint64_t>& o_rCounts) const
{
    o_rCounts.clear();
    const auto pSelection = m_pSource->GetSelection();
    std::map<ESelectionKind, std::size_t> counts;
    for (const auto& [rType, rRecord] : GetTypes(i_Mask))
    {
        if (rRecord.Kind == ESelectionKind::None)
            continue;
        const auto [found, bNew] = counts.try_emplace(rRecord.Kind, 0);
        if (bNew)
            found->second = ThingsOf(*m_pSource, *pSelection, rRecord.Kind).size();
        if (found->second != 0)
            o_rCounts[rType] = found->second;
    }
}

void VChannelSelectionManager::GetSelectedChannelTypes(std::uint64_t i_Mask, std::set<std::string>& o_rTypes) const
{
    std::map<std::string, std::uint64_t> counts;
    GetSelectedTypeCounts(i_Mask, counts);
    o_rTypes.clear();
    bool bSubject = false;
    for (const auto& [rType, count] : counts)
    {
        auto kind = ESelectionKind::None;
        bSubject = bSubject || (GetSelectionKind(rType, kind).IsSuccess() && kind == ESelectionKind::Subject);
        o_rTypes.insert(rType);
    }
    if (!bSubject)
        return;
    const TypeTable offered = GetTypes(i_Mask);
    for (const char* pType : {"SubjectSegmentPose", "SubjectSegmentPoseSolve", "SubjectSegmentPoseRetarget"})
    {
        auto kind = ESelectionKind::None;
        if (offered.contains(pType) || GetSelectionKind(pType, kind).IsError()) // not one that the mask leaves out
            o_rTypes.insert(pType);
    }
}

void VChannelSelectionManager::GetGlobalChannelTypes(std::uint64_t i_Mask, std::set<std::string>& o_rTypes) const
{
    o_rTypes.clear();
    for (const auto& [rType, rRecord] : GetTypes(i_Mask))
        if (rRecord.Kind == ESelectionKind::Global)
            o_rTypes.insert(rType);
}

TQL::IResult VChannelSelectionManager::GetSelectionKind(std::string_view i_Type, ESelectionKind& o_rKind) const
{
    const std::lock_guard lock(m_Mutex);
    const auto found = m_Types.find(i_Type);
    if (found == m_Types.end())
        return TQL::Result::NotFound;
    o_rKind = found->second.Kind;
    return TQL::Result::Ok;
}

void VChannelSelectionManager::SelectThingsOf(const std::shared_ptr<TQL::IChannel>& i_rpChannel, bool i_bExtend)
{
    std::vector<SelectionItem> items;
    std::vector<std::shared_ptr<TQL::IChannel>> open{i_rpChannel};
    std::unordered_set<const TQL::IChannel*> seen; // channels may share what they are made from
    while (!open.empty())
    {
        const auto pChannel = open.back();
        open.pop_back();
        if (!pChannel || !seen.insert(pChannel.get()).second)
            continue;
        auto kind = ESelectionKind::None;
        const TQL::IChannelInstanceId& rId = pChannel->GetInstanceId();
        const bool bKnown = GetSelectionKind(rId.TypeName, kind).IsSuccess();
        const SelectionItem item = bKnown ? MakeSelectionItem(kind, rId) : SelectionItem{};
        if (item.Kind != ESelectionKind::None && std::ranges::find(items, item) == items.end())
            items.push_back(item);
        std::vector<std::shared_ptr<TQL::IChannel>> dependents;
        pChannel->GetDependentChannels(dependents);
        open.insert(open.end(), dependents.rbegin(), dependents.rend());
    }
    if (items.empty())
        return;
    if (i_bExtend)
        m_pSource->Add(items);
    else
        m_pSource->Set(items);
}

void VChannelSelectionManager::RegisterChannelType(std::string_view i_Type, ESelectionKind i_Kind,
                                                   std::uint32_t i_Flags)
{
    const std::lock_guard lock(m_Mutex);
    m_Types.insert_or_assign(std::string(i_Type), TypeRecord{i_Kind, i_Flags});
}

VChannelSelectionManager::TypeTable VChannelSelectionManager::GetTypes(std::uint64_t i_Mask) const
{
    const std::lock_guard lock(m_Mutex);
    TypeTable types = m_Types;
    std::erase_if(types, [i_Mask](const auto& i_rPair) { return (i_rPair.second.Flags & i_Mask) != 0; });
    return types;
}

} // namespace ChannelSystemSelection

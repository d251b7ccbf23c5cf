#include "Channels/Contexts/ContextThings.h"

#include "Channels/Common/ChannelTypes.h"
#include "Channels/Contexts/VChannelContext.h"

#include <algorithm>
#include <initializer_list>
#include <set>

namespace Channels
{

using TQL::ESelectionKind;

namespace
{

/// Items of a kind for the first numbers of all channels that are about one of the other kinds.
std::vector<TQL::SelectionItem> OwnersOf(const VChannelContext& i_rContext, ESelectionKind i_Kind,
                                         std::initializer_list<ESelectionKind> i_Owned)
{
    std::set<std::uint64_t> numbers;
    const auto pChannels = i_rContext.GetChannels();
    for (const auto& rpChannel : *pChannels)
    {
        const ChannelType* pType = FindChannelType(rpChannel->GetInstanceId().TypeName);
        if (pType && std::ranges::find(i_Owned, pType->Kind) != i_Owned.end())
            numbers.insert(rpChannel->GetInstanceId().First);
    }
    std::vector<TQL::SelectionItem> items;
    for (const std::uint64_t number : numbers)
        items.push_back({i_Kind, number, 0, {}});
    return items;
}

} // namespace

std::uint64_t RootSegmentOf(const VChannelContext& i_rContext, std::uint64_t i_Subject)
{
    const auto pChannels = i_rContext.GetChannels();
    for (const auto& rpChannel : *pChannels)
    {
        const TQL::IChannelInstanceId& rId = rpChannel->GetInstanceId();
        if (rId.TypeName == SegmentPoseType && rId.First == i_Subject)
            return rId.Second;
    }
    return 0;
}

std::vector<TQL::SelectionItem> SubjectsOf(const VChannelContext& i_rContext)
{
    return OwnersOf(i_rContext, ESelectionKind::Subject, {ESelectionKind::Label, ESelectionKind::Segment});
}

std::vector<TQL::SelectionItem> DevicesOf(const VChannelContext& i_rContext)
{
    return OwnersOf(i_rContext, ESelectionKind::Device, {ESelectionKind::AnalogueDeviceOutput});
}

} // namespace Channels

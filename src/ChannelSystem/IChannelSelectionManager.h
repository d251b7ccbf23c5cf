#pragma once

#include "ChannelSystem/ISelectionSource.h"
#include "TQL/IChannelInstanceId.h"

#include <cstdint>
#include <map>
#include <set>
#include <string_view>

namespace TQL
{

class IChannel;

/// What the host's selection means in channels: for each channel type it knows what kind of thing that is a channel of,
/// and names the channels that the selected things imply. UI thread, but for GetSelectionKind and RegisterChannelType,
/// which any thread may call. A mask leaves out the types whose flags share a bit with it: 2 what is never plotted,
/// 4 what only developers see; 0 leaves out none.
class IChannelSelectionManager
{
public:
    virtual ~IChannelSelectionManager() = default;

    /// Nothing for an unknown type or one without a kind; one id of context and type alone for a global type.
    virtual void GetSelectedChannelIds(std::string_view i_Context, std::string_view i_Type,
                                       std::vector<IChannelInstanceId>& o_rIds) const = 0;
    /// How many selected things each type could take.
    virtual void GetSelectedTypeCounts(std::uint64_t i_Mask, std::map<std::string, std::uint64_t>& o_rCounts) const = 0;
    virtual void GetSelectedChannelTypes(std::uint64_t i_Mask, std::set<std::string>& o_rTypes) const = 0;
    virtual void GetGlobalChannelTypes(std::uint64_t i_Mask, std::set<std::string>& o_rTypes) const = 0;
    /// The bool asks for a refresh by force.
    virtual std::shared_ptr<IMultiCallbackPostal<void(bool)>> SelectionChanged() const = 0;
    virtual IResult GetSelectionKind(std::string_view i_Type, ESelectionKind& o_rKind) const = 0; ///< NotFound
    /// Selects the things that the channel and its dependents are channels of; adds to the selection with i_bExtend.
    virtual void SelectThingsOf(const std::shared_ptr<IChannel>& i_rpChannel, bool i_bExtend) = 0;
    virtual void RegisterChannelType(std::string_view i_Type, ESelectionKind i_Kind, std::uint32_t i_Flags) = 0;
};

} // namespace TQL

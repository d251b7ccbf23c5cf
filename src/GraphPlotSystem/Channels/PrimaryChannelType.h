#pragma once

#include <memory>
#include <set>
#include <string>
#include <string_view>

namespace TQL
{
class IChannel;
}

namespace GraphPlotUI
{

/// The one type that "Auto" plots of a selection that can give channels of the given types; empty for none. Poses are
/// plotted as position and rotation, whichever way they were computed.
std::string PrimaryChannelType(const std::set<std::string>& i_rSelectedTypes);

/// Whether the channel, or any that it is derived from, is of the type.
bool IsMadeOfType(const std::shared_ptr<TQL::IChannel>& i_rpChannel, std::string_view i_TypeName);

} // namespace GraphPlotUI

#pragma once

#include "TQL/IResult.h"

#include <memory>
#include <span>
#include <string>
#include <string_view>
#include <vector>

namespace ChannelSystem
{
class IChannelService;
}
namespace TQL
{
class IChannel;
struct ComponentGroup;
} // namespace TQL

/// Units as text: "mm/s^2", or "mm/s<sup>2</sup>" as rich text, in which the host's own texts are escaped. UTF-8. Any
/// thread.
namespace ChannelSystemUtils
{

enum class EUnitText
{
    Plain,
    Rich
};

/// The unit of one component: factors by falling exponent, those below the line behind one slash, in brackets when they
/// are several. A factor that the host does not know is left out; a group that is not used has no unit. Without a
/// factor above the line there is no line either, so a host describes a frequency by a unit of its own, such as hertz.
std::string ComposeUnitText(const TQL::ComponentGroup& i_rGroup, const ChannelSystem::IChannelService& i_rService,
                            EUnitText i_Form);

/// The unit of each component of a channel. NotAvailable for a null channel.
TQL::IResult ComposeUnitTexts(const std::shared_ptr<TQL::IChannel>& i_rpChannel,
                              const ChannelSystem::IChannelService& i_rService, EUnitText i_Form,
                              std::vector<std::string>& o_rTexts);

/// Runs of equal texts: "mm[3] °".
std::string ComposeRunText(std::span<const std::string> i_UnitTexts);

/// "Name (unit)"; the name alone when there is no unit.
std::string JoinNameAndUnit(std::string_view i_Name, std::string_view i_Unit);

} // namespace ChannelSystemUtils

#pragma once

#include "TQL/IResult.h"

#include <string>
#include <string_view>
#include <vector>

namespace TQL
{
class IChannel;
}

/// Names of channels and of their components, as the operator reads them. UTF-8. Any thread.
namespace ChannelSystemUtils
{

/// Says what the operator calls the result of a chain of derivations: "Position 1st Derivative (Magnitude)" is "Speed".
/// A table of expressions, applied in turn to the whole text.
std::string RenameType(std::string_view i_TypeName);

/// "Type - Instance"; without the dash when the instance name is empty or begins with a blank.
std::string JoinTypeAndInstance(std::string_view i_TypeName, std::string_view i_InstanceName);

struct ChannelNames
{
    std::string TypeName;    ///< renamed
    std::string DisplayName; ///< with the instance

    friend bool operator==(const ChannelNames&, const ChannelNames&) = default;
};

/// A channel whose parameters name no type goes by the type of its id.
ChannelNames ComposeChannelNames(const TQL::IChannel& i_rChannel);

/// Cuts at each comma; blanks stay. The empty text holds no name.
std::vector<std::string> SplitComponentNames(std::string_view i_Names);

/// InvalidIndex, and the empty text, past the end.
TQL::IResult GetComponentName(std::string_view i_Names, std::size_t i_Index, std::string& o_rName);

} // namespace ChannelSystemUtils

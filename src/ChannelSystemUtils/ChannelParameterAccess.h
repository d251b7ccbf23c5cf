#pragma once

#include "ChannelSystem/ISelectionSource.h"
#include "TQL/IResult.h"

#include <optional>
#include <string>
#include <string_view>

namespace TQL
{
class IChannelParameters;
}

/// Typed reads of channel parameters. Any thread.
namespace ChannelSystemUtils
{

/// Nothing when the parameter is absent or no text.
std::optional<std::string> ReadTextParameter(const TQL::IChannelParameters& i_rParameters, std::string_view i_Name);

/// Nothing when the parameter is absent or no bool.
std::optional<bool> ReadBoolParameter(const TQL::IChannelParameters& i_rParameters, std::string_view i_Name);

/// The kind of selection of a channel type, stored as its number or its name. The failure of the read; InvalidType,
/// with a line in the log, when the value stands for no kind. o_rKind is None on a failure.
TQL::IResult ReadSelectionParameter(const TQL::IChannelParameters& i_rParameters, TQL::ESelectionKind& o_rKind);

} // namespace ChannelSystemUtils

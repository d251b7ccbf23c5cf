#pragma once

#include <string>
#include <string_view>

namespace TQL
{
struct ISchema;
class IStoreReader;
} // namespace TQL

namespace Studio
{

/// A type as a person reads it: "ELengthUnits", "List of Float64", "Tuple (UInt64, List of UInt64)".
std::string TypeText(const TQL::ISchema& i_rSchema);

/// A text cut to what fits on a line, with "..." where it goes on.
std::string Shortened(std::string_view i_Text);

/// What a store holds, a line an entry: its name, and with a value its type and value.
std::string FormatStoreTree(const TQL::IStoreReader& i_rReader);

} // namespace Studio

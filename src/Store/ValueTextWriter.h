#pragma once

#include <cstdint>
#include <span>
#include <string>

namespace TQL
{
struct ISchema;
}

namespace Store
{

/// Appends the text form of a value, which ParseValueText reads: compact JSON in which an enum is its name in quotes
/// and an array, list or tuple, a named one too, a JSON list. Bytes behind the value are ignored. False, and io_rText
/// as it was, for bytes that end too early, a number of an enum without a name, a number that is not finite, Void and
/// Ref.
[[nodiscard]] bool AppendValueText(std::string& io_rText, const TQL::ISchema& i_rSchema,
                                   std::span<const std::uint8_t> i_Bytes);

} // namespace Store

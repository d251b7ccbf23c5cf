#pragma once

#include "StoreInterface/StoreValue.h"

#include <optional>
#include <string_view>

namespace Store
{

/// The value of a String schema.
StoreValue StringValue(const TQL::ISchema& i_rSchema, std::string_view i_Text);

/// The value of an enum schema that has this name, the first one where it stands twice; none for an unknown name or a
/// number that the storage does not hold.
std::optional<StoreValue> EnumValue(const TQL::ISchema& i_rSchema, std::string_view i_Name);

/// Reads a value from its text form, which is JSON: a float is any number, an integer one without fraction or exponent
/// that is in range, an enum its name in quotes, a list, array or tuple a JSON list; a named tuple also an object
/// with all members in any order. None for any other text, and for Void and Ref. The schema is an interned one.
std::optional<StoreValue> ParseValueText(const TQL::ISchema& i_rSchema, std::string_view i_Text);

} // namespace Store

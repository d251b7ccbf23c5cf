#pragma once

#include "TQL/RapidJson.h"

#include <cstddef>
#include <cstdint>
#include <span>
#include <string_view>

namespace TQL
{
struct ISchema;
}

namespace StoreIO
{

/// Adds a member to the object that is being built in i_rTarget, with a value as store files hold it: a bool and the
/// numbers as such (0 for bytes that end too early, a Float32 widened, any Float that is not finite too), a String as
/// itself, all others as a string of their text form. False, and nothing is added, for a value that has no text form.
[[nodiscard]] bool AddValueMember(rapidjson::Document& i_rTarget, std::string_view i_Name,
                                  const TQL::ISchema& i_rSchema, std::span<const std::uint8_t> i_Bytes);

/// Copies the text.
void AddName(rapidjson::Document& i_rTarget, std::string_view i_Name);
void AddText(rapidjson::Document& i_rTarget, std::string_view i_Text);

} // namespace StoreIO

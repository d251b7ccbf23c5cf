#pragma once

#include "StoreInterface/StoreValue.h"
#include "TQL/RapidJson.h"

namespace StoreIO
{

/// The value that a member of a store file stands for. Never empty for Bool and numbers: an integer takes the low bytes
/// of an integer, a float any number, and what is no such number counts as 0. Empty for a String that is no JSON
/// string, and for any other type whose JSON is no string with the value's text form. The schema is an interned one.
Store::StoreValue ValueFromJson(const rapidjson::Value& i_rJson, const TQL::ISchema& i_rSchema);

} // namespace StoreIO

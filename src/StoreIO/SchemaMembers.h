#pragma once

#include "TQL/RapidJson.h"

namespace StoreIO
{

/// Writes those members of an entry object that describe its type, as an object in compact form.
void WriteSchemaText(const rapidjson::Value& i_rEntry, rapidjson::StringBuffer& o_rText);

/// Whether two entry objects have the same such text, found out without making it.
bool HaveSameSchemaText(const rapidjson::Value& i_rA, const rapidjson::Value& i_rB);

} // namespace StoreIO

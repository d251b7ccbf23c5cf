#pragma once

#include "TQL/RapidJson.h"

#include <string_view>

namespace StoreIO
{

/// The text of a JSON string.
inline std::string_view TextOf(const rapidjson::Value& i_rString)
{
    return {i_rString.GetString(), i_rString.GetStringLength()};
}

/// The first member of that name, or null.
inline const rapidjson::Value* FindMember(const rapidjson::Value& i_rObject, std::string_view i_Name)
{
    for (const auto& rMember : i_rObject.GetObject())
        if (TextOf(rMember.name) == i_Name)
            return &rMember.value;
    return nullptr;
}

} // namespace StoreIO

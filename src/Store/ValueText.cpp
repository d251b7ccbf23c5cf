#include "Store/ValueText.h"

#include "Store/EnumStorage.h"
#include "TQL/ISchema.h"
#include "TQL/RapidJson.h"

#include <algorithm>
#include <bit>
#include <cmath>
#include <cstdint>
#include <limits>
#include <vector>

namespace Store
{
namespace
{

using Bytes = std::vector<std::uint8_t>;
using Json = rapidjson::Value;

void AppendNumber(Bytes& io_rBytes, std::uint64_t i_Bits, std::size_t i_Size)
{
    for (std::size_t i = 0; i < i_Size; ++i)
        io_rBytes.push_back(static_cast<std::uint8_t>(i_Bits >> (8 * i)));
}

bool AppendCount(Bytes& io_rBytes, std::size_t i_Count)
{
    AppendNumber(io_rBytes, i_Count, 4);
    return i_Count <= static_cast<std::size_t>(std::numeric_limits<std::int32_t>::max());
}

bool AppendString(Bytes& io_rBytes, std::string_view i_Text)
{
    if (!AppendCount(io_rBytes, i_Text.size()))
        return false;
    io_rBytes.insert(io_rBytes.end(), i_Text.begin(), i_Text.end());
    return true;
}

template <typename TInteger>
bool AppendInteger(Bytes& io_rBytes, const Json& i_rJson)
{
    constexpr std::numeric_limits<TInteger> s_Limits;
    if constexpr (s_Limits.is_signed)
    {
        if (!i_rJson.IsInt64() || i_rJson.GetInt64() < s_Limits.min() || i_rJson.GetInt64() > s_Limits.max())
            return false;
        AppendNumber(io_rBytes, static_cast<std::uint64_t>(i_rJson.GetInt64()), sizeof(TInteger));
    }
    else
    {
        if (!i_rJson.IsUint64() || i_rJson.GetUint64() > s_Limits.max())
            return false;
        AppendNumber(io_rBytes, i_rJson.GetUint64(), sizeof(TInteger));
    }
    return true;
}

bool AppendFloat(Bytes& io_rBytes, const Json& i_rJson, bool i_bDouble)
{
    if (!i_rJson.IsNumber())
        return false;
    const double number = i_rJson.GetDouble(); // infinity for 1.8e308
    if (i_bDouble && std::isfinite(number))
        AppendNumber(io_rBytes, std::bit_cast<std::uint64_t>(number), 8);
    else if (!i_bDouble && std::abs(number) <= static_cast<double>(std::numeric_limits<float>::max()))
        AppendNumber(io_rBytes, std::bit_cast<std::uint32_t>(static_cast<float>(number)), 4);
    else
        return false;
    return true;
}

bool AppendEnum(Bytes& io_rBytes, const TQL::ISchema& i_rSchema, std::string_view i_Name)
{
    for (const auto& [name, number] : i_rSchema.EnumValues)
        if (name == i_Name)
        {
            AppendNumber(io_rBytes, static_cast<std::uint64_t>(std::int64_t{number}), EnumSize(i_rSchema.Type));
            return FitsEnum(i_rSchema.Type, number);
        }
    return false;
}

std::string_view TextOf(const Json& i_rJson)
{
    return {i_rJson.GetString(), i_rJson.GetStringLength()};
}

bool Append(Bytes& io_rBytes, const TQL::ISchema& i_rSchema, const Json& i_rJson);

bool AppendElements(Bytes& io_rBytes, const TQL::ISchema& i_rSchema, const Json& i_rJson)
{
    if (!i_rJson.IsArray() || i_rSchema.SubSchemas.size() != 1)
        return false;
    if (i_rSchema.Type == TQL::EType::List ? !AppendCount(io_rBytes, i_rJson.Size())
                                           : i_rJson.Size() != i_rSchema.Count)
        return false;
    return std::all_of(i_rJson.Begin(), i_rJson.End(),
                       [&](const Json& i_rElement)
                       { return Append(io_rBytes, i_rSchema.SubSchemas.front().Schema, i_rElement); });
}

bool AppendMembers(Bytes& io_rBytes, const TQL::ISchema& i_rSchema, const Json& i_rJson)
{
    const auto& rMembers = i_rSchema.SubSchemas;
    if (i_rJson.IsArray() && i_rJson.Size() == rMembers.size())
        return std::equal(rMembers.begin(), rMembers.end(), i_rJson.Begin(),
                          [&](const TQL::SchemaMember& i_rMember, const Json& i_rElement)
                          { return Append(io_rBytes, i_rMember.Schema, i_rElement); });
    if (i_rSchema.Type != TQL::EType::NamedTuple || !i_rJson.IsObject() || i_rJson.MemberCount() != rMembers.size())
        return false;
    return std::all_of(rMembers.begin(), rMembers.end(),
                       [&](const TQL::SchemaMember& i_rMember)
                       {
                           const auto found = i_rJson.FindMember(
                               Json(rapidjson::StringRef(i_rMember.Name.data(), i_rMember.Name.size())));
                           return found != i_rJson.MemberEnd() && Append(io_rBytes, i_rMember.Schema, found->value);
                       });
}

/// As deep as the schema, never as the text.
bool Append(Bytes& io_rBytes, const TQL::ISchema& i_rSchema, const Json& i_rJson)
{
    switch (i_rSchema.Type)
    {
    case TQL::EType::Bool:
        io_rBytes.push_back(i_rJson.IsTrue() ? 1 : 0);
        return i_rJson.IsBool();
    case TQL::EType::Int8:
        return AppendInteger<std::int8_t>(io_rBytes, i_rJson);
    case TQL::EType::Int16:
        return AppendInteger<std::int16_t>(io_rBytes, i_rJson);
    case TQL::EType::Int32:
        return AppendInteger<std::int32_t>(io_rBytes, i_rJson);
    case TQL::EType::Int64:
        return AppendInteger<std::int64_t>(io_rBytes, i_rJson);
    case TQL::EType::UInt8:
        return AppendInteger<std::uint8_t>(io_rBytes, i_rJson);
    case TQL::EType::UInt16:
        return AppendInteger<std::uint16_t>(io_rBytes, i_rJson);
    case TQL::EType::UInt32:
        return AppendInteger<std::uint32_t>(io_rBytes, i_rJson);
    case TQL::EType::UInt64:
        return AppendInteger<std::uint64_t>(io_rBytes, i_rJson);
    case TQL::EType::Float32:
        return AppendFloat(io_rBytes, i_rJson, false);
    case TQL::EType::Float64:
        return AppendFloat(io_rBytes, i_rJson, true);
    case TQL::EType::String:
        return i_rJson.IsString() && AppendString(io_rBytes, TextOf(i_rJson));
    case TQL::EType::Enum8:
    case TQL::EType::Enum16:
    case TQL::EType::Enum32:
        return i_rJson.IsString() && AppendEnum(io_rBytes, i_rSchema, TextOf(i_rJson));
    case TQL::EType::Array:
    case TQL::EType::List:
        return AppendElements(io_rBytes, i_rSchema, i_rJson);
    case TQL::EType::Tuple:
    case TQL::EType::NamedTuple:
        return AppendMembers(io_rBytes, i_rSchema, i_rJson);
    case TQL::EType::Void:
    case TQL::EType::Ref:
        return false;
    }
    return false;
}

} // namespace

StoreValue StringValue(const TQL::ISchema& i_rSchema, std::string_view i_Text)
{
    Bytes bytes;
    return AppendString(bytes, i_Text) ? StoreValue(&i_rSchema, bytes) : StoreValue();
}

std::optional<StoreValue> EnumValue(const TQL::ISchema& i_rSchema, std::string_view i_Name)
{
    Bytes bytes;
    if (!AppendEnum(bytes, i_rSchema, i_Name))
        return std::nullopt;
    return StoreValue(&i_rSchema, bytes);
}

std::optional<StoreValue> ParseValueText(const TQL::ISchema& i_rSchema, std::string_view i_Text)
{
    // Most texts are short, and the memory for long ones is slow to get.
    char memory[2048];
    rapidjson::MemoryPoolAllocator<> pool(memory, sizeof(memory));
    rapidjson::Document document(&pool);
    // Iterative: the depth of the text must not be the depth of the stack.
    document.Parse<rapidjson::kParseFullPrecisionFlag | rapidjson::kParseIterativeFlag>(i_Text.data(), i_Text.size());
    Bytes bytes;
    if (document.HasParseError() || !Append(bytes, i_rSchema, document))
        return std::nullopt;
    return StoreValue(&i_rSchema, bytes);
}

} // namespace Store

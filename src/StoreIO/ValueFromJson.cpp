#include "StoreIO/ValueFromJson.h"

#include "Store/ValueText.h"
#include "TQL/ISchema.h"

#include <array>
#include <cstdint>
#include <cstring>
#include <span>
#include <string_view>

namespace StoreIO
{
namespace
{

using Json = rapidjson::Value;

template <typename TNumber>
Store::StoreValue NumberValue(const TQL::ISchema& i_rSchema, TNumber i_Number)
{
    std::array<std::uint8_t, sizeof(TNumber)> bytes;
    std::memcpy(bytes.data(), &i_Number, sizeof(TNumber));
    return {&i_rSchema, bytes};
}

std::uint64_t IntegerBits(const Json& i_rJson)
{
    if (i_rJson.IsUint64())
        return i_rJson.GetUint64();
    return i_rJson.IsInt64() ? static_cast<std::uint64_t>(i_rJson.GetInt64()) : 0;
}

template <typename TInteger>
Store::StoreValue IntegerValue(const TQL::ISchema& i_rSchema, const Json& i_rJson)
{
    return NumberValue(i_rSchema, static_cast<TInteger>(IntegerBits(i_rJson)));
}

/// Whole numbers go there directly: by way of a double they could be rounded twice.
float ToFloat(const Json& i_rJson)
{
    if (i_rJson.IsUint64())
        return static_cast<float>(i_rJson.GetUint64());
    if (i_rJson.IsInt64())
        return static_cast<float>(i_rJson.GetInt64());
    return i_rJson.IsDouble() ? static_cast<float>(i_rJson.GetDouble()) : 0.0F;
}

Store::StoreValue TextValue(const TQL::ISchema& i_rSchema, const Json& i_rJson)
{
    if (!i_rJson.IsString())
        return {};
    const std::string_view text(i_rJson.GetString(), i_rJson.GetStringLength());
    if (i_rSchema.Type == TQL::EType::String)
        return Store::StringValue(i_rSchema, text);
    return Store::ParseValueText(i_rSchema, text).value_or(Store::StoreValue());
}

} // namespace

Store::StoreValue ValueFromJson(const rapidjson::Value& i_rJson, const TQL::ISchema& i_rSchema)
{
    switch (i_rSchema.Type)
    {
    case TQL::EType::Bool:
        return NumberValue(i_rSchema, static_cast<std::uint8_t>(i_rJson.IsTrue() ? 1 : 0));
    case TQL::EType::Int8:
    case TQL::EType::UInt8:
        return IntegerValue<std::uint8_t>(i_rSchema, i_rJson);
    case TQL::EType::Int16:
    case TQL::EType::UInt16:
        return IntegerValue<std::uint16_t>(i_rSchema, i_rJson);
    case TQL::EType::Int32:
    case TQL::EType::UInt32:
        return IntegerValue<std::uint32_t>(i_rSchema, i_rJson);
    case TQL::EType::Int64:
    case TQL::EType::UInt64:
        return IntegerValue<std::uint64_t>(i_rSchema, i_rJson);
    case TQL::EType::Float32:
        return NumberValue(i_rSchema, ToFloat(i_rJson));
    case TQL::EType::Float64:
        return NumberValue(i_rSchema, i_rJson.IsNumber() ? i_rJson.GetDouble() : 0.0);
    case TQL::EType::String:
    case TQL::EType::Enum8:
    case TQL::EType::Enum16:
    case TQL::EType::Enum32:
    case TQL::EType::Array:
    case TQL::EType::List:
    case TQL::EType::Tuple:
    case TQL::EType::NamedTuple:
    case TQL::EType::Void:
    case TQL::EType::Ref:
        break;
    }
    return TextValue(i_rSchema, i_rJson);
}

} // namespace StoreIO

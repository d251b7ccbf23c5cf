#include "StoreIO/ValueToJson.h"

#include "Store/ValueTextWriter.h"
#include "TQL/ISchema.h"

#include <cstring>
#include <limits>
#include <optional>
#include <string>

namespace StoreIO
{
namespace
{

using Bytes = std::span<const std::uint8_t>;

template <typename T>
T NumberOf(Bytes i_Bytes)
{
    T number{};
    if (i_Bytes.size() >= sizeof(T))
        std::memcpy(&number, i_Bytes.data(), sizeof(T));
    return number;
}

/// Where the value is a plain number or bool: true, and it is added.
bool AddPlain(rapidjson::Document& i_rTarget, TQL::EType i_Type, Bytes i_Bytes)
{
    switch (i_Type)
    {
    case TQL::EType::Bool:
        return i_rTarget.Bool(NumberOf<std::uint8_t>(i_Bytes) != 0);
    case TQL::EType::Int8:
        return i_rTarget.Int(NumberOf<std::int8_t>(i_Bytes));
    case TQL::EType::Int16:
        return i_rTarget.Int(NumberOf<std::int16_t>(i_Bytes));
    case TQL::EType::Int32:
        return i_rTarget.Int(NumberOf<std::int32_t>(i_Bytes));
    case TQL::EType::Int64:
        return i_rTarget.Int64(NumberOf<std::int64_t>(i_Bytes));
    case TQL::EType::UInt8:
        return i_rTarget.Uint(NumberOf<std::uint8_t>(i_Bytes));
    case TQL::EType::UInt16:
        return i_rTarget.Uint(NumberOf<std::uint16_t>(i_Bytes));
    case TQL::EType::UInt32:
        return i_rTarget.Uint(NumberOf<std::uint32_t>(i_Bytes));
    case TQL::EType::UInt64:
        return i_rTarget.Uint64(NumberOf<std::uint64_t>(i_Bytes));
    case TQL::EType::Float32:
        return i_rTarget.Double(double{NumberOf<float>(i_Bytes)});
    default:
        return i_rTarget.Double(NumberOf<double>(i_Bytes));
    }
}

/// The text in the bytes of a String: it may be long, so it is not copied here.
std::optional<std::string_view> StringOf(Bytes i_Bytes)
{
    constexpr std::size_t begin = sizeof(std::int32_t);
    const auto size = NumberOf<std::int32_t>(i_Bytes);
    if (i_Bytes.size() < begin || size < 0 || i_Bytes.size() - begin < static_cast<std::size_t>(size))
        return std::nullopt;
    return std::string_view(reinterpret_cast<const char*>(i_Bytes.data()) + begin, static_cast<std::size_t>(size));
}

} // namespace

bool AddValueMember(rapidjson::Document& i_rTarget, std::string_view i_Name, const TQL::ISchema& i_rSchema,
                    Bytes i_Bytes)
{
    if (i_rSchema.Type >= TQL::EType::Bool && i_rSchema.Type <= TQL::EType::Float64)
    {
        AddName(i_rTarget, i_Name);
        return AddPlain(i_rTarget, i_rSchema.Type, i_Bytes);
    }
    std::string made;
    std::optional<std::string_view> text;
    if (i_rSchema.Type == TQL::EType::String)
        text = StringOf(i_Bytes);
    else if (Store::AppendValueText(made, i_rSchema, i_Bytes))
        text = made;
    if (!text || text->size() > std::numeric_limits<rapidjson::SizeType>::max())
        return false;
    AddName(i_rTarget, i_Name);
    AddText(i_rTarget, *text);
    return true;
}

void AddName(rapidjson::Document& i_rTarget, std::string_view i_Name)
{
    i_rTarget.Key(i_Name.data(), static_cast<rapidjson::SizeType>(i_Name.size()), true);
}

void AddText(rapidjson::Document& i_rTarget, std::string_view i_Text)
{
    i_rTarget.String(i_Text.data(), static_cast<rapidjson::SizeType>(i_Text.size()), true);
}

} // namespace StoreIO

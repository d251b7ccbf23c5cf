#include "Store/ValueTextWriter.h"

#include "Store/EnumStorage.h"
#include "TQL/ISchema.h"
#include "TQL/JsonText.h"

#include <algorithm>
#include <bit>
#include <cstring>
#include <string_view>
#include <type_traits>

namespace Store
{
namespace
{

using Bytes = std::span<const std::uint8_t>;

static_assert(std::endian::native == std::endian::little, "stored numbers are copied as they lie in memory");

template <typename T>
bool TakeNumber(Bytes& io_rBytes, T& o_rNumber)
{
    if (io_rBytes.size() < sizeof(T))
        return false;
    std::memcpy(&o_rNumber, io_rBytes.data(), sizeof(T));
    io_rBytes = io_rBytes.subspan(sizeof(T));
    return true;
}

bool TakeCount(Bytes& io_rBytes, std::size_t& o_rCount)
{
    std::int32_t count = 0;
    if (!TakeNumber(io_rBytes, count) || count < 0)
        return false;
    o_rCount = static_cast<std::size_t>(count);
    return true;
}

template <typename T>
bool AppendNumber(std::string& io_rText, Bytes& io_rBytes)
{
    T number{};
    if (!TakeNumber(io_rBytes, number))
        return false;
    if constexpr (std::is_floating_point_v<T>)
        return TQL::JsonText::AppendNumber(io_rText, double{number});
    else
    {
        using Wide = std::conditional_t<std::is_signed_v<T>, std::int64_t, std::uint64_t>;
        TQL::JsonText::AppendNumber(io_rText, Wide{number});
        return true;
    }
}

bool AppendBool(std::string& io_rText, Bytes& io_rBytes)
{
    std::uint8_t byte = 0;
    if (!TakeNumber(io_rBytes, byte))
        return false;
    io_rText += byte != 0 ? "true" : "false";
    return true;
}

bool AppendString(std::string& io_rText, Bytes& io_rBytes)
{
    std::size_t size = 0;
    if (!TakeCount(io_rBytes, size) || io_rBytes.size() < size)
        return false;
    TQL::JsonText::AppendQuoted(io_rText, {reinterpret_cast<const char*>(io_rBytes.data()), size});
    io_rBytes = io_rBytes.subspan(size);
    return true;
}

/// The first name whose number has these bytes.
bool AppendEnum(std::string& io_rText, const TQL::ISchema& i_rSchema, Bytes& io_rBytes)
{
    const std::size_t size = EnumSize(i_rSchema.Type);
    if (io_rBytes.size() < size)
        return false;
    const auto found = std::ranges::find_if(i_rSchema.EnumValues,
                                            [&](const TQL::SchemaEnumValue& i_rValue) {
                                                return FitsEnum(i_rSchema.Type, i_rValue.Value) &&
                                                       std::memcmp(&i_rValue.Value, io_rBytes.data(), size) == 0;
                                            });
    if (found == i_rSchema.EnumValues.end())
        return false;
    io_rBytes = io_rBytes.subspan(size);
    TQL::JsonText::AppendQuoted(io_rText, found->Name);
    return true;
}

bool Append(std::string& io_rText, const TQL::ISchema& i_rSchema, Bytes& io_rBytes);

bool AppendElements(std::string& io_rText, const TQL::ISchema& i_rSchema, Bytes& io_rBytes)
{
    std::size_t count = i_rSchema.Count;
    if (i_rSchema.SubSchemas.size() != 1 || (i_rSchema.Type == TQL::EType::List && !TakeCount(io_rBytes, count)))
        return false;
    io_rText += '[';
    for (std::size_t i = 0; i < count; ++i)
    {
        if (i != 0)
            io_rText += ',';
        if (!Append(io_rText, i_rSchema.SubSchemas.front().Schema, io_rBytes))
            return false;
    }
    io_rText += ']';
    return true;
}

bool AppendMembers(std::string& io_rText, const TQL::ISchema& i_rSchema, Bytes& io_rBytes)
{
    io_rText += '[';
    for (std::size_t i = 0; i < i_rSchema.SubSchemas.size(); ++i)
    {
        if (i != 0)
            io_rText += ',';
        if (!Append(io_rText, i_rSchema.SubSchemas[i].Schema, io_rBytes))
            return false;
    }
    io_rText += ']';
    return true;
}

/// Takes the value off the front of io_rBytes. As deep as the schema.
bool Append(std::string& io_rText, const TQL::ISchema& i_rSchema, Bytes& io_rBytes)
{
    switch (i_rSchema.Type)
    {
    case TQL::EType::Bool:
        return AppendBool(io_rText, io_rBytes);
    case TQL::EType::Int8:
        return AppendNumber<std::int8_t>(io_rText, io_rBytes);
    case TQL::EType::Int16:
        return AppendNumber<std::int16_t>(io_rText, io_rBytes);
    case TQL::EType::Int32:
        return AppendNumber<std::int32_t>(io_rText, io_rBytes);
    case TQL::EType::Int64:
        return AppendNumber<std::int64_t>(io_rText, io_rBytes);
    case TQL::EType::UInt8:
        return AppendNumber<std::uint8_t>(io_rText, io_rBytes);
    case TQL::EType::UInt16:
        return AppendNumber<std::uint16_t>(io_rText, io_rBytes);
    case TQL::EType::UInt32:
        return AppendNumber<std::uint32_t>(io_rText, io_rBytes);
    case TQL::EType::UInt64:
        return AppendNumber<std::uint64_t>(io_rText, io_rBytes);
    case TQL::EType::Float32:
        return AppendNumber<float>(io_rText, io_rBytes);
    case TQL::EType::Float64:
        return AppendNumber<double>(io_rText, io_rBytes);
    case TQL::EType::String:
        return AppendString(io_rText, io_rBytes);
    case TQL::EType::Enum8:
    case TQL::EType::Enum16:
    case TQL::EType::Enum32:
        return AppendEnum(io_rText, i_rSchema, io_rBytes);
    case TQL::EType::Array:
    case TQL::EType::List:
        return AppendElements(io_rText, i_rSchema, io_rBytes);
    case TQL::EType::Tuple:
    case TQL::EType::NamedTuple:
        return AppendMembers(io_rText, i_rSchema, io_rBytes);
    case TQL::EType::Void:
    case TQL::EType::Ref:
        return false;
    }
    return false;
}

} // namespace

bool AppendValueText(std::string& io_rText, const TQL::ISchema& i_rSchema, std::span<const std::uint8_t> i_Bytes)
{
    const std::size_t size = io_rText.size();
    if (Append(io_rText, i_rSchema, i_Bytes))
        return true;
    io_rText.resize(size);
    return false;
}

} // namespace Store

#pragma once

#include "StoreInterface/StoreValue.h"
#include "TQL/SchemaIntern.h"

#include <array>
#include <bit>
#include <cstdint>
#include <cstring>
#include <limits>
#include <stdexcept>
#include <string>
#include <string_view>
#include <tuple>
#include <type_traits>
#include <vector>

/// Values of C++ types as store values. Known are bool, the integers and floats, std::string, std::vector, std::array
/// and std::tuple of known types, and:
/// - an enum of one, two or four bytes with a function TQL::ISchema DescribeSchema(std::type_identity<TEnum>) beside
/// it;
/// - a struct with such a function, giving a NamedTuple, and std::tuple<T&...> TieMembers(TStruct&), its members in
///   order.
namespace Store
{

static_assert(std::endian::native == std::endian::little, "stored numbers are copied as they lie in memory");

template <typename T>
concept StoreNumber = std::is_arithmetic_v<T> || std::is_enum_v<T>;

template <typename T>
concept StoreStruct = requires(T& i_rValue)
{
    TieMembers(i_rValue);
};

template <typename T>
struct IsVector : std::false_type
{
};
template <typename T>
struct IsVector<std::vector<T>> : std::true_type
{
};
template <typename T>
struct IsArray : std::false_type
{
};
template <typename T, std::size_t N>
struct IsArray<std::array<T, N>> : std::true_type
{
};
template <typename T>
struct IsTuple : std::false_type
{
};
template <typename... Ts>
struct IsTuple<std::tuple<Ts...>> : std::true_type
{
};

/// The schema of a type, not interned.
template <typename T>
TQL::ISchema MakeSchemaOf()
{
    using enum TQL::EType;
    if constexpr (std::is_same_v<T, bool>)
        return TQL::ISchema(Bool);
    else if constexpr (std::is_integral_v<T>)
    {
        constexpr TQL::EType types[2][4] = {{UInt8, UInt16, UInt32, UInt64}, {Int8, Int16, Int32, Int64}};
        return TQL::ISchema(types[std::is_signed_v<T>][std::countr_zero(sizeof(T))]);
    }
    else if constexpr (std::is_floating_point_v<T>)
    {
        static_assert(sizeof(T) <= 8);
        return TQL::ISchema(sizeof(T) == 4 ? Float32 : Float64);
    }
    else if constexpr (std::is_same_v<T, std::string>)
        return TQL::ISchema(String);
    else if constexpr (IsVector<T>::value)
        return TQL::MakeListSchema(MakeSchemaOf<typename T::value_type>());
    else if constexpr (IsArray<T>::value)
        return TQL::MakeArraySchema(MakeSchemaOf<typename T::value_type>(), std::tuple_size_v<T>);
    else if constexpr (IsTuple<T>::value)
        return []<typename... Ts>(std::type_identity<std::tuple<Ts...>>)
        {
            return TQL::MakeTupleSchema({MakeSchemaOf<Ts>()...});
        }(std::type_identity<T>{});
    else
        return DescribeSchema(std::type_identity<T>{});
}

/// The one instance of that schema.
template <typename T>
const TQL::ISchema& SchemaOf()
{
    static const TQL::ISchema* const s_pSchema = &TQL::IO::GetUniqueSchema(MakeSchemaOf<T>());
    return *s_pSchema;
}

/// Appends the bytes of i_rValue. Throws std::length_error for a text or list of more than 2^31 - 1 elements.
template <typename T>
void EncodeTo(std::vector<std::uint8_t>& io_rBytes, const T& i_rValue)
{
    const auto append = [&](const void* i_pData, std::size_t i_Size)
    {
        const std::size_t begin = io_rBytes.size();
        io_rBytes.resize(begin + i_Size);
        if (i_Size != 0)
            std::memcpy(io_rBytes.data() + begin, i_pData, i_Size);
    };
    const auto appendCount = [&](std::size_t i_Count)
    {
        if (i_Count > static_cast<std::size_t>(std::numeric_limits<std::int32_t>::max()))
            throw std::length_error("too long for a store value");
        EncodeTo(io_rBytes, static_cast<std::int32_t>(i_Count));
    };
    if constexpr (StoreNumber<T>)
        append(&i_rValue, sizeof(T));
    else if constexpr (std::is_same_v<T, std::string>)
    {
        appendCount(i_rValue.size());
        append(i_rValue.data(), i_rValue.size());
    }
    else if constexpr (IsVector<T>::value || IsArray<T>::value)
    {
        if constexpr (IsVector<T>::value)
            appendCount(i_rValue.size());
        for (const typename T::value_type& rElement : i_rValue)
            EncodeTo(io_rBytes, rElement);
    }
    else if constexpr (IsTuple<T>::value)
        std::apply([&](const auto&... i_rMember) { (EncodeTo(io_rBytes, i_rMember), ...); }, i_rValue);
    else
        std::apply([&](const auto&... i_rMember) { (EncodeTo(io_rBytes, i_rMember), ...); },
                   TieMembers(const_cast<T&>(i_rValue)));
}

/// Takes one value off the front of io_rBytes. False when they end too early or hold an impossible count.
template <typename T>
bool DecodeFrom(std::span<const std::uint8_t>& io_rBytes, T& o_rValue)
{
    const auto takeCount = [&](std::int32_t& o_rCount)
    {
        return DecodeFrom(io_rBytes, o_rCount) && o_rCount >= 0 &&
               static_cast<std::size_t>(o_rCount) <= io_rBytes.size();
    };
    if constexpr (std::is_same_v<T, bool>)
    {
        std::uint8_t byte = 0;
        const bool bDone = DecodeFrom(io_rBytes, byte);
        o_rValue = byte != 0;
        return bDone;
    }
    else if constexpr (StoreNumber<T>)
    {
        if (io_rBytes.size() < sizeof(T))
            return false;
        std::memcpy(&o_rValue, io_rBytes.data(), sizeof(T));
        io_rBytes = io_rBytes.subspan(sizeof(T));
        return true;
    }
    else if constexpr (std::is_same_v<T, std::string>)
    {
        std::int32_t count = 0;
        if (!takeCount(count))
            return false;
        const auto bytes = io_rBytes.first(static_cast<std::size_t>(count));
        o_rValue.assign(bytes.begin(), bytes.end());
        io_rBytes = io_rBytes.subspan(bytes.size());
        return true;
    }
    else if constexpr (IsVector<T>::value)
    {
        std::int32_t count = 0;
        if (!takeCount(count))
            return false;
        o_rValue.clear();
        o_rValue.reserve(static_cast<std::size_t>(count));
        for (std::int32_t i = 0; i < count; ++i)
        {
            typename T::value_type element{};
            if (!DecodeFrom(io_rBytes, element))
                return false;
            o_rValue.push_back(std::move(element));
        }
        return true;
    }
    else
    {
        const auto decodeAll = [&](auto&... o_rMember)
        {
            return (DecodeFrom(io_rBytes, o_rMember) && ...);
        };
        if constexpr (IsTuple<T>::value || IsArray<T>::value)
            return std::apply(decodeAll, o_rValue);
        else
            return std::apply(decodeAll, TieMembers(o_rValue));
    }
}

template <typename T>
StoreValue MakeValue(const T& i_rValue)
{
    if constexpr (StoreNumber<T>)
    {
        std::array<std::uint8_t, sizeof(T)> bytes;
        std::memcpy(bytes.data(), &i_rValue, sizeof(T));
        return {&SchemaOf<T>(), bytes};
    }
    else
    {
        std::vector<std::uint8_t> bytes;
        EncodeTo(bytes, i_rValue);
        return {&SchemaOf<T>(), bytes};
    }
}

inline StoreValue MakeValue(const char* i_pText)
{
    return MakeValue(std::string(i_pText));
}

enum class EDecodeResult
{
    Done,
    WrongType,
    Malformed
};

/// Reads a value as T. o_rValue keeps no meaning after a failure. A number of too few bytes is read as 0.
template <typename T>
EDecodeResult DecodeValue(const StoreValue& i_rValue, T& o_rValue)
{
    if (i_rValue.Schema() != &SchemaOf<T>())
        return EDecodeResult::WrongType;
    std::span<const std::uint8_t> bytes = i_rValue.Bytes();
    if constexpr (StoreNumber<T>)
    {
        if (!DecodeFrom(bytes, o_rValue))
            o_rValue = T{};
        return EDecodeResult::Done;
    }
    else
        return DecodeFrom(bytes, o_rValue) && bytes.empty() ? EDecodeResult::Done : EDecodeResult::Malformed;
}

} // namespace Store

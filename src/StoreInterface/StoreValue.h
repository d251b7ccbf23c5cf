#pragma once

#include <algorithm>
#include <cstddef>
#include <cstdint>
#include <cstring>
#include <memory>
#include <span>
#include <utility>

namespace TQL
{
struct ISchema;
}

namespace Store
{

/// One value: its interned schema and its bytes in the layout of that schema. No bytes means not set. The bytes do not
/// change after the value was made; up to eight of them are kept in the value itself.
/// Layout: numbers little-endian in their own size (Bool and Enum8 one byte); String and List with a signed 32-bit
/// count before their bytes or elements; Array, Tuple and NamedTuple as their elements alone.
class StoreValue
{
public:
    StoreValue() noexcept = default;
    StoreValue(const TQL::ISchema* i_pSchema, std::span<const std::uint8_t> i_Bytes)
        : m_pSchema(i_pSchema), m_Size(i_Bytes.size())
    {
        if (IsLong())
            m_pLong = new std::uint8_t[m_Size];
        if (m_Size != 0)
            std::memcpy(Begin(), i_Bytes.data(), m_Size);
    }
    StoreValue(const StoreValue& i_rOther) : StoreValue(i_rOther.m_pSchema, i_rOther.Bytes()) {}
    StoreValue(StoreValue&& i_rOther) noexcept { Swap(i_rOther); }
    StoreValue& operator=(StoreValue i_Other) noexcept
    {
        Swap(i_Other);
        return *this;
    }
    ~StoreValue()
    {
        if (IsLong())
            delete[] m_pLong;
    }

    const TQL::ISchema* Schema() const noexcept { return m_pSchema; } ///< may be null: no type
    bool IsEmpty() const noexcept { return m_Size == 0; }
    std::span<const std::uint8_t> Bytes() const noexcept { return {IsLong() ? m_pLong : m_Short, m_Size}; }

    /// Two values that are not set are equal whatever their schemas.
    friend bool operator==(const StoreValue& i_rA, const StoreValue& i_rB) noexcept
    {
        if (i_rA.IsEmpty() && i_rB.IsEmpty())
            return true;
        return i_rA.m_pSchema == i_rB.m_pSchema && std::ranges::equal(i_rA.Bytes(), i_rB.Bytes());
    }

private:
    bool IsLong() const noexcept { return m_Size > sizeof(m_Short); }
    std::uint8_t* Begin() noexcept { return IsLong() ? m_pLong : m_Short; }
    void Swap(StoreValue& i_rOther) noexcept
    {
        std::swap(m_pSchema, i_rOther.m_pSchema);
        std::swap(m_Size, i_rOther.m_Size);
        std::swap(m_Short, i_rOther.m_Short); // the longer member of the union
    }

    const TQL::ISchema* m_pSchema = nullptr;
    std::size_t m_Size = 0;
    union
    {
        std::uint8_t m_Short[8] = {};
        std::uint8_t* m_pLong;
    };
};

} // namespace Store

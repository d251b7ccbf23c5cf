#pragma once

#include <compare>
#include <cstdint>

namespace TQL
{

/// The value of an id that names nothing.
struct IInvalidIdValueZero
{
    static constexpr std::uint64_t Value = 0;
};

/// A number that names one kind of thing; ids of different tags do not mix.
template <typename TNumber, typename TTag, typename TInvalid>
class ITypedId
{
public:
    constexpr ITypedId() noexcept = default;
    constexpr explicit ITypedId(TNumber i_Value) noexcept : m_Value(i_Value) {}

    constexpr TNumber Value() const noexcept { return m_Value; }
    constexpr bool IsValid() const noexcept { return m_Value != TInvalid::Value; }
    friend constexpr auto operator<=>(ITypedId, ITypedId) noexcept = default;

private:
    TNumber m_Value = TInvalid::Value;
};

struct IChangeIdTag;

/// The number of one commit of a store; the first is 1.
using ChangeId = ITypedId<std::uint64_t, IChangeIdTag, IInvalidIdValueZero>;

} // namespace TQL

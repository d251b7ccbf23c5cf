#pragma once

#include <type_traits>

namespace TQL
{

/// A set of the flags of one enum, as a value. Made from an enumerator without a cast, from a number only on purpose.
template <typename TEnum>
class IBitFlags
{
public:
    using Word = std::underlying_type_t<TEnum>;

    constexpr IBitFlags() noexcept = default;
    constexpr IBitFlags(TEnum i_Flag) noexcept : m_Word(static_cast<Word>(i_Flag)) {}
    constexpr explicit IBitFlags(Word i_Word) noexcept : m_Word(i_Word) {}

    constexpr Word Value() const noexcept { return m_Word; }
    constexpr bool IsEmpty() const noexcept { return m_Word == 0; }
    constexpr bool HasAny(IBitFlags i_Flags) const noexcept { return (m_Word & i_Flags.m_Word) != 0; }

    constexpr IBitFlags& operator|=(IBitFlags i_Flags) noexcept
    {
        m_Word |= i_Flags.m_Word;
        return *this;
    }
    constexpr IBitFlags& operator&=(IBitFlags i_Flags) noexcept
    {
        m_Word &= i_Flags.m_Word;
        return *this;
    }
    friend constexpr IBitFlags operator|(IBitFlags i_A, IBitFlags i_B) noexcept { return i_A |= i_B; }
    friend constexpr IBitFlags operator&(IBitFlags i_A, IBitFlags i_B) noexcept { return i_A &= i_B; }
    friend constexpr IBitFlags operator~(IBitFlags i_Flags) noexcept { return IBitFlags(~i_Flags.m_Word); }
    friend constexpr bool operator==(IBitFlags, IBitFlags) noexcept = default;

private:
    Word m_Word = 0;
};

} // namespace TQL

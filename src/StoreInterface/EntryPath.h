#pragma once

#include "TQL/HashMix.h"

#include <array>
#include <compare>
#include <cstddef>
#include <cstdint>
#include <string>
#include <string_view>
#include <utility>

namespace Store
{

/// Names an entry, or, where a whole component is `*`, a pattern of entries. Components are joined by `/`, without a
/// leading slash; the empty text is the root. The text is taken as it stands: an empty component is a name, and
/// `Speed*` is an ordinary one. An immutable value; the hash is computed when the path is made.
class EntryPath
{
public:
    static constexpr std::size_t NoWildcard = static_cast<std::size_t>(-1);

    EntryPath() = default;
    explicit EntryPath(std::string&& i_Text) : m_Text(std::move(i_Text)), m_Hash(HashFrom(0, m_Text))
    {
        Scan(m_Text, 0);
    }
    explicit EntryPath(const std::string& i_rText) : EntryPath(std::string_view(i_rText)) {}
    /// Reads the given text, not the copy: reading bytes right behind a wide store stalls the processor.
    explicit EntryPath(std::string_view i_Text) : m_Text(i_Text), m_Hash(HashFrom(0, i_Text)) { Scan(i_Text, 0); }
    explicit EntryPath(const char* i_pText) : EntryPath(std::string_view(i_pText)) {}

    const std::string& Text() const noexcept { return m_Text; }
    std::uint64_t Hash() const noexcept { return m_Hash; }
    bool IsRoot() const noexcept { return m_Text.empty(); }
    bool IsWildcard() const noexcept { return m_Wildcard != NoWildcard; }
    /// Where the first component that is `*` begins, or NoWildcard.
    std::size_t WildcardPosition() const noexcept { return m_Wildcard; }

    std::string_view Leaf() const noexcept { return std::string_view(m_Text).substr(m_LeafStart); }
    std::string_view ParentText() const noexcept
    {
        return std::string_view(m_Text).substr(0, m_LeafStart == 0 ? 0 : m_LeafStart - 1);
    }
    EntryPath Parent() const { return EntryPath(ParentText()); }

    /// The path below this one; i_Name may itself hold several components.
    EntryPath operator/(std::string_view i_Name) const
    {
        EntryPath child;
        child.m_Text.reserve(m_Text.size() + 1 + i_Name.size());
        child.m_Text = m_Text;
        if (!m_Text.empty())
            child.m_Text += '/';
        const std::size_t begin = child.m_Text.size();
        child.m_Text += i_Name;
        child.m_Hash = HashFrom(m_Hash, std::string_view(child.m_Text).substr(m_Text.size()));
        child.m_Wildcard = m_Wildcard;
        child.Scan(child.m_Text, begin);
        return child;
    }

    /// Continues a path's hash over more text: each byte is taken as a signed number.
    static constexpr std::uint64_t HashFrom(std::uint64_t i_Hash, std::string_view i_Text) noexcept
    {
        for (const char c : i_Text)
            i_Hash = TQL::HashFold(i_Hash, s_SpreadBytes[static_cast<unsigned char>(c)]);
        return i_Hash;
    }

    friend bool operator==(const EntryPath& i_rA, const EntryPath& i_rB) noexcept
    {
        return i_rA.m_Hash == i_rB.m_Hash && i_rA.m_Text == i_rB.m_Text;
    }
    friend std::strong_ordering operator<=>(const EntryPath& i_rA, const EntryPath& i_rB) noexcept
    {
        return i_rA.m_Text <=> i_rB.m_Text;
    }

private:
    /// HashSpread of every byte as a signed number: hashing a path is most of what finding an entry by text costs.
    static constexpr std::array<std::uint64_t, 256> s_SpreadBytes = []
    {
        std::array<std::uint64_t, 256> spread{};
        for (std::size_t byte = 0; byte < spread.size(); ++byte)
            spread[byte] = TQL::HashSpread(static_cast<std::uint64_t>(std::int64_t{static_cast<signed char>(byte)}));
        return spread;
    }();

    /// Finds the leaf and the first wildcard among the components from i_Begin on.
    void Scan(std::string_view i_Text, std::size_t i_Begin) noexcept
    {
        for (std::size_t begin = i_Begin;;)
        {
            m_LeafStart = begin;
            const std::size_t end = i_Text.find('/', begin);
            if (m_Wildcard == NoWildcard && i_Text.substr(begin, end - begin) == "*")
                m_Wildcard = begin;
            if (end == std::string_view::npos)
                return;
            begin = end + 1;
        }
    }

    std::string m_Text;
    std::size_t m_Wildcard = NoWildcard;
    std::size_t m_LeafStart = 0;
    std::uint64_t m_Hash = 0;
};

} // namespace Store

#pragma once

#include "StoreInterface/IBitFlags.h"

#include <cstdint>

namespace TQL
{

/// What changed at an entry of a store. The low twelve bits stand for the entry flags of the same bit.
enum class EChangeFlags : std::uint64_t
{
    FlagBits = 0xFFF,
    VerifiedValue = 0x10000,
    ProposedValue = 0x20000,
    DefaultValue = 0x40000,
    Minimum = 0x1000000,
    Maximum = 0x2000000,
    ChoiceValues = 0x4000000,
    ChoiceNames = 0x8000000,
    ChoiceDescriptions = 0x10000000,
    Validator = 0x20000000,
    DisplayName = 0x100000000,
    Category = 0x200000000,
    Description = 0x400000000,
    Details = 0x800000000,
    FileAccessMode = 0x1000000000,
    ValueDisplayHint = 0x2000000000,
    Properties = 0x4000000000,
    ChoicesPresence = 0x8000000000, ///< the choice list went from empty to not empty, or back
    Recreated = 0x800000000000,     ///< asked for by TouchEntry; a revived entry then reports as created
    ForceReport = 0x1000000000000,  ///< what was set is reported even where old and new are equal
    Created = 0x2000000000000,
    ChildCreated = 0x4000000000000,
    DescendantCreated = 0x8000000000000, ///< deeper than a child
    Removed = 0x10000000000000,
    ChildRemoved = 0x20000000000000,
    DescendantRemoved = 0x40000000000000, ///< deeper than a child
    Unverified = 0x80000000000000,        ///< VerifyRequired is set and verified and proposed value differ

    ValuesAndFlags = 0x70FFF,
    Limits = 0x3F000000,
    Info = 0xFF00000000,
    Attributes = 0xFF3F070FFF,
    Structure = 0xFF800000000000
};

using ChangeFlags = IBitFlags<EChangeFlags>;

constexpr ChangeFlags operator|(EChangeFlags i_A, EChangeFlags i_B) noexcept
{
    return ChangeFlags(i_A) | ChangeFlags(i_B);
}

constexpr ChangeFlags operator~(EChangeFlags i_Flag) noexcept
{
    return ~ChangeFlags(i_Flag);
}

} // namespace TQL

#include "Store/EntryApply.h"

#include "StoreInterface/EntryFlag.h"

namespace Store
{
namespace
{

using TQL::ChangeFlags;
using enum TQL::EChangeFlags;

/// Moves the selected fields of one block over, reporting those that differ, or all of them when that is forced.
template <typename TBlock, typename TFields>
void ApplyFields(EntryBlocks& io_rTo, EntryBlocks& io_rFrom, const TFields& i_rFields, ChangeFlags i_Mask,
                 ChangeFlags& io_rReport)
{
    TBlock& rFrom = io_rFrom.Make<TBlock>();
    TBlock& rTo = io_rTo.Make<TBlock>();
    const auto apply = [&](const auto& i_rField)
    {
        if (!i_Mask.HasAny(i_rField.Bit))
            return;
        const bool bDiffers = rTo.*i_rField.pMember != rFrom.*i_rField.pMember;
        if (bDiffers)
            rTo.*i_rField.pMember = std::move(rFrom.*i_rField.pMember);
        if (bDiffers || i_Mask.HasAny(ForceReport))
            io_rReport |= i_rField.Bit;
    };
    std::apply([&](const auto&... i_rFieldOf) { (apply(i_rFieldOf), ...); }, i_rFields);
}

void ApplyFlags(std::uint32_t& io_rFlags, std::uint32_t i_New, ChangeFlags i_Mask, ChangeFlags& io_rReport)
{
    const auto selected = static_cast<std::uint32_t>((i_Mask & FlagBits).Value());
    const std::uint32_t changed = (io_rFlags ^ i_New) & selected;
    io_rFlags ^= changed;
    io_rReport |= i_Mask.HasAny(ForceReport) ? i_Mask & ValuesAndFlags : ChangeFlags(std::uint64_t{changed});
}

void ApplyLimits(EntryBlocks& io_rTo, EntryBlocks& io_rFrom, ChangeFlags i_Mask, ChangeFlags& io_rReport)
{
    if (i_Mask.HasAny(ChoiceValues) &&
        io_rTo.Get<EntryLimitBlock>().ChoiceValues.empty() != io_rFrom.Get<EntryLimitBlock>().ChoiceValues.empty())
        io_rReport |= ChoicesPresence;
    ApplyFields<EntryLimitBlock>(io_rTo, io_rFrom, Field::s_AllOfLimits, i_Mask, io_rReport);
}

/// The attributes that i_Mask selects. Blocks that neither side has are not made.
void ApplyAttributes(EntryData& io_rData, EntryBlocks& io_rFrom, ChangeFlags i_Mask, bool i_bMakeBlocks,
                     ChangeFlags& io_rReport)
{
    EntryBlocks& rTo = io_rData.Blocks;
    if (i_Mask.HasAny(ValuesAndFlags) && (i_bMakeBlocks || rTo.Find<EntryValueBlock>()))
    {
        ApplyFields<EntryValueBlock>(rTo, io_rFrom, Field::s_AllOfValues, i_Mask, io_rReport);
        ApplyFlags(rTo.Make<EntryValueBlock>().Flags, io_rFrom.Get<EntryValueBlock>().Flags, i_Mask, io_rReport);
    }
    if (i_Mask.HasAny(Limits) && (i_bMakeBlocks || rTo.Find<EntryLimitBlock>()))
        ApplyLimits(rTo, io_rFrom, i_Mask, io_rReport);
    if (i_Mask.HasAny(Info) && (i_bMakeBlocks || rTo.Find<EntryInfoBlock>()))
        ApplyFields<EntryInfoBlock>(rTo, io_rFrom, Field::s_AllOfInfo, i_Mask, io_rReport);
}

void SetIds(TQL::EntryChangeIds& io_rIds, ChangeFlags i_Report, TQL::ChangeId i_Commit)
{
    const auto set = [&](TQL::ChangeId& o_rId, ChangeFlags i_Bits)
    {
        if (i_Report.HasAny(i_Bits))
            o_rId = i_Commit;
    };
    set(io_rIds.Verified, VerifiedValue);
    set(io_rIds.Proposed, ProposedValue);
    set(io_rIds.Attribute, ~(VerifiedValue | ProposedValue));
    set(io_rIds.Child, ChildCreated | ChildRemoved);
    set(io_rIds.Descendant, DescendantCreated | DescendantRemoved);
}

} // namespace

void ApplyChange(EntryData& io_rData, EntryChange& io_rChange, bool i_bRecreated, TQL::ChangeId i_Commit,
                 ChangeFlags& io_rReport)
{
    constexpr ChangeFlags typed =
        VerifiedValue | ProposedValue | DefaultValue | Minimum | Maximum | ChoiceValues | Created | Removed;
    const ChangeFlags mask = io_rChange.Mask;
    if (i_bRecreated)
    {
        EntryBlocks blank;
        ApplyAttributes(io_rData, blank, Attributes & ~mask, false, io_rReport);
        if (mask.HasAny(Recreated))
            io_rReport |= Created;
    }
    if (mask.HasAny(Removed))
        io_rReport |= Removed;
    else
    {
        if (i_bRecreated || (mask.HasAny(typed) && io_rChange.pSchema))
            io_rData.pSchema = io_rChange.pSchema;
        ApplyAttributes(io_rData, io_rChange.Blocks, mask, true, io_rReport);
        if (mask.HasAny(Attributes) &&
            io_rReport.HasAny(VerifiedValue | ProposedValue | ChangeFlags(std::uint64_t{EntryFlag::VerifyRequired})) &&
            IsUnverified(io_rData.Blocks.Get<EntryValueBlock>()))
            io_rReport |= Unverified;
    }
    io_rReport |= mask & (Recreated | ForceReport);
    SetIds(io_rData.Ids, io_rReport, i_Commit);
}

bool IsUnverified(const EntryValueBlock& i_rValues)
{
    return (i_rValues.Flags & EntryFlag::VerifyRequired) != 0 && i_rValues.Verified != i_rValues.Proposed;
}

ChangeFlags MoveUp(ChangeFlags i_Report)
{
    constexpr ChangeFlags moving = Created | ChildCreated | Removed | ChildRemoved;
    return (i_Report & ~moving) | ChangeFlags((i_Report & moving).Value() << 1);
}

} // namespace Store

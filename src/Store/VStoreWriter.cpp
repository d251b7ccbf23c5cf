#include "Store/VStoreWriter.h"

#include "Store/PropertyText.h"
#include "Store/StagedFields.h"
#include "Store/StoreLog.h"

#include <algorithm>

namespace Store
{
namespace
{

using EntryFlag::Readout;
using EntryFlag::ValueIsDefault;
using EntryFlag::VerifyRequired;
using TQL::ChangeFlags;

void PutFlags(EntryChange& io_rChange, std::uint32_t i_Flags, bool i_bOn)
{
    std::uint32_t& rFlags = io_rChange.Blocks.Make<EntryValueBlock>().Flags;
    rFlags = i_bOn ? rFlags | i_Flags : rFlags & ~i_Flags;
    io_rChange.Mask |= ChangeFlags(std::uint64_t{i_Flags});
}

void LogReadoutDefault(const VStoreEntry& i_rEntry)
{
    LogOf(i_rEntry, TQL::ELogSeverity::Warning, "Set a default value on a Readout %1%.");
}

void LogVerifyAndReadout(const VStoreEntry& i_rEntry)
{
    LogOf(i_rEntry, TQL::ELogSeverity::Error, "Setting both VerifyRequired and Readout is not supported %1%.");
}

} // namespace

TQL::IResult VStoreWriter::Refuse(const VStoreEntry& i_rEntry, const char* i_pFormat, TQL::IResult i_Result) const
{
    LogOf(i_rEntry, TQL::ELogSeverity::Error, i_pFormat);
    return i_Result;
}

template <typename TBlock, typename T>
TQL::IResult VStoreWriter::Put(EntryHandle i_Entry, BlockField<TBlock, T> i_Field, T i_Value)
{
    VStoreEntry* const pEntry = Own(i_Entry);
    if (!pEntry)
        return TQL::Result::NotFound;
    PutInto(m_rStore.Staging().Write(*pEntry), i_Field, std::move(i_Value));
    return TQL::Result::Ok;
}

TQL::IResult VStoreWriter::SetVerifiedValue(EntryHandle i_Entry, StoreValue i_Value)
{
    return Typed(i_Entry, std::move(i_Value),
                 "Failed to set '%1%' verified value: the value type does not match the entry type.",
                 [](const VStoreEntry& i_rEntry, EntryChange& io_rChange, StoreValue i_Set)
                 {
                     if ((StagedView::Flags(i_rEntry) & (ValueIsDefault | VerifyRequired)) == ValueIsDefault)
                         PutFlags(io_rChange, ValueIsDefault, false);
                     PutInto(io_rChange, Field::s_Verified, std::move(i_Set));
                 });
}

TQL::IResult VStoreWriter::SetProposedValue(EntryHandle i_Entry, StoreValue i_Value)
{
    return Typed(i_Entry, std::move(i_Value),
                 "Failed to set '%1%' proposed value: the value type does not match the entry type.",
                 [](const VStoreEntry& i_rEntry, EntryChange& io_rChange, StoreValue i_Set)
                 {
                     if ((StagedView::Flags(i_rEntry) & ValueIsDefault) != 0)
                         PutFlags(io_rChange, ValueIsDefault, false);
                     PutInto(io_rChange, Field::s_Proposed, std::move(i_Set));
                 });
}

TQL::IResult VStoreWriter::SetValue(EntryHandle i_Entry, StoreValue i_Value)
{
    return Typed(i_Entry, std::move(i_Value),
                 "Failed to set '%1%' value: the value type does not match the entry type.",
                 [](const VStoreEntry& i_rEntry, EntryChange& io_rChange, StoreValue i_Set)
                 {
                     const bool bProposed = (StagedView::Flags(i_rEntry) & VerifyRequired) != 0;
                     PutFlags(io_rChange, ValueIsDefault, false);
                     PutInto(io_rChange, bProposed ? Field::s_Proposed : Field::s_Verified, std::move(i_Set));
                 });
}

TQL::IResult VStoreWriter::SetDefaultValue(EntryHandle i_Entry, StoreValue i_Value)
{
    return Typed(i_Entry, std::move(i_Value),
                 "Failed to set '%1%' default value: the value type does not match the entry type.",
                 [this, i_Entry](const VStoreEntry& i_rEntry, EntryChange& io_rChange, StoreValue i_Set)
                 {
                     const std::uint32_t flags = StagedView::Flags(i_rEntry);
                     if ((flags & Readout) != 0)
                         LogReadoutDefault(i_rEntry);
                     const auto shown = (flags & VerifyRequired) != 0 ? Field::s_Proposed : Field::s_Verified;
                     const bool bHadDefault = !StagedView::Get(i_rEntry, Field::s_Default).IsEmpty();
                     if (!bHadDefault && StagedView::Get(i_rEntry, shown).IsEmpty())
                     {
                         PutInto(io_rChange, shown, i_Set);
                         PutFlags(io_rChange, ValueIsDefault, true);
                     }
                     else if (bHadDefault && (flags & ValueIsDefault) != 0)
                         (void)SetValue(i_Entry, i_Set); // its type has been checked
                     PutInto(io_rChange, Field::s_Default, std::move(i_Set));
                 });
}

TQL::IResult VStoreWriter::ClearValue(EntryHandle i_Entry)
{
    VStoreEntry* const pEntry = Own(i_Entry);
    if (!pEntry)
        return TQL::Result::NotFound;
    EntryChange& rChange = m_rStore.Staging().Write(*pEntry);
    PutInto(rChange, Field::s_Proposed, StoreValue());
    PutFlags(rChange, ValueIsDefault, false);
    PutInto(rChange, Field::s_Verified, StoreValue());
    return TQL::Result::Ok;
}

TQL::IResult VStoreWriter::EnableFlags(EntryHandle i_Entry, std::uint32_t i_Flags)
{
    return SetFlags(i_Entry, i_Flags, true);
}

TQL::IResult VStoreWriter::DisableFlags(EntryHandle i_Entry, std::uint32_t i_Flags)
{
    return SetFlags(i_Entry, i_Flags, false);
}

TQL::IResult VStoreWriter::SetFlags(EntryHandle i_Entry, std::uint32_t i_Flags, bool i_bOn)
{
    VStoreEntry* const pEntry = Own(i_Entry);
    if (!pEntry)
        return TQL::Result::NotFound;
    const std::uint32_t selected = i_Flags & EntryFlag::Mask;
    EntryChange& rChange = m_rStore.Staging().Write(*pEntry);
    const std::uint32_t before = StagedView::Flags(*pEntry);
    const std::uint32_t turned = i_bOn ? selected & ~before : selected & before;
    const bool bNewReadout = i_bOn && (turned & Readout) != 0 && !rChange.Mask.HasAny(TQL::EChangeFlags::Created);
    if ((turned & VerifyRequired) != 0)
    {
        if (i_bOn && ((selected | before) & Readout) != 0)
            LogVerifyAndReadout(*pEntry);
        ExchangeValues(i_Entry);
    }
    if (bNewReadout)
    {
        if (((selected | before) & VerifyRequired) != 0)
            LogVerifyAndReadout(*pEntry);
        ClearForReadout(i_Entry, rChange);
    }
    PutFlags(rChange, selected, i_bOn);
    return TQL::Result::Ok;
}

/// An entry that requires verification shows its proposed value where another shows its verified one: with the exchange
/// what the user sees stays the same.
void VStoreWriter::ExchangeValues(EntryHandle i_Entry)
{
    StoreValue verified = GetVerifiedValue(i_Entry);
    StoreValue proposed = GetProposedValue(i_Entry);
    if (verified == proposed)
        return;
    (void)SetVerifiedValue(i_Entry, std::move(proposed)); // both have the entry's type
    (void)SetProposedValue(i_Entry, std::move(verified));
}

/// Wipes what the entry held but keeps what this write has set.
void VStoreWriter::ClearForReadout(EntryHandle i_Entry, EntryChange& io_rChange)
{
    using enum TQL::EChangeFlags;
    const ChangeFlags staged = io_rChange.Mask;
    const EntryValueBlock kept = io_rChange.Blocks.Get<EntryValueBlock>();
    // None of these can fail: no value has no type, and what was staged has the entry's.
    (void)SetDefaultValue(i_Entry, StoreValue());
    (void)SetProposedValue(i_Entry, StoreValue());
    (void)SetVerifiedValue(i_Entry, StoreValue());
    if (staged.HasAny(DefaultValue))
    {
        LogReadoutDefault(*Own(i_Entry));
        (void)SetDefaultValue(i_Entry, kept.Default);
    }
    if (staged.HasAny(ProposedValue))
        (void)SetProposedValue(i_Entry, kept.Proposed);
    if (staged.HasAny(VerifiedValue))
        (void)SetVerifiedValue(i_Entry, kept.Verified);
}

TQL::IResult VStoreWriter::SetMinimum(EntryHandle i_Entry, StoreValue i_Value)
{
    return Typed(i_Entry, std::move(i_Value),
                 "Failed to set '%1%' minimum value: the value type does not match the entry type.",
                 [](const VStoreEntry&, EntryChange& io_rChange, StoreValue i_Set)
                 { PutInto(io_rChange, Field::s_Minimum, std::move(i_Set)); });
}

TQL::IResult VStoreWriter::SetMaximum(EntryHandle i_Entry, StoreValue i_Value)
{
    return Typed(i_Entry, std::move(i_Value),
                 "Failed to set '%1%' maximum value: the value type does not match the entry type.",
                 [](const VStoreEntry&, EntryChange& io_rChange, StoreValue i_Set)
                 { PutInto(io_rChange, Field::s_Maximum, std::move(i_Set)); });
}

TQL::IResult VStoreWriter::SetValidator(EntryHandle i_Entry, std::string i_Text)
{
    return Put(i_Entry, Field::s_Validator, std::move(i_Text));
}

TQL::IResult VStoreWriter::SetDisplayName(EntryHandle i_Entry, std::string i_Text)
{
    return Put(i_Entry, Field::s_DisplayName, std::optional<std::string>(std::move(i_Text)));
}

TQL::IResult VStoreWriter::ClearDisplayName(EntryHandle i_Entry)
{
    return Put(i_Entry, Field::s_DisplayName, std::optional<std::string>());
}

TQL::IResult VStoreWriter::SetCategory(EntryHandle i_Entry, std::string i_Text)
{
    return Put(i_Entry, Field::s_Category, std::move(i_Text));
}

TQL::IResult VStoreWriter::SetDescription(EntryHandle i_Entry, std::string i_Text)
{
    return Put(i_Entry, Field::s_Description, std::move(i_Text));
}

TQL::IResult VStoreWriter::SetDetails(EntryHandle i_Entry, std::string i_Text)
{
    return Put(i_Entry, Field::s_Details, std::move(i_Text));
}

TQL::IResult VStoreWriter::SetFileAccessMode(EntryHandle i_Entry, std::uint32_t i_Mode)
{
    return Put(i_Entry, Field::s_FileAccessMode, i_Mode);
}

TQL::IResult VStoreWriter::SetValueDisplayHint(EntryHandle i_Entry, std::uint32_t i_Hint)
{
    return Put(i_Entry, Field::s_ValueDisplayHint, i_Hint);
}

TQL::IResult VStoreWriter::SetPropertyMap(EntryHandle i_Entry, const TQL::PropertyMap& i_rProperties)
{
    return SetProperties(i_Entry, WriteProperties(i_rProperties));
}

TQL::IResult VStoreWriter::SetProperties(EntryHandle i_Entry, std::string i_Text)
{
    return Put(i_Entry, Field::s_Properties, std::move(i_Text));
}

TQL::IResult VStoreWriter::RemoveEntry(EntryHandle i_Entry)
{
    VStoreEntry* const pEntry = Own(i_Entry);
    return pEntry ? m_rStore.Staging().Remove(*pEntry) : TQL::Result::NotFound;
}

TQL::IResult VStoreWriter::TouchEntry(EntryHandle i_Entry)
{
    VStoreEntry* const pEntry = Own(i_Entry);
    if (!pEntry)
        return TQL::Result::NotFound;
    m_rStore.Staging().Write(*pEntry).Mask |= TQL::EChangeFlags::Recreated | TQL::EChangeFlags::ForceReport;
    return TQL::Result::Ok;
}

void VStoreWriter::QueueNotice(const HandlerKey& i_rKey, ChangeFlags i_What)
{
    if (!i_What.IsEmpty())
        m_rStore.QueueNotice({i_rKey, i_What});
}

void VStoreWriter::QueueVerifyNotice(const HandlerKey& i_rKey)
{
    m_rStore.QueueNotice({i_rKey, {}});
}

TQL::IResult VStoreWriter::SetValueSchema(EntryHandle i_Entry, const TQL::ISchema& i_rSchema)
{
    VStoreEntry* const pEntry = Own(i_Entry);
    if (!pEntry)
        return TQL::Result::NotFound;
    const TQL::ISchema& rUnique = TQL::IO::GetUniqueSchema(i_rSchema);
    const TQL::ISchema* const pSchema = StagedView::Schema(*pEntry);
    if (!pSchema)
    {
        const bool bVoid = rUnique.Type == TQL::EType::Void;
        VStaging& rStaging = m_rStore.Staging();
        // A removed entry stays so, but one that comes into being needs all above it.
        EntryChange& rChange = pEntry->pData ? rStaging.Stage(*pEntry) : rStaging.Write(*pEntry);
        rChange.pSchema = bVoid ? nullptr : &rUnique;
        return TQL::Result::Ok;
    }
    if (pSchema == &rUnique)
        return TQL::Result::Ok;
    return Refuse(*pEntry, "Failed to set '%1%' value schema: the requested type does not match the entry type.",
                  TQL::Result::InvalidType);
}

namespace
{

/// A name or description beside a choice that was just appended: lists that are empty stay so until a text comes.
void AppendText(const VStoreEntry& i_rEntry, EntryChange& io_rChange,
                BlockField<EntryLimitBlock, std::vector<std::string>> i_Field, std::size_t i_Count, std::string i_Text)
{
    if (i_Text.empty() && StagedView::Get(i_rEntry, i_Field).empty())
        return;
    std::vector<std::string>& rList = StageCopy(i_rEntry, io_rChange, i_Field);
    rList.resize(i_Count);
    rList.back() = std::move(i_Text);
}

template <typename TField>
void EraseAt(const VStoreEntry& i_rEntry, EntryChange& io_rChange, TField i_Field, std::size_t i_Index)
{
    if (StagedView::Get(i_rEntry, i_Field).size() <= i_Index)
        return;
    auto& rList = StageCopy(i_rEntry, io_rChange, i_Field);
    rList.erase(rList.begin() + static_cast<std::ptrdiff_t>(i_Index));
}

} // namespace

TQL::IResult VStoreWriter::AddChoice(EntryHandle i_Entry, StoreValue i_Value, std::string i_Name,
                                     std::string i_Description)
{
    return Typed(
        i_Entry, std::move(i_Value), "Failed to add '%1%' value choice: the value type does not match the entry type.",
        [&](const VStoreEntry& i_rEntry, EntryChange& io_rChange, StoreValue i_Added)
        {
            auto& rValues = StageCopy(i_rEntry, io_rChange, Field::s_ChoiceValues);
            rValues.push_back(std::move(i_Added));
            AppendText(i_rEntry, io_rChange, Field::s_ChoiceNames, rValues.size(), std::move(i_Name));
            AppendText(i_rEntry, io_rChange, Field::s_ChoiceDescriptions, rValues.size(), std::move(i_Description));
        });
}

TQL::IResult VStoreWriter::RemoveChoice(EntryHandle i_Entry, std::size_t i_Index)
{
    VStoreEntry* const pEntry = Own(i_Entry);
    if (!pEntry)
        return TQL::Result::NotFound;
    if (i_Index >= GetChoiceCount(i_Entry))
        return Refuse(*pEntry, "Failed to remove '%1%' value choice: the choice index provided was invalid.",
                      TQL::Result::InvalidIndex);
    EntryChange& rChange = m_rStore.Staging().Write(*pEntry);
    EraseAt(*pEntry, rChange, Field::s_ChoiceValues, i_Index);
    EraseAt(*pEntry, rChange, Field::s_ChoiceNames, i_Index);
    EraseAt(*pEntry, rChange, Field::s_ChoiceDescriptions, i_Index);
    return TQL::Result::Ok;
}

TQL::IResult VStoreWriter::ClearChoices(EntryHandle i_Entry)
{
    VStoreEntry* const pEntry = Own(i_Entry);
    if (!pEntry)
        return TQL::Result::NotFound;
    if (GetChoiceCount(i_Entry) == 0)
        return TQL::Result::OkButNoEffect;
    EntryChange& rChange = m_rStore.Staging().Write(*pEntry);
    PutInto(rChange, Field::s_ChoiceValues, {});
    PutInto(rChange, Field::s_ChoiceNames, {});
    PutInto(rChange, Field::s_ChoiceDescriptions, {});
    return TQL::Result::Ok;
}

TQL::IResult VStoreWriter::SetChoiceDescription(EntryHandle i_Entry, std::size_t i_Index, std::string i_Text)
{
    VStoreEntry* const pEntry = Own(i_Entry);
    if (!pEntry)
        return TQL::Result::NotFound;
    const std::size_t count = GetChoiceCount(i_Entry);
    if (i_Index >= count)
        return TQL::Result::InvalidIndex;
    EntryChange& rChange = m_rStore.Staging().Write(*pEntry);
    std::vector<std::string>& rList = StageCopy(*pEntry, rChange, Field::s_ChoiceDescriptions);
    rList.resize(count);
    rList[i_Index] = std::move(i_Text);
    if (rList[i_Index].empty() &&
        std::ranges::all_of(rList, [](const std::string& i_rText) { return i_rText.empty(); }))
        rList.clear();
    return TQL::Result::Ok;
}

} // namespace Store

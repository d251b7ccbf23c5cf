#pragma once

#include "Store/VReadOperations.h"

namespace Store
{

/// Stages changes in records on the entries, and reads them back through StagedView. Used by the one thread that
/// writes.
class VStoreWriter final : public VReadOperations<TQL::IStoreWriter, StagedView>
{
public:
    using VReadOperations::VReadOperations;

    std::shared_ptr<TQL::IStore> GetWriterShared() const override { return m_rStore.GetShared(); }

    TQL::IResult SetVerifiedValue(EntryHandle i_Entry, StoreValue i_Value) override;
    TQL::IResult SetProposedValue(EntryHandle i_Entry, StoreValue i_Value) override;
    TQL::IResult SetValue(EntryHandle i_Entry, StoreValue i_Value) override;
    TQL::IResult SetDefaultValue(EntryHandle i_Entry, StoreValue i_Value) override;
    TQL::IResult ClearValue(EntryHandle i_Entry) override;
    TQL::IResult EnableFlags(EntryHandle i_Entry, std::uint32_t i_Flags) override;
    TQL::IResult DisableFlags(EntryHandle i_Entry, std::uint32_t i_Flags) override;
    TQL::IResult SetFlags(EntryHandle i_Entry, std::uint32_t i_Flags, bool i_bOn) override;
    TQL::IResult SetMinimum(EntryHandle i_Entry, StoreValue i_Value) override;
    TQL::IResult SetMaximum(EntryHandle i_Entry, StoreValue i_Value) override;

    TQL::IResult AddChoice(EntryHandle i_Entry, StoreValue i_Value, std::string i_Name,
                           std::string i_Description) override;
    TQL::IResult RemoveChoice(EntryHandle i_Entry, std::size_t i_Index) override;
    TQL::IResult ClearChoices(EntryHandle i_Entry) override;
    TQL::IResult SetChoiceDescription(EntryHandle i_Entry, std::size_t i_Index, std::string i_Text) override;
    TQL::IResult SetValidator(EntryHandle i_Entry, std::string i_Text) override;

    TQL::IResult SetDisplayName(EntryHandle i_Entry, std::string i_Text) override;
    TQL::IResult ClearDisplayName(EntryHandle i_Entry) override;
    TQL::IResult SetCategory(EntryHandle i_Entry, std::string i_Text) override;
    TQL::IResult SetDescription(EntryHandle i_Entry, std::string i_Text) override;
    TQL::IResult SetDetails(EntryHandle i_Entry, std::string i_Text) override;
    TQL::IResult SetFileAccessMode(EntryHandle i_Entry, std::uint32_t i_Mode) override;
    TQL::IResult SetValueDisplayHint(EntryHandle i_Entry, std::uint32_t i_Hint) override;
    TQL::IResult SetPropertyMap(EntryHandle i_Entry, const TQL::PropertyMap& i_rProperties) override;
    TQL::IResult SetProperties(EntryHandle i_Entry, std::string i_Text) override;

    TQL::IResult RemoveEntry(EntryHandle i_Entry) override;
    TQL::IResult TouchEntry(EntryHandle i_Entry) override;
    void QueueNotice(const HandlerKey& i_rKey, TQL::ChangeFlags i_What) override;
    void QueueVerifyNotice(const HandlerKey& i_rKey) override;
    TQL::IResult SetValueSchema(EntryHandle i_Entry, const TQL::ISchema& i_rSchema) override;

private:
    /// The steps that every setter of a value shares: the handle, the type, the record; then i_rApply(entry, record,
    /// value). i_pFault is the message of a refusal.
    template <typename TApply>
    TQL::IResult Typed(EntryHandle i_Entry, StoreValue i_Value, const char* i_pFault, const TApply& i_rApply);
    template <typename TBlock, typename T>
    TQL::IResult Put(EntryHandle i_Entry, BlockField<TBlock, T> i_Field, T i_Value);
    void ExchangeValues(EntryHandle i_Entry);
    void ClearForReadout(EntryHandle i_Entry, EntryChange& io_rChange);
    TQL::IResult Refuse(const VStoreEntry& i_rEntry, const char* i_pFormat, TQL::IResult i_Result) const;
};

template <typename TApply>
TQL::IResult VStoreWriter::Typed(EntryHandle i_Entry, StoreValue i_Value, const char* i_pFault, const TApply& i_rApply)
{
    VStoreEntry* const pEntry = Own(i_Entry);
    if (!pEntry)
        return TQL::Result::NotFound;
    if (!i_Value.Schema())
        i_Value = StoreValue(&TQL::IO::GetUniquePodSchema(TQL::EType::Void), i_Value.Bytes());
    const bool bVoid = i_Value.Schema()->Type == TQL::EType::Void;
    const TQL::ISchema* const pSchema = StagedView::Schema(*pEntry);
    if (!bVoid && pSchema && pSchema != i_Value.Schema())
        return Refuse(*pEntry, i_pFault, TQL::Result::InvalidType);
    EntryChange& rChange = m_rStore.Staging().Write(*pEntry);
    if (!bVoid && !rChange.pSchema)
        rChange.pSchema = i_Value.Schema();
    i_rApply(*pEntry, rChange, std::move(i_Value));
    return TQL::Result::Ok;
}

} // namespace Store

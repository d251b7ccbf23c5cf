#pragma once

#include "Store/EntryViews.h"
#include "Store/VStore.h"
#include "StoreInterface/EntryFlag.h"
#include "StoreInterface/IStoreWriter.h"
#include "TQL/SchemaIntern.h"

namespace Store
{

/// The reading operations of the reader and of the writer, which differ in how they see an entry (EntryViews.h). One of
/// each per store, owned by it.
template <typename TInterface, typename TView>
class VReadOperations : public TInterface
{
public:
    explicit VReadOperations(VStore& i_rStore) : m_rStore(i_rStore) {}

    std::shared_ptr<TQL::IStore> GetStoreShared() const override { return m_rStore.GetShared(); }
    TQL::IStore& GetStore() const override { return m_rStore; }
    TQL::ChangeId GetChangeId() const override { return m_rStore.GetChangeIdOfThisThread(); }
    void Defer(std::function<void()> i_Callable) override { m_rStore.Defer(std::move(i_Callable)); }
    std::vector<EntryHandle> FindEntries(const EntryPath& i_rPattern) const override
    {
        return m_rStore.template FindEntries<TView>(i_rPattern);
    }

    bool HasChildren(EntryHandle i_Entry) const override { return GetChildCount(i_Entry) != 0; }
    std::size_t GetChildCount(EntryHandle i_Entry) const override
    {
        const VStoreEntry* const pEntry = Own(i_Entry);
        return pEntry ? TView::ChildCount(*pEntry) : 0;
    }
    std::vector<EntryHandle> GetChildren(EntryHandle i_Entry) const override
    {
        std::vector<EntryHandle> handles;
        if (const VStoreEntry* const pEntry = Own(i_Entry))
            for (const VStoreEntry* const pChild : TView::Children(*pEntry))
                handles.emplace_back(pChild);
        return handles;
    }
    EntryHandle FindChild(EntryHandle i_Entry, std::string_view i_Leaf) const override
    {
        const VStoreEntry* const pEntry = Own(i_Entry);
        return pEntry ? EntryHandle(m_rStore.template FindChild<TView>(*pEntry, i_Leaf)) : EntryHandle();
    }

    bool Exists(EntryHandle i_Entry) const override
    {
        const VStoreEntry* const pEntry = Own(i_Entry);
        return pEntry && TView::Exists(*pEntry);
    }
    bool HasValue(EntryHandle i_Entry) const override
    {
        return !Get(i_Entry, Field::s_Verified).IsEmpty() || !Get(i_Entry, Field::s_Proposed).IsEmpty();
    }
    const TQL::ISchema& GetValueSchema(EntryHandle i_Entry) const override
    {
        const VStoreEntry* const pEntry = Own(i_Entry);
        const TQL::ISchema* const pSchema = pEntry ? TView::Schema(*pEntry) : nullptr;
        return pSchema ? *pSchema : TQL::IO::GetUniquePodSchema(TQL::EType::Void);
    }
    const StoreValue& GetVerifiedValue(EntryHandle i_Entry) const override { return Get(i_Entry, Field::s_Verified); }
    const StoreValue& GetProposedValue(EntryHandle i_Entry) const override { return Get(i_Entry, Field::s_Proposed); }
    const StoreValue& GetDefaultValue(EntryHandle i_Entry) const override { return Get(i_Entry, Field::s_Default); }
    std::uint32_t GetFlags(EntryHandle i_Entry) const override
    {
        const VStoreEntry* const pEntry = Own(i_Entry);
        return pEntry ? TView::Flags(*pEntry) : 0;
    }
    bool HasUnverifiedValue(EntryHandle i_Entry) const override
    {
        return (GetFlags(i_Entry) & EntryFlag::VerifyRequired) != 0 &&
               GetVerifiedValue(i_Entry) != GetProposedValue(i_Entry);
    }

    bool HasConstraints(EntryHandle i_Entry) const override { return HasAny(i_Entry, Field::s_AllOfLimits); }
    const StoreValue& GetMinimum(EntryHandle i_Entry) const override { return Get(i_Entry, Field::s_Minimum); }
    const StoreValue& GetMaximum(EntryHandle i_Entry) const override { return Get(i_Entry, Field::s_Maximum); }
    std::size_t GetChoiceCount(EntryHandle i_Entry) const override { return GetChoiceValues(i_Entry).size(); }
    const std::vector<StoreValue>& GetChoiceValues(EntryHandle i_Entry) const override
    {
        return Get(i_Entry, Field::s_ChoiceValues);
    }
    const std::vector<std::string>& GetChoiceNames(EntryHandle i_Entry) const override
    {
        return Get(i_Entry, Field::s_ChoiceNames);
    }
    const std::vector<std::string>& GetChoiceDescriptions(EntryHandle i_Entry) const override
    {
        return Get(i_Entry, Field::s_ChoiceDescriptions);
    }
    const std::string& GetValidator(EntryHandle i_Entry) const override { return Get(i_Entry, Field::s_Validator); }

    bool HasInfo(EntryHandle i_Entry) const override { return HasAny(i_Entry, Field::s_AllOfInfo); }
    const std::optional<std::string>& GetDisplayName(EntryHandle i_Entry) const override
    {
        return Get(i_Entry, Field::s_DisplayName);
    }
    const std::string& GetCategory(EntryHandle i_Entry) const override { return Get(i_Entry, Field::s_Category); }
    const std::string& GetDescription(EntryHandle i_Entry) const override { return Get(i_Entry, Field::s_Description); }
    const std::string& GetDetails(EntryHandle i_Entry) const override { return Get(i_Entry, Field::s_Details); }
    std::uint32_t GetFileAccessMode(EntryHandle i_Entry) const override
    {
        return Get(i_Entry, Field::s_FileAccessMode);
    }
    std::uint32_t GetValueDisplayHint(EntryHandle i_Entry) const override
    {
        return Get(i_Entry, Field::s_ValueDisplayHint);
    }
    const std::string& GetProperties(EntryHandle i_Entry) const override { return Get(i_Entry, Field::s_Properties); }
    std::uint32_t GetConstraintFlags(EntryHandle i_Entry) const override
    {
        return GetChoiceCount(i_Entry) != 0 ? 1 : 0;
    }

    TQL::EntryChangeIds GetEntryChangeIds(EntryHandle i_Entry) const override
    {
        const VStoreEntry* const pEntry = Own(i_Entry);
        return pEntry && pEntry->pData ? pEntry->pData->Ids : TQL::EntryChangeIds{};
    }

protected:
    VStoreEntry* Own(EntryHandle i_Entry) const { return m_rStore.Own(i_Entry); }

    template <typename TBlock, typename T>
    const T& Get(EntryHandle i_Entry, BlockField<TBlock, T> i_Field) const
    {
        const VStoreEntry* const pEntry = Own(i_Entry);
        return pEntry ? TView::Get(*pEntry, i_Field) : EmptyBlock<TBlock>().*i_Field.pMember;
    }

    /// Whether one of the fields differs from that of an empty block.
    template <typename... TFields>
    bool HasAny(EntryHandle i_Entry, const std::tuple<TFields...>& i_rFields) const
    {
        const auto isSet = [&]<typename TBlock, typename T>(BlockField<TBlock, T> i_Field)
        {
            return Get(i_Entry, i_Field) != EmptyBlock<TBlock>().*i_Field.pMember;
        };
        return std::apply([&](const auto&... i_rField) { return (isSet(i_rField) || ...); }, i_rFields);
    }

    VStore& m_rStore;
};

} // namespace Store

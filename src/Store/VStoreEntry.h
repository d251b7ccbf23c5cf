#pragma once

#include "StoreInterface/EChangeFlags.h"
#include "StoreInterface/EntryPath.h"
#include "StoreInterface/IStoreReader.h"
#include "StoreInterface/StoreValue.h"

#include <boost/container/small_vector.hpp>

#include <cstdint>
#include <memory>
#include <optional>
#include <string>
#include <tuple>
#include <utility>
#include <vector>

namespace Store
{

class VEntryTable;
class VHandlerCallback;
struct VStoreEntry;

struct EntryValueBlock
{
    std::uint32_t Flags = 0;
    StoreValue Verified;
    StoreValue Proposed;
    StoreValue Default;
};

struct EntryLimitBlock
{
    StoreValue Minimum;
    StoreValue Maximum;
    std::vector<StoreValue> ChoiceValues;
    std::vector<std::string> ChoiceNames;        ///< empty, or one for each value
    std::vector<std::string> ChoiceDescriptions; ///< empty, or one for each value
    std::string Validator;
};

struct EntryInfoBlock
{
    std::optional<std::string> DisplayName;
    std::string Category;
    std::string Description;
    std::string Details;
    std::uint32_t FileAccessMode = 0;
    std::uint32_t ValueDisplayHint = 0;
    std::string Properties;
};

/// One attribute: its change bit and its place in a block. The tables below name every attribute but the flags once;
/// staging, effective reading and the commit are written over them.
template <typename TBlock, typename T>
struct BlockField
{
    TQL::EChangeFlags Bit;
    T TBlock::*pMember;
};
template <typename TBlock, typename T>
BlockField(TQL::EChangeFlags, T TBlock::*) -> BlockField<TBlock, T>; // clang deduces it itself from 17 on

namespace Field
{
using enum TQL::EChangeFlags;

inline constexpr BlockField s_Verified{VerifiedValue, &EntryValueBlock::Verified};
inline constexpr BlockField s_Proposed{ProposedValue, &EntryValueBlock::Proposed};
inline constexpr BlockField s_Default{DefaultValue, &EntryValueBlock::Default};
inline constexpr BlockField s_Minimum{Minimum, &EntryLimitBlock::Minimum};
inline constexpr BlockField s_Maximum{Maximum, &EntryLimitBlock::Maximum};
inline constexpr BlockField s_ChoiceValues{ChoiceValues, &EntryLimitBlock::ChoiceValues};
inline constexpr BlockField s_ChoiceNames{ChoiceNames, &EntryLimitBlock::ChoiceNames};
inline constexpr BlockField s_ChoiceDescriptions{ChoiceDescriptions, &EntryLimitBlock::ChoiceDescriptions};
inline constexpr BlockField s_Validator{Validator, &EntryLimitBlock::Validator};
inline constexpr BlockField s_DisplayName{DisplayName, &EntryInfoBlock::DisplayName};
inline constexpr BlockField s_Category{Category, &EntryInfoBlock::Category};
inline constexpr BlockField s_Description{Description, &EntryInfoBlock::Description};
inline constexpr BlockField s_Details{Details, &EntryInfoBlock::Details};
inline constexpr BlockField s_FileAccessMode{FileAccessMode, &EntryInfoBlock::FileAccessMode};
inline constexpr BlockField s_ValueDisplayHint{ValueDisplayHint, &EntryInfoBlock::ValueDisplayHint};
inline constexpr BlockField s_Properties{Properties, &EntryInfoBlock::Properties};

inline constexpr std::tuple s_AllOfValues{s_Verified, s_Proposed, s_Default};
inline constexpr std::tuple s_AllOfLimits{s_Minimum,  s_Maximum, s_ChoiceValues, s_ChoiceNames, s_ChoiceDescriptions,
                                          s_Validator};
inline constexpr std::tuple s_AllOfInfo{s_DisplayName,    s_Category,         s_Description, s_Details,
                                        s_FileAccessMode, s_ValueDisplayHint, s_Properties};
} // namespace Field

/// What a block that does not exist answers.
template <typename TBlock>
const TBlock& EmptyBlock()
{
    static const TBlock s_Empty{};
    return s_Empty;
}

/// The three blocks of an entry or of a staged change, each made on first use: most entries have only values.
struct EntryBlocks
{
    template <typename TBlock>
    const TBlock& Get() const
    {
        const auto& rpBlock = std::get<std::unique_ptr<TBlock>>(Owned);
        return rpBlock ? *rpBlock : EmptyBlock<TBlock>();
    }
    template <typename TBlock>
    TBlock* Find()
    {
        return std::get<std::unique_ptr<TBlock>>(Owned).get();
    }
    template <typename TBlock>
    TBlock& Make()
    {
        auto& rpBlock = std::get<std::unique_ptr<TBlock>>(Owned);
        if (!rpBlock)
            rpBlock = std::make_unique<TBlock>();
        return *rpBlock;
    }

    std::tuple<std::unique_ptr<EntryValueBlock>, std::unique_ptr<EntryLimitBlock>, std::unique_ptr<EntryInfoBlock>>
        Owned;
};

/// The committed state of an entry. Changed by commits only.
struct EntryData
{
    boost::container::small_vector<VStoreEntry*, 2> Children; ///< by leaf name, as bytes
    TQL::EntryChangeIds Ids;
    EntryBlocks Blocks;
    const TQL::ISchema* pSchema = nullptr;       ///< interned; null while the entry has no type
    std::vector<VHandlerCallback*> PathHandlers; ///< those that came by a pattern; guarded by the store's mutex
};

/// What the running write has staged for an entry.
struct EntryChange
{
    std::vector<VStoreEntry*> Children; ///< those staged too, in the order of staging; may name one that is no more
    TQL::ChangeFlags Mask;              ///< what this record overrides
    EntryBlocks Blocks;
    const TQL::ISchema* pSchema = nullptr;

    void ClearAttributes()
    {
        Mask = {};
        if (EntryValueBlock* const pValues = Blocks.Find<EntryValueBlock>())
            *pValues = {};
        std::get<1>(Blocks.Owned).reset();
        std::get<2>(Blocks.Owned).reset();
        pSchema = nullptr;
    }
};

/// One node of the tree. Never freed while its store lives, so its address serves as the handle; without data it does
/// not exist. Data is read under a read access, changed by a commit; the change belongs to the writing thread.
struct VStoreEntry
{
    VStoreEntry(EntryPath i_Path, VStoreEntry* i_pParent, const VEntryTable& i_rTable)
        : Path(std::move(i_Path)), pParent(i_pParent), pTable(&i_rTable)
    {
    }

    VStoreEntry* pNextInBucket = nullptr; // guarded by the store's mutex
    const EntryPath Path;
    VStoreEntry* const pParent;
    const VEntryTable* const pTable;         ///< tells entries of another store apart
    std::vector<VHandlerCallback*> Handlers; // guarded by the store's mutex
    std::unique_ptr<EntryData> pData;
    std::unique_ptr<EntryChange> pChange;
};

/// The order of children. The paths decide between "A" and "/A", whose leaf is the same.
inline bool IsBefore(const VStoreEntry* i_pA, const VStoreEntry* i_pB)
{
    const int order = i_pA->Path.Leaf().compare(i_pB->Path.Leaf());
    return order != 0 ? order < 0 : i_pA->Path.Text().size() < i_pB->Path.Text().size();
}

} // namespace Store

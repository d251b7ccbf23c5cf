#include "Store/StagedFields.h"
#include "Store/StoreLog.h"
#include "Store/VStoreWriter.h"

#include <algorithm>

namespace Store
{
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

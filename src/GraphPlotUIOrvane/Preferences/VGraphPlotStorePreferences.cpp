#include "GraphPlotUIOrvane/Preferences/VGraphPlotStorePreferences.h"

#include "GraphPlotSystem/Traces/TracePalette.h"
#include "StoreInterface/IEntryEditor.h"
#include "StoreInterface/IHandlerCallback.h"
#include "StoreInterface/ScopedAccess.h"
#include "StoreInterface/TypedValue.h"

#include <algorithm>

namespace GraphPlotUI
{
namespace
{

using Value = IGraphPlotPreferences::Value;

constexpr const char* s_pFolder = "User/Preferences/Graph Plots";
constexpr const char* s_pCategory = "Graph Plots";

struct Row
{
    IGraphPlotPreferences::EIndex Index;
    const char* pKey;
    Value Default; ///< the type too; the number is an ETraceColourSet
    const char* pDisplayName;
    const char* pDescription;
};

constexpr Row s_Rows[] = {
    {IGraphPlotPreferences::TraceColourSet, "TraceColourSet",
     static_cast<std::int32_t>(ETraceColourSet::TracesStandard), "Trace colors",
     "Set of unique colors to use for traces. The smaller color sets are designed for those with limited color "
     "vision."},
    {IGraphPlotPreferences::EnableRotationUnwrapping, "EnableRotationUnwrapping", true, "Enable rotation unwrapping",
     "Rotation unwrapping compensates for discontinuities in rotation values caused by wrapping at certain "
     "boundaries, e.g. 0 == 360 == 720 degrees."},
    {IGraphPlotPreferences::ShowPanZoomGraphic, "ShowPanZoomGraphic", true, "Show pan/scale overlay graphics",
     "Show graphical overlay indicating the mouse origin and target when panning or zooming on a subplot or axis."},
};

const Row* FindRow(int i_Index)
{
    const auto* pRow = std::ranges::find(s_Rows, i_Index, &Row::Index);
    return pRow == std::end(s_Rows) ? nullptr : pRow;
}

bool IsColourSet(std::int32_t i_Number)
{
    return std::ranges::any_of(GetTraceColourSets(), [i_Number](const TraceColourSet& i_rSet)
                               { return static_cast<std::int32_t>(i_rSet.Set) == i_Number; });
}

Store::StoreValue ToStore(const Value& i_rValue)
{
    if (const bool* pbValue = std::get_if<bool>(&i_rValue))
        return Store::MakeValue(*pbValue);
    return Store::MakeValue(static_cast<ETraceColourSet>(std::get<std::int32_t>(i_rValue)));
}

/// Completes one entry. Setting again what is there already changes nothing, but for a default, which would be taken
/// for a choice of the operator's.
void Complete(TQL::IStoreWriter& i_rWriter, Store::EntryHandle i_Entry, const Row& i_rRow)
{
    const Store::StoreValue standard = ToStore(i_rRow.Default);
    TQL::PrepareEntry(i_rWriter, i_Entry, *standard.Schema(), TQL::EOtherType::Replace);
    // The store refuses only foreign handles and other types, neither of which can be here.
    (void)i_rWriter.EnableFlags(i_Entry, Store::EntryFlag::Persistable);
    (void)i_rWriter.SetCategory(i_Entry, s_pCategory);
    (void)i_rWriter.SetDisplayName(i_Entry, i_rRow.pDisplayName);
    (void)i_rWriter.SetDescription(i_Entry, i_rRow.pDescription);
    if (i_rRow.Index == IGraphPlotPreferences::TraceColourSet)
    {
        (void)i_rWriter.ClearChoices(i_Entry);
        for (const TraceColourSet& rSet : GetTraceColourSets())
            (void)i_rWriter.AddChoice(i_Entry, Store::MakeValue(rSet.Set), rSet.pDisplayName, {});
    }
    if (i_rWriter.GetDefaultValue(i_Entry) != standard)
        (void)i_rWriter.SetDefaultValue(i_Entry, standard);
}

} // namespace

TQL::ISchema DescribeSchema(std::type_identity<ETraceColourSet>)
{
    std::vector<TQL::SchemaEnumValue> values;
    for (const TraceColourSet& rSet : GetTraceColourSets())
        values.push_back({rSet.pName, static_cast<std::int32_t>(rSet.Set)});
    return TQL::MakeEnumSchema(TQL::EType::Enum32, "ETraceColourSet", std::move(values));
}

VGraphPlotStorePreferences::VGraphPlotStorePreferences(std::shared_ptr<TQL::IStore> i_pStore)
    : m_pStore(std::move(i_pStore))
{
    const TQL::ScopedWrite writer(*m_pStore);
    for (const Row& rRow : s_Rows)
    {
        const Store::EntryHandle entry = m_pStore->GetEntry(Store::EntryPath(s_pFolder) / rRow.pKey);
        m_Preferences[rRow.Index] = {entry, m_pStore->GetHandlerCallback({{entry}, {}})};
        Complete(*writer, entry, rRow);
    }
}

VGraphPlotStorePreferences::~VGraphPlotStorePreferences() = default;

const VGraphPlotStorePreferences::Preference* VGraphPlotStorePreferences::Find(int i_Index) const
{
    const auto found = m_Preferences.find(i_Index);
    return found == m_Preferences.end() ? nullptr : &found->second;
}

TQL::IResult VGraphPlotStorePreferences::GetValue(int i_Index, Value& o_rValue) const
{
    const Preference* pPreference = Find(i_Index);
    if (!pPreference)
        return TQL::Result::InvalidArgument;
    const TQL::ScopedRead reader(*m_pStore);
    const Store::StoreValue& rValue = reader->GetVerifiedValue(pPreference->Entry);
    if (rValue.IsEmpty())
        return TQL::Result::NotSet;
    bool bValue = false;
    ETraceColourSet set{};
    if (Store::DecodeValue(rValue, bValue) == Store::EDecodeResult::Done)
        o_rValue = bValue;
    else if (Store::DecodeValue(rValue, set) == Store::EDecodeResult::Done)
        o_rValue = static_cast<std::int32_t>(set);
    else
        return TQL::Result::InvalidType;
    return TQL::Result::Ok;
}

TQL::IResult VGraphPlotStorePreferences::SetValue(int i_Index, const Value& i_rValue)
{
    const Row* pRow = FindRow(i_Index);
    if (!pRow || pRow->Default.index() != i_rValue.index())
        return TQL::Result::InvalidArgument;
    // A number without a name could not be written to a file.
    if (const auto* pNumber = std::get_if<std::int32_t>(&i_rValue); pNumber && !IsColourSet(*pNumber))
        return TQL::Result::InvalidArgument;
    const TQL::ScopedWrite writer(*m_pStore);
    return writer->SetValue(Find(i_Index)->Entry, ToStore(i_rValue));
}

TQL::IResult VGraphPlotStorePreferences::AddCallback(Token& o_rToken, int i_Index, std::function<void()> i_Callback,
                                                     std::shared_ptr<TQL::IPostalService> i_pPostalService)
{
    const Preference* pPreference = Find(i_Index);
    if (!pPreference || !i_Callback)
        return TQL::Result::InvalidArgument;
    auto callback = [callback = std::move(i_Callback)](TQL::ChangeFlags, TQL::ChangeId)
    {
        callback();
    };
    return i_pPostalService
               ? pPreference->pHandler->SubscribePostal(o_rToken, std::move(i_pPostalService), std::move(callback), 0)
               : pPreference->pHandler->SubscribeDirect(o_rToken, std::move(callback));
}

TQL::IResult VGraphPlotStorePreferences::RemoveCallback(int i_Index, Token i_Token)
{
    const Preference* pPreference = Find(i_Index);
    return pPreference ? pPreference->pHandler->UnsubscribeCallback(i_Token) : TQL::Result::InvalidArgument;
}

} // namespace GraphPlotUI

#include "GraphPlotUIOrvane/Files/VGraphPlotStoreMigrator.h"

#include "GraphPlotUIOrvane/Files/GraphPlotStateTree.h"
#include "StoreIO/FirstResult.h"
#include "StoreIO/StoreClear.h"
#include "StoreIO/StoreCopy.h"
#include "StoreIO/StoreFormat.h"
#include "StoreInterface/IStore.h"
#include "StoreInterface/TypedValue.h"

#include <algorithm>
#include <array>
#include <string_view>

namespace GraphPlotUI
{
namespace
{

using Store::EntryHandle;
using Store::EntryPath;
using StoreIO::KeepFirst;
using TQL::IResult;

// What 1.0 had in the active channel state. One name stood for a type of the selection's channels or for a global one;
// the pinned channels have moved to a part of their own.
constexpr const char* s_pCurrentChannelType = "CurrentChannelTypeInternalName";
constexpr const char* s_pSelectionLocked = "SelectionLocked";
constexpr const char* s_pSelectedChannels = "SelectedChannels";

constexpr std::array<std::string_view, 10> s_GlobalChannelTypes{
    "Subject Item Count",   "Subject Dynamic Parameters Item Count",
    "Label Count",          "Unlabeled Reconstruction Count",
    "TotalCentroidCount",   "LiveOutputLatency",
    "GeneralOutputLatency", "CameraCalibrationHealth",
    "SystemAccelerometers", "SystemTemperature",
};

/// Upgrades the state of one view from 1.0.
class ViewUpgrade
{
public:
    ViewUpgrade(TQL::IStoreWriter& i_rWriter, const EntryPath& i_rView)
        : m_rWriter(i_rWriter)
        , m_State(i_rView / StateTree::Parts[StateTree::ActiveChannelState])
        , m_Pins(i_rView / StateTree::Parts[StateTree::PinnedChannels])
    {
    }

    IResult Run()
    {
        SplitChannelType();
        ReplaceLock();
        MovePins();
        for (const char* pOld : {s_pCurrentChannelType, s_pSelectionLocked, s_pSelectedChannels})
            if (m_rWriter.Exists(Entry(pOld)))
                KeepFirst(m_Result, m_rWriter.RemoveEntry(Entry(pOld)));
        return m_Result;
    }

private:
    EntryHandle Entry(const char* i_pKey) const { return m_rWriter.GetStore().GetEntry(m_State / i_pKey); }

    /// False for an entry that holds no such value.
    template <typename T>
    bool Read(const char* i_pKey, T& o_rValue) const
    {
        const Store::StoreValue& rValue = m_rWriter.GetVerifiedValue(Entry(i_pKey));
        return !rValue.IsEmpty() && Store::DecodeValue(rValue, o_rValue) == Store::EDecodeResult::Done;
    }

    template <typename T>
    void Write(const char* i_pKey, const T& i_rValue)
    {
        KeepFirst(m_Result, m_rWriter.SetValue(Entry(i_pKey), Store::MakeValue(i_rValue)));
        KeepFirst(m_Result, m_rWriter.EnableFlags(Entry(i_pKey), Store::EntryFlag::Persistable));
    }

    void SplitChannelType()
    {
        std::string name;
        if (!Read(s_pCurrentChannelType, name))
            name.clear();
        const bool bGlobal = std::ranges::find(s_GlobalChannelTypes, name) != s_GlobalChannelTypes.end();
        Write(StateTree::GlobalChannelType, bGlobal ? name : StateTree::NoGlobalChannelType);
        Write(StateTree::SelectedChannelType, bGlobal || name.empty() ? StateTree::AutomaticChannelType : name);
    }

    void ReplaceLock()
    {
        bool bLocked = false;
        if (Read(s_pSelectionLocked, bLocked))
            Write(StateTree::SelectionLinked, !bLocked);
    }

    void MovePins()
    {
        const EntryHandle pins = m_rWriter.GetStore().GetEntry(m_Pins);
        if (m_rWriter.Exists(Entry(s_pSelectedChannels)))
            KeepFirst(m_Result, StoreIO::CopyEntryTree(m_rWriter, Entry(s_pSelectedChannels), m_rWriter, pins,
                                                       StoreIO::CopyOption::Literal));
    }

    TQL::IStoreWriter& m_rWriter;
    const EntryPath m_State;
    const EntryPath m_Pins;
    IResult m_Result;
};

EntryHandle DataRootOf(const TQL::IStoreReader& i_rReader)
{
    return i_rReader.GetStore().GetEntry(EntryPath(StateTree::DataRoot));
}

} // namespace

EntryPath VGraphPlotStoreMigrator::GetVersionPath() const
{
    return EntryPath(StoreIO::VersionsEntry) / GetName();
}

IResult VGraphPlotStoreMigrator::Upgrade(TQL::StoreVersion& io_rVersion, TQL::IStoreWriter& i_rWriter)
{
    IResult result;
    if (io_rVersion == TQL::StoreVersion{0, 0} || io_rVersion == TQL::StoreVersion{1, 0})
    {
        for (const char* pView : StateTree::Views)
            KeepFirst(result, ViewUpgrade(i_rWriter, EntryPath(StateTree::DataRoot) / pView).Run());
        io_rVersion = {2, 0};
    }
    if (io_rVersion != TQL::StoreVersion{2, 0})
        KeepFirst(result, TQL::Result::InvalidVersion);
    return result;
}

IResult VGraphPlotStoreMigrator::Copy(TQL::IStoreReader& i_rReader, TQL::IStoreWriter& i_rWriter,
                                      std::uint32_t i_Options)
{
    return StoreIO::CopyEntryTree(i_rReader, DataRootOf(i_rReader), i_rWriter, DataRootOf(i_rWriter), i_Options);
}

IResult VGraphPlotStoreMigrator::Clear(TQL::IStoreWriter& i_rWriter)
{
    return StoreIO::RemoveChildren(i_rWriter, DataRootOf(i_rWriter));
}

TQL::ChangeId VGraphPlotStoreMigrator::GetChangeId(TQL::IStoreReader& i_rReader) const
{
    const EntryHandle root = DataRootOf(i_rReader);
    if (!i_rReader.Exists(root))
        return {};
    const TQL::EntryChangeIds ids = i_rReader.GetEntryChangeIds(root);
    return std::max({ids.Verified, ids.Proposed, ids.Attribute, ids.Child, ids.Descendant});
}

} // namespace GraphPlotUI

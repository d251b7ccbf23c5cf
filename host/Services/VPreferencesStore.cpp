#include "Services/VPreferencesStore.h"

#include "NotificationSystem/VDispatchCollapsers.h"
#include "NotificationSystem/WeakCallback.h"
#include "Store/VStore.h"
#include "StoreIO/StoreCopy.h"
#include "StoreIO/VStoreImporterJson.h"
#include "StoreInterface/EntryFlag.h"
#include "StoreInterface/IHandlerCallback.h"
#include "StoreInterface/ScopedAccess.h"
#include "TQL/Log.h"
#include "UtilsFileSystem/FileIO.h"

#include <QtCore/QDir>
#include <QtCore/QFileInfo>

#include <utility>

namespace Services
{
namespace
{

using Store::EntryHandle;
namespace EntryFlag = Store::EntryFlag;

constexpr int s_MostBroken = 10; ///< files put aside; one more replaces the last

template <typename... Args>
void LogError(const char* i_pFormat, const Args&... i_rArgs)
{
    TQL::Log::Format(TQL::Log::GetCategory("Host"), TQL::ELogSeverity::Error, i_pFormat, i_rArgs...);
}

/// A file does not say that what it holds belongs into it.
void MarkPersistable(TQL::IStoreWriter& i_rWriter, EntryHandle i_Entry)
{
    if (i_rWriter.HasValue(i_Entry))
        (void)i_rWriter.EnableFlags(i_Entry, EntryFlag::Persistable); // an entry of this store
    for (const EntryHandle child : i_rWriter.GetChildren(i_Entry))
        MarkPersistable(i_rWriter, child);
}

/// Copies the values that the operator chose.
void CopyChosen(const TQL::IStoreReader& i_rReader, EntryHandle i_Entry, TQL::IStoreWriter& i_rWriter)
{
    if ((i_rReader.GetFlags(i_Entry) & EntryFlag::ValueIsDefault) == 0)
    {
        const EntryHandle target = i_rWriter.GetStore().GetEntry(i_rReader.GetStore().GetEntryPath(i_Entry));
        // Into an empty store nothing is refused.
        (void)StoreIO::CopyEntry(i_rReader, i_Entry, i_rWriter, target,
                                 StoreIO::CopyOption::PersistableOnly | StoreIO::CopyOption::Literal);
    }
    for (const EntryHandle child : i_rReader.GetChildren(i_Entry))
        CopyChosen(i_rReader, child, i_rWriter);
}

} // namespace

VPreferencesStore::VPreferencesStore(std::string i_Path, std::shared_ptr<TQL::IPostalService> i_pUiPostalService)
    : m_Path(std::move(i_Path))
    , m_pUiPostalService(std::move(i_pUiPostalService))
    , m_pStore(TQL::MakeShared<Store::VStore>())
{
    if (!m_Path.empty())
        Load();
}

VPreferencesStore::~VPreferencesStore()
{
    Save();
}

void VPreferencesStore::OnPostCreation()
{
    if (!m_bSaves)
        return;
    m_pHandler = m_pStore->GetHandlerCallback({{m_pStore->GetRoot()}, {}});
    TQL::IHandlerCallback::Token token = 0;
    // The collapser is there, so it is taken.
    (void)m_pHandler->SubscribePostal(token, NotificationSystem::MakeCollapserDontPost(m_pUiPostalService),
                                      NotificationSystem::MakeWeakFunction(
                                          WeakSelf(this), [](VPreferencesStore& i_rSelf, auto...) { i_rSelf.Save(); }),
                                      0);
}

void VPreferencesStore::Load()
{
    StoreIO::VStoreImporterJson importer;
    TQL::IResult result = importer.ReadFile(m_Path);
    m_bSaves = result.IsSuccess() || result == TQL::Result::FileNotFound || result == TQL::Result::SerialisationFailure;
    if (!m_bSaves)
        return LogUnusable(result);
    if (result.IsSuccess())
        result = Import(importer);
    if (result.IsSuccess() || result == TQL::Result::FileNotFound)
        m_Saved = Export();
    else
        MoveAside();
}

TQL::IResult VPreferencesStore::Import(StoreIO::IStoreImporter& i_rImporter)
{
    const TQL::ScopedWrite writer(*m_pStore);
    const TQL::IResult imported = i_rImporter.Import(*writer);
    MarkPersistable(*writer, m_pStore->GetRoot());
    return imported;
}

/// What the operator has must not be written over by what this program made of it, nor one broken file by the next.
void VPreferencesStore::MoveAside()
{
    std::string broken = m_Path + ".broken";
    for (int number = 2; QFileInfo::exists(QString::fromStdString(broken)) && number < s_MostBroken; ++number)
        broken = m_Path + ".broken" + std::to_string(number);
    if (const TQL::IResult moved = UtilsFileSystem::ReplaceFile(m_Path, broken); moved.IsError())
    {
        m_bSaves = false;
        return LogUnusable(moved);
    }
    LogError("The preferences in \"%1%\" have faults: what cannot be read of them has its default. The file is now "
             "\"%2%\"; graphplots-studio check-store says what is wrong with it.",
             m_Path, broken);
    Save();
}

void VPreferencesStore::LogUnusable(TQL::IResult i_Why) const
{
    LogError("The preferences in \"%1%\" cannot be used (%2%): changes will not be saved.", m_Path,
             i_Why.Description());
}

StoreIO::VStoreExporterJson VPreferencesStore::Export() const
{
    const auto pChosen = TQL::MakeShared<Store::VStore>();
    {
        const TQL::ScopedRead reader(*m_pStore);
        const TQL::ScopedWrite writer(*pChosen);
        CopyChosen(*reader, m_pStore->GetRoot(), *writer);
    }
    StoreIO::VStoreExporterJson exporter;
    const TQL::ScopedRead reader(*pChosen);
    if (exporter.Export(*reader).IsError()) // why is in the log
        exporter.GetDocument().SetNull();
    return exporter;
}

void VPreferencesStore::Save()
{
    if (!m_bSaves)
        return;
    StoreIO::VStoreExporterJson exporter = Export();
    if (exporter.GetDocument().IsNull() || exporter.GetDocument() == m_Saved.GetDocument())
        return;
    QDir().mkpath(QFileInfo(QString::fromStdString(m_Path)).absolutePath()); // a failure shows in the next line
    if (exporter.WriteToFile(m_Path, UtilsFileSystem::EWriteMode::Overwrite).IsSuccess())
        m_Saved = std::move(exporter);
}

} // namespace Services

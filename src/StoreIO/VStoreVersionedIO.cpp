#include "StoreIO/VStoreVersionedIO.h"

#include "Store/VStore.h"
#include "StoreIO/FirstResult.h"
#include "StoreIO/IStoreExporter.h"
#include "StoreIO/IStoreImporter.h"
#include "StoreIO/StoreClear.h"
#include "StoreIO/StoreCopy.h"
#include "StoreIO/StoreIOLog.h"
#include "StoreIO/VersionRecords.h"
#include "StoreInterface/ScopedAccess.h"

#include <algorithm>
#include <iterator>
#include <utility>

namespace StoreIO
{
namespace
{

using TQL::IResult;

/// Writes a line about a part when something failed.
void LogFailure(const char* i_pFormat, const TQL::IStoreMigrator& i_rMigrator, IResult i_Result)
{
    if (i_Result.IsError())
        LogError(i_pFormat, i_rMigrator.GetName(), i_Result.Description());
}

IResult CopyAll(const TQL::IStoreReader& i_rReader, TQL::IStoreWriter& i_rWriter, std::uint32_t i_Options = 0)
{
    return CopyEntryTree(i_rReader, i_rReader.GetStore().GetRoot(), i_rWriter, i_rWriter.GetStore().GetRoot(),
                         CopyOption::Literal | i_Options);
}

bool IsEmptyStore(const TQL::IStoreReader& i_rReader)
{
    return !i_rReader.HasChildren(i_rReader.GetStore().GetRoot());
}

/// Adds what i_rWriter's store lacks. A copy onto an entry of another type would be refused, so what is to win goes
/// first, and an entry keeps what it has below.
IResult CopyMissing(TQL::IStore& i_rFrom, TQL::IStoreWriter& i_rWriter)
{
    const TQL::ScopedRead from(i_rFrom);
    if (IsEmptyStore(*from))
        return TQL::Result::Ok;
    return CopyAll(*from, i_rWriter, CopyOption::KeepValues);
}

/// Takes an entry out, so that it can come back with another type, and puts back what is below it.
IResult Retype(TQL::IStoreWriter& i_rWriter, Store::EntryHandle i_Entry)
{
    const auto pKept = TQL::MakeShared<Store::VStore>();
    const Store::EntryPath path = i_rWriter.GetStore().GetEntryPath(i_Entry);
    IResult result;
    for (const Store::EntryHandle child : i_rWriter.GetChildren(i_Entry))
    {
        const TQL::ScopedWrite kept(*pKept);
        const auto target = pKept->GetEntry(i_rWriter.GetStore().GetEntryPath(child));
        KeepFirst(result, CopyEntryTree(i_rWriter, child, *kept, target, CopyOption::Literal));
    }
    KeepFirst(result, i_rWriter.RemoveEntry(i_Entry));
    const TQL::ScopedRead kept(*pKept);
    for (const Store::EntryHandle child : kept->GetChildren(pKept->GetEntry(path)))
    {
        const auto target = i_rWriter.GetStore().GetEntry(pKept->GetEntryPath(child));
        KeepFirst(result, CopyEntryTree(*kept, child, i_rWriter, target, CopyOption::Literal));
    }
    return result;
}

/// Makes room for the values of i_rReader where i_rWriter's store has values of other types.
IResult RetypeLike(const TQL::IStoreReader& i_rReader, TQL::IStoreWriter& i_rWriter)
{
    IResult result;
    std::vector<Store::EntryHandle> open{i_rReader.GetStore().GetRoot()};
    while (!open.empty())
    {
        const Store::EntryHandle entry = open.back();
        open.pop_back();
        std::ranges::copy(i_rReader.GetChildren(entry), std::back_inserter(open));
        const auto target = i_rWriter.GetStore().GetEntry(i_rReader.GetStore().GetEntryPath(entry));
        if (i_rReader.HasValue(entry) && i_rWriter.HasValue(target) &&
            &i_rReader.GetValueSchema(entry) != &i_rWriter.GetValueSchema(target))
            KeepFirst(result, Retype(i_rWriter, target));
    }
    return result;
}

} // namespace

VStoreVersionedIO::VStoreVersionedIO(std::shared_ptr<TQL::IStore> i_pTemporaryStore,
                                     std::shared_ptr<TQL::IStore> i_pLostAndFoundStore)
    : m_pTemporaryStore(std::move(i_pTemporaryStore)), m_pLostAndFoundStore(std::move(i_pLostAndFoundStore))
{
}

IResult VStoreVersionedIO::RegisterMigrator(std::shared_ptr<TQL::IStoreMigrator> i_pMigrator)
{
    const std::lock_guard lock(m_Mutex);
    const std::string name = i_pMigrator->GetName();
    if (std::ranges::any_of(m_Migrators, [&](const auto& i_rpOther) { return i_rpOther->GetName() == name; }))
        return TQL::Result::AlreadyPresent;
    m_Migrators.push_back(std::move(i_pMigrator));
    return TQL::Result::Ok;
}

TQL::ChangeId VStoreVersionedIO::GetLatestChangeId(TQL::IStoreReader& i_rReader) const
{
    const std::lock_guard lock(m_Mutex);
    TQL::ChangeId latest;
    for (const auto& rpMigrator : m_Migrators)
        latest = std::max(latest, rpMigrator->GetChangeId(i_rReader));
    return latest;
}

bool VStoreVersionedIO::IsOwnStore(const TQL::IStore& i_rStore) const
{
    return &i_rStore == m_pTemporaryStore.get() || &i_rStore == m_pLostAndFoundStore.get();
}

IResult VStoreVersionedIO::Export(TQL::IStoreReader& i_rReader, IStoreExporter& i_rExporter)
{
    // Without the mutex: who holds it may be waiting for the read of that store to end.
    if (IsOwnStore(i_rReader.GetStore()))
        return ExportTemporary(i_rExporter);
    const std::lock_guard lock(m_Mutex);
    const IResult result = Populate(i_rReader);
    if (result.IsError())
    {
        LogError("Store export failed: Failed populating the temporary Store: %1%", result.Description());
        return result;
    }
    return ExportTemporary(i_rExporter);
}

IResult VStoreVersionedIO::Populate(TQL::IStoreReader& i_rReader)
{
    const TQL::ScopedWrite temporary(*m_pTemporaryStore);
    IResult result = RemoveChildren(*temporary, m_pTemporaryStore->GetRoot());
    if (result.IsError())
        return result;
    for (const auto& rpMigrator : m_Migrators)
    {
        const IResult copied =
            rpMigrator->Copy(i_rReader, *temporary, CopyOption::Literal | CopyOption::PersistableOnly);
        LogFailure("Failed to copy '%1%': '%2%'", *rpMigrator, copied);
        KeepFirst(result, copied);
        const IResult written = WriteVersion(*temporary, *rpMigrator);
        LogFailure("Failed to write version '%1%': '%2%'", *rpMigrator, written);
        KeepFirst(result, written);
    }
    // What was found earlier fills in what the parts lack: the application's own values win, whatever their types.
    if (m_pLostAndFoundStore && result.IsSuccess())
        KeepFirst(result, CopyMissing(*m_pLostAndFoundStore, *temporary));
    return result;
}

IResult VStoreVersionedIO::ExportTemporary(IStoreExporter& i_rExporter)
{
    const TQL::ScopedRead temporary(*m_pTemporaryStore);
    const IResult result = i_rExporter.Export(*temporary);
    if (result.IsError())
        LogError("Store export failed: Failed exporting the temporary Store: %1%", result.Description());
    return result;
}

IResult VStoreVersionedIO::Import(TQL::IStoreWriter& i_rWriter, IStoreImporter& i_rImporter,
                                  std::uint32_t i_CopyOptions)
{
    if (IsOwnStore(i_rWriter.GetStore()))
        return TQL::Result::InvalidArgument;
    const std::lock_guard lock(m_Mutex);
    if (ImportTemporary(i_rImporter).IsError())
        return TQL::Result::Failed;
    const Migrators parts = BringPartsUpToDate();
    IResult result = TQL::Result::SerialisationFailure;
    if (!parts.empty())
    {
        result = CopyParts(parts, i_rWriter, i_CopyOptions | CopyOption::SkipReadouts | CopyOption::MarkPersistable);
        ClearParts(parts);
    }
    KeepUnknown();
    if (parts.empty())
        LogError("Store import failed: All Store migrators failed or none were registered.");
    return result;
}

IResult VStoreVersionedIO::ImportTemporary(IStoreImporter& i_rImporter)
{
    const TQL::ScopedWrite temporary(*m_pTemporaryStore);
    const IResult cleared = RemoveChildren(*temporary, m_pTemporaryStore->GetRoot());
    return cleared.IsError() ? cleared : i_rImporter.Import(*temporary);
}

VStoreVersionedIO::Migrators VStoreVersionedIO::BringPartsUpToDate()
{
    const TQL::ScopedWrite temporary(*m_pTemporaryStore);
    Migrators usable;
    std::ranges::copy_if(m_Migrators, std::back_inserter(usable),
                         [&](const auto& i_rpMigrator) { return BringUpToDate(*temporary, *i_rpMigrator); });
    return usable;
}

IResult VStoreVersionedIO::CopyParts(const Migrators& i_rParts, TQL::IStoreWriter& i_rWriter, std::uint32_t i_Options)
{
    const TQL::ScopedRead temporary(*m_pTemporaryStore);
    IResult result;
    for (const auto& rpMigrator : i_rParts)
    {
        IResult copied = rpMigrator->Copy(*temporary, i_rWriter, i_Options);
        KeepFirst(copied, WriteVersion(i_rWriter, *rpMigrator));
        LogFailure("Failed to copy '%1%': '%2%'", *rpMigrator, copied);
        KeepFirst(result, copied);
    }
    return result;
}

void VStoreVersionedIO::ClearParts(const Migrators& i_rParts)
{
    const TQL::ScopedWrite temporary(*m_pTemporaryStore);
    IResult result;
    for (const auto& rpMigrator : i_rParts)
    {
        const IResult cleared = rpMigrator->Clear(*temporary);
        LogFailure("Failed to clear '%1%': '%2%'", *rpMigrator, cleared);
        KeepFirst(result, cleared);
        const IResult forgotten = temporary->RemoveEntry(m_pTemporaryStore->GetEntry(rpMigrator->GetVersionPath()));
        LogFailure("Failed to clear version '%1%': '%2%'", *rpMigrator, forgotten);
        KeepFirst(result, forgotten);
    }
    if (result.IsError())
        LogError("Store import: failed to clear migrator data from temporary store: %1%", result.Description());
}

void VStoreVersionedIO::KeepUnknown()
{
    if (!m_pLostAndFoundStore)
        return;
    const TQL::ScopedRead temporary(*m_pTemporaryStore);
    if (IsEmptyStore(*temporary))
        return;
    const TQL::ScopedWrite lostAndFound(*m_pLostAndFoundStore);
    IResult result = RetypeLike(*temporary, *lostAndFound);
    KeepFirst(result, CopyAll(*temporary, *lostAndFound));
    if (result.IsError())
        LogError("Store import: failed to update the lost and found store on import, unknown data will be lost on "
                 "export: %1%",
                 result.Description());
}

} // namespace StoreIO

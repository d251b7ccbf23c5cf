#pragma once

#include "StoreIO/IStoreMigrator.h"

#include <cstdint>
#include <memory>
#include <mutex>
#include <vector>

namespace StoreIO
{

class IStoreExporter;
class IStoreImporter;

/// Stands between an application's store and its files, so that no file touches that store directly and nothing is lost
/// that this application does not know. A file is read into a temporary store, each registered part is upgraded there
/// and copied out; what is left (parts of a newer version, and what no part claims) goes to the lost-and-found store
/// and from there into every file that is written later: nothing leaves that store. Where two of them have the same
/// entry, the application's own value goes into the file before one that was found, and what was found last before what
/// was found earlier, also where their types differ.
/// Shared by the owners of the application's stores. From any thread; one import or export at a time. The caller holds
/// a read or a write of the application's store and none of the two others; their handlers must not call back in here.
class VStoreVersionedIO final : public TQL::IStoreMigratorRegistry
{
public:
    /// Both stores are for this object alone; the lost-and-found store may be null, then unknown data is dropped.
    VStoreVersionedIO(std::shared_ptr<TQL::IStore> i_pTemporaryStore,
                      std::shared_ptr<TQL::IStore> i_pLostAndFoundStore);

    TQL::IResult RegisterMigrator(std::shared_ptr<TQL::IStoreMigrator> i_pMigrator) override;
    TQL::ChangeId GetLatestChangeId(TQL::IStoreReader& i_rReader) const override;
    std::shared_ptr<TQL::IStore> GetTemporaryStore() const override { return m_pLostAndFoundStore; }

    /// Exports the persistable entries of all parts, with their versions, and what was found earlier beside them. With
    /// a reader of the temporary or the lost-and-found store, what the temporary store holds. The first failure, or
    /// else the exporter's result.
    TQL::IResult Export(TQL::IStoreReader& i_rReader, IStoreExporter& i_rExporter);

    /// Imports all parts that this application can use, all entries marked Persistable and no Readout touched;
    /// i_CopyOptions come on top. `InvalidArgument` for a writer of one of the two stores, `Failed` when the importer
    /// failed, `SerialisationFailure` when no part was usable; else the result of the copies, most often
    /// `OkButPartial`. The caller ends the write in any case: what was copied before a failure stays.
    TQL::IResult Import(TQL::IStoreWriter& i_rWriter, IStoreImporter& i_rImporter, std::uint32_t i_CopyOptions);

private:
    using Migrators = std::vector<std::shared_ptr<TQL::IStoreMigrator>>;

    bool IsOwnStore(const TQL::IStore& i_rStore) const;
    TQL::IResult Populate(TQL::IStoreReader& i_rReader);
    TQL::IResult ExportTemporary(IStoreExporter& i_rExporter);
    TQL::IResult ImportTemporary(IStoreImporter& i_rImporter);
    Migrators BringPartsUpToDate();
    TQL::IResult CopyParts(const Migrators& i_rParts, TQL::IStoreWriter& i_rWriter, std::uint32_t i_Options);
    void ClearParts(const Migrators& i_rParts);
    void KeepUnknown();

    const std::shared_ptr<TQL::IStore> m_pTemporaryStore;
    const std::shared_ptr<TQL::IStore> m_pLostAndFoundStore;
    mutable std::mutex m_Mutex;
    Migrators m_Migrators; // guarded by m_Mutex; in order of registration
};

} // namespace StoreIO

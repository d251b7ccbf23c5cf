#pragma once

#include "StoreInterface/EntryPath.h"
#include "StoreInterface/ITypedId.h"
#include "TQL/IResult.h"

#include <compare>
#include <cstdint>
#include <memory>
#include <string>

namespace TQL
{

class IStore;
class IStoreReader;
class IStoreWriter;

/// A version of a part of a store file; 0.0 where none was found.
struct StoreVersion
{
    std::int32_t Major = 0;
    std::int32_t Minor = 0;

    friend constexpr auto operator<=>(const StoreVersion&, const StoreVersion&) = default;
};

/// One part of a store file with a version of its own. Readers and writers that it is handed belong to an access that
/// the caller began on this thread.
class IStoreMigrator
{
public:
    virtual ~IStoreMigrator() = default;

    virtual std::string GetName() const = 0;             ///< unique within a file
    virtual StoreVersion GetVersion() const = 0;         ///< what the application writes
    virtual Store::EntryPath GetVersionPath() const = 0; ///< where the file's version is kept
    /// Brings data of an older version, on the file's own store, up to date and io_rVersion with it.
    virtual IResult Upgrade(StoreVersion& io_rVersion, IStoreWriter& i_rWriter) = 0;
    /// Copies this part; the options are those of StoreIO::CopyEntry.
    virtual IResult Copy(IStoreReader& i_rReader, IStoreWriter& i_rWriter, std::uint32_t i_Options) = 0;
    /// Removes this part. Gives the first failure, or else the first result that is not `Ok`.
    virtual IResult Clear(IStoreWriter& i_rWriter) = 0;
    /// The commit that last changed this part; invalid when there is no such part.
    virtual ChangeId GetChangeId(IStoreReader& i_rReader) const = 0;
};

/// Where the parts of a file are made known.
class IStoreMigratorRegistry
{
public:
    virtual ~IStoreMigratorRegistry() = default;

    /// `AlreadyPresent` for a second one of a name.
    virtual IResult RegisterMigrator(std::shared_ptr<IStoreMigrator> i_pMigrator) = 0;
    /// The latest change of all parts.
    virtual ChangeId GetLatestChangeId(IStoreReader& i_rReader) const = 0;
    /// The store that keeps what no part claims; may be null.
    virtual std::shared_ptr<IStore> GetTemporaryStore() const = 0;
};

} // namespace TQL

#pragma once

#include "StoreInterface/EntryHandle.h"
#include "StoreInterface/EntryPath.h"
#include "StoreInterface/HandlerKey.h"

#include <memory>

namespace TQL
{

class IHandlerCallback;
class IStoreReader;
class IStoreWriter;

/// What a store is to those that only pass registries on.
class IRegistry
{
public:
    virtual ~IRegistry() = default;
};

/// A hierarchical, typed, transactional store of parameters. Many readers or one commit are inside at a time; what a
/// writer stages is seen through the writer only, until the last EndWrite commits it. There is no way to abandon a
/// write. All operations from any thread; a reader or writer is used on the thread that began it, until the matching
/// end. Begins and ends nest (ScopedRead and ScopedWrite pair them).
class IStore : public IRegistry
{
public:
    /// The store's own path of that entry; an empty one for a path with a wildcard.
    virtual const Store::EntryPath& GetPath(const Store::EntryPath& i_rPath) = 0;
    /// From now on no handler is told anything. Reads and writes work on.
    virtual void Close() = 0;
    virtual Store::EntryHandle GetRoot() const = 0;
    /// The handle of that entry, whether it exists or not; null for a path with a wildcard.
    virtual Store::EntryHandle GetEntry(const Store::EntryPath& i_rPath) = 0;
    /// An empty path for a null or foreign handle.
    virtual const Store::EntryPath& GetEntryPath(Store::EntryHandle i_Entry) const = 0;
    /// Waits while a commit is due. Inside a write of the same thread this is the writer.
    virtual IStoreReader& BeginRead() = 0;
    virtual void EndRead() = 0;
    /// Waits for the writers before. Null, without waiting, on a thread that reads.
    virtual IStoreWriter* BeginWrite() = 0;
    /// The last end commits, then runs the direct callables of this commit's notices and what was deferred. Whichever
    /// of the two ends comes last on a thread that writes commits; an end without a begin is only logged.
    virtual void EndWrite() = 0;
    /// The one handler of that key, made when none is alive.
    virtual std::shared_ptr<IHandlerCallback> GetHandlerCallback(const Store::HandlerKey& i_rKey) = 0;
    virtual std::shared_ptr<void> GetOwner() const = 0;
};

} // namespace TQL

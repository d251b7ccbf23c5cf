#pragma once

#include "StoreInterface/IStore.h"
#include "StoreInterface/IStoreWriter.h"

#include <stdexcept>

namespace TQL
{

/// A read of a store for the length of a scope.
class ScopedRead
{
public:
    explicit ScopedRead(IStore& i_rStore) : m_rStore(i_rStore), m_rReader(i_rStore.BeginRead()) {}
    ~ScopedRead() noexcept(false) { m_rStore.EndRead(); } // deferred callables may throw
    ScopedRead(const ScopedRead&) = delete;
    ScopedRead& operator=(const ScopedRead&) = delete;

    IStoreReader* operator->() const { return &m_rReader; }
    IStoreReader& operator*() const { return m_rReader; }

private:
    IStore& m_rStore;
    IStoreReader& m_rReader;
};

/// A write of a store for the length of a scope, committed at its end. Made on a thread that reads, it is a fault of
/// the program and throws std::logic_error.
class ScopedWrite
{
public:
    explicit ScopedWrite(IStore& i_rStore) : m_rStore(i_rStore), m_pWriter(i_rStore.BeginWrite())
    {
        if (!m_pWriter)
            throw std::logic_error("a write was begun on a thread that reads the store");
    }
    ~ScopedWrite() noexcept(false) { m_rStore.EndWrite(); } // direct callables may throw
    ScopedWrite(const ScopedWrite&) = delete;
    ScopedWrite& operator=(const ScopedWrite&) = delete;

    IStoreWriter* operator->() const { return m_pWriter; }
    IStoreWriter& operator*() const { return *m_pWriter; }

private:
    IStore& m_rStore;
    IStoreWriter* const m_pWriter;
};

} // namespace TQL

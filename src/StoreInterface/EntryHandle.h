#pragma once

#include <compare>
#include <cstddef>

namespace Store
{

struct VStoreEntry;

/// Names one entry of one store, whether it exists or not; valid as long as its store lives. A null handle, or one of
/// another living store, names nothing: readers answer with empty values, writers with NotFound.
class EntryHandle
{
public:
    constexpr EntryHandle() noexcept = default;
    constexpr EntryHandle(std::nullptr_t) noexcept {}
    constexpr explicit EntryHandle(const VStoreEntry* i_pEntry) noexcept : m_pEntry(i_pEntry) {}

    constexpr explicit operator bool() const noexcept { return m_pEntry != nullptr; }
    constexpr const VStoreEntry* Get() const noexcept { return m_pEntry; }

    friend constexpr auto operator<=>(EntryHandle, EntryHandle) noexcept = default;

private:
    const VStoreEntry* m_pEntry = nullptr;
};

} // namespace Store

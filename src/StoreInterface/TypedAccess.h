#pragma once

#include "StoreInterface/IStore.h"
#include "StoreInterface/IStoreReader.h"
#include "StoreInterface/TypedValue.h"
#include "TQL/Log.h"

namespace TQL
{

/// Writes one line about an entry to the store's log; a "%1%" in i_rFormat is the entry's path.
template <typename... Args>
void LogEntry(const IStoreReader& i_rReader, Store::EntryHandle i_Entry, ELogSeverity i_Severity,
              const LogText& i_rFormat, const Args&... i_rArgs)
{
    static const VLogCategory& s_rCategory = Log::GetCategory("Store");
    Log::Format(s_rCategory, i_Severity, i_rFormat, i_rReader.GetStore().GetEntryPath(i_Entry).Text(), i_rArgs...);
}

/// Reads one of an entry's values as T. False, with an error in the log, when the entry or the value does not exist or
/// is of another type; o_rValue is then not to be used.
template <typename T>
[[nodiscard]] bool ReadValue(const IStoreReader& i_rReader, Store::EntryHandle i_Entry,
                             const Store::StoreValue& i_rValue, T& o_rValue)
{
    const char* pFault = nullptr;
    if (i_rValue.IsEmpty())
        pFault = i_rReader.Exists(i_Entry) ? "Store entry '%1%' has no value." : "Store entry '%1%' does not exist.";
    else
        switch (Store::DecodeValue(i_rValue, o_rValue))
        {
        case Store::EDecodeResult::Done:
            return true;
        case Store::EDecodeResult::WrongType:
            pFault = "Failed getting value for store entry '%1%': the requested value type does not match the store "
                     "value type.";
            break;
        case Store::EDecodeResult::Malformed:
            pFault = "Failed getting value for store entry '%1%': encountered an unknown error.";
            break;
        }
    LogEntry(i_rReader, i_Entry, ELogSeverity::Error, pFault);
    return false;
}

/// The verified value: the one in force.
template <typename T>
[[nodiscard]] bool GetValue(const IStoreReader& i_rReader, Store::EntryHandle i_Entry, T& o_rValue)
{
    return ReadValue(i_rReader, i_Entry, i_rReader.GetVerifiedValue(i_Entry), o_rValue);
}

template <typename T>
[[nodiscard]] bool GetProposedValue(const IStoreReader& i_rReader, Store::EntryHandle i_Entry, T& o_rValue)
{
    return ReadValue(i_rReader, i_Entry, i_rReader.GetProposedValue(i_Entry), o_rValue);
}

template <typename T>
[[nodiscard]] bool GetDefaultValue(const IStoreReader& i_rReader, Store::EntryHandle i_Entry, T& o_rValue)
{
    return ReadValue(i_rReader, i_Entry, i_rReader.GetDefaultValue(i_Entry), o_rValue);
}

} // namespace TQL

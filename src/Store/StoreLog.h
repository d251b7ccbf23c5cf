#pragma once

#include "Store/VStoreEntry.h"
#include "TQL/Log.h"

namespace Store
{

/// Writes one line to the category "Store"; a "%1%" in i_rFormat is the entry's path.
inline void LogOf(const VStoreEntry& i_rEntry, TQL::ELogSeverity i_Severity, const TQL::LogText& i_rFormat)
{
    static const TQL::VLogCategory& s_rCategory = TQL::Log::GetCategory("Store");
    TQL::Log::Format(s_rCategory, i_Severity, i_rFormat, i_rEntry.Path.Text());
}

} // namespace Store

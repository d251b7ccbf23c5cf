#pragma once

#include "TQL/Log.h"

namespace Store
{

/// One line of the room's log.
template <typename... Args>
void LogParameter(TQL::ELogSeverity i_Severity, const TQL::LogText& i_rFormat, const Args&... i_rArgs)
{
    static TQL::VLogCategory& s_rCategory = TQL::Log::GetCategory("StoreParameters");
    TQL::Log::Format(s_rCategory, i_Severity, i_rFormat, i_rArgs...);
}

} // namespace Store

#pragma once

#include "TQL/Log.h"

namespace StoreIO
{

/// Writes one error to the category "StoreIO".
template <typename... Args>
void LogError(const char* i_pFormat, const Args&... i_rArgs)
{
    static const TQL::VLogCategory& s_rCategory = TQL::Log::GetCategory("StoreIO");
    TQL::Log::Format(s_rCategory, TQL::ELogSeverity::Error, "StoreIO", __LINE__, i_pFormat, i_rArgs...);
}

} // namespace StoreIO

#pragma once

#include "TQL/Log.h"

namespace StoreIO
{

/// Writes one error to the category "StoreIO".
template <typename... Args>
void LogError(const TQL::LogText& i_rFormat, const Args&... i_rArgs)
{
    static const TQL::VLogCategory& s_rCategory = TQL::Log::GetCategory("StoreIO");
    TQL::Log::Format(s_rCategory, TQL::ELogSeverity::Error, i_rFormat, i_rArgs...);
}

} // namespace StoreIO

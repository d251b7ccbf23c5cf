#pragma once

#include "TQL/IResult.h"
#include "TQL/Log.h"

#include <string>
#include <system_error>

/// How system errors become results, and the log of this room. For this room only.
namespace UtilsFileSystem
{

/// The one mapping of system errors. Never a success: a call that reported a failure without an error gives `Failed`.
TQL::IResult ResultFromError(const std::error_code& i_rError);

/// `Ok` for no error, else ResultFromError.
TQL::IResult ResultOf(const std::error_code& i_rError);

/// What errno holds, for calls of the C library.
std::error_code LastCError();

/// Logs i_pFormat as an error with the path and the names of those that hold the file. False, and nothing is logged,
/// where the query fails or finds nobody.
bool LogLockers(const char* i_pFormat, const std::string& i_rPath);

template <typename... Args>
void LogFile(TQL::ELogSeverity i_Severity, const TQL::LogText& i_rFormat, const Args&... i_rArgs)
{
    static TQL::VLogCategory& rCategory = TQL::Log::GetCategory("FileSystem");
    TQL::Log::Format(rCategory, i_Severity, i_rFormat, i_rArgs...);
}

} // namespace UtilsFileSystem

#include "UtilsFileSystem/FileResult.h"

#include "UtilsFileSystem/SystemCalls.h"

#include <boost/algorithm/string/join.hpp>

#include <cerrno>

namespace UtilsFileSystem
{
namespace
{

struct ErrorRow
{
    std::errc Condition;
    TQL::IResult Result;
};

/// The first row that matches decides.
constexpr ErrorRow s_ErrorRows[] = {
    {std::errc::file_exists, TQL::Result::AlreadyPresent},
    {std::errc::invalid_argument, TQL::Result::InvalidArgument},
    {std::errc::no_such_file_or_directory, TQL::Result::FileNotFound},
    {std::errc::is_a_directory, TQL::Result::InvalidType},
    {std::errc::not_a_directory, TQL::Result::InvalidType},
    {std::errc::not_supported, TQL::Result::NotSupported},
    {std::errc::operation_not_permitted, TQL::Result::NotPermitted},
    {std::errc::permission_denied, TQL::Result::NotPermitted},
};

} // namespace

TQL::IResult ResultFromError(const std::error_code& i_rError)
{
    if (!i_rError)
        return TQL::Result::Failed;
    for (const ErrorRow& rRow : s_ErrorRows)
        if (i_rError == rRow.Condition)
            return rRow.Result;
    LogFile(TQL::ELogSeverity::Warning, "Std error code: %1%", i_rError.message());
    return TQL::Result::FileIOFailure;
}

TQL::IResult ResultOf(const std::error_code& i_rError)
{
    return i_rError ? ResultFromError(i_rError) : TQL::Result::Ok;
}

std::error_code LastCError()
{
    return {errno, std::generic_category()};
}

bool LogLockers(const char* i_pFormat, const std::string& i_rPath)
{
    std::vector<std::string> names;
    if (!System::FindLockers(i_rPath, names) || names.empty())
        return false;
    LogFile(TQL::ELogSeverity::Error, i_pFormat, i_rPath, boost::algorithm::join(names, "', '"));
    return true;
}

} // namespace UtilsFileSystem

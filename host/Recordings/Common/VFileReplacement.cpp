#include "Recordings/Common/VFileReplacement.h"

#include "Recordings/Common/FileMessage.h"
#include "UtilsFileSystem/FileIO.h"

#include <cerrno>
#include <cstdio>
#include <utility>

namespace Recordings
{

namespace
{

std::string Utf8Of(const std::filesystem::path& i_rPath)
{
    const std::u8string text = i_rPath.u8string();
    return {text.begin(), text.end()};
}

std::filesystem::path PathOf(const std::string& i_rUtf8)
{
    return std::u8string(i_rUtf8.begin(), i_rUtf8.end());
}

} // namespace

VFileReplacement::VFileReplacement(std::filesystem::path i_Path) : m_Path(std::move(i_Path)), m_Target(m_Path) {}

VFileReplacement::~VFileReplacement()
{
    m_pFile.reset();
    std::error_code ignored;
    if (!m_Temporary.empty())
        std::filesystem::remove(m_Temporary, ignored);
}

TQL::IResult VFileReplacement::Open(std::string& o_rError)
{
    std::error_code error;
    const std::filesystem::file_status status = std::filesystem::status(m_Path, error);
    if (std::filesystem::is_directory(status))
    {
        o_rError = FileMessage(m_Path, "this is a folder. Give the name of a file in it.");
        return TQL::Result::InvalidArgument;
    }
    // A pipe or a device has no name of its own to resolve, and nothing beside it to put in its place.
    if (std::filesystem::exists(status) && !std::filesystem::is_regular_file(status))
        error = UtilsFileSystem::CreateFileAt(Utf8Of(m_Path), m_pFile);
    else
        error = OpenBeside();
    return error ? Fail(error.value(), o_rError) : TQL::Result::Ok;
}

std::error_code VFileReplacement::OpenBeside()
{
    m_Target = PathOf(UtilsFileSystem::ResolveLink(Utf8Of(m_Path)));
    // A name that is too long has to show now, not when all has been written beside it under a shorter one.
    std::error_code error;
    const auto type = std::filesystem::symlink_status(m_Target, error).type();
    if (type == std::filesystem::file_type::none)
        return error;
    std::string created;
    error = UtilsFileSystem::CreateFileBeside(Utf8Of(m_Target), created, m_pFile);
    if (!error)
        m_Temporary = PathOf(created);
    return error;
}

TQL::IResult VFileReplacement::Write(std::span<const std::byte> i_Bytes, std::string& o_rError)
{
    errno = 0;
    const bool bWritten =
        m_pFile && std::fwrite(i_Bytes.data(), 1, i_Bytes.size(), m_pFile->GetFile()) == i_Bytes.size();
    return bWritten ? TQL::Result::Ok : Fail(errno, o_rError);
}

TQL::IResult VFileReplacement::Write(std::string_view i_Text, std::string& o_rError)
{
    return Write(std::as_bytes(std::span(i_Text)), o_rError);
}

TQL::IResult VFileReplacement::Commit(std::string& o_rError)
{
    errno = 0;
    const bool bComplete = m_pFile && std::fflush(m_pFile->GetFile()) == 0 && !std::ferror(m_pFile->GetFile());
    if (!bComplete || m_pFile->Close().IsError())
        return Fail(errno, o_rError);
    m_pFile.reset();
    return m_Temporary.empty() ? TQL::Result::Ok : MoveIntoPlace(o_rError);
}

TQL::IResult VFileReplacement::MoveIntoPlace(std::string& o_rError)
{
    std::error_code error;
    const std::filesystem::file_status old = std::filesystem::status(m_Target, error);
    if (std::filesystem::exists(old))
        std::filesystem::permissions(m_Temporary, old.permissions(), error);
    std::filesystem::rename(m_Temporary, m_Target, error);
    if (error)
        return Fail(error.value(), o_rError);
    m_Temporary.clear();
    return TQL::Result::Ok;
}

TQL::IResult VFileReplacement::Fail(int i_SystemError, std::string& o_rError)
{
    const bool bFull = i_SystemError == ENOSPC;
    const std::string reason =
        i_SystemError == 0 ? "unknown reason" : std::error_code(i_SystemError, std::generic_category()).message();
    o_rError = FileMessage(m_Path, "the file cannot be written (" + reason + "). " +
                                       (bFull ? "Free some space or choose another disk."
                                              : "Choose a folder that exists and that you may write to."));
    return bFull ? TQL::Result::DiskFull : TQL::Result::FileIOFailure;
}

} // namespace Recordings

#include "Recordings/VFileReplacement.h"

#include "Recordings/FileMessage.h"

#include <cerrno>
#include <system_error>
#include <utility>

namespace Recordings
{

namespace
{

std::filesystem::path FreeSibling(const std::filesystem::path& i_rPath)
{
    std::error_code error;
    std::filesystem::path sibling = i_rPath;
    sibling += ".part";
    for (int i = 2; std::filesystem::exists(sibling, error); ++i)
    {
        sibling = i_rPath;
        sibling += ".part" + std::to_string(i);
    }
    return sibling;
}

} // namespace

VFileReplacement::VFileReplacement(std::filesystem::path i_Path) : m_Path(std::move(i_Path)), m_Target(m_Path) {}

VFileReplacement::~VFileReplacement()
{
    m_Stream.close();
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
    const bool bDirect = std::filesystem::exists(status) && !std::filesystem::is_regular_file(status);
    if (!bDirect)
    {
        const auto resolved = std::filesystem::weakly_canonical(m_Path, error);
        m_Target = error ? m_Path : resolved;
        m_Temporary = FreeSibling(m_Target);
    }
    errno = 0;
    m_Stream.open(bDirect ? m_Target : m_Temporary, std::ios::binary | std::ios::trunc);
    return m_Stream ? TQL::Result::Ok : Fail(errno, o_rError);
}

TQL::IResult VFileReplacement::Write(std::span<const std::byte> i_Bytes, std::string& o_rError)
{
    errno = 0;
    m_Stream.write(reinterpret_cast<const char*>(i_Bytes.data()), static_cast<std::streamsize>(i_Bytes.size()));
    return m_Stream ? TQL::Result::Ok : Fail(errno, o_rError);
}

TQL::IResult VFileReplacement::Write(std::string_view i_Text, std::string& o_rError)
{
    return Write(std::as_bytes(std::span(i_Text)), o_rError);
}

TQL::IResult VFileReplacement::Commit(std::string& o_rError)
{
    errno = 0;
    m_Stream.close();
    if (!m_Stream)
        return Fail(errno, o_rError);
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

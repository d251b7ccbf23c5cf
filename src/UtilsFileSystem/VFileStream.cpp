#include "UtilsFileSystem/VFileStream.h"

#include "UtilsFileSystem/FileResult.h"
#include "UtilsFileSystem/SystemCalls.h"

#include <cerrno>
#include <limits>

namespace UtilsFileSystem
{

TQL::IResult VFileStream::Close()
{
    if (!m_pFile)
        return TQL::Result::FileNotOpen;
    const bool bBrokenBefore = std::ferror(m_pFile.get()) != 0;
    errno = 0;
    if (std::fclose(m_pFile.release()) != 0)
        return ResultFromError(LastCError());
    return bBrokenBefore ? TQL::Result::FileIOFailure : TQL::Result::Ok;
}

TQL::IResult VFileStream::Seek(std::uint64_t i_Position)
{
    if (!m_pFile)
        return TQL::Result::FileNotOpen;
    if (i_Position > static_cast<std::uint64_t>(std::numeric_limits<std::int64_t>::max()))
        return TQL::Result::InvalidArgument;
    return ResultOf(System::Seek(m_pFile.get(), static_cast<std::int64_t>(i_Position), SEEK_SET));
}

std::pair<std::uint64_t, TQL::IResult> VFileStream::Tell()
{
    if (!m_pFile)
        return {TQL::InvalidPosition, TQL::Result::FileNotOpen};
    errno = 0;
    const std::int64_t position = System::Tell(m_pFile.get());
    if (position < 0)
        return {TQL::InvalidPosition, ResultFromError(LastCError())};
    return {static_cast<std::uint64_t>(position), TQL::Result::Ok};
}

std::pair<std::uint64_t, TQL::IResult> VFileStream::GetSize()
{
    const auto before = Tell();
    if (before.second.IsError())
        return before;
    if (const auto error = System::Seek(m_pFile.get(), 0, SEEK_END))
        return {TQL::InvalidPosition, ResultFromError(error)};
    const auto size = Tell();
    if (size.second.IsError())
        return size;
    if (const TQL::IResult back = Seek(before.first); back.IsError())
        return {TQL::InvalidPosition, back};
    return size;
}

std::pair<std::size_t, TQL::IResult> VFileInputStream::Read(std::span<std::byte> o_Bytes)
{
    if (!GetFile())
        return {0, TQL::Result::FileNotOpen};
    errno = 0;
    const std::size_t count = std::fread(o_Bytes.data(), 1, o_Bytes.size(), GetFile());
    if (count < o_Bytes.size() && std::ferror(GetFile()))
        return {count, ResultFromError(LastCError())};
    return {count, TQL::Result::Ok};
}

TQL::IResult VFileOutputStream::Write(std::span<const std::byte> i_Bytes)
{
    if (!GetFile())
        return TQL::Result::FileNotOpen;
    errno = 0;
    if (std::fwrite(i_Bytes.data(), 1, i_Bytes.size(), GetFile()) != i_Bytes.size())
        return ResultFromError(LastCError());
    return TQL::Result::Ok;
}

TQL::IResult VFileOutputStream::Flush()
{
    if (!GetFile())
        return TQL::Result::FileNotOpen;
    errno = 0;
    return std::fflush(GetFile()) == 0 ? TQL::Result::Ok : ResultFromError(LastCError());
}

} // namespace UtilsFileSystem

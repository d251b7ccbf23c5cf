#include "UtilsFileSystem/VMemoryMappedInputFile.h"

#include "UtilsFileSystem/FileResult.h"

#include <algorithm>
#include <cstring>
#include <limits>

namespace UtilsFileSystem
{
namespace
{

constexpr std::uint64_t s_Mebibyte = 1048576;

} // namespace

TQL::IResult VMemoryMappedInputFile::Open(const std::string& i_rPath, std::uint64_t i_WindowMebibytes,
                                          std::int32_t i_Option)
{
    if (i_WindowMebibytes > std::numeric_limits<std::uint64_t>::max() / s_Mebibyte)
        return TQL::Result::InvalidArgument;
    if (const TQL::IResult opened = OpenInput(i_rPath, i_Option == OptionSequential); opened.IsError())
        return opened;
    m_PageSize = i_WindowMebibytes == 0 ? DefaultPageSize : i_WindowMebibytes * s_Mebibyte;
    m_ReadPosition = m_BytesAvailable = m_SwapCount = 0;
    if (GetFileSize() == 0)
        return TQL::Result::Ok;
    TQL::IResult result = TQL::Result::FileIOFailure;
    if (i_WindowMebibytes == 0)
        result = MapPage(0, GetFileSize());
    if (result.IsError() && result != TQL::Result::NotSupported)
        result = FindPage();
    if (result.IsError())
        CloseFile();
    return result;
}

void VMemoryMappedInputFile::Close()
{
    if (!IsOpen())
        return;
    m_Pages.clear();
    LogFile(TQL::ELogSeverity::Detail, "VMemoryMappedInputStream stats: %1% swaps, %2% pages in file.", m_SwapCount,
            GetFileSize() / m_PageSize + 1);
    CloseFile();
}

std::pair<std::size_t, TQL::IResult> VMemoryMappedInputFile::Read(std::span<std::byte> o_Bytes)
{
    if (!IsOpen())
        return {0, TQL::Result::FileNotOpen};
    std::size_t count = 0;
    while (count < o_Bytes.size() && m_ReadPosition < GetFileSize())
    {
        if (const TQL::IResult found = FindPage(); found.IsError())
            return {count, found};
        const MappedPage& rPage = m_Pages.front();
        const std::uint64_t piece = std::min<std::uint64_t>(o_Bytes.size() - count, rPage.End - m_ReadPosition);
        std::memcpy(o_Bytes.data() + count, rPage.pBytes + (m_ReadPosition - rPage.First), piece);
        count += piece;
        m_ReadPosition += piece;
    }
    return {count, TQL::Result::Ok};
}

TQL::IResult VMemoryMappedInputFile::Seek(std::uint64_t i_Position)
{
    if (!IsOpen())
        return TQL::Result::FileNotOpen;
    m_ReadPosition = i_Position;
    return TQL::Result::Ok;
}

std::pair<std::uint64_t, TQL::IResult> VMemoryMappedInputFile::Tell() const
{
    if (!IsOpen())
        return {TQL::InvalidPosition, TQL::Result::FileNotOpen};
    return {m_ReadPosition, TQL::Result::Ok};
}

std::pair<std::uint64_t, TQL::IResult> VMemoryMappedInputFile::GetSize() const
{
    if (!IsOpen())
        return {TQL::InvalidPosition, TQL::Result::FileNotOpen};
    return {GetFileSize(), TQL::Result::Ok};
}

std::pair<std::span<const std::byte>, bool> VMemoryMappedInputFile::GetWholeFile() const
{
    if (!IsOpen())
        return {{}, false};
    if (GetFileSize() == 0)
        return {{}, true};
    const MappedPage& rPage = m_Pages.front();
    if (rPage.Length != GetFileSize())
        return {{}, false};
    return {{rPage.pBytes, rPage.Length}, true};
}

bool VMemoryMappedInputFile::IsInPage(const MappedPage& i_rPage) const
{
    return i_rPage.First <= m_ReadPosition && m_ReadPosition < i_rPage.End;
}

/// Brings the page of the read position to the front, mapping it if need be.
TQL::IResult VMemoryMappedInputFile::FindPage()
{
    const auto found =
        std::find_if(m_Pages.begin(), m_Pages.end(), [this](const MappedPage& i_rPage) { return IsInPage(i_rPage); });
    if (found != m_Pages.end())
    {
        std::rotate(m_Pages.begin(), found, found + 1);
        return TQL::Result::Ok;
    }
    if (m_Pages.size() >= m_MaximumPages)
    {
        UnmapView(m_Pages.back().pBytes);
        m_Pages.pop_back();
    }
    const std::uint64_t first = m_ReadPosition - m_ReadPosition % m_PageSize;
    return MapPage(first, std::min(m_PageSize, GetFileSize() - first));
}

TQL::IResult VMemoryMappedInputFile::MapPage(std::uint64_t i_First, std::uint64_t i_Length)
{
    const auto [pBytes, result] = MapView(i_First, i_Length);
    if (result.IsError())
        return result;
    m_Pages.insert(m_Pages.begin(), {i_First, i_First + i_Length, pBytes, i_Length});
    m_BytesAvailable = i_Length;
    ++m_SwapCount;
    return TQL::Result::Ok;
}

} // namespace UtilsFileSystem

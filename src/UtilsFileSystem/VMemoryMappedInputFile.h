#pragma once

#include "TQL/IStream.h"
#include "UtilsFileSystem/VMemoryMappedFileBase.h"

#include <span>
#include <vector>

namespace UtilsFileSystem
{

/// Reads a file through one view of the whole of it, or through the two pages used last where the whole cannot be
/// mapped or a window size is asked for. Belongs to one thread at a time. Another program that shortens the file
/// meanwhile makes reads fault, as with every mapping, unless GuardViews was called.
class VMemoryMappedInputFile : private VMemoryMappedFileBase
{
public:
    static constexpr std::uint64_t DefaultPageSize = 0x10000000;
    static constexpr std::int32_t OptionSequential = 1;

    ~VMemoryMappedInputFile() { Close(); }

    /// Window 0 maps the whole file, and pages of 256 MiB if that fails; otherwise pages of that many MiB. The option
    /// OptionSequential tells the system that the file is read from front to back; others mean nothing.
    /// Errors: `AlreadyPresent` when open, `NotSupported` where the file system cannot map, `FileIOFailure` where the
    /// mapping fails otherwise.
    TQL::IResult Open(const std::string& i_rPath, std::uint64_t i_WindowMebibytes = 0, std::int32_t i_Option = 0);

    /// Logs the statistics.
    void Close();

    using VMemoryMappedFileBase::ForgetViews;
    using VMemoryMappedFileBase::GuardViews;
    using VMemoryMappedFileBase::IsOpen;
    using VMemoryMappedFileBase::IsStillWhole;

    std::pair<std::size_t, TQL::IResult> Read(std::span<std::byte> o_Bytes);
    TQL::IResult Seek(std::uint64_t i_Position);
    std::pair<std::uint64_t, TQL::IResult> Tell() const;
    std::pair<std::uint64_t, TQL::IResult> GetSize() const;

    /// All bytes of the file while one view covers it (and for an empty file); no bytes and false otherwise.
    std::pair<std::span<const std::byte>, bool> GetWholeFile() const;

    /// How many times a view was mapped.
    std::uint64_t GetSwapCount() const { return m_SwapCount; }

private:
    struct MappedPage
    {
        std::uint64_t First;
        std::uint64_t End;
        const std::byte* pBytes;
        std::uint64_t Length;
    };

    bool IsInPage(const MappedPage& i_rPage) const;
    TQL::IResult FindPage();
    TQL::IResult MapPage(std::uint64_t i_First, std::uint64_t i_Length);

    std::vector<MappedPage> m_Pages; ///< most recently used first
    std::uint64_t m_PageSize = DefaultPageSize;
    std::uint64_t m_ReadPosition = 0;
    std::uint64_t m_MaximumPages = 2;
    std::uint64_t m_BytesAvailable = 0; ///< length of the view mapped last
    std::uint64_t m_SwapCount = 0;
};

/// The memory-mapped file as a seekable stream. Open it before use; reads of a stream that is not open end at once with
/// `FileNotOpen`.
class VMemoryMappedInputStreamVirtual : public TQL::IInputStreamSeekableOwningAdapter<VMemoryMappedInputFile>
{
public:
    TQL::IResult Open(const std::string& i_rPath, std::uint64_t i_WindowMebibytes = 0, std::int32_t i_Option = 0)
    {
        return m_Stream.Open(i_rPath, i_WindowMebibytes, i_Option);
    }
    void Close() { m_Stream.Close(); }
    void GuardViews() { m_Stream.GuardViews(); }
    bool IsStillWhole() { return m_Stream.IsStillWhole(); }
    const VMemoryMappedInputFile& GetFile() const { return m_Stream; }
};

} // namespace UtilsFileSystem

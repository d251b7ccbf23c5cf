#pragma once

#include "TQL/IStream.h"

#include <cstdio>
#include <memory>

namespace UtilsFileSystem
{

/// What the two file streams share: owns one C file stream and closes it when destroyed (a failure is then swallowed;
/// call Close to hear of it). Movable; a stream that was closed or moved from answers `FileNotOpen`. One thread at a
/// time.
class VFileStream
{
public:
    explicit VFileStream(std::FILE* i_pFile) : m_pFile(i_pFile) {}

    /// Closes the file. A write that failed before or that fails now, when the buffer is emptied, gives an error.
    TQL::IResult Close();

    TQL::IResult Seek(std::uint64_t i_Position);
    std::pair<std::uint64_t, TQL::IResult> Tell();

    /// Finds the size by going to the end and back.
    std::pair<std::uint64_t, TQL::IResult> GetSize();

    /// The C stream for libraries that want one; still owned here.
    std::FILE* GetFile() const { return m_pFile.get(); }

private:
    struct CloseFile
    {
        void operator()(std::FILE* i_pFile) const { (void)std::fclose(i_pFile); }
    };

    std::unique_ptr<std::FILE, CloseFile> m_pFile;
};

class VFileInputStream : public VFileStream
{
public:
    using VFileStream::VFileStream;

    std::pair<std::size_t, TQL::IResult> Read(std::span<std::byte> o_Bytes);
};

class VFileOutputStream : public VFileStream
{
public:
    using VFileStream::VFileStream;

    TQL::IResult Write(std::span<const std::byte> i_Bytes);
    TQL::IResult Flush();
};

using VFileInputStreamVirtual = TQL::IInputStreamSeekableOwningAdapter<VFileInputStream>;
using VFileOutputStreamVirtual = TQL::IOutputStreamSeekableOwningAdapter<VFileOutputStream>;

} // namespace UtilsFileSystem

#pragma once

#include "TQL/IResult.h"

#include <cstddef>
#include <cstdint>
#include <limits>
#include <span>
#include <utility>

namespace TQL
{

/// The answer to a size or position query when it fails.
inline constexpr std::uint64_t InvalidPosition = std::numeric_limits<std::uint64_t>::max();

/// A source of bytes. A stream belongs to one thread at a time.
class IInputStream
{
public:
    virtual ~IInputStream() = default;

    /// Fills o_Bytes from the stream. Gives how many bytes were read; fewer than asked for with a success means that
    /// the stream ended, fewer with an error that it broke.
    virtual std::pair<std::size_t, IResult> Read(std::span<std::byte> o_Bytes) = 0;
};

/// A target of bytes. A stream belongs to one thread at a time.
class IOutputStream
{
public:
    virtual ~IOutputStream() = default;

    virtual IResult Write(std::span<const std::byte> i_Bytes) = 0;
    virtual IResult Flush() = 0;
};

/// A stream whose position can be asked for and set. Positions are bytes from the start.
class ISeekable
{
public:
    virtual ~ISeekable() = default;

    /// Beyond the end is allowed; reads end there at once.
    virtual IResult Seek(std::uint64_t i_Position) = 0;

    /// Both give InvalidPosition on failure.
    virtual std::pair<std::uint64_t, IResult> Tell() = 0;
    virtual std::pair<std::uint64_t, IResult> GetSize() = 0;
};

class IInputStreamSeekable : public IInputStream, public ISeekable
{
};

class IOutputStreamSeekable : public IOutputStream, public ISeekable
{
};

/// Owns a stream of a plain class and offers it as ISeekable: Seek, Tell and GetSize go to the operations of that name.
template <typename Interface, typename Stream>
class SeekableOwningAdapter : public Interface
{
public:
    SeekableOwningAdapter() = default;
    explicit SeekableOwningAdapter(Stream&& i_rrStream) : m_Stream(std::move(i_rrStream)) {}

    IResult Seek(std::uint64_t i_Position) override { return m_Stream.Seek(i_Position); }
    std::pair<std::uint64_t, IResult> Tell() override { return m_Stream.Tell(); }
    std::pair<std::uint64_t, IResult> GetSize() override { return m_Stream.GetSize(); }

protected:
    Stream m_Stream;
};

/// The seekable input interface over an owned stream.
template <typename Stream>
class IInputStreamSeekableOwningAdapter : public SeekableOwningAdapter<IInputStreamSeekable, Stream>
{
public:
    using SeekableOwningAdapter<IInputStreamSeekable, Stream>::SeekableOwningAdapter;

    std::pair<std::size_t, IResult> Read(std::span<std::byte> o_Bytes) override { return this->m_Stream.Read(o_Bytes); }
};

/// The seekable output interface over an owned stream.
template <typename Stream>
class IOutputStreamSeekableOwningAdapter : public SeekableOwningAdapter<IOutputStreamSeekable, Stream>
{
public:
    using SeekableOwningAdapter<IOutputStreamSeekable, Stream>::SeekableOwningAdapter;

    IResult Write(std::span<const std::byte> i_Bytes) override { return this->m_Stream.Write(i_Bytes); }
    IResult Flush() override { return this->m_Stream.Flush(); }
};

} // namespace TQL

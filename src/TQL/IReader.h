#pragma once

#include "TQL/IResult.h"

#include <cstddef>
#include <cstdint>

namespace TQL
{

/// Where a reader takes its bytes from.
class IByteSource
{
public:
    virtual ~IByteSource() = default;

    /// Fills exactly i_Size bytes; false when there are not so many.
    virtual bool Read(void* o_pBytes, std::size_t i_Size) = 0;
};

/// Reads one value that was laid out by an older schema. One thread at a time.
class IReader
{
public:
    virtual ~IReader() = default;

    /// Takes the value's bytes from the source; what is kept of it goes to o_pTarget, which a reader that skips never
    /// touches. OkButNoEffect when the target stays as it was on purpose, Failed when the source ends too early.
    virtual IResult Read(IByteSource& io_rSource, void* o_pTarget) = 0;
};

/// A reader that may be merged with its neighbours.
class IReaderCollapsable : public IReader
{
public:
    /// Bytes that every Read takes; 0 when that varies.
    std::uint64_t FixedSize() const noexcept { return m_FixedSize; }

protected:
    explicit IReaderCollapsable(std::uint64_t i_FixedSize) noexcept : m_FixedSize(i_FixedSize) {}

private:
    std::uint64_t m_FixedSize;
};

} // namespace TQL

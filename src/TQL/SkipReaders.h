#pragma once

#include "TQL/IReader.h"
#include "TQL/ISchema.h"

#include <memory>
#include <vector>

namespace TQL
{

/// The readers that skip values of the types that a newer schema has no place for. They never touch the target. Made by
/// MakeSkipReader; large values are read in pieces, so the size in a broken file costs no memory.

using SkipReaderPtr = std::unique_ptr<IReaderCollapsable>;

/// Skips a fixed number of bytes.
class VReaderSkipBytes : public IReaderCollapsable
{
public:
    explicit VReaderSkipBytes(std::uint64_t i_Size) noexcept : IReaderCollapsable(i_Size), m_Size(i_Size) {}

    IResult Read(IByteSource& io_rSource, void* o_pTarget) override;

protected:
    VReaderSkipBytes(std::uint64_t i_Size, std::uint64_t i_FixedSize) noexcept
        : IReaderCollapsable(i_FixedSize), m_Size(i_Size)
    {
    }

private:
    std::uint64_t m_Size;
};

/// The same, but never merged with a neighbour.
class VReaderSkipBytesNoCollapse final : public VReaderSkipBytes
{
public:
    explicit VReaderSkipBytesNoCollapse(std::uint64_t i_Size) noexcept : VReaderSkipBytes(i_Size, 0) {}
};

/// Skips a signed 32-bit count and as many elements of a fixed size. A negative count has none.
class VReaderSkipContiguousVector final : public IReaderCollapsable
{
public:
    explicit VReaderSkipContiguousVector(std::uint64_t i_ElementSize) noexcept
        : IReaderCollapsable(0), m_ElementSize(i_ElementSize)
    {
    }

    IResult Read(IByteSource& io_rSource, void* o_pTarget) override;

private:
    std::uint64_t m_ElementSize;
};

/// Skips a signed 32-bit count and as many elements. A negative count has none.
class VReaderSkipContainer final : public IReaderCollapsable
{
public:
    explicit VReaderSkipContainer(SkipReaderPtr i_pElement) noexcept
        : IReaderCollapsable(0), m_pElement(std::move(i_pElement))
    {
    }

    IResult Read(IByteSource& io_rSource, void* o_pTarget) override;

private:
    SkipReaderPtr m_pElement;
};

/// Runs one reader a fixed number of times. The result is that of FoldResults.
class VReaderSkipArray final : public IReaderCollapsable
{
public:
    VReaderSkipArray(SkipReaderPtr i_pElement, std::uint32_t i_Count) noexcept
        : IReaderCollapsable(0), m_pElement(std::move(i_pElement)), m_Count(i_Count)
    {
    }

    IResult Read(IByteSource& io_rSource, void* o_pTarget) override;

private:
    SkipReaderPtr m_pElement;
    std::uint32_t m_Count;
};

/// Runs its members' readers in order. Neighbours of fixed size become one; with nothing else, so does the tuple.
class VReaderSkipTuple final : public IReaderCollapsable
{
public:
    explicit VReaderSkipTuple(std::vector<SkipReaderPtr> i_Members);

    IResult Read(IByteSource& io_rSource, void* o_pTarget) override;

private:
    std::vector<SkipReaderPtr> m_Readers;
};

/// The reader that skips a value of the schema. None for a Ref or an unknown type, alone or inside the schema.
SkipReaderPtr MakeSkipReader(const ISchema& i_rSchema);

/// The result of several rounds: a failure ends the rounds and stands; OkButNoEffect when all were that or there were
/// none, Ok when all were Ok, OkButPartial for a mixture.
class VResultFold
{
public:
    /// False when the rounds end with this one.
    bool Add(IResult i_Result) noexcept;
    IResult Get() const noexcept;

private:
    IResult m_Failure;
    bool m_bDone = false;    ///< a round was Ok or OkButPartial
    bool m_bOmitted = false; ///< a round was OkButNoEffect or OkButPartial
};

} // namespace TQL

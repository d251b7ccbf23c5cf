#include "TQL/SkipReaders.h"

#include <algorithm>
#include <array>
#include <limits>
#include <utility>

namespace TQL
{
namespace
{

constexpr std::uint64_t MaximumSize = std::numeric_limits<std::uint64_t>::max();

IResult Skip(IByteSource& io_rSource, std::uint64_t i_Size)
{
    constexpr std::uint64_t pieceSize = 65536;
    if (i_Size <= 16)
    {
        std::array<std::byte, 16> scratch;
        return i_Size == 0 || io_rSource.Read(scratch.data(), static_cast<std::size_t>(i_Size)) ? Result::Ok
                                                                                                : Result::Failed;
    }
    std::vector<std::byte> scratch(static_cast<std::size_t>(std::min(i_Size, pieceSize)));
    while (i_Size != 0)
    {
        const std::uint64_t piece = std::min<std::uint64_t>(i_Size, scratch.size());
        if (!io_rSource.Read(scratch.data(), static_cast<std::size_t>(piece)))
            return Result::Failed;
        i_Size -= piece;
    }
    return Result::Ok;
}

bool IsProductTooLarge(std::uint64_t i_Size, std::uint64_t i_Count) noexcept
{
    return i_Count != 0 && i_Size > MaximumSize / i_Count;
}

/// Bytes of one value; nothing where the type alone does not say.
std::optional<std::uint64_t> FindPlainSize(EType i_Type) noexcept
{
    switch (i_Type)
    {
    case EType::Void:
        return 0;
    case EType::Bool:
    case EType::Int8:
    case EType::UInt8:
    case EType::Enum8:
        return 1;
    case EType::Int16:
    case EType::UInt16:
    case EType::Enum16:
        return 2;
    case EType::Int32:
    case EType::UInt32:
    case EType::Float32:
    case EType::Enum32:
        return 4;
    case EType::Int64:
    case EType::UInt64:
    case EType::Float64:
        return 8;
    default:
        return std::nullopt;
    }
}

SkipReaderPtr MakeElementReader(const ISchema& i_rSchema)
{
    return i_rSchema.SubSchemas.empty() ? nullptr : MakeSkipReader(i_rSchema.SubSchemas.front().Schema);
}

SkipReaderPtr MakeArrayReader(const ISchema& i_rSchema)
{
    SkipReaderPtr pElement = MakeElementReader(i_rSchema);
    if (!pElement)
        return nullptr;
    const std::uint64_t size = pElement->FixedSize();
    if (size != 0 && !IsProductTooLarge(size, i_rSchema.Count))
        return std::make_unique<VReaderSkipBytes>(size * i_rSchema.Count);
    return std::make_unique<VReaderSkipArray>(std::move(pElement), i_rSchema.Count);
}

SkipReaderPtr MakeListReader(const ISchema& i_rSchema)
{
    SkipReaderPtr pElement = MakeElementReader(i_rSchema);
    if (!pElement)
        return nullptr;
    if (pElement->FixedSize() != 0)
        return std::make_unique<VReaderSkipContiguousVector>(pElement->FixedSize());
    return std::make_unique<VReaderSkipContainer>(std::move(pElement));
}

SkipReaderPtr MakeTupleReader(const ISchema& i_rSchema)
{
    std::vector<SkipReaderPtr> members;
    for (const SchemaMember& rMember : i_rSchema.SubSchemas)
    {
        members.push_back(MakeSkipReader(rMember.Schema));
        if (!members.back())
            return nullptr;
    }
    return std::make_unique<VReaderSkipTuple>(std::move(members));
}

/// What a tuple of these members always takes, 0 when that varies.
std::uint64_t SumFixedSizes(const std::vector<SkipReaderPtr>& i_rMembers) noexcept
{
    std::uint64_t sum = 0;
    for (const SkipReaderPtr& rpMember : i_rMembers)
    {
        const std::uint64_t size = rpMember->FixedSize();
        if (size == 0 || size > MaximumSize - sum)
            return 0;
        sum += size;
    }
    return sum;
}

std::vector<SkipReaderPtr> MergeNeighbours(std::vector<SkipReaderPtr> i_Members)
{
    std::vector<SkipReaderPtr> merged;
    for (SkipReaderPtr& rpMember : i_Members)
    {
        const std::uint64_t size = rpMember->FixedSize();
        const std::uint64_t before = merged.empty() ? 0 : merged.back()->FixedSize();
        if (size != 0 && before != 0 && size <= MaximumSize - before)
            merged.back() = std::make_unique<VReaderSkipBytes>(before + size);
        else
            merged.push_back(std::move(rpMember));
    }
    return merged;
}

} // namespace

IResult VReaderSkipBytes::Read(IByteSource& io_rSource, void*)
{
    return Skip(io_rSource, m_Size);
}

IResult VReaderSkipContiguousVector::Read(IByteSource& io_rSource, void*)
{
    std::int32_t count = 0;
    if (!io_rSource.Read(&count, sizeof(count)))
        return Result::Failed;
    if (count <= 0)
        return Result::Ok;
    const auto elements = static_cast<std::uint64_t>(count);
    return IsProductTooLarge(m_ElementSize, elements) ? Result::Failed : Skip(io_rSource, m_ElementSize * elements);
}

IResult VReaderSkipContainer::Read(IByteSource& io_rSource, void* o_pTarget)
{
    std::int32_t count = 0;
    if (!io_rSource.Read(&count, sizeof(count)))
        return Result::Failed;
    for (std::int32_t i = 0; i < count; ++i)
    {
        if (m_pElement->Read(io_rSource, o_pTarget).IsError())
            return Result::Failed;
    }
    return Result::Ok;
}

IResult VReaderSkipArray::Read(IByteSource& io_rSource, void* o_pTarget)
{
    VResultFold fold;
    for (std::uint32_t i = 0; i < m_Count; ++i)
    {
        if (!fold.Add(m_pElement->Read(io_rSource, o_pTarget)))
            break;
    }
    return fold.Get();
}

VReaderSkipTuple::VReaderSkipTuple(std::vector<SkipReaderPtr> i_Members)
    : IReaderCollapsable(SumFixedSizes(i_Members)), m_Readers(MergeNeighbours(std::move(i_Members)))
{
}

IResult VReaderSkipTuple::Read(IByteSource& io_rSource, void* o_pTarget)
{
    VResultFold fold;
    for (const SkipReaderPtr& rpReader : m_Readers)
    {
        if (!fold.Add(rpReader->Read(io_rSource, o_pTarget)))
            break;
    }
    return fold.Get();
}

SkipReaderPtr MakeSkipReader(const ISchema& i_rSchema)
{
    if (const auto size = FindPlainSize(i_rSchema.Type))
        return std::make_unique<VReaderSkipBytes>(*size);
    switch (i_rSchema.Type)
    {
    case EType::String:
        return std::make_unique<VReaderSkipContiguousVector>(1);
    case EType::Array:
        return MakeArrayReader(i_rSchema);
    case EType::List:
        return MakeListReader(i_rSchema);
    case EType::Tuple:
    case EType::NamedTuple:
        return MakeTupleReader(i_rSchema);
    default:
        return nullptr;
    }
}

bool VResultFold::Add(IResult i_Result) noexcept
{
    if (i_Result.IsError())
        m_Failure = i_Result;
    m_bDone |= i_Result != Result::OkButNoEffect;
    m_bOmitted |= i_Result == Result::OkButNoEffect || i_Result == Result::OkButPartial;
    return i_Result.IsSuccess();
}

IResult VResultFold::Get() const noexcept
{
    if (m_Failure.IsError())
        return m_Failure;
    if (!m_bDone)
        return Result::OkButNoEffect;
    return m_bOmitted ? Result::OkButPartial : Result::Ok;
}

} // namespace TQL

#pragma once

#include "TQL/IReader.h"
#include "TQL/SchemaHistory.h"

#include <memory>

namespace TQL
{

/// Reads a value of an old enum as the value of the new one. It takes four bytes, whatever the storage type of the
/// enum, and writes to a target that is a std::int32_t.
class VReaderMappedEnum final : public IReaderCollapsable
{
public:
    /// The mapping has succeeded; its lists are sorted.
    explicit VReaderMappedEnum(EnumMapping i_Mapping) noexcept : IReaderCollapsable(0), m_Mapping(std::move(i_Mapping))
    {
    }

    /// OkButNoEffect for a value that was removed, Failed for one that the old enum did not have.
    IResult Read(IByteSource& io_rSource, void* o_pTarget) override;

private:
    EnumMapping m_Mapping;
};

/// The reader from an old enum to a new one; none when the mapping fails.
std::unique_ptr<IReader> MakeEnumReader(const ISchema& i_rOld, const ISchema& i_rNew);

} // namespace TQL

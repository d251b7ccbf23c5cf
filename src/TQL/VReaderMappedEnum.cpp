#include "TQL/VReaderMappedEnum.h"

#include <algorithm>

namespace TQL
{

IResult VReaderMappedEnum::Read(IByteSource& io_rSource, void* o_pTarget)
{
    std::int32_t value = 0;
    if (!io_rSource.Read(&value, sizeof(value)))
        return Result::Failed;
    if (std::ranges::binary_search(m_Mapping.Removed, value))
        return Result::OkButNoEffect;
    if (!m_Mapping.Values.empty())
    {
        const auto found =
            std::ranges::lower_bound(m_Mapping.Values, value, {}, &std::pair<std::int32_t, std::int32_t>::first);
        if (found == m_Mapping.Values.end() || found->first != value)
            return Result::Failed;
        value = found->second;
    }
    *static_cast<std::int32_t*>(o_pTarget) = value;
    return Result::Ok;
}

std::unique_ptr<IReader> MakeEnumReader(const ISchema& i_rOld, const ISchema& i_rNew)
{
    EnumMapping mapping = MapEnum(i_rOld, i_rNew);
    return mapping.HasSucceeded() ? std::make_unique<VReaderMappedEnum>(std::move(mapping)) : nullptr;
}

} // namespace TQL

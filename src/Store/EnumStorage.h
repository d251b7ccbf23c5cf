#pragma once

#include "TQL/ISchema.h"

#include <cstddef>
#include <cstdint>

namespace Store
{

/// The bytes that a value of an enum type takes.
constexpr std::size_t EnumSize(TQL::EType i_Type) noexcept
{
    return i_Type == TQL::EType::Enum8 ? 1 : i_Type == TQL::EType::Enum16 ? 2 : 4;
}

/// Whether the storage of an enum type holds the number, be it meant with a sign or without.
constexpr bool FitsEnum(TQL::EType i_Type, std::int32_t i_Number) noexcept
{
    const std::int64_t half = std::int64_t{1} << (8 * EnumSize(i_Type) - 1);
    return i_Number >= -half && i_Number < 2 * half;
}

} // namespace Store

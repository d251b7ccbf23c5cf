#pragma once

#include "ChannelSystem/ComponentDescription.h"
#include "TQL/IResult.h"

#include <cstdint>
#include <string_view>

namespace Expressions
{

/// What component subtype ids mean, and the id of a unit by name. Any thread.
class IUnitTable
{
public:
    /// Dimension of units that nobody told the meaning of: no two of them convert into one another.
    static constexpr std::uint16_t UnknownDimension = 0xffff;

    virtual ~IUnitTable() = default;

    /// InvalidId for an id that stands for nothing.
    virtual TQL::IResult Find(std::uint16_t i_Id, TQL::SubTypeRecord& o_rRecord) const = 0;

    /// The id of a prefix and a base unit by name, "milli" and "meter", "" and "degree"; false when there is no such.
    virtual bool FindByName(std::string_view i_Prefix, std::string_view i_Base, std::uint16_t& o_rId) const = 0;
};

} // namespace Expressions

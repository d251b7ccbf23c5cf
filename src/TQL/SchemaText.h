#pragma once

#include "TQL/IResult.h"
#include "TQL/ISchema.h"

#include <string>
#include <string_view>

namespace TQL
{

/// The textual forms of a schema; inner schemas are written in the same form.
enum class ESchemaTextMode : int
{
    Positional = 0, ///< ["Int32","Value",0,0,"",[],[],[],[]]
    Named = 1,      ///< {"Type":"Int32","Role":"Value",...}
    NamedBrief = 2, ///< as Named, without the members that are as in a default schema: {"Type":"Int32"}
    Counts = 3 ///< as Positional without the outer brackets, each list as its count: "Int32","Value",0,0,"",0,0,0,0
};

std::string WriteSchema(const ISchema& i_rSchema, ESchemaTextMode i_Mode);

/// Reads the named forms, members in any order; an absent one keeps its default and an unknown one is ignored.
/// InvalidFormat, and o_rSchema as it was, for text that is no JSON object, a known member of a wrong kind or out of
/// its range, an unknown type or role, a pair that is none, or more than 64 schemas inside one another.
IResult ReadSchema(std::string_view i_Text, ISchema& o_rSchema);

} // namespace TQL

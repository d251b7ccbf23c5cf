#pragma once

#include "TQL/IResult.h"
#include "TQL/ISchema.h"

#include <cstddef>
#include <vector>

namespace TQL
{

/// The bodies of named types, each once and themselves reduced.
using SchemaTypeList = std::vector<ISchema>;

/// Replaces every schema that has a type name by a Ref, the inner ones first, and puts the bodies that the list lacks
/// into it. A Ref keeps Role, Detail, Count and History. Gives how many types were added.
std::size_t ReduceSchema(ISchema& io_rSchema, SchemaTypeList& io_rTypes);

/// Puts the bodies back in the place of the Refs. NotFound for a Ref whose name the list does not hold, InvalidType for
/// types that contain themselves; the schema then stays as it was.
IResult ExpandSchema(ISchema& io_rSchema, const SchemaTypeList& i_rTypes);

} // namespace TQL

#pragma once

#include "TQL/ISchema.h"

namespace TQL::IO
{

/// The one instance in this process of the schema's shape (HaveSameShape). It lives as long as the process, so values
/// compare their schemas by address. The first instance interned stands, with its names and docs: an application
/// interns its own schemas before it reads any file. Any thread.
const ISchema& GetUniqueSchema(const ISchema& i_rSchema);

/// The same for a schema that has only a type. A value outside EType gives Void.
const ISchema& GetUniquePodSchema(EType i_Type);

} // namespace TQL::IO

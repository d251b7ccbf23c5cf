#pragma once

#include "TQL/ISchema.h"

#include <string>
#include <string_view>
#include <vector>

namespace TQL
{

/// What has happened to a schema between a file and the application, as sentences that begin with the place.
struct SchemaDifferences
{
    std::vector<std::string> Changes; ///< values of the old schema can still be read
    std::vector<std::string> Errors;  ///< they cannot
};

/// True where every value of the old type has its like in the new one. Void and Ref convert to nothing.
bool IsConvertible(EType i_Old, EType i_New) noexcept;

/// Adds what differs between the schemas, all through; i_Context is the path of the value. Detail, Role and Docs do not
/// count, type names only as a part of the place.
void CompareSchemas(const ISchema& i_rOld, const ISchema& i_rNew, std::string_view i_Context,
                    SchemaDifferences& io_rDifferences);

} // namespace TQL

#pragma once

#include "Studio/StoreLint/LocatedJson.h"

namespace Studio
{

/// What a store file says that its reader does not take as it stands, in the order of the text. Stricter than the
/// reader, which passes over unknown members and makes 0 of a number that does not fit.
std::vector<TextProblem> FindStoreProblems(std::string_view i_Text, const LocatedValue& i_rRoot);

} // namespace Studio

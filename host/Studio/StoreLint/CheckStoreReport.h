#pragma once

#include <cstddef>
#include <string>
#include <string_view>

namespace Studio
{

struct CheckStoreReport
{
    std::string Text; ///< what is read from the file, then a line a problem: FILE:LINE:COLUMN: entry: problem
    std::size_t Problems = 0;
};

/// Checks the text of a store file; i_rName is the file's for the lines. Touches no file, so it never repairs one.
CheckStoreReport MakeCheckStoreReport(const std::string& i_rName, std::string_view i_Text);

} // namespace Studio

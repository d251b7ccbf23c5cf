#pragma once

#include <cstddef>
#include <span>
#include <string>
#include <vector>

namespace Store
{

struct CategoryOrder
{
    std::vector<std::string> Categories;
    std::size_t OrderedCount = 0; ///< those that the wanted order names; the rest is in alphabetical order
};

/// Sorts categories that are present: first those of the wanted order, in it, then the others by their bytes.
CategoryOrder OrderCategories(std::vector<std::string> i_Present, std::span<const std::string> i_Wanted);

} // namespace Store

#include "StoreParameters/CategoryOrder.h"

#include <algorithm>
#include <cstddef>
#include <string_view>
#include <utility>

namespace Store
{

CategoryOrder OrderCategories(std::vector<std::string> i_Present, std::span<const std::string> i_Wanted)
{
    CategoryOrder order{std::move(i_Present), 0};
    const auto rank = [&](const std::string& i_rCategory)
    {
        return std::ranges::find(i_Wanted, i_rCategory) - i_Wanted.begin();
    };
    std::ranges::sort(
        order.Categories, [&](const std::string& i_rA, const std::string& i_rB)
        { return std::pair(rank(i_rA), std::string_view(i_rA)) < std::pair(rank(i_rB), std::string_view(i_rB)); });
    const auto unordered = std::ranges::find(order.Categories, static_cast<std::ptrdiff_t>(i_Wanted.size()), rank);
    order.OrderedCount = static_cast<std::size_t>(unordered - order.Categories.begin());
    return order;
}

} // namespace Store

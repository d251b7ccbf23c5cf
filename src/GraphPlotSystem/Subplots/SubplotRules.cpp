#include "GraphPlotSystem/Subplots/SubplotRules.h"

#include "TQL/HashMix.h"

#include <algorithm>
#include <cstddef>
#include <unordered_map>

namespace GraphPlotUI
{

std::uint64_t SubplotIdOf(std::uint64_t i_SubType, std::uint64_t i_Component) noexcept
{
    return TQL::HashMix(TQL::HashMix(0, i_SubType), i_Component);
}

QString SubplotOrderKey(const QString& i_rName, const QString& i_rUnits, std::uint64_t i_Component)
{
    const QString units = i_rUnits.isEmpty() ? QString() : QLatin1String(" [") + i_rUnits + QLatin1Char(']');
    return i_rName + units + QString::number(i_Component);
}

QString SubplotLabel(const QString& i_rTypeName, const QString& i_rComponentName)
{
    return i_rComponentName.isEmpty() ? i_rTypeName : i_rTypeName + QLatin1String(" : ") + i_rComponentName;
}

std::vector<bool> FindSteadyRows(std::span<const std::uint64_t> i_Rows, std::span<const std::uint64_t> i_NewRows)
{
    std::unordered_map<std::uint64_t, std::size_t> places;
    for (std::size_t place = 0; place < i_NewRows.size(); ++place)
        places.emplace(i_NewRows[place], place);

    // The longest ascending run of new places: tails[n] is the row that ends the best run of n + 1 rows so far.
    constexpr std::size_t none = static_cast<std::size_t>(-1);
    std::vector<std::size_t> placeOf(i_Rows.size(), none);
    std::vector<std::size_t> before(i_Rows.size(), none);
    std::vector<std::size_t> tails;
    for (std::size_t row = 0; row < i_Rows.size(); ++row)
    {
        const auto found = places.find(i_Rows[row]);
        if (found == places.end())
            continue;
        placeOf[row] = found->second;
        const auto tail = std::ranges::lower_bound(tails, placeOf[row], {}, [&](std::size_t i) { return placeOf[i]; });
        before[row] = tail == tails.begin() ? none : *(tail - 1);
        if (tail == tails.end())
            tails.push_back(row);
        else
            *tail = row;
    }
    std::vector<bool> steady(i_Rows.size(), false);
    for (std::size_t row = tails.empty() ? none : tails.back(); row != none; row = before[row])
        steady[row] = true;
    return steady;
}

} // namespace GraphPlotUI

#include "GraphPlotSystem/Channels/ChannelTypeRows.h"

#include <algorithm>
#include <iterator>
#include <set>
#include <tuple>

namespace GraphPlotUI
{
namespace
{

bool IsDigit(char i_Character)
{
    return i_Character >= '0' && i_Character <= '9';
}

} // namespace

bool LooksTheSame(const ChannelTypeRow& i_rA, const ChannelTypeRow& i_rB)
{
    const auto face = [](const ChannelTypeRow& i_rRow)
    {
        return std::tie(i_rRow.InternalName, i_rRow.DisplayName, i_rRow.Category, i_rRow.bDeveloperOnly,
                        i_rRow.bAvailable, i_rRow.bCategoryHeader);
    };
    return face(i_rA) == face(i_rB);
}

void SortChannelTypeRows(std::vector<ChannelTypeRow>& io_rRows)
{
    if (io_rRows.empty())
        return;
    std::stable_sort(std::next(io_rRows.begin()), io_rRows.end(),
                     [](const ChannelTypeRow& i_rA, const ChannelTypeRow& i_rB)
                     { return std::tie(i_rA.Category, i_rA.DisplayName) < std::tie(i_rB.Category, i_rB.DisplayName); });
}

void AddCategoryHeaders(std::vector<ChannelTypeRow>& io_rRows)
{
    std::set<QString> missing;
    for (const ChannelTypeRow& rRow : io_rRows)
        missing.insert(rRow.Category);
    missing.erase(QString());
    std::vector<ChannelTypeRow> headers;
    for (const QString& rCategory : missing)
    {
        ChannelTypeRow header;
        header.Category = rCategory;
        header.bCategoryHeader = true;
        headers.push_back(std::move(header));
    }
    // Ahead of the types, so that a stable sort leaves a header above a type without a display name.
    io_rRows.insert(std::next(io_rRows.begin()), headers.begin(), headers.end());
}

int FindChannelTypeRow(const std::vector<ChannelTypeRow>& i_rRows, const std::string& i_rInternalName)
{
    const auto found =
        std::ranges::find_if(i_rRows, [&i_rInternalName](const ChannelTypeRow& i_rRow)
                             { return !i_rRow.bCategoryHeader && i_rRow.InternalName == i_rInternalName; });
    return found == i_rRows.end() ? -1 : static_cast<int>(found - i_rRows.begin());
}

bool IsChannelTypeAvailable(const ChannelTypeRow& i_rRow, const std::map<std::string, std::uint64_t>& i_rCounts)
{
    if (!i_rRow.Requirement.bApplies)
        return i_rCounts.contains(i_rRow.InternalName);
    std::uint64_t sum = 0;
    for (const std::string& rType : i_rRow.Requirement.InputTypeNames)
        if (const auto found = i_rCounts.find(rType); found != i_rCounts.end())
            sum += found->second;
    const std::int64_t required = i_rRow.Requirement.InputCount;
    return required < 0 ? sum > 0 : sum >= static_cast<std::uint64_t>(required);
}

std::string RemovePlaceholders(const std::string& i_rTypeDisplayName)
{
    std::string name;
    for (std::size_t i = 0; i < i_rTypeDisplayName.size();)
    {
        const bool bPlaceholder = i + 2 < i_rTypeDisplayName.size() && i_rTypeDisplayName[i] == '%' &&
                                  IsDigit(i_rTypeDisplayName[i + 1]) && i_rTypeDisplayName[i + 2] == '%';
        if (!bPlaceholder)
            name += i_rTypeDisplayName[i];
        i += bPlaceholder ? 3 : 1;
    }
    return name;
}

} // namespace GraphPlotUI

#pragma once

#include <QtCore/QString>

#include <cstdint>
#include <map>
#include <string>
#include <vector>

namespace GraphPlotUI
{

/// Types whose flags share a bit with this mask are not offered: never those of bit 1, and those of bit 2 only to
/// developers.
constexpr std::uint64_t ChannelTypeMask(bool i_bDeveloperMode)
{
    return i_bDeveloperMode ? 2 : 6;
}

inline constexpr const char* AutoChannelType = "Auto";     ///< row 0 of the selected types
inline constexpr const char* NoGlobalChannelType = "None"; ///< row 0 of the global types

/// What must be selected for a type: some number of things that give channels of the named types.
struct ChannelTypeRequirement
{
    bool bApplies = false;
    std::int64_t InputCount = 0; ///< -1: any number above 0
    std::vector<std::string> InputTypeNames;
};

/// One row of a channel type picker.
struct ChannelTypeRow
{
    std::string InternalName; ///< empty for a header
    QString DisplayName;      ///< empty for a header
    QString Category;
    bool bDeveloperOnly = false;
    bool bAvailable = true;
    bool bCategoryHeader = false;
    ChannelTypeRequirement Requirement;
};

/// Whether two rows look the same in the picker.
bool LooksTheSame(const ChannelTypeRow& i_rA, const ChannelTypeRow& i_rB);

/// Row 0 stays; the others are ordered by category, then by display name, so that a header leads its category.
void SortChannelTypeRows(std::vector<ChannelTypeRow>& io_rRows);

/// Adds a header for each category that is not empty, behind row 0.
void AddCategoryHeaders(std::vector<ChannelTypeRow>& io_rRows);

/// The first row that is no header with that name, -1 when there is none.
int FindChannelTypeRow(const std::vector<ChannelTypeRow>& i_rRows, const std::string& i_rInternalName);

/// Whether the selection, as counts by channel type, can give a channel of the row's type.
bool IsChannelTypeAvailable(const ChannelTypeRow& i_rRow, const std::map<std::string, std::uint64_t>& i_rCounts);

/// A type name without its places for the names of inputs: "%1% (Magnitude)" gives " (Magnitude)".
std::string RemovePlaceholders(const std::string& i_rTypeDisplayName);

} // namespace GraphPlotUI

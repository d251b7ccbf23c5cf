#pragma once

#include <QtCore/QString>

#include <cstdint>
#include <span>
#include <vector>

namespace GraphPlotUI
{

/// The id of the one subplot that holds all traces.
inline constexpr std::uint64_t SingleSubplotId = 0;

/// The id of the subplot that shows one component of a channel subtype. It is written to files, so it never changes.
std::uint64_t SubplotIdOf(std::uint64_t i_SubType, std::uint64_t i_Component) noexcept;

/// Subplots stand in the order of these texts, compared by character code, from top to bottom.
QString SubplotOrderKey(const QString& i_rName, const QString& i_rUnits, std::uint64_t i_Component);

/// "type" or "type : component".
QString SubplotLabel(const QString& i_rTypeName, const QString& i_rComponentName);

/// Which rows stay where they are when a list of distinct ids becomes another: a largest set of rows whose ids are in
/// the new list and in the same order there. Every other row has to go or to move. One flag a row.
std::vector<bool> FindSteadyRows(std::span<const std::uint64_t> i_Rows, std::span<const std::uint64_t> i_NewRows);

} // namespace GraphPlotUI

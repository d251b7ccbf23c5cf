#pragma once

#include <QtCore/QString>

#include <cstdint>
#include <span>
#include <vector>

namespace TQL
{
struct IChannelInstanceId;
class IChannelComponentControls;
class IChannelTextProvider;
} // namespace TQL

namespace GraphPlotUI
{

/// One row of the list of components: a channel subtype, or a component of the one above it.
struct VComponentType
{
    std::uint64_t SubType = 0; ///< 0 for channels that are not known yet
    QString Text;
    bool bHeader = false;
    std::uint64_t Component = 0; ///< 0 for a header
    int State = 0;               ///< a Qt::CheckState; a header is partly checked when some of its components are on

    /// Whether both are the same row, checked or not.
    bool IsSameRow(const VComponentType& i_rOther) const
    {
        return SubType == i_rOther.SubType && Text == i_rOther.Text && bHeader == i_rOther.bHeader &&
               Component == i_rOther.Component;
    }
    friend bool operator==(const VComponentType&, const VComponentType&) = default;
};

/// How many components the types of the list have, those without a row of their own included.
struct ComponentCounts
{
    int Total = 0;
    int Enabled = 0;

    friend bool operator==(const ComponentCounts&, const ComponentCounts&) = default;
};

/// The types of the given channels by text, each once with its components under it; a single component has no row but
/// its type's. Asks for texts that the text provider has; a channel that it does not know is "Unknown".
std::vector<VComponentType> ComposeComponentRows(std::span<const TQL::IChannelInstanceId> i_Channels,
                                                 const TQL::IChannelTextProvider& i_rTexts,
                                                 const TQL::IChannelComponentControls& i_rControls,
                                                 ComponentCounts& o_rCounts);

} // namespace GraphPlotUI

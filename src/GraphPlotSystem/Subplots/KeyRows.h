#pragma once

#include "TQL/ITraceId.h"

#include <cstddef>
#include <cstdint>
#include <memory>
#include <span>
#include <vector>

namespace TQL
{
class IChannel;
class IChannelComponentControls;
class IChannelTextProvider;
} // namespace TQL

namespace GraphPlotUI
{

/// One trace for each component of each channel, in the order of the channels. A channel without data has one
/// component; no channel has more than 256.
std::vector<TQL::ITraceId> ListKeyTraces(std::span<const std::shared_ptr<TQL::IChannel>> i_Channels);

/// Two lists that differ have, but for chance, another hash.
std::uint64_t HashKeyTraces(std::span<const TQL::ITraceId> i_Traces);

/// What of a channel subtype is switched on, as seen from one of its components.
struct KeyComponents
{
    int EnabledCount = 0;
    std::vector<std::uint64_t> Disabled; ///< ascending
    bool bFirstEnabled = false;          ///< the component is on and none before it is
    bool bLastEnabled = false;           ///< no component after it is on
};

/// i_ComponentCount: of the subtype; 0, which stands for an unknown one, counts as 1. i_Disabled: in any order, also
/// of components that the subtype does not have.
KeyComponents DescribeKeyComponents(std::uint64_t i_Component, std::uint64_t i_ComponentCount,
                                    std::vector<std::uint64_t> i_Disabled);

/// A run of rows.
struct RowRun
{
    std::size_t First = 0;
    std::size_t Last = 0; ///< of the run itself

    friend bool operator==(const RowRun&, const RowRun&) = default;
};

/// The runs of rows, as far as both lists reach, that are not the same in both.
std::vector<RowRun> FindChangedRows(std::span<const TQL::ITraceId> i_Old, std::span<const TQL::ITraceId> i_New);

} // namespace GraphPlotUI

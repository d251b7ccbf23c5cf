#pragma once

#include "GraphPlotSystem/Channels/VActiveChannelRows.h"
#include "TQL/IResult.h"

#include <memory>
#include <set>
#include <string>
#include <unordered_map>

namespace OrvanePluginInterface
{
class IChannelMigrationService;
}

namespace GraphPlotUI
{

/// What a change of the data context does to the plotted channels, found before any row is touched.
struct VContextSwitchPlan
{
    /// The channels that go, each with what takes its place; null for nothing. The others stay.
    std::unordered_map<const TQL::IChannel*, std::shared_ptr<TQL::IChannel>> Changes;
    bool bMigrated = false;         ///< some channel found what takes its place
    TQL::IResult FirstFailure = {}; ///< of the migrations; Ok when none failed

    /// Of the switch as a whole.
    TQL::IResult GetResult() const;
};

/// What stands for a channel now that has lost its data because its context was read again: the same thing there, or
/// the same derivation of it. The channel itself while it has data, while nothing stands for it, or without a migration
/// service. UI thread.
std::shared_ptr<TQL::IChannel> FindChannelAnew(const std::shared_ptr<TQL::IChannel>& i_rpChannel,
                                               OrvanePluginInterface::IChannelMigrationService* i_pMigrationService);

/// Asks the migration service, which may be null, for every row that has to follow and for what stands now for a row
/// that stays without data, and logs what becomes of the rows. UI thread.
VContextSwitchPlan PlanContextSwitch(const VActiveChannelRows::RowList& i_rRows, const std::string& i_rNewContext,
                                     const std::set<std::string>& i_rPresentContexts,
                                     OrvanePluginInterface::IChannelMigrationService* i_pMigrationService);

} // namespace GraphPlotUI

#include "GraphPlotSystem/Channels/VContextSwitchPlan.h"

#include "GraphPlotSystem/Channels/ContextSwitchRules.h"
#include "OrvanePluginInterface/IChannelMigrationService.h"
#include "TQL/Log.h"

#include <algorithm>
#include <vector>

namespace GraphPlotUI
{
namespace
{

using ChannelList = std::vector<std::shared_ptr<TQL::IChannel>>;

template <typename... Args>
void LogDetail(const TQL::LogText& i_rFormat, const Args&... i_rArgs)
{
    static const TQL::VLogCategory& rCategory = TQL::Log::GetCategory("GraphPlot");
    TQL::Log::Format(rCategory, TQL::ELogSeverity::Detail, i_rFormat, i_rArgs...);
}

/// What takes the place of a channel; null when there is nothing.
TQL::IResult FindSuccessor(const std::shared_ptr<TQL::IChannel>& i_rpChannel, const std::string& i_rNewContext,
                           OrvanePluginInterface::IChannelMigrationService* i_pMigrationService,
                           std::shared_ptr<TQL::IChannel>& o_rpSuccessor)
{
    if (!i_pMigrationService)
        return TQL::Result::NotAvailable;
    ChannelList migrated;
    ChannelList fallbacks;
    const TQL::IResult result = i_pMigrationService->Migrate(i_rpChannel, i_rNewContext, migrated, fallbacks);
    if (result.IsError())
        return result;
    for (const ChannelList* pList : {&migrated, &fallbacks})
        if (!o_rpSuccessor && !pList->empty())
            o_rpSuccessor = pList->front();
    return TQL::Result::Ok;
}

void PlanMigration(const VActiveChannelData& i_rRow, const std::string& i_rContext, const std::string& i_rNewContext,
                   OrvanePluginInterface::IChannelMigrationService* i_pMigrationService, VContextSwitchPlan& io_rPlan)
{
    std::shared_ptr<TQL::IChannel> pSuccessor;
    const TQL::IResult result = FindSuccessor(i_rRow.pChannel, i_rNewContext, i_pMigrationService, pSuccessor);
    if (result.IsError())
    {
        LogDetail("Failed to migrate channel %1% to context '%2%': %3%", i_rRow.Name.toStdString(), i_rNewContext,
                  result.Description());
        if (io_rPlan.FirstFailure.IsSuccess())
            io_rPlan.FirstFailure = result;
        return;
    }
    if (!pSuccessor)
        return; // the row goes on with the channel that it has
    LogDetail("Migrated channel %1% from context '%2%' to context '%3%'", i_rRow.Name.toStdString(), i_rContext,
              i_rNewContext);
    io_rPlan.bMigrated = true;
    io_rPlan.Changes.emplace(i_rRow.pChannel.get(), std::move(pSuccessor));
}

void PlanRenewal(const VActiveChannelData& i_rRow, const std::string& i_rContext,
                 OrvanePluginInterface::IChannelMigrationService* i_pMigrationService, VContextSwitchPlan& io_rPlan)
{
    std::shared_ptr<TQL::IChannel> pAnew = FindChannelAnew(i_rRow.pChannel, i_pMigrationService);
    if (pAnew == i_rRow.pChannel)
        return;
    LogDetail("Found channel %1% again in context '%2%'", i_rRow.Name.toStdString(), i_rContext);
    io_rPlan.Changes.emplace(i_rRow.pChannel.get(), std::move(pAnew));
}

} // namespace

std::shared_ptr<TQL::IChannel> FindChannelAnew(const std::shared_ptr<TQL::IChannel>& i_rpChannel,
                                               OrvanePluginInterface::IChannelMigrationService* i_pMigrationService)
{
    if (!i_pMigrationService || !i_rpChannel || i_rpChannel->GetOutput())
        return i_rpChannel;
    ChannelList same;
    ChannelList alike; // no substitute: the operator pinned this very thing
    const TQL::IResult result = i_pMigrationService->Migrate(i_rpChannel, FindDataContext(i_rpChannel), same, alike);
    const bool bFound = result.IsSuccess() && !same.empty() && same.front() && same.front()->GetOutput();
    return bFound ? same.front() : i_rpChannel;
}

TQL::IResult VContextSwitchPlan::GetResult() const
{
    return FirstFailure.IsError() && bMigrated ? TQL::Result::OkButPartial : FirstFailure;
}

VContextSwitchPlan PlanContextSwitch(const VActiveChannelRows::RowList& i_rRows, const std::string& i_rNewContext,
                                     const std::set<std::string>& i_rPresentContexts,
                                     OrvanePluginInterface::IChannelMigrationService* i_pMigrationService)
{
    VContextSwitchPlan plan;
    for (const VActiveChannelRows::RowPointer& rpRow : i_rRows)
    {
        const std::string context = FindDataContext(rpRow->pChannel);
        switch (DecideContextSwitch(context, i_rNewContext, i_rPresentContexts))
        {
        case EContextSwitchFate::Stay:
            PlanRenewal(*rpRow, context, i_pMigrationService, plan);
            break;
        case EContextSwitchFate::Migrate:
            PlanMigration(*rpRow, context, i_rNewContext, i_pMigrationService, plan);
            break;
        case EContextSwitchFate::Leave:
            LogDetail("Removing channel %1% from context '%2%' when switching to context '%3%'",
                      rpRow->Name.toStdString(), context, i_rNewContext);
            plan.Changes.emplace(rpRow->pChannel.get(), nullptr);
            break;
        }
    }
    return plan;
}

} // namespace GraphPlotUI

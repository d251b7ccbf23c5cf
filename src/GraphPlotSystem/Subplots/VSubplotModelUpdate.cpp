// How the list of subplots becomes another one, by an update and by a state that is restored.
#include "GraphPlotSystem/Subplots/SubplotRules.h"
#include "GraphPlotSystem/Subplots/VSubplotData.h"
#include "GraphPlotSystem/Subplots/VSubplotModel.h"
#include "GraphPlotSystem/Subplots/VTraceModel.h"

#include <algorithm>
#include <iterator>
#include <utility>

namespace GraphPlotUI
{

using namespace TQL::SubplotModelRoles;

void VSubplotModel::Update(const SubplotMap& i_rSubplots, const std::vector<std::uint64_t>& i_rOrder)
{
    std::vector<std::uint64_t> order;
    std::ranges::copy_if(i_rOrder, std::back_inserter(order),
                         [&](std::uint64_t i_Id) { return i_rSubplots.contains(i_Id); });
    bool bCountChanged = RemoveMovedRows(order);
    for (int row = 0; row < static_cast<int>(order.size()); ++row)
    {
        const SubplotPointer& rpSubplot = i_rSubplots.at(order[static_cast<std::size_t>(row)]);
        if (row < rowCount() && At(row).Id == rpSubplot->Id)
        {
            UpdateRow(row, *rpSubplot);
            continue;
        }
        InsertRow(row, rpSubplot);
        bCountChanged = true;
    }
    AssignUnnamedRanges();
    if (bCountChanged)
        Q_EMIT SubplotCountChanged();
}

/// Removes the rows that are not listed and those that the walk could only reach by passing others; the walk inserts
/// these again where they belong. True when there were any.
bool VSubplotModel::RemoveMovedRows(const std::vector<std::uint64_t>& i_rOrder)
{
    std::vector<std::uint64_t> ids(m_Rows.size());
    std::ranges::transform(m_Rows, ids.begin(), [](const SubplotPointer& i_rpRow) { return i_rpRow->Id; });
    const std::vector<bool> steady = FindSteadyRows(ids, i_rOrder);
    for (int end = rowCount(); end > 0;)
    {
        const int last = end - 1;
        if (steady[static_cast<std::size_t>(last)])
        {
            end = last;
            continue;
        }
        int first = last;
        while (first > 0 && !steady[static_cast<std::size_t>(first - 1)])
            --first;
        removeRows(first, end - first);
        end = first;
    }
    return m_Rows.size() != ids.size();
}

void VSubplotModel::UpdateRow(int i_Row, const VSubplotData& i_rSubplot)
{
    VSubplotData& rRow = At(i_Row);
    QList<int> roles;
    const auto take = [&roles](auto& io_rStored, const auto& i_rNew, int i_Role)
    {
        if (io_rStored == i_rNew)
            return false;
        io_rStored = i_rNew;
        roles.append(i_Role);
        return true;
    };
    take(rRow.YAxisLabel, i_rSubplot.YAxisLabel, SubplotYAxisLabel);
    take(rRow.YAxisUnits, i_rSubplot.YAxisUnits, SubplotYAxisUnits);
    take(rRow.YAxisToolTip, i_rSubplot.YAxisToolTip, SubplotYAxisToolTip);
    const bool bTracesChanged = take(rRow.Traces, i_rSubplot.Traces, SubplotTraces);
    take(rRow.pChannelModel, i_rSubplot.pChannelModel, SubplotChannelModel);
    const std::shared_ptr<VTraceModel> pOldTraceModel = rRow.pTraceModel;
    if (take(rRow.pTraceModel, i_rSubplot.pTraceModel, SubplotTraceModel) && pOldTraceModel && rRow.pTraceModel &&
        pOldTraceModel->IsInspectionEnabled())
    {
        pOldTraceModel->setInspectionEnabled(false);
        rRow.pTraceModel->setInspectionEnabled(true);
    }
    if (!roles.isEmpty())
        Q_EMIT dataChanged(index(i_Row), index(i_Row), roles);
    if (bTracesChanged && IsRefreshing())
        FitRow(i_Row);
}

VSubplotModel::Ranges VSubplotModel::RangesOf(const SubplotConfiguration& i_rConfiguration)
{
    return {{i_rConfiguration.YAxisMinimum, i_rConfiguration.YAxisMaximum},
            {i_rConfiguration.YAxisCacheMinimum, i_rConfiguration.YAxisCacheMaximum}};
}

SubplotConfiguration VSubplotModel::ConfigurationOf(const Ranges& i_rRanges)
{
    return {i_rRanges.Manual.Minimum, i_rRanges.Manual.Maximum, i_rRanges.Fit.Minimum, i_rRanges.Fit.Maximum};
}

void VSubplotModel::SaveState(SubplotState& o_rState) const
{
    o_rState.Configurations.clear();
    o_rState.SubplotIds.clear();
    std::map<std::uint64_t, Ranges> others = m_Ranges;
    const auto add = [&](std::uint64_t i_Id, const Ranges& i_rRanges)
    {
        o_rState.Configurations.push_back(ConfigurationOf(i_rRanges));
        o_rState.SubplotIds.push_back(i_Id);
    };
    for (const SubplotPointer& rpRow : m_Rows)
    {
        add(rpRow->Id, FindRanges(rpRow->Id));
        others.erase(rpRow->Id);
    }
    for (const auto& [id, rRanges] : others)
        add(id, rRanges);
    o_rState.bLockYAxes = m_bLockYAxes;
    o_rState.bFitYAxes = m_bFitYAxes;
}

void VSubplotModel::LoadState(const SubplotState& i_rState)
{
    beginResetModel();
    m_Ranges.clear();
    for (std::size_t i = 0; i < std::min(i_rState.SubplotIds.size(), i_rState.Configurations.size()); ++i)
        m_Ranges[i_rState.SubplotIds[i]] = RangesOf(i_rState.Configurations[i]);
    m_UnnamedRanges.clear();
    if (i_rState.SubplotIds.empty())
        m_UnnamedRanges = i_rState.Configurations;
    AssignUnnamedRanges();
    endResetModel();
    Q_EMIT SubplotCountChanged();
    SetLockYAxes(i_rState.bLockYAxes);
    SetFitYAxes(i_rState.bFitYAxes);
    Refresh(); // what was fitted then need not fit the data now
}

void VSubplotModel::AssignUnnamedRanges()
{
    if (m_Rows.empty() || m_UnnamedRanges.empty())
        return;
    for (std::size_t row = 0; row < std::min(m_Rows.size(), m_UnnamedRanges.size()); ++row)
        m_Ranges[m_Rows[row]->Id] = RangesOf(m_UnnamedRanges[row]);
    m_UnnamedRanges.clear();
}

} // namespace GraphPlotUI

#include "GraphPlotSystem/Subplots/VSubplotModel.h"

#include "GraphPlotSystem/Channels/VActiveChannelModelFiltered.h"
#include "GraphPlotSystem/Common/ModelRoleNames.h"
#include "GraphPlotSystem/Subplots/SubplotRules.h"
#include "GraphPlotSystem/Subplots/VSubplotData.h"
#include "GraphPlotSystem/Subplots/VTraceModel.h"
#include "GraphPlotSystem/Traces/ITraceDataStorage.h"

#include <QtCore/QPointF>

#include <algorithm>
#include <iterator>
#include <optional>
#include <utility>

namespace GraphPlotUI
{

using namespace TQL::SubplotModelRoles;

namespace
{

/// Views write a point, native code may write a ValueRange.
std::optional<QPointF> RangeOf(const QVariant& i_rValue)
{
    if (i_rValue.metaType() == QMetaType::fromType<ValueRange>())
    {
        const auto range = i_rValue.value<ValueRange>();
        return QPointF(range.Minimum, range.Maximum);
    }
    return i_rValue.canConvert<QPointF>() ? std::optional(i_rValue.value<QPointF>()) : std::nullopt;
}

} // namespace

VSubplotModel::VSubplotModel(std::shared_ptr<TQL::ITraceDataStorage> i_pStorage, QObject* i_pParent)
    : QAbstractListModel(i_pParent), m_pStorage(std::move(i_pStorage))
{
}

VSubplotModel::~VSubplotModel() = default;

int VSubplotModel::rowCount(const QModelIndex& i_rParent) const
{
    return i_rParent.isValid() ? 0 : static_cast<int>(m_Rows.size());
}

QHash<int, QByteArray> VSubplotModel::roleNames() const
{
    return ModelRoleNames(QMetaEnum::fromType<ESubplotModelRoles>());
}

QVariant VSubplotModel::data(const QModelIndex& i_rIndex, int i_Role) const
{
    if (!checkIndex(i_rIndex, CheckIndexOption::IndexIsValid | CheckIndexOption::ParentIsInvalid))
        return {};
    const VSubplotData& rSubplot = At(i_rIndex.row());
    switch (i_Role)
    {
    case SubplotYAxisLabel:
        return rSubplot.YAxisLabel;
    case SubplotYAxisUnits:
        return rSubplot.YAxisUnits;
    case SubplotYAxisToolTip:
        return rSubplot.YAxisToolTip;
    case SubplotYAxisRange:
    {
        const Ranges ranges = FindRanges(rSubplot.Id);
        const ValueRange& rRange = m_bFitYAxes ? ranges.Fit : ranges.Manual;
        return QPointF(rRange.Minimum, rRange.Maximum);
    }
    case SubplotChannelModel:
        return QVariant::fromValue<QObject*>(rSubplot.pChannelModel.get());
    case SubplotTraces:
    {
        QVariantList traces;
        traces.reserve(static_cast<qsizetype>(rSubplot.Traces.size()));
        for (const TQL::ITraceId& rTrace : rSubplot.Traces)
            traces.append(QVariant::fromValue(rTrace));
        return traces;
    }
    case SubplotTraceModel:
        return QVariant::fromValue<QObject*>(rSubplot.pTraceModel.get());
    case SubplotOverlays:
        return QVariant::fromValue(rSubplot.Overlays);
    default:
        return {};
    }
}

bool VSubplotModel::setData(const QModelIndex& i_rIndex, const QVariant& i_rValue, int i_Role)
{
    const std::optional<QPointF> value = RangeOf(i_rValue);
    if (!checkIndex(i_rIndex, CheckIndexOption::IndexIsValid | CheckIndexOption::ParentIsInvalid) ||
        i_Role != SubplotYAxisRange || !value)
        return false;
    Ranges& rRanges = m_Ranges[At(i_rIndex.row()).Id];
    ValueRange& rRange = m_bFitYAxes ? rRanges.Fit : rRanges.Manual;
    bool bChanged = false;
    const auto store = [&](double& io_rStored, double i_New)
    {
        if (!(i_New < io_rStored || i_New > io_rStored)) // a NaN is no change
            return;
        io_rStored = i_New;
        bChanged = true;
    };
    store(rRange.Minimum, value->x());
    store(rRange.Maximum, value->y());
    if (bChanged)
        Q_EMIT dataChanged(i_rIndex, i_rIndex, {SubplotYAxisRange});
    return true;
}

bool VSubplotModel::insertRows(int i_Row, int i_Count, const QModelIndex& i_rParent)
{
    if (i_rParent.isValid() || i_Row < 0 || i_Row > rowCount() || i_Count <= 0)
        return false;
    std::vector<SubplotPointer> rows(static_cast<std::size_t>(i_Count));
    std::ranges::generate(rows, [] { return std::make_shared<VSubplotData>(); });
    beginInsertRows({}, i_Row, i_Row + i_Count - 1);
    m_Rows.insert(m_Rows.begin() + i_Row, rows.begin(), rows.end());
    endInsertRows();
    return true;
}

bool VSubplotModel::removeRows(int i_Row, int i_Count, const QModelIndex& i_rParent)
{
    if (i_rParent.isValid() || i_Row < 0 || i_Row >= rowCount() || i_Count <= 0)
        return false;
    const int count = std::min(i_Count, rowCount() - i_Row);
    beginRemoveRows({}, i_Row, i_Row + count - 1);
    m_Rows.erase(m_Rows.begin() + i_Row, m_Rows.begin() + i_Row + count);
    endRemoveRows();
    return true;
}

void VSubplotModel::InsertRow(int i_Row, SubplotPointer i_pSubplot)
{
    beginInsertRows({}, i_Row, i_Row);
    m_Rows.insert(m_Rows.begin() + i_Row, std::move(i_pSubplot));
    endInsertRows();
}

VSubplotModel::SubplotMap VSubplotModel::GetSubplots() const
{
    SubplotMap subplots;
    for (const SubplotPointer& rpRow : m_Rows)
        subplots.emplace(rpRow->Id, rpRow);
    return subplots;
}

VSubplotModel::Ranges VSubplotModel::FindRanges(std::uint64_t i_Id) const
{
    const auto found = m_Ranges.find(i_Id);
    return found == m_Ranges.end() ? Ranges{} : found->second;
}

void VSubplotModel::SetLockYAxes(bool i_bLock)
{
    if (std::exchange(m_bLockYAxes, i_bLock) == i_bLock)
        return;
    Q_EMIT LockYAxesChanged();
    Refresh();
    if (m_bFitYAxes)
        EmitRangesChanged();
}

void VSubplotModel::SetFitYAxes(bool i_bFit)
{
    if (std::exchange(m_bFitYAxes, i_bFit) == i_bFit)
        return;
    Q_EMIT FitYAxesChanged();
    Refresh();
    EmitRangesChanged();
}

void VSubplotModel::EmitRangesChanged()
{
    if (!m_Rows.empty())
        Q_EMIT dataChanged(index(0), index(rowCount() - 1), {SubplotYAxisRange});
}

bool VSubplotModel::resetYAxisRange(int i_Row)
{
    if (i_Row < 0 || i_Row >= rowCount())
        return false;
    FitRow(i_Row);
    return true;
}

void VSubplotModel::resetAllYAxisRanges()
{
    for (int row = 0; row < rowCount(); ++row)
        FitRow(row);
}

void VSubplotModel::Refresh()
{
    if (IsRefreshing())
        resetAllYAxisRanges();
}

void VSubplotModel::FitRow(int i_Row)
{
    ValueRange range;
    m_pStorage->GetValueRange(range, At(i_Row).Traces);
    setData(index(i_Row), QPointF(range.Minimum, range.Maximum), SubplotYAxisRange);
}

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

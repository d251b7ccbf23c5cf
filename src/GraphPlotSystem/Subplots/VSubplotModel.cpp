#include "GraphPlotSystem/Subplots/VSubplotModel.h"

#include "GraphPlotSystem/Channels/VActiveChannelModelFiltered.h"
#include "GraphPlotSystem/Common/ModelRoleNames.h"
#include "GraphPlotSystem/Subplots/SubplotRules.h"
#include "GraphPlotSystem/Subplots/VSubplotData.h"
#include "GraphPlotSystem/Subplots/VTraceModel.h"
#include "GraphPlotSystem/Traces/ITraceDataStorage.h"

#include <QtCore/QPointF>

#include <algorithm>
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

} // namespace GraphPlotUI

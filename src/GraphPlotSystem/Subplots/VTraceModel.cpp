#include "GraphPlotSystem/Subplots/VTraceModel.h"

#include "GraphPlotSystem/Common/ModelRoleNames.h"
#include "GraphPlotSystem/Common/WeakObjectCallback.h"
#include "GraphPlotSystem/Texts/IChannelTextProvider.h"
#include "GraphPlotSystem/Traces/ITraceDataStorage.h"
#include "NotificationSystem/VDispatchCollapsers.h"

#include <QtCore/QTimer>
#include <QtGui/QColor>

#include <algorithm>
#include <chrono>

namespace GraphPlotUI
{

using namespace TQL::TraceModelRoles;

namespace
{

constexpr double s_RefreshPeriodSeconds = 0.25;
constexpr int s_RefreshDelayMilliseconds = 300;

double SteadySeconds()
{
    return std::chrono::duration<double>(std::chrono::steady_clock::now().time_since_epoch()).count();
}

} // namespace

VTraceModel::VTraceModel(std::shared_ptr<TQL::IPostalService> i_pUiPostalService,
                         std::shared_ptr<TQL::ITraceDataStorage> i_pProvider,
                         std::shared_ptr<TQL::IChannelTextProvider> i_pTextProvider, QObject* i_pParent, Clock i_Clock)
    : QAbstractListModel(i_pParent)
    , m_pUiPostalService(std::move(i_pUiPostalService))
    , m_pProvider(std::move(i_pProvider))
    , m_pTextProvider(std::move(i_pTextProvider))
    , m_Clock(i_Clock ? std::move(i_Clock) : Clock(SteadySeconds))
    , m_pRefreshTimer(new QTimer(this))
{
    m_pRefreshTimer->setSingleShot(true);
    connect(m_pRefreshTimer, &QTimer::timeout, this, &VTraceModel::Refresh);
    m_Subscriptions.Subscribe<void()>(m_pProvider->ColoursChanged(),
                                      MakeWeakObjectCallback(this, &VTraceModel::OnColoursChanged),
                                      NotificationSystem::MakeCollapserDontPost(m_pUiPostalService));
}

VTraceModel::~VTraceModel()
{
    if (!IsInspectionEnabled())
        return;
    TQL::IResult result; // nobody is left to inspect for
    m_pProvider->RemoveInspectedTraces(result, m_TraceIds);
    EndInspectionSubscription();
}

void VTraceModel::SetTraces(const TraceList& i_rTraces)
{
    beginResetModel();
    m_TraceIds.resize(i_rTraces.size());
    m_DisplayNames.resize(i_rTraces.size());
    m_Values.resize(i_rTraces.size());
    for (std::size_t i = 0; i < i_rTraces.size(); ++i)
    {
        m_TraceIds[i] = i_rTraces[i].first;
        m_DisplayNames[i] = i_rTraces[i].second;
        m_Values[i].bValid = false;
    }
    endResetModel();
    if (!IsInspectionEnabled())
        return;
    TQL::IResult result; // the set of inspected traces takes any traces
    m_pProvider->SetInspectedTraces(result, m_TraceIds);
}

int VTraceModel::rowCount(const QModelIndex& i_rParent) const
{
    return i_rParent.isValid() ? 0 : static_cast<int>(m_TraceIds.size());
}

QHash<int, QByteArray> VTraceModel::roleNames() const
{
    return ModelRoleNames(QMetaEnum::fromType<ETraceModelRoles>());
}

QVariant VTraceModel::data(const QModelIndex& i_rIndex, int i_Role) const
{
    if (!checkIndex(i_rIndex, CheckIndexOption::IndexIsValid | CheckIndexOption::ParentIsInvalid))
        return {};
    const auto row = static_cast<std::size_t>(i_rIndex.row());
    const TQL::ITraceId& rTrace = m_TraceIds[row];
    const TraceInspectionValues& rValues = m_Values[row];
    const auto ifValid = [&](float i_Value)
    {
        return rValues.bValid ? QVariant(i_Value) : QVariant();
    };
    switch (i_Role)
    {
    case TraceId:
        return QVariant::fromValue(rTrace);
    case TraceDisplayName:
        return m_DisplayNames[row];
    case TraceColour:
    {
        Colour4f colour{};
        m_pProvider->GetTraceColour(colour, rTrace);
        return QColor::fromRgbF(colour[0], colour[1], colour[2], colour[3]);
    }
    case TraceValue:
        return ifValid(rValues.Value);
    case TraceMean:
        return ifValid(rValues.Mean);
    case TraceStandardDeviation:
        return ifValid(rValues.StandardDeviation);
    case TraceUnits:
        return m_pTextProvider->GetComponentUnits(m_pTextProvider->GetSubTypeId(rTrace.Channel()), rTrace.Component(),
                                                  true);
    default:
        return {};
    }
}

bool VTraceModel::insertRows(int i_Row, int i_Count, const QModelIndex& i_rParent)
{
    if (i_rParent.isValid() || i_Row < 0 || i_Row > rowCount() || i_Count <= 0)
        return false;
    const auto count = static_cast<std::size_t>(i_Count);
    beginInsertRows({}, i_Row, i_Row + i_Count - 1);
    m_TraceIds.insert(m_TraceIds.begin() + i_Row, count, {});
    m_DisplayNames.insert(m_DisplayNames.begin() + i_Row, count, {});
    m_Values.insert(m_Values.begin() + i_Row, count, {});
    endInsertRows();
    return true;
}

bool VTraceModel::removeRows(int i_Row, int i_Count, const QModelIndex& i_rParent)
{
    if (i_rParent.isValid() || i_Row < 0 || i_Row >= rowCount() || i_Count <= 0)
        return false;
    const int count = std::min(i_Count, rowCount() - i_Row);
    const auto erase = [&](auto& io_rRows)
    {
        io_rRows.erase(io_rRows.begin() + i_Row, io_rRows.begin() + i_Row + count);
    };
    beginRemoveRows({}, i_Row, i_Row + count - 1);
    erase(m_TraceIds);
    erase(m_DisplayNames);
    erase(m_Values);
    endRemoveRows();
    return true;
}

void VTraceModel::OnColoursChanged()
{
    for (int row = 0; row < rowCount(); ++row)
        Q_EMIT dataChanged(index(row), index(row), {TraceColour});
}

void VTraceModel::setInspectionEnabled(bool i_bEnabled)
{
    TQL::IResult result; // the set of inspected traces takes any traces
    if (!i_bEnabled)
    {
        m_pProvider->RemoveInspectedTraces(result, m_TraceIds);
        EndInspectionSubscription();
        Refresh();
        return;
    }
    m_pProvider->SetInspectedTraces(result, m_TraceIds);
    if (!IsInspectionEnabled())
        m_InspectionHandle =
            m_pProvider->InspectionChanged()->Add(MakeWeakObjectCallback(this, &VTraceModel::Refresh),
                                                  NotificationSystem::MakeCollapserDontPost(m_pUiPostalService));
}

void VTraceModel::EndInspectionSubscription()
{
    if (IsInspectionEnabled())
        m_pProvider->InspectionChanged()->Remove(std::exchange(m_InspectionHandle, 0));
}

void VTraceModel::setInspectionTime(double i_ContextFrameNumber)
{
    m_pProvider->SetInspectionTime(i_ContextFrameNumber);
}

void VTraceModel::Refresh()
{
    const double now = m_Clock();
    if (now - m_LastRefresh < s_RefreshPeriodSeconds)
    {
        m_pRefreshTimer->start(s_RefreshDelayMilliseconds);
        return;
    }
    m_pRefreshTimer->stop();
    m_LastRefresh = now;
    TQL::IResult result;
    m_pProvider->GetInspectionValues(result, m_TraceIds, m_Values, m_InspectionProgress);
    if (result.IsError())
        return;
    if (!m_TraceIds.empty())
        Q_EMIT dataChanged(index(0), index(rowCount() - 1), {TraceValue, TraceMean, TraceStandardDeviation});
    Q_EMIT InspectionProgressChanged();
}

} // namespace GraphPlotUI

#include "GraphPlotSystem/VPlainSubplotModel.h"

#include "GraphPlotSystem/IChannelTextProvider.h"
#include "GraphPlotSystem/ITraceDataStorage.h"
#include "GraphPlotSystem/TracePalette.h"
#include "GraphPlotSystem/WeakObjectCallback.h"
#include "NotificationSystem/VDispatchCollapsers.h"

#include <QtGui/QColor>

#include <algorithm>
#include <map>
#include <tuple>

namespace GraphPlotUI
{

VPlainSubplotModel::VPlainSubplotModel(std::shared_ptr<TQL::IPostalService> i_pUiPostalService,
                                       std::shared_ptr<TQL::ITraceDataStorage> i_pStorage,
                                       std::shared_ptr<TQL::IChannelTextProvider> i_pTextProvider,
                                       std::shared_ptr<IGraphPlotPreferences> i_pPreferences, QObject* i_pParent)
    : QAbstractListModel(i_pParent)
    , m_pStorage(std::move(i_pStorage))
    , m_pTextProvider(std::move(i_pTextProvider))
    , m_pPreferences(std::move(i_pPreferences))
{
    m_pStorage->SetPalette(GetTracePalette(m_ColourSet));
    const auto subscribe =
        [&](const std::shared_ptr<TQL::IChangeSignal>& i_rpSignal, void (VPlainSubplotModel::*i_pMember)())
    {
        const auto pCollapser = NotificationSystem::MakeCollapserDontPost(i_pUiPostalService);
        m_Subscriptions.Subscribe<void()>(
            i_rpSignal,
            MakeWeakObjectCallback(this, [i_pMember](VPlainSubplotModel& i_rSelf) { (i_rSelf.*i_pMember)(); }),
            pCollapser);
    };
    subscribe(m_pStorage->DataChanged(), &VPlainSubplotModel::RefreshTraces);
    subscribe(m_pTextProvider->TextChanged(), &VPlainSubplotModel::RefreshTraces);
    subscribe(m_pStorage->ValueRangeChanged(), &VPlainSubplotModel::RefreshRanges);
    SubscribeColourSet(std::move(i_pUiPostalService));
    OnColourSetPreference();
}

VPlainSubplotModel::~VPlainSubplotModel()
{
    if (m_ColourSetToken != 0)
        (void)m_pPreferences->RemoveCallback(IGraphPlotPreferences::TraceColourSet, m_ColourSetToken);
}

void VPlainSubplotModel::SubscribeColourSet(std::shared_ptr<TQL::IPostalService> i_pUiPostalService)
{
    const TQL::IResult result = m_pPreferences->AddCallback(
        m_ColourSetToken, IGraphPlotPreferences::TraceColourSet,
        MakeWeakObjectCallback(this, [](VPlainSubplotModel& i_rSelf) { i_rSelf.OnColourSetPreference(); }),
        std::move(i_pUiPostalService));
    if (result.IsError())
        m_ColourSetToken = 0; // without notices the set at the start holds
}

void VPlainSubplotModel::OnColourSetPreference()
{
    IGraphPlotPreferences::Value value;
    const TQL::IResult result = m_pPreferences->GetValue(IGraphPlotPreferences::TraceColourSet, value);
    const auto* const pSet = std::get_if<std::int32_t>(&value);
    if (result.IsError() || !pSet || *pSet == m_ColourSet)
        return;
    m_ColourSet = *pSet;
    m_pStorage->SetPalette(GetTracePalette(m_ColourSet));
    RefreshTraces();
}

int VPlainSubplotModel::rowCount(const QModelIndex& i_rParent) const
{
    return i_rParent.isValid() ? 0 : static_cast<int>(m_Subplots.size());
}

QHash<int, QByteArray> VPlainSubplotModel::roleNames() const
{
    return {{TraceIdsRole, "subplotTraceIds"},
            {LabelRole, "subplotLabel"},
            {UnitsRole, "subplotUnits"},
            {YAxisRangeRole, "subplotYAxisRange"},
            {LegendRole, "subplotLegend"}};
}

QVariant VPlainSubplotModel::data(const QModelIndex& i_rIndex, int i_Role) const
{
    if (!checkIndex(i_rIndex, CheckIndexOption::IndexIsValid | CheckIndexOption::ParentIsInvalid))
        return {};
    const Subplot& rSubplot = m_Subplots[static_cast<std::size_t>(i_rIndex.row())];
    switch (i_Role)
    {
    case TraceIdsRole:
    {
        QVariantList ids;
        for (const TQL::ITraceId& rTrace : rSubplot.Traces)
            ids.append(QVariant::fromValue(rTrace));
        return ids;
    }
    case LabelRole:
    {
        const QString component = m_pTextProvider->GetComponentName(rSubplot.SubType, rSubplot.Component);
        const QString type = m_pTextProvider->GetSubTypeDisplayName(rSubplot.SubType);
        return component.isEmpty() ? type : type + QLatin1Char(' ') + component;
    }
    case UnitsRole:
        return m_pTextProvider->GetComponentUnits(rSubplot.SubType, rSubplot.Component);
    case YAxisRangeRole:
        return rSubplot.Range;
    case LegendRole:
        return LegendOf(rSubplot);
    default:
        return {};
    }
}

QVariantList VPlainSubplotModel::LegendOf(const Subplot& i_rSubplot) const
{
    QVariantList legend;
    for (const TQL::ITraceId& rTrace : i_rSubplot.Traces)
    {
        Colour4f colour{};
        m_pStorage->GetTraceColour(colour, rTrace);
        legend.append(QVariantMap{{QStringLiteral("name"), m_pTextProvider->GetChannelDisplayName(rTrace.Channel())},
                                  {QStringLiteral("colour"), QColor::fromRgbF(colour[0], colour[1], colour[2])}});
    }
    return legend;
}

QPointF VPlainSubplotModel::RangeOf(const Subplot& i_rSubplot) const
{
    ValueRange range;
    m_pStorage->GetValueRange(range, i_rSubplot.Traces);
    return {range.Minimum, range.Maximum};
}

VPlainSubplotModel::SubplotList VPlainSubplotModel::GroupTraces() const
{
    std::vector<TQL::ITraceId> traces;
    m_pStorage->GetTraces(traces);
    std::map<std::tuple<QString, std::uint64_t, std::uint8_t>, Subplot> groups;
    for (const TQL::ITraceId& rTrace : traces)
    {
        const std::uint64_t subType = m_pTextProvider->GetSubTypeId(rTrace.Channel());
        Subplot& rSubplot = groups[{m_pTextProvider->GetSubTypeDisplayName(subType), subType, rTrace.Component()}];
        rSubplot.SubType = subType;
        rSubplot.Component = rTrace.Component();
        rSubplot.Traces.push_back(rTrace);
    }
    SubplotList subplots;
    for (auto& [rKey, rSubplot] : groups)
        subplots.push_back(std::move(rSubplot));
    return subplots;
}

void VPlainSubplotModel::RefreshTraces()
{
    SubplotList subplots = GroupTraces();
    for (Subplot& rSubplot : subplots)
    {
        for (const TQL::ITraceId& rTrace : rSubplot.Traces)
        {
            TQL::IResult result; // a channel beyond the palette is drawn grey, which is no fault
            m_pStorage->AssignChannelColour(
                result, TQL::ITraceId(rTrace.Channel(), 0),
                static_cast<std::uint32_t>(m_pTextProvider->GetComponentCount(rSubplot.SubType)));
        }
        rSubplot.Range = RangeOf(rSubplot);
    }
    const auto sameRow = [](const Subplot& i_rA, const Subplot& i_rB)
    {
        return i_rA.SubType == i_rB.SubType && i_rA.Component == i_rB.Component;
    };
    if (std::ranges::equal(subplots, m_Subplots, sameRow))
    {
        m_Subplots = std::move(subplots);
        if (!m_Subplots.empty())
            Q_EMIT dataChanged(index(0), index(rowCount() - 1));
        return;
    }
    beginResetModel();
    m_Subplots = std::move(subplots);
    endResetModel();
}

void VPlainSubplotModel::RefreshRanges()
{
    for (int row = 0; row < rowCount(); ++row)
    {
        Subplot& rSubplot = m_Subplots[static_cast<std::size_t>(row)];
        const QPointF range = RangeOf(rSubplot);
        if (range == rSubplot.Range)
            continue;
        rSubplot.Range = range;
        Q_EMIT dataChanged(index(row), index(row), {YAxisRangeRole});
    }
}

} // namespace GraphPlotUI

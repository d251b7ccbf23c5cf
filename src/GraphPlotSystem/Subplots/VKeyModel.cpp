#include "GraphPlotSystem/Subplots/VKeyModel.h"

#include "GraphPlotSystem/Channels/VActiveChannelModel.h"
#include "GraphPlotSystem/Common/ModelRoleNames.h"
#include "GraphPlotSystem/Common/WeakObjectCallback.h"
#include "GraphPlotSystem/Subplots/KeyRows.h"
#include "GraphPlotSystem/Texts/IChannelComponentControls.h"
#include "GraphPlotSystem/Texts/IChannelTextProvider.h"
#include "GraphPlotSystem/Traces/ITraceDataStorage.h"
#include "NotificationSystem/VDispatchCollapsers.h"

#include <QtGui/QColor>

#include <algorithm>
#include <array>
#include <set>
#include <utility>

namespace GraphPlotUI
{

using TQL::ActiveChannelModelRoles::ActiveChannelMissingData;
using TQL::ActiveChannelModelRoles::ActiveChannelPinned;

using namespace TQL::KeyModelRoles;

VKeyModel::VKeyModel(std::shared_ptr<TQL::IPostalService> i_pUiPostalService,
                     std::shared_ptr<TQL::IChannelTextProvider> i_pTextProvider,
                     std::shared_ptr<TQL::IChannelComponentControls> i_pComponentControls,
                     std::shared_ptr<TQL::ITraceDataStorage> i_pStorage, VActiveChannelModel* i_pActiveChannelModel,
                     QObject* i_pParent)
    : QAbstractListModel(i_pParent)
    , m_pTextProvider(std::move(i_pTextProvider))
    , m_pComponentControls(std::move(i_pComponentControls))
    , m_pStorage(std::move(i_pStorage))
    , m_pActiveChannelModel(i_pActiveChannelModel)
{
    const auto subscribe = [&](const std::shared_ptr<TQL::IChangeSignal>& i_rpSignal, auto i_Function,
                               const std::shared_ptr<TQL::IPostalService>& i_rpPostalService)
    {
        m_Subscriptions.Subscribe<void()>(i_rpSignal, MakeWeakObjectCallback(this, i_Function), i_rpPostalService);
    };
    const auto pRebuild = NotificationSystem::MakeCollapserDontPost(i_pUiPostalService);
    subscribe(m_pActiveChannelModel->ChannelsChanged(), &VKeyModel::Rebuild, pRebuild);
    subscribe(m_pComponentControls->Changed(), &VKeyModel::Rebuild, pRebuild);
    subscribe(m_pTextProvider->TextChanged(), &VKeyModel::OnTextChanged,
              NotificationSystem::MakeCollapserDontPost(i_pUiPostalService));
    subscribe(
        m_pStorage->ColoursChanged(), [](VKeyModel& i_rSelf) { i_rSelf.EmitAllChanged({KeyColour}); },
        NotificationSystem::MakeCollapserDontPost(i_pUiPostalService));
    connect(m_pActiveChannelModel, &QAbstractItemModel::dataChanged, this, &VKeyModel::OnChannelRowsChanged);
    Rebuild();
}

VKeyModel::~VKeyModel() = default;

void VKeyModel::SetShowKey(bool i_bShow)
{
    if (std::exchange(m_bShowKey, i_bShow) != i_bShow)
        Q_EMIT ShowKeyChanged();
}

int VKeyModel::rowCount(const QModelIndex& i_rParent) const
{
    return i_rParent.isValid() ? 0 : static_cast<int>(m_Rows.size());
}

QHash<int, QByteArray> VKeyModel::roleNames() const
{
    return ModelRoleNames(QMetaEnum::fromType<EKeyModelRoles>());
}

bool VKeyModel::insertRows(int i_Row, int i_Count, const QModelIndex& i_rParent)
{
    if (i_rParent.isValid() || i_Row < 0 || i_Row > rowCount() || i_Count <= 0)
        return false;
    beginInsertRows({}, i_Row, i_Row + i_Count - 1);
    m_Rows.insert(m_Rows.begin() + i_Row, static_cast<std::size_t>(i_Count), {});
    IndexRows();
    endInsertRows();
    return true;
}

bool VKeyModel::removeRows(int i_Row, int i_Count, const QModelIndex& i_rParent)
{
    if (i_rParent.isValid() || i_Row < 0 || i_Row >= rowCount() || i_Count <= 0)
        return false;
    const int count = std::min(i_Count, rowCount() - i_Row);
    beginRemoveRows({}, i_Row, i_Row + count - 1);
    m_Rows.erase(m_Rows.begin() + i_Row, m_Rows.begin() + i_Row + count);
    IndexRows();
    endRemoveRows();
    return true;
}

void VKeyModel::EmitChanged(int i_First, int i_Last, const QList<int>& i_rRoles)
{
    if (i_First <= i_Last)
        Q_EMIT dataChanged(index(i_First), index(i_Last), i_rRoles);
}

void VKeyModel::Rebuild()
{
    if (!m_pActiveChannelModel)
        return;
    std::vector<TQL::ITraceId> traces = ListKeyTraces(m_pActiveChannelModel->GetChannels());
    const std::uint64_t hash = HashKeyTraces(traces);
    m_pComponentControls->FilterTraces(traces);
    m_pTextProvider->Update(std::span<const TQL::ITraceId>(traces));
    const bool bHashChanged = std::exchange(m_RowsHash, hash) != hash;
    const bool bChanged = bHashChanged || traces != m_Rows;
    TakeRows(std::move(traces));
    if (bChanged)
        EmitAllChanged();
}

void VKeyModel::TakeRows(std::vector<TQL::ITraceId> i_Traces)
{
    const std::vector<RowRun> runs = FindChangedRows(m_Rows, i_Traces);
    const std::size_t common = std::min(m_Rows.size(), i_Traces.size());
    std::copy_n(i_Traces.begin(), common, m_Rows.begin());
    IndexRows();
    for (const RowRun& rRun : runs)
        EmitChanged(static_cast<int>(rRun.First), static_cast<int>(rRun.Last));
    if (m_Rows.size() > common)
        removeRows(static_cast<int>(common), rowCount() - static_cast<int>(common));
    if (i_Traces.size() == common)
        return;
    beginInsertRows({}, static_cast<int>(common), static_cast<int>(i_Traces.size()) - 1);
    m_Rows.insert(m_Rows.end(), i_Traces.begin() + static_cast<std::ptrdiff_t>(common), i_Traces.end());
    IndexRows();
    endInsertRows();
}

/// Counts on the rows of a channel standing together.
void VKeyModel::IndexRows()
{
    m_ChannelRuns.clear();
    for (std::size_t row = 0; row < m_Rows.size(); ++row)
        m_ChannelRuns.try_emplace(m_Rows[row].Channel(), RowRun{row, row}).first->second.Last = row;
}

void VKeyModel::OnTextChanged()
{
    Rebuild(); // a channel may have another subtype, of which other components are switched on
    EmitAllChanged({KeyChannelName, KeyComponentName, KeyEnabledComponentCount, KeyEnabledComponents,
                    KeyFirstEnabledComponent, KeyLastEnabledComponent, KeyChannelSubTypeName});
}

void VKeyModel::OnChannelRowsChanged(const QModelIndex& i_rFirst, const QModelIndex& i_rLast,
                                     const QList<int>& i_rRoles)
{
    using namespace TQL::ActiveChannelModelRoles;
    if (!i_rRoles.isEmpty() && !i_rRoles.contains(ActiveChannelPinned) && !i_rRoles.contains(ActiveChannelMissingData))
        return;
    const QList<int> roles = {KeyPinned, KeyMissingData};
    if (i_rFirst.row() == 0 && i_rLast.row() == m_pActiveChannelModel->rowCount() - 1)
        return EmitAllChanged(roles);
    for (int row = i_rFirst.row(); row <= i_rLast.row(); ++row)
    {
        const QVariant id = m_pActiveChannelModel->index(row).data(ActiveChannelInstanceId);
        if (const auto found = m_ChannelRuns.find(id.value<TQL::IChannelInstanceId>()); found != m_ChannelRuns.end())
            EmitChanged(static_cast<int>(found->second.First), static_cast<int>(found->second.Last), roles);
    }
}

QVariant VKeyModel::data(const QModelIndex& i_rIndex, int i_Role) const
{
    if (!checkIndex(i_rIndex, CheckIndexOption::IndexIsValid | CheckIndexOption::ParentIsInvalid))
        return {};
    const TQL::ITraceId& rTrace = m_Rows[static_cast<std::size_t>(i_rIndex.row())];
    switch (i_Role)
    {
    case KeyComponentIndex:
        return static_cast<int>(rTrace.Component());
    case KeyColour:
        return ColourOf(rTrace);
    case KeyChannelId:
        return QVariant::fromValue(rTrace.Channel());
    case KeyTraceId:
        return QVariant::fromValue(rTrace);
    case KeyChannelName:
    case KeyComponentName:
    case KeyChannelSubTypeName:
        return TextData(rTrace, i_Role);
    case KeyEnabledComponentCount:
    case KeyEnabledComponents:
    case KeyFirstEnabledComponent:
    case KeyLastEnabledComponent:
        return ComponentData(rTrace, i_Role);
    case KeyPinned:
    case KeyMissingData:
        return ChannelData(rTrace, i_Role);
    default:
        return {};
    }
}

QVariant VKeyModel::ColourOf(const TQL::ITraceId& i_rTrace) const
{
    std::array<float, 4> colour{};
    m_pStorage->GetTraceColour(colour, i_rTrace);
    return QColor::fromRgbF(colour[0], colour[1], colour[2], colour[3]);
}

QVariant VKeyModel::TextData(const TQL::ITraceId& i_rTrace, int i_Role) const
{
    if (i_Role == KeyChannelName)
        return m_pTextProvider->GetChannelDisplayName(i_rTrace.Channel());
    if (i_Role == KeyComponentName)
        return m_pTextProvider->GetComponentName(i_rTrace.Channel(), i_rTrace.Component());
    return m_pTextProvider->GetSubTypeDisplayName(m_pTextProvider->GetSubTypeId(i_rTrace.Channel()));
}

KeyComponents VKeyModel::ComponentsOf(const TQL::ITraceId& i_rTrace) const
{
    const std::uint64_t subType = m_pTextProvider->GetSubTypeId(i_rTrace.Channel());
    const TQL::VDisabledComponents disabled = m_pComponentControls->GetDisabledComponents(subType);
    return DescribeKeyComponents(i_rTrace.Component(), m_pTextProvider->GetComponentCount(subType),
                                 {disabled.begin(), disabled.end()});
}

QVariant VKeyModel::ComponentData(const TQL::ITraceId& i_rTrace, int i_Role) const
{
    const KeyComponents components = ComponentsOf(i_rTrace);
    if (i_Role == KeyEnabledComponentCount)
        return components.EnabledCount;
    if (i_Role == KeyFirstEnabledComponent)
        return components.bFirstEnabled;
    if (i_Role == KeyLastEnabledComponent)
        return components.bLastEnabled;
    QVariantList disabled;
    for (const std::uint64_t component : components.Disabled)
        disabled.append(static_cast<int>(component));
    return disabled;
}

QModelIndex VKeyModel::ChannelRowOf(const TQL::ITraceId& i_rTrace) const
{
    return m_pActiveChannelModel ? m_pActiveChannelModel->index(m_pActiveChannelModel->FindRow(i_rTrace.Channel()))
                                 : QModelIndex();
}

QVariant VKeyModel::ChannelData(const TQL::ITraceId& i_rTrace, int i_Role) const
{
    const QModelIndex channel = ChannelRowOf(i_rTrace);
    if (i_Role == KeyPinned)
        return channel.isValid() && channel.data(ActiveChannelPinned).toBool();
    return !channel.isValid() || channel.data(ActiveChannelMissingData).toBool();
}

bool VKeyModel::setData(const QModelIndex& i_rIndex, const QVariant& i_rValue, int i_Role)
{
    if (!checkIndex(i_rIndex, CheckIndexOption::IndexIsValid | CheckIndexOption::ParentIsInvalid))
        return false;
    const TQL::ITraceId trace = m_Rows[static_cast<std::size_t>(i_rIndex.row())];
    if (i_Role == KeyEnabledComponents && i_rValue.canConvert<QVariantList>())
        return SwitchComponents(trace, i_rValue.toList());
    if (i_Role != KeyPinned)
        return false;
    const QModelIndex channel = ChannelRowOf(trace);
    return channel.isValid() && m_pActiveChannelModel->setData(channel, i_rValue, ActiveChannelPinned);
}

bool VKeyModel::SwitchComponents(const TQL::ITraceId& i_rTrace, const QVariantList& i_rDisabled)
{
    std::set<std::uint64_t> disabled;
    for (const QVariant& rComponent : i_rDisabled)
        disabled.insert(rComponent.toULongLong());
    const std::uint64_t subType = m_pTextProvider->GetSubTypeId(i_rTrace.Channel());
    const std::uint64_t count = m_pTextProvider->GetComponentCount(subType);
    bool bAll = count != 0;
    for (std::uint64_t component = 0; component < count; ++component)
        bAll =
            m_pComponentControls->SetComponentEnabled(subType, component, !disabled.contains(component)).IsSuccess() &&
            bAll;
    return bAll;
}

} // namespace GraphPlotUI

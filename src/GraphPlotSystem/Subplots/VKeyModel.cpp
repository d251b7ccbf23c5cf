#include "GraphPlotSystem/Subplots/VKeyModel.h"

#include "GraphPlotSystem/Channels/VActiveChannelModel.h"
#include "GraphPlotSystem/Common/ModelRoleNames.h"
#include "GraphPlotSystem/Common/WeakObjectCallback.h"
#include "GraphPlotSystem/Texts/IChannelComponentControls.h"
#include "GraphPlotSystem/Texts/IChannelTextProvider.h"
#include "GraphPlotSystem/Traces/ITraceDataStorage.h"
#include "NotificationSystem/VDispatchCollapsers.h"

#include <algorithm>
#include <utility>

namespace GraphPlotUI
{

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

} // namespace GraphPlotUI

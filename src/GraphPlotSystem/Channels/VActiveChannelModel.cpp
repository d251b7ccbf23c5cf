#include "GraphPlotSystem/Channels/VActiveChannelModel.h"

#include "GraphPlotSystem/Channels/VContextSwitchPlan.h"
#include "GraphPlotSystem/Common/ModelRoleNames.h"
#include "GraphPlotSystem/Texts/IChannelTextProvider.h"
#include "NotificationSystem/VMultiCallbackPostal.h"

#include <algorithm>
#include <unordered_set>
#include <utility>

namespace GraphPlotUI
{

using namespace TQL::ActiveChannelModelRoles;

using TQL::IChannel;
using TQL::IResult;

VActiveChannelModel::VActiveChannelModel(
    std::shared_ptr<TQL::IPostalService> i_pUiPostalService, std::shared_ptr<TQL::IChannelTextProvider> i_pTextProvider,
    std::shared_ptr<OrvanePluginInterface::IChannelMigrationService> i_pMigrationService, QObject* i_pParent)
    : QAbstractListModel(i_pParent)
    , m_pTextProvider(std::move(i_pTextProvider))
    , m_pMigrationService(std::move(i_pMigrationService))
    , m_pChannelsChanged(std::make_shared<NotificationSystem::VChangeSignal>(std::move(i_pUiPostalService)))
{
}

VActiveChannelModel::~VActiveChannelModel() = default;

std::shared_ptr<TQL::IChangeSignal> VActiveChannelModel::ChannelsChanged() const
{
    return m_pChannelsChanged;
}

VActiveChannelModel::ChannelList VActiveChannelModel::GetChannels() const
{
    ChannelList channels;
    channels.reserve(m_Rows.Count());
    for (const RowPointer& rpRow : m_Rows.Get())
        channels.push_back(rpRow->pChannel);
    return channels;
}

VActiveChannelModel::ChannelList VActiveChannelModel::GetPinnedChannels() const
{
    ChannelList channels;
    channels.reserve(m_Rows.PinnedCount());
    for (const RowPointer& rpRow : m_Rows.Get())
        if (rpRow->bPinned)
            channels.push_back(rpRow->pChannel);
    return channels;
}

IResult VActiveChannelModel::SetChannels(ChannelList i_Channels)
{
    bool bChanged = i_Channels != m_Current;
    m_Current = i_Channels;
    const ChannelSet listed(i_Channels.begin(), i_Channels.end());
    bChanged = TakeChannels(i_Channels, listed) || bChanged;
    bChanged = RemoveUnlisted(listed) || bChanged;
    bChanged = RefreshOutputs() || bChanged;
    if (!bChanged)
        return TQL::Result::OkButNoEffect;
    SortRows();
    if (m_Rows.Count() != 0)
        Q_EMIT dataChanged(index(0), index(rowCount() - 1));
    NotifyChanged();
    return TQL::Result::Ok;
}

void VActiveChannelModel::Restore(const ChannelList& i_rPinned)
{
    beginResetModel();
    m_Rows.Clear();
    endResetModel();
    for (const std::shared_ptr<IChannel>& rpChannel : i_rPinned)
        AddChannel(FindChannelAnew(rpChannel, m_pMigrationService.get()), true);
    if (SetChannels({}) == TQL::Result::OkButNoEffect)
        NotifyChanged(); // of the rows from before
}

bool VActiveChannelModel::AddChannel(const std::shared_ptr<IChannel>& i_rpChannel, bool i_bPinned)
{
    if (!i_rpChannel || m_Rows.HasThing(i_rpChannel->GetInstanceId()))
        return false;
    (void)m_pTextProvider->Update(i_rpChannel); // without texts the channel goes by the provider's stand-in
    auto pRow = std::make_shared<VActiveChannelData>();
    pRow->pChannel = i_rpChannel;
    pRow->Name = m_pTextProvider->GetChannelDisplayName(i_rpChannel->GetInstanceId());
    pRow->bPinned = i_bPinned;
    const std::size_t place = m_Rows.FindPlace(pRow->Name);
    const int row = static_cast<int>(place);
    beginInsertRows({}, row, row);
    m_Rows.Insert(place, std::move(pRow));
    endInsertRows();
    Q_EMIT dataChanged(index(row), index(row));
    return true;
}

bool VActiveChannelModel::TakeChannels(const ChannelList& i_rChannels, const ChannelSet& i_rListed)
{
    bool bChanged = false;
    for (const std::shared_ptr<IChannel>& rpChannel : i_rChannels)
    {
        const RowPointer pRow = rpChannel ? m_Rows.Find(rpChannel->GetInstanceId()) : nullptr;
        if (!pRow)
        {
            bChanged = AddChannel(rpChannel, false) || bChanged;
        }
        else if (!i_rListed.contains(pRow->pChannel))
        {
            // The host made the channel anew: the row goes on with the one that lives.
            m_Rows.SetChannel(pRow, rpChannel);
            bChanged = true;
        }
    }
    return bChanged;
}

bool VActiveChannelModel::RemoveUnlisted(const ChannelSet& i_rListed)
{
    const auto hasToGo = [&](std::size_t i_Row)
    {
        const VActiveChannelData& rRow = *m_Rows.Get()[i_Row];
        return !rRow.bPinned && !i_rListed.contains(rRow.pChannel);
    };
    bool bChanged = false;
    for (std::size_t row = 0; row < m_Rows.Count(); ++row)
    {
        std::size_t end = row;
        while (end < m_Rows.Count() && hasToGo(end))
            ++end;
        if (end == row)
            continue;
        EraseRows(row, end - row);
        bChanged = true;
    }
    return bChanged;
}

bool VActiveChannelModel::RefreshOutputs()
{
    bool bChanged = false;
    for (const RowPointer& rpRow : m_Rows.Get())
    {
        const TQL::IChannelOutput* const pOutput = rpRow->pChannel->GetOutput().get();
        if (std::exchange(rpRow->pOutput, pOutput) == pOutput)
            continue;
        (void)m_pTextProvider->Update(rpRow->pChannel); // texts that cannot be read stay as they are
        bChanged = true;
    }
    return bChanged;
}

void VActiveChannelModel::EraseRows(std::size_t i_First, std::size_t i_Count)
{
    beginRemoveRows({}, static_cast<int>(i_First), static_cast<int>(i_First + i_Count - 1));
    m_Rows.Erase(i_First, i_Count);
    endRemoveRows();
}

void VActiveChannelModel::SortRows()
{
    const auto order = m_Rows.FindOrder();
    if (!order)
        return;
    Q_EMIT layoutAboutToBeChanged({}, QAbstractItemModel::VerticalSortHint);
    QModelIndexList from;
    QModelIndexList to;
    for (std::size_t row = 0; row < order->size(); ++row)
    {
        from.append(index(static_cast<int>((*order)[row])));
        to.append(index(static_cast<int>(row)));
    }
    m_Rows.Reorder(*order);
    changePersistentIndexList(from, to);
    Q_EMIT layoutChanged({}, QAbstractItemModel::VerticalSortHint);
}

void VActiveChannelModel::NotifyChanged()
{
    m_pChannelsChanged->Invoke();
    const bool bHaveChannels = m_Rows.Count() != 0;
    if (std::exchange(m_bHaveActiveChannels, bHaveChannels) != bHaveChannels)
        Q_EMIT haveActiveChannelsChanged();
    UpdatePinState();
}

void VActiveChannelModel::UpdatePinState()
{
    const std::size_t pinned = m_Rows.PinnedCount();
    const ESubplotPinState state = pinned == 0                ? ESubplotPinState::AllUnpinned
                                   : pinned == m_Rows.Count() ? ESubplotPinState::AllPinned
                                                              : ESubplotPinState::Mixed;
    if (std::exchange(m_PinState, state) != state)
        Q_EMIT pinStateChanged();
}

IResult VActiveChannelModel::SwitchContext(const std::string& i_rNewContext,
                                           const std::set<std::string>& i_rPresentContexts)
{
    const VContextSwitchPlan plan =
        PlanContextSwitch(m_Rows.Get(), i_rNewContext, i_rPresentContexts, m_pMigrationService.get());
    beginResetModel();
    ApplySwitch(plan);
    endResetModel();
    NotifyChanged();
    return plan.GetResult();
}

void VActiveChannelModel::ApplySwitch(const VContextSwitchPlan& i_rPlan)
{
    const auto change = [&i_rPlan](std::shared_ptr<IChannel>& io_rpChannel)
    {
        const auto found = i_rPlan.Changes.find(io_rpChannel.get());
        if (found == i_rPlan.Changes.end())
            return false;
        io_rpChannel = found->second;
        return true;
    };
    VActiveChannelRows::RowList rows = m_Rows.Get();
    for (const RowPointer& rpRow : rows)
        if (change(rpRow->pChannel) && rpRow->pChannel)
            (void)m_pTextProvider->Update(rpRow->pChannel); // the row keeps its name whatever the provider can read
    std::erase_if(rows, [](const RowPointer& i_rpRow) { return !i_rpRow->pChannel; });
    m_Rows.Replace(std::move(rows));
    for (std::shared_ptr<IChannel>& rpChannel : m_Current)
        change(rpChannel);
    std::erase(m_Current, nullptr);
}

int VActiveChannelModel::rowCount(const QModelIndex& i_rParent) const
{
    return i_rParent.isValid() ? 0 : static_cast<int>(m_Rows.Count());
}

QHash<int, QByteArray> VActiveChannelModel::roleNames() const
{
    return ModelRoleNames(QMetaEnum::fromType<EActiveChannelModelRoles>());
}

bool VActiveChannelModel::IsRow(const QModelIndex& i_rIndex) const
{
    return i_rIndex.isValid() && i_rIndex.model() == this && i_rIndex.row() < rowCount();
}

QVariant VActiveChannelModel::data(const QModelIndex& i_rIndex, int i_Role) const
{
    if (!IsRow(i_rIndex))
        return {};
    const VActiveChannelData& rRow = *m_Rows.Get()[static_cast<std::size_t>(i_rIndex.row())];
    switch (i_Role)
    {
    case ActiveChannelName:
        return rRow.Name;
    case ActiveChannelPinned:
        return rRow.bPinned;
    case ActiveChannelMissingData:
        return !rRow.pChannel->GetOutput();
    case ActiveChannelInstanceId:
        return QVariant::fromValue(rRow.pChannel->GetInstanceId());
    default:
        return {};
    }
}

bool VActiveChannelModel::setData(const QModelIndex& i_rIndex, const QVariant& i_rValue, int i_Role)
{
    if (!IsRow(i_rIndex))
        return false;
    const std::size_t row = static_cast<std::size_t>(i_rIndex.row());
    switch (i_Role)
    {
    case ActiveChannelName:
        SetName(row, i_rValue.toString());
        return true;
    case ActiveChannelPinned:
        SetPinned(row, i_rValue.toBool());
        UpdatePinState();
        return true;
    default:
        return false;
    }
}

void VActiveChannelModel::SetName(std::size_t i_Row, const QString& i_rName)
{
    VActiveChannelData& rRow = *m_Rows.Get()[i_Row];
    if (rRow.Name == i_rName)
        return;
    m_Rows.SetName(rRow, i_rName);
    const QModelIndex changed = index(static_cast<int>(i_Row));
    Q_EMIT dataChanged(changed, changed, {ActiveChannelName});
}

void VActiveChannelModel::SetPinned(std::size_t i_Row, bool i_bPinned)
{
    VActiveChannelData& rRow = *m_Rows.Get()[i_Row];
    if (rRow.bPinned == i_bPinned)
        return;
    m_Rows.SetPinned(rRow, i_bPinned);
    const QModelIndex changed = index(static_cast<int>(i_Row));
    Q_EMIT dataChanged(changed, changed, {ActiveChannelPinned});
}

void VActiveChannelModel::setAllPinned(bool i_bPinned)
{
    for (std::size_t row = 0; row < m_Rows.Count(); ++row)
        if (m_Rows.Get()[row]->pChannel->GetOutput())
            SetPinned(row, i_bPinned);
    UpdatePinState();
}

void VActiveChannelModel::clear()
{
    removeRows(0, rowCount());
}

TQL::IResult VActiveChannelModel::removeChannel(TQL::IChannelInstanceId i_rChannelInstanceId)
{
    const int row = FindRow(i_rChannelInstanceId);
    if (row < 0)
        return TQL::Result::NotFound;
    return removeRow(row) ? TQL::Result::Ok : TQL::Result::Failed;
}

bool VActiveChannelModel::removeRows(int i_Row, int i_Count, const QModelIndex& i_rParent)
{
    if (i_rParent.isValid() || i_Row < 0 || i_Row >= rowCount() || i_Count <= 0)
        return false;
    const auto first = static_cast<std::size_t>(i_Row);
    const std::size_t count = std::min(static_cast<std::size_t>(i_Count), m_Rows.Count() - first);
    ChannelList removed;
    removed.reserve(count);
    for (std::size_t row = first; row < first + count; ++row)
        removed.push_back(m_Rows.Get()[row]->pChannel);
    EraseRows(first, count);
    NotifyChanged();
    for (const std::shared_ptr<TQL::IChannel>& rpChannel : removed)
        Q_EMIT channelRemoved(rpChannel);
    return true;
}

} // namespace GraphPlotUI

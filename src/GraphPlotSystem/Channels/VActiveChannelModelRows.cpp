#include "GraphPlotSystem/Channels/VActiveChannelModel.h"
#include "GraphPlotSystem/Common/ModelRoleNames.h"

#include <algorithm>

namespace GraphPlotUI
{

using namespace TQL::ActiveChannelModelRoles;

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

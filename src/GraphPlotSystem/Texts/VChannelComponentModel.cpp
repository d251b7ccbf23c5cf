#include "GraphPlotSystem/Texts/VChannelComponentModel.h"

#include "GraphPlotSystem/Common/ModelRoleNames.h"
#include "GraphPlotSystem/Common/WeakObjectCallback.h"
#include "GraphPlotSystem/Texts/IChannelComponentControls.h"
#include "GraphPlotSystem/Texts/IChannelTextProvider.h"
#include "NotificationSystem/VDispatchCollapsers.h"

#include <algorithm>
#include <utility>

namespace GraphPlotUI
{

VChannelComponentModel::VChannelComponentModel(std::shared_ptr<TQL::IPostalService> i_pUiPostalService,
                                               std::shared_ptr<TQL::IChannelTextProvider> i_pTextProvider,
                                               std::shared_ptr<TQL::IChannelComponentControls> i_pControls,
                                               QObject* i_pParent)
    : QAbstractListModel(i_pParent), m_pTextProvider(std::move(i_pTextProvider)), m_pControls(std::move(i_pControls))
{
    // Both do the same, so one that waits stands for the other too.
    const auto pCollapser = NotificationSystem::MakeCollapserDontPost(std::move(i_pUiPostalService));
    const auto rebuild = MakeWeakObjectCallback(this, [](VChannelComponentModel& i_rSelf) { i_rSelf.Rebuild(); });
    m_Subscriptions.Subscribe<void()>(m_pTextProvider->TextChanged(), rebuild, pCollapser);
    m_Subscriptions.Subscribe<void()>(m_pControls->Changed(), rebuild, pCollapser);
}

VChannelComponentModel::~VChannelComponentModel() = default;

void VChannelComponentModel::SetChannels(std::vector<TQL::IChannelInstanceId> i_Channels)
{
    m_Channels = std::move(i_Channels);
    Rebuild();
}

void VChannelComponentModel::Rebuild()
{
    ComponentCounts counts;
    ReplaceRows(ComposeComponentRows(m_Channels, *m_pTextProvider, *m_pControls, counts));
    if (std::exchange(m_Counts, counts) != counts)
        Q_EMIT ComponentCountChanged();
}

void VChannelComponentModel::ReplaceRows(std::vector<VComponentType> i_Rows)
{
    const bool bSameRows = std::ranges::equal(i_Rows, m_Rows, &VComponentType::IsSameRow);
    if (!bSameRows)
    {
        beginResetModel();
        m_Rows = std::move(i_Rows);
        endResetModel();
        return;
    }
    if (m_Rows == i_Rows)
        return;
    m_Rows = std::move(i_Rows);
    Q_EMIT dataChanged(index(0), index(rowCount() - 1), {ChannelComponentEnabledState});
}

int VChannelComponentModel::rowCount(const QModelIndex& i_rParent) const
{
    return i_rParent.isValid() ? 0 : static_cast<int>(m_Rows.size());
}

QVariant VChannelComponentModel::data(const QModelIndex& i_rIndex, int i_Role) const
{
    if (!checkIndex(i_rIndex, CheckIndexOption::IndexIsValid | CheckIndexOption::ParentIsInvalid))
        return {};
    const VComponentType& rRow = m_Rows[static_cast<std::size_t>(i_rIndex.row())];
    switch (i_Role)
    {
    case Qt::DisplayRole:
    case ChannelComponentName:
        return rRow.Text;
    case ChannelComponentSubTypeId:
        return QVariant::fromValue<quint64>(rRow.SubType);
    case ChannelComponentTypeHeader:
        return rRow.bHeader;
    case ChannelComponentEnabledState:
        return rRow.State;
    default:
        return {};
    }
}

bool VChannelComponentModel::setData(const QModelIndex& i_rIndex, const QVariant& i_rValue, int i_Role)
{
    if (i_Role != ChannelComponentEnabledState ||
        !checkIndex(i_rIndex, CheckIndexOption::IndexIsValid | CheckIndexOption::ParentIsInvalid))
        return false;
    const VComponentType row = m_Rows[static_cast<std::size_t>(i_rIndex.row())];
    const bool bEnable = i_rValue.toInt() == Qt::Checked;
    const TQL::IResult result = row.bHeader ? m_pControls->SetChannelComponentsEnabled(row.SubType, bEnable)
                                            : m_pControls->SetComponentEnabled(row.SubType, row.Component, bEnable);
    return result.IsSuccess();
}

QHash<int, QByteArray> VChannelComponentModel::roleNames() const
{
    QHash<int, QByteArray> names = ModelRoleNames(QMetaEnum::fromType<EModelRoles>());
    names.insert(Qt::DisplayRole, "display");
    return names;
}

} // namespace GraphPlotUI

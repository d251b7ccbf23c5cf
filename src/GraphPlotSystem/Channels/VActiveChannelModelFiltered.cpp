#include "GraphPlotSystem/Channels/VActiveChannelModelFiltered.h"

#include "GraphPlotSystem/Channels/VActiveChannelModel.h"

#include <utility>

namespace GraphPlotUI
{

VActiveChannelModelFiltered::VActiveChannelModelFiltered(VActiveChannelModel* i_pModel, QObject* i_pParent)
    : QSortFilterProxyModel(i_pParent)
{
    setSourceModel(i_pModel);
}

void VActiveChannelModelFiltered::SetFilter(Predicate i_Accepts)
{
    m_Accepts = std::move(i_Accepts);
    invalidateRowsFilter();
}

bool VActiveChannelModelFiltered::filterAcceptsRow(int i_Row, const QModelIndex& i_rParent) const
{
    const QVariant id =
        sourceModel()->index(i_Row, 0, i_rParent).data(TQL::ActiveChannelModelRoles::ActiveChannelInstanceId);
    return m_Accepts && id.isValid() && m_Accepts(id.value<TQL::IChannelInstanceId>());
}

} // namespace GraphPlotUI

#pragma once

#include <QtCore/QSortFilterProxyModel>

#include <functional>

namespace TQL
{
struct IChannelInstanceId;
}

namespace GraphPlotUI
{

class VActiveChannelModel;

/// One subplot's share of the active channels, in their order. Made by the subplot manager, which also says which
/// channels belong to the subplot; without that no channel does. UI thread.
class VActiveChannelModelFiltered : public QSortFilterProxyModel
{
    Q_OBJECT

public:
    using Predicate = std::function<bool(const TQL::IChannelInstanceId&)>;

    VActiveChannelModelFiltered(VActiveChannelModel* i_pModel, QObject* i_pParent);

    /// Which channels are shown; to be set again when its answers change.
    void SetFilter(Predicate i_Accepts);

protected:
    bool filterAcceptsRow(int i_Row, const QModelIndex& i_rParent) const override;

private:
    Predicate m_Accepts;
};

} // namespace GraphPlotUI

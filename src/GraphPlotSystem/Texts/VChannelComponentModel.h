#pragma once

#include "GraphPlotSystem/Texts/ComponentRows.h"
#include "NotificationSystem/VSubscriptions.h"
#include "TQL/IChannelInstanceId.h"
#include "TQL/IPostalService.h"
#include "TQL/IResult.h"

#include <QtCore/QAbstractListModel>

#include <memory>
#include <vector>

namespace GraphPlotUI
{

/// The components that can be switched on and off, as a list of two levels: a row for each kind of the plotted
/// channels, under it a row for each of its components. Checking a row goes to the component controls; what has become
/// of it comes back from them. A child of the graph plot context. UI thread.
class VChannelComponentModel : public QAbstractListModel
{
    Q_OBJECT
    Q_PROPERTY(int totalComponentCount READ GetTotalComponentCount NOTIFY ComponentCountChanged)
    Q_PROPERTY(int enabledComponentCount READ GetEnabledComponentCount NOTIFY ComponentCountChanged)

public:
    enum EModelRoles
    {
        ChannelComponentSubTypeId = 256, ///< 0 in the row of channels that are not known yet
        ChannelComponentName,
        ChannelComponentTypeHeader,
        ChannelComponentEnabledState ///< a Qt::CheckState; can be set: 2 switches on, any other value off
    };
    Q_ENUM(EModelRoles)

    VChannelComponentModel(std::shared_ptr<TQL::IPostalService> i_pUiPostalService,
                           std::shared_ptr<TQL::IChannelTextProvider> i_pTextProvider,
                           std::shared_ptr<TQL::IChannelComponentControls> i_pControls, QObject* i_pParent);
    ~VChannelComponentModel() override;

    /// What is plotted now.
    void SetChannels(std::vector<TQL::IChannelInstanceId> i_Channels);

    int GetTotalComponentCount() const { return m_Counts.Total; }
    int GetEnabledComponentCount() const { return m_Counts.Enabled; }

    int rowCount(const QModelIndex& i_rParent = QModelIndex()) const override;
    QVariant data(const QModelIndex& i_rIndex, int i_Role) const override;
    bool setData(const QModelIndex& i_rIndex, const QVariant& i_rValue, int i_Role) override;
    QHash<int, QByteArray> roleNames() const override;

Q_SIGNALS:
    void ComponentCountChanged();

private:
    void Rebuild();
    void ReplaceRows(std::vector<VComponentType> i_Rows);

    const std::shared_ptr<TQL::IChannelTextProvider> m_pTextProvider;
    const std::shared_ptr<TQL::IChannelComponentControls> m_pControls;
    std::vector<TQL::IChannelInstanceId> m_Channels;
    std::vector<VComponentType> m_Rows;
    ComponentCounts m_Counts;
    NotificationSystem::VSubscriptions m_Subscriptions;
};

} // namespace GraphPlotUI

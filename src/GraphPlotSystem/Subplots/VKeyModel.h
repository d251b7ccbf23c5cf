#pragma once

#include "GraphPlotSystem/Subplots/KeyRows.h"
#include "NotificationSystem/VSubscriptions.h"
#include "TQL/ITraceId.h"

#include <QtCore/QAbstractListModel>
#include <QtCore/QPointer>

#include <cstdint>
#include <map>
#include <memory>
#include <vector>

namespace TQL
{

class IChannelComponentControls;
class IChannelTextProvider;
class IPostalService;
class ITraceDataStorage;

namespace KeyModelRoles
{

Q_NAMESPACE

enum EKeyModelRoles
{
    KeyChannelName = 0,       ///< text
    KeyComponentName = 256,   ///< text
    KeyComponentIndex,        ///< number
    KeyColour,                ///< QColor
    KeyEnabledComponentCount, ///< of the channel's subtype; at least 0
    KeyEnabledComponents,     ///< list of the component indexes of the subtype that are switched off; can be written
    KeyFirstEnabledComponent, ///< bool: the component is on and none before it is
    KeyLastEnabledComponent,  ///< bool: no component after it is on
    KeyPinned,                ///< bool; can be written
    KeyChannelId,             ///< TQL::IChannelInstanceId
    KeyChannelSubTypeName,    ///< text
    KeyTraceId,               ///< TQL::ITraceId
    KeyMissingData,           ///< bool
    KeyToolTip                ///< nothing: views make their own
};
Q_ENUM_NS(EKeyModelRoles)

} // namespace KeyModelRoles

} // namespace TQL

namespace GraphPlotUI
{

class VActiveChannelModel;

/// The key of one window: a row for each component that is switched on of each active channel, in the order of these.
/// Follows the channels with their pins, the switched components, the texts and the colours. QML sees it as
/// "contextKeyModel". A child of the window's graph plot context; UI thread.
class VKeyModel : public QAbstractListModel
{
    Q_OBJECT
    Q_PROPERTY(bool showKey READ GetShowKey WRITE SetShowKey NOTIFY ShowKeyChanged)

public:
    VKeyModel(std::shared_ptr<TQL::IPostalService> i_pUiPostalService,
              std::shared_ptr<TQL::IChannelTextProvider> i_pTextProvider,
              std::shared_ptr<TQL::IChannelComponentControls> i_pComponentControls,
              std::shared_ptr<TQL::ITraceDataStorage> i_pStorage, VActiveChannelModel* i_pActiveChannelModel,
              QObject* i_pParent);
    ~VKeyModel() override;

    bool GetShowKey() const { return m_bShowKey; }
    void SetShowKey(bool i_bShow);

    int rowCount(const QModelIndex& i_rParent = {}) const override;
    QVariant data(const QModelIndex& i_rIndex, int i_Role) const override;
    bool setData(const QModelIndex& i_rIndex, const QVariant& i_rValue, int i_Role) override;
    QHash<int, QByteArray> roleNames() const override;
    bool insertRows(int i_Row, int i_Count, const QModelIndex& i_rParent = {}) override;
    bool removeRows(int i_Row, int i_Count, const QModelIndex& i_rParent = {}) override;

Q_SIGNALS:
    void ShowKeyChanged();

private:
    void Rebuild();
    void TakeRows(std::vector<TQL::ITraceId> i_Traces);
    void IndexRows();
    void OnTextChanged();
    void OnChannelRowsChanged(const QModelIndex& i_rFirst, const QModelIndex& i_rLast, const QList<int>& i_rRoles);
    void EmitChanged(int i_First, int i_Last, const QList<int>& i_rRoles = {});
    void EmitAllChanged(const QList<int>& i_rRoles = {}) { EmitChanged(0, rowCount() - 1, i_rRoles); }

    QVariant TextData(const TQL::ITraceId& i_rTrace, int i_Role) const;
    QVariant ComponentData(const TQL::ITraceId& i_rTrace, int i_Role) const;
    QVariant ChannelData(const TQL::ITraceId& i_rTrace, int i_Role) const;
    QVariant ColourOf(const TQL::ITraceId& i_rTrace) const;
    KeyComponents ComponentsOf(const TQL::ITraceId& i_rTrace) const;
    QModelIndex ChannelRowOf(const TQL::ITraceId& i_rTrace) const;
    bool SwitchComponents(const TQL::ITraceId& i_rTrace, const QVariantList& i_rDisabled);

    const std::shared_ptr<TQL::IChannelTextProvider> m_pTextProvider;
    const std::shared_ptr<TQL::IChannelComponentControls> m_pComponentControls;
    const std::shared_ptr<TQL::ITraceDataStorage> m_pStorage;
    const QPointer<VActiveChannelModel> m_pActiveChannelModel;
    std::vector<TQL::ITraceId> m_Rows;
    std::map<TQL::IChannelInstanceId, RowRun> m_ChannelRuns; // the rows of each channel
    std::uint64_t m_RowsHash = 0;
    bool m_bShowKey = true;
    NotificationSystem::VSubscriptions m_Subscriptions;
};

} // namespace GraphPlotUI

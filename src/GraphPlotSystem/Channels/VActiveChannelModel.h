#pragma once

#include "GraphPlotSystem/Channels/EActiveChannelModelRoles.h"
#include "GraphPlotSystem/Channels/VActiveChannelRows.h"
#include "GraphPlotSystem/Common/ESubplotPinState.h"
#include "TQL/IMultiCallback.h"
#include "TQL/IResult.h"

#include <QtCore/QAbstractListModel>

#include <memory>
#include <set>
#include <string>
#include <unordered_set>
#include <vector>

namespace NotificationSystem
{
template <typename Signature>
class VMultiCallbackPostal;
}

namespace OrvanePluginInterface
{
class IChannelMigrationService;
}

namespace TQL
{
class IChannelTextProvider;
}

namespace GraphPlotUI
{

struct VContextSwitchPlan;

/// The channels that are plotted now, sorted by name. An unpinned row stays as long as the builder delivers its
/// channel, a pinned one until the operator removes it; a change of the data context finds what stands for a channel in
/// the new one, and each notice of the contexts what stands now for a channel that was read again. Owned by the graph
/// plot context and living as long as the plot. UI thread.
class VActiveChannelModel : public QAbstractListModel
{
    Q_OBJECT
    Q_PROPERTY(bool haveActiveChannels READ HaveActiveChannels NOTIFY haveActiveChannelsChanged)
    Q_PROPERTY(int pinState READ GetPinStateNumber NOTIFY pinStateChanged)

public:
    using ChannelList = std::vector<std::shared_ptr<TQL::IChannel>>;

    /// i_pMigrationService may be null: then no channel follows a change of context, and none comes back by itself.
    VActiveChannelModel(std::shared_ptr<TQL::IPostalService> i_pUiPostalService,
                        std::shared_ptr<TQL::IChannelTextProvider> i_pTextProvider,
                        std::shared_ptr<OrvanePluginInterface::IChannelMigrationService> i_pMigrationService,
                        QObject* i_pParent);
    ~VActiveChannelModel() override;

    ChannelList GetChannels() const; ///< in the order of the rows
    ChannelList GetPinnedChannels() const;

    /// The channels to plot, from the builder. OkButNoEffect when nothing changed.
    TQL::IResult SetChannels(ChannelList i_Channels);

    /// The pinned channels of a stored plot, as they stand now; every row from before goes.
    void Restore(const ChannelList& i_rPinned);

    /// Takes the rows to another data context, or to the same one after a notice: a row follows through the migration
    /// service, stays, or goes. One that stays without data goes on with the channel that stands for it now, if any.
    /// i_rPresentContexts: the contexts that exist now. OkButPartial when some rows followed and some could not, the
    /// first failure when none could.
    TQL::IResult SwitchContext(const std::string& i_rNewContext, const std::set<std::string>& i_rPresentContexts);

    /// Raised when the list of channels has changed.
    std::shared_ptr<TQL::IChangeSignal> ChannelsChanged() const;

    /// The row of that very channel, -1 when there is none.
    int FindRow(const TQL::IChannelInstanceId& i_rId) const { return m_Rows.FindIndex(i_rId); }

    bool HaveActiveChannels() const { return m_bHaveActiveChannels; }
    ESubplotPinState GetPinState() const { return m_PinState; }
    int GetPinStateNumber() const { return static_cast<int>(m_PinState); }

    int rowCount(const QModelIndex& i_rParent = {}) const override;
    QVariant data(const QModelIndex& i_rIndex, int i_Role = Qt::DisplayRole) const override;
    bool setData(const QModelIndex& i_rIndex, const QVariant& i_rValue, int i_Role = Qt::EditRole) override;
    bool removeRows(int i_Row, int i_Count, const QModelIndex& i_rParent = {}) override;
    QHash<int, QByteArray> roleNames() const override;

    Q_INVOKABLE void clear();
    /// NotFound for an unknown id.
    Q_INVOKABLE TQL::IResult removeChannel(TQL::IChannelInstanceId i_rChannelInstanceId);
    /// Rows whose data are missing keep their pin.
    Q_INVOKABLE void setAllPinned(bool i_bPinned);

Q_SIGNALS:
    void haveActiveChannelsChanged();
    void pinStateChanged();
    /// The operator removed a channel; not raised for rows that left with the selection or the context.
    void channelRemoved(std::shared_ptr<TQL::IChannel> i_pChannel);

private:
    using RowPointer = VActiveChannelRows::RowPointer;
    using ChannelSet = std::unordered_set<std::shared_ptr<TQL::IChannel>>;

    bool IsRow(const QModelIndex& i_rIndex) const;
    bool AddChannel(const std::shared_ptr<TQL::IChannel>& i_rpChannel, bool i_bPinned);
    bool TakeChannels(const ChannelList& i_rChannels, const ChannelSet& i_rListed);
    bool RemoveUnlisted(const ChannelSet& i_rListed);
    bool RefreshOutputs();
    void EraseRows(std::size_t i_First, std::size_t i_Count);
    void SortRows();
    void SetName(std::size_t i_Row, const QString& i_rName);
    void SetPinned(std::size_t i_Row, bool i_bPinned);
    void NotifyChanged();
    void UpdatePinState();
    void ApplySwitch(const VContextSwitchPlan& i_rPlan);

    const std::shared_ptr<TQL::IChannelTextProvider> m_pTextProvider;
    const std::shared_ptr<OrvanePluginInterface::IChannelMigrationService> m_pMigrationService;
    const std::shared_ptr<NotificationSystem::VMultiCallbackPostal<void()>> m_pChannelsChanged;
    VActiveChannelRows m_Rows;
    ChannelList m_Current; // what the builder delivered last
    bool m_bHaveActiveChannels = false;
    ESubplotPinState m_PinState = ESubplotPinState::AllUnpinned;
};

} // namespace GraphPlotUI

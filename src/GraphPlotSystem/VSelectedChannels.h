#pragma once

#include "ChannelSystem/IChannelService.h"
#include "NotificationSystem/VMultiCallbackPostal.h"
#include "NotificationSystem/VSubscriptions.h"

#include <QtCore/QObject>
#include <QtCore/QString>

namespace GraphPlotUI
{

/// The channels that the host's selection names in one data context, as they come from the host: no derivation, no
/// pins. Stands where the active channel manager and model will stand. UI thread.
class VSelectedChannels : public QObject
{
    Q_OBJECT
    Q_PROPERTY(int count READ GetCount NOTIFY CountChanged)

public:
    using ChannelList = std::vector<std::shared_ptr<TQL::IChannel>>;

    VSelectedChannels(std::shared_ptr<TQL::IPostalService> i_pUiPostalService,
                      std::shared_ptr<ChannelSystem::IChannelService> i_pChannelService, QObject* i_pParent);

    /// The empty name lists no channel.
    void SetContext(const std::string& i_rName);
    const ChannelList& GetChannels() const { return m_Channels; }
    int GetCount() const { return static_cast<int>(m_Channels.size()); }

    /// Raised when the list has become another one.
    std::shared_ptr<TQL::IChangeSignal> ChannelsChanged() const { return m_pChannelsChanged; }

Q_SIGNALS:
    void CountChanged();

private:
    void Rebuild();
    ChannelList FindSelectedChannels() const;

    const std::shared_ptr<ChannelSystem::IChannelService> m_pChannelService;
    const std::shared_ptr<NotificationSystem::VChangeSignal> m_pChannelsChanged;
    NotificationSystem::VSubscriptions m_Subscriptions;
    std::string m_ContextName;
    ChannelList m_Channels;
};

} // namespace GraphPlotUI

#pragma once

#include <QtCore/QHash>
#include <QtCore/QObject>
#include <QtCore/QString>

#include <memory>

namespace ChannelSystem
{
class IChannelService;
}

namespace TQL
{
class IChannelTypeRegistry;
}

namespace GraphPlotUI
{

/// Tells the operator in words what to select in the host so that a channel type can be plotted. A child of the active
/// channel manager, which shows it to QML. UI thread.
class VChannelSelectionHelp : public QObject
{
    Q_OBJECT

public:
    /// The registry may be null: then no type counts as creatable. With the object word a host speaks of objects where
    /// it otherwise speaks of subjects and segments.
    VChannelSelectionHelp(std::shared_ptr<ChannelSystem::IChannelService> i_pChannelService,
                          std::shared_ptr<TQL::IChannelTypeRegistry> i_pTypeRegistry, bool i_bObjectWord,
                          QObject* i_pParent = nullptr);

    /// The empty text for a type that nothing is known of.
    Q_INVOKABLE QString selectionHelpText(const QString& i_rChannelType) const;

private:
    QString TextOfSourceType(const QString& i_rChannelType) const;

    const std::shared_ptr<ChannelSystem::IChannelService> m_pChannelService;
    const std::shared_ptr<TQL::IChannelTypeRegistry> m_pTypeRegistry;
    const bool m_bObjectWord;
    QHash<QString, QString> m_TextByType;
};

} // namespace GraphPlotUI

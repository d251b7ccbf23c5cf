#pragma once

#include <QtCore/QObject>

/// What a row of the list of active channels tells.
namespace TQL::ActiveChannelModelRoles
{

Q_NAMESPACE

enum EActiveChannelModelRoles
{
    ActiveChannelName = 0,     ///< QString; may be written
    ActiveChannelPinned = 256, ///< bool; may be written
    ActiveChannelMissingData,  ///< bool: the channel has no data now
    ActiveChannelInstanceId    ///< TQL::IChannelInstanceId
};
Q_ENUM_NS(EActiveChannelModelRoles)

} // namespace TQL::ActiveChannelModelRoles

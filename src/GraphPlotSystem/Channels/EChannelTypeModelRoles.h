#pragma once

#include <QtCore/QObject>

/// What a row of a channel type picker tells.
namespace TQL::ChannelTypeModelRoles
{

Q_NAMESPACE

enum EChannelTypeModelRoles
{
    ChannelTypeInternalName = 256, ///< QString
    ChannelTypeDisplayName,        ///< QString; of a header its category
    ChannelTypeCategoryHeader,     ///< bool
    ChannelTypeAvailable,          ///< bool: what is selected can give such a channel
    ChannelTypeDeveloperOnly       ///< bool
};
Q_ENUM_NS(EChannelTypeModelRoles)

} // namespace TQL::ChannelTypeModelRoles

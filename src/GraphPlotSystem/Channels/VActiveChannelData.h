#pragma once

#include "ChannelSystem/IChannel.h"

#include <QtCore/QString>

#include <cstddef>
#include <memory>

namespace GraphPlotUI
{

/// One row of the list of active channels.
struct VActiveChannelData
{
    std::shared_ptr<TQL::IChannel> pChannel; ///< never null in a list
    QString Name;
    bool bPinned = false;
    const TQL::IChannelOutput* pOutput = nullptr; ///< the output last seen, for its identity only: may be dead
    std::size_t Row = 0;                          ///< its place, as of the last numbering of its list
};

} // namespace GraphPlotUI

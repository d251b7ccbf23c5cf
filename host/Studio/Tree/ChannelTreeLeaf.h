#pragma once

#include "ChannelSystem/ISelectionSource.h"
#include "Studio/Tree/ChannelSearch.h"

#include <QtCore/QString>
#include <QtCore/QStringList>

namespace Studio
{

/// One channel as the tree shows it: the branches above it from the top ("Walker1", "Markers"), its own text, and what
/// is selected when it is ticked.
struct ChannelTreeLeaf
{
    QStringList Branches;
    QString Text;
    TQL::SelectionItem Item;
    ChannelSearchText Search = {};

    friend bool operator==(const ChannelTreeLeaf&, const ChannelTreeLeaf&) = default;
};

} // namespace Studio

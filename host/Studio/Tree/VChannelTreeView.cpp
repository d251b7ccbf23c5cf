#include "Studio/Tree/VChannelTreeView.h"

#include <QtGui/QKeyEvent>

namespace Studio
{

VChannelTreeView::VChannelTreeView(QWidget* i_pParent) : QTreeView(i_pParent)
{
    setObjectName(QStringLiteral("channelTree"));
    setAccessibleName(tr("Channels"));
    setHeaderHidden(true);
    setUniformRowHeights(true);
    setSelectionMode(QAbstractItemView::ExtendedSelection);
}

void VChannelTreeView::keyPressEvent(QKeyEvent* i_pEvent)
{
    if (i_pEvent->key() == Qt::Key_Space && i_pEvent->modifiers() == Qt::NoModifier)
        Q_EMIT ToggleRequested();
    else if (i_pEvent->key() == Qt::Key_Escape)
        Q_EMIT Left();
    else
        QTreeView::keyPressEvent(i_pEvent);
}

} // namespace Studio

#include "Studio/Common/WidgetKeys.h"

#include <QtCore/QCoreApplication>
#include <QtGui/QKeyEvent>
#include <QtWidgets/QAbstractButton>
#include <QtWidgets/QAbstractItemView>
#include <QtWidgets/QComboBox>

namespace Studio
{

namespace
{

bool IsListKey(const QKeyEvent& i_rKey)
{
    switch (i_rKey.key())
    {
    case Qt::Key_Left:
    case Qt::Key_Right:
    case Qt::Key_Up:
    case Qt::Key_Down:
    case Qt::Key_Home:
    case Qt::Key_End:
    case Qt::Key_PageUp:
    case Qt::Key_PageDown:
        return true;
    default:
        return !i_rKey.text().isEmpty() && i_rKey.text().front().isPrint(); // goes to the row that begins with it
    }
}

} // namespace

bool IsKeyOfWidget(const QWidget& i_rWidget, const QKeyEvent& i_rKey)
{
    if ((i_rKey.modifiers() & ~(Qt::ShiftModifier | Qt::KeypadModifier)) != Qt::NoModifier)
        return false;
    if (qobject_cast<const QAbstractItemView*>(&i_rWidget))
        return IsListKey(i_rKey);
    const bool bPressed =
        qobject_cast<const QAbstractButton*>(&i_rWidget) || qobject_cast<const QComboBox*>(&i_rWidget);
    return bPressed && i_rKey.key() == Qt::Key_Space;
}

VWidgetKeys::VWidgetKeys(QObject* i_pParent) : QObject(i_pParent)
{
    QCoreApplication::instance()->installEventFilter(this);
}

bool VWidgetKeys::eventFilter(QObject* i_pObject, QEvent* i_pEvent)
{
    if (i_pEvent->type() != QEvent::ShortcutOverride)
        return false;
    const auto* pWidget = qobject_cast<const QWidget*>(i_pObject);
    if (!pWidget || !IsKeyOfWidget(*pWidget, static_cast<QKeyEvent&>(*i_pEvent)))
        return false;
    i_pEvent->accept();
    return true;
}

} // namespace Studio

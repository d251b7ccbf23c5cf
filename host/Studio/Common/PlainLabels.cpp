#include "Studio/Common/PlainLabels.h"

#include <QtCore/QCoreApplication>
#include <QtCore/QEvent>
#include <QtWidgets/QLabel>

namespace Studio
{

QString WithoutMnemonics(QString i_Text)
{
    return i_Text.replace(QLatin1Char('&'), QLatin1String("&&"));
}

VPlainLabels::VPlainLabels(QObject* i_pParent) : QObject(i_pParent)
{
    QCoreApplication::instance()->installEventFilter(this);
}

/// Every widget is polished before it is seen the first time.
bool VPlainLabels::eventFilter(QObject* i_pObject, QEvent* i_pEvent)
{
    if (i_pEvent->type() != QEvent::Polish)
        return false;
    if (auto* pLabel = qobject_cast<QLabel*>(i_pObject); pLabel && pLabel->textFormat() == Qt::AutoText)
        pLabel->setTextFormat(Qt::PlainText);
    return false;
}

} // namespace Studio

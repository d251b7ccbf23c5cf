#pragma once

#include <QtCore/QObject>

class QKeyEvent;
class QWidget;

namespace Studio
{

/// Whether a key is the widget's own, so that it must not start an action of the window: Space on a button, the arrows
/// and letters in a list. Fields for text keep theirs by themselves.
bool IsKeyOfWidget(const QWidget& i_rWidget, const QKeyEvent& i_rKey);

/// Leaves to the widgets of the application the keys that are theirs, where they are shortcuts of the window too. Owned
/// by the window; UI thread.
class VWidgetKeys : public QObject
{
    Q_OBJECT

public:
    explicit VWidgetKeys(QObject* i_pParent = nullptr);

protected:
    bool eventFilter(QObject* i_pObject, QEvent* i_pEvent) override;
};

} // namespace Studio

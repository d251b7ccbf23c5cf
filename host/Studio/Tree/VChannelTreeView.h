#pragma once

#include <QtWidgets/QTreeView>

namespace Studio
{

/// The view of the channel tree: rows are selected to be ticked together, Space ticks them, Esc leaves. UI thread.
class VChannelTreeView : public QTreeView
{
    Q_OBJECT

public:
    explicit VChannelTreeView(QWidget* i_pParent = nullptr);

Q_SIGNALS:
    void ToggleRequested(); ///< of the selected rows
    void Left();            ///< the operator wants the keys of the window back

protected:
    void keyPressEvent(QKeyEvent* i_pEvent) override;
};

} // namespace Studio

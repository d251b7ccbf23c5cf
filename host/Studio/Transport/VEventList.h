#pragma once

#include <QtWidgets/QWidget>

class QLabel;
class QTreeView;

namespace Studio
{

class VEventListModel;
class VTransport;

/// The events of the current recording; a click or Return goes there. The transport outlives it. UI thread.
class VEventList : public QWidget
{
    Q_OBJECT

public:
    explicit VEventList(VTransport& i_rTransport, QWidget* i_pParent = nullptr);

private:
    void ShowEvents();
    void ShowTime();

    VTransport& m_rTransport;
    VEventListModel* m_pModel = nullptr;
    QTreeView* m_pView = nullptr;
    QLabel* m_pNone = nullptr; ///< in place of the list
};

} // namespace Studio

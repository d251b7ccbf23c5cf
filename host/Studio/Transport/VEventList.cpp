#include "Studio/Transport/VEventList.h"

#include "Studio/Transport/VEventListModel.h"
#include "Studio/Transport/VTransport.h"

#include <QtWidgets/QHeaderView>
#include <QtWidgets/QLabel>
#include <QtWidgets/QTreeView>
#include <QtWidgets/QVBoxLayout>

namespace Studio
{

VEventList::VEventList(VTransport& i_rTransport, QWidget* i_pParent) : QWidget(i_pParent), m_rTransport(i_rTransport)
{
    m_pModel = new VEventListModel(this);
    m_pView = new QTreeView(this);
    m_pView->setObjectName(QStringLiteral("eventList"));
    m_pView->setAccessibleName(tr("Events"));
    m_pView->setModel(m_pModel);
    m_pView->setRootIsDecorated(false);
    m_pView->setUniformRowHeights(true);
    m_pView->setAllColumnsShowFocus(true);
    m_pView->header()->setSectionResizeMode(QHeaderView::ResizeToContents);
    m_pNone = new QLabel(this);
    m_pNone->setAlignment(Qt::AlignCenter);
    m_pNone->setWordWrap(true);
    m_pNone->setEnabled(false);
    auto* pLayout = new QVBoxLayout(this);
    pLayout->setContentsMargins(0, 0, 0, 0);
    pLayout->addWidget(m_pView, 1);
    pLayout->addWidget(m_pNone, 1);

    const auto goTo = [this](const QModelIndex& i_rIndex)
    {
        m_rTransport.SeekToFrame(m_pModel->FrameOf(i_rIndex.row()));
    };
    connect(m_pView, &QTreeView::clicked, this, goTo);
    connect(m_pView, &QTreeView::activated, this, goTo);
    connect(&m_rTransport, &VTransport::EventsChanged, this, &VEventList::ShowEvents);
    connect(&m_rTransport, &VTransport::Changed, this, &VEventList::ShowTime);
    ShowEvents();
}

void VEventList::ShowEvents()
{
    m_pModel->SetEvents(m_rTransport.Events());
    m_pView->setVisible(m_pModel->rowCount() > 0);
    m_pNone->setVisible(m_pModel->rowCount() == 0);
    ShowTime();
}

void VEventList::ShowTime()
{
    const TransportState state = m_rTransport.State();
    if (!state.bSource)
        m_pNone->clear();
    else
        m_pNone->setText(state.bLiveData ? tr("A capture has no events.") : tr("This recording has no events."));
    const int former = m_pModel->CurrentRow();
    m_pModel->SetCurrentFrame(state.Frame);
    const int current = m_pModel->CurrentRow();
    if (current >= 0 && current != former)
        m_pView->scrollTo(m_pModel->index(current, 0));
}

} // namespace Studio

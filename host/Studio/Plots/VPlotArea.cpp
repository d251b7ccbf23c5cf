#include "Studio/Plots/VPlotArea.h"

#include "Studio/Common/VMainActions.h"
#include "Studio/Plots/VPlotFrame.h"
#include "Studio/Session/VStudioSession.h"

#include <QtCore/QEvent>
#include <QtCore/QScopedValueRollback>
#include <QtGui/QAction>
#include <QtWidgets/QMdiArea>
#include <QtWidgets/QMdiSubWindow>
#include <QtWidgets/QVBoxLayout>

#include <algorithm>

namespace Studio
{

VPlotArea::VPlotArea(VStudioSession& i_rSession, VMainActions& i_rActions, QWidget* i_pParent)
    : QWidget(i_pParent), m_rSession(i_rSession), m_rActions(i_rActions)
{
    m_pMdi = new QMdiArea(this);
    m_pMdi->setObjectName(QStringLiteral("plots"));
    m_pMdi->setActivationOrder(QMdiArea::CreationOrder);
    m_pMdi->setOption(QMdiArea::DontMaximizeSubWindowOnActivation);
    m_pMdi->setDocumentMode(true);
    m_pMdi->setTabsClosable(true);
    m_pMdi->setTabsMovable(true);
    m_pMdi->viewport()->installEventFilter(this);
    auto* pLayout = new QVBoxLayout(this);
    pLayout->setContentsMargins(0, 0, 0, 0);
    pLayout->addWidget(m_pMdi);
    ConnectActions(i_rActions);
    SetTabbed(true);
}

VPlotArea::~VPlotArea()
{
    // The windows tell of their end while this goes.
    for (const auto& [pWindow, place] : m_Places)
        disconnect(pWindow, nullptr, this, nullptr);
}

void VPlotArea::ConnectActions(VMainActions& i_rActions)
{
    const auto on = [&](EAction i_Action, auto i_Function)
    {
        connect(i_rActions.Get(i_Action), &QAction::triggered, this, i_Function);
    };
    on(EAction::NewPlot,
       [this]
       {
           std::string error;
           if (!OpenPlot(error))
               Q_EMIT Failed(QString::fromStdString(error));
       });
    on(EAction::ClosePlot, [this] { CloseCurrent(); });
    on(EAction::NextPlot, [this] { m_pMdi->activateNextSubWindow(); });
    on(EAction::PreviousPlot, [this] { m_pMdi->activatePreviousSubWindow(); });
    on(EAction::Tabs, [this] { SetTabbed(true); });
    on(EAction::SideBySide, [this] { SetTabbed(false); });
    on(EAction::Arrange,
       [this]
       {
           SetTabbed(false);
           Arrange();
       });
}

QString VPlotArea::FreeTitle() const
{
    for (int number = 1;; ++number)
    {
        const QString title = tr("Graph Plots %1").arg(number);
        if (std::ranges::none_of(m_Places,
                                 [&](const auto& i_rEntry) { return i_rEntry.first->windowTitle() == title; }))
            return title;
    }
}

bool VPlotArea::OpenPlot(std::string& o_rError)
{
    auto* pFrame = new VPlotFrame;
    const QString title = FreeTitle();
    QMdiSubWindow* pWindow = nullptr;
    {
        const QScopedValueRollback placing(m_bPlacing, true);
        pWindow = m_pMdi->addSubWindow(pFrame, Qt::SubWindow | Qt::CustomizeWindowHint | Qt::WindowTitleHint |
                                                   Qt::WindowCloseButtonHint);
        pWindow->setAttribute(Qt::WA_DeleteOnClose);
        pWindow->setSystemMenu(nullptr); // its keys are the window's own actions
        if (pFrame->Open(m_rSession, o_rError).IsError())
        {
            delete pWindow;
            return false;
        }
        pFrame->setWindowTitle(title);
        m_Places[pWindow] = m_bArranged ? QRectF(0, 0, 1, 1) : QRectF(0.25, 0.25, 0.5, 0.5);
        pWindow->installEventFilter(this);
        connect(pWindow, &QObject::destroyed, this, &VPlotArea::Forget);
        if (m_pMdi->viewMode() == QMdiArea::TabbedView)
            pWindow->showMaximized();
        else
            pWindow->show();
    }
    m_pMdi->setActiveSubWindow(pWindow);
    if (m_bArranged)
        Arrange();
    PlaceAll();
    Q_EMIT CountChanged();
    return true;
}

void VPlotArea::CloseCurrent()
{
    if (QMdiSubWindow* pWindow = m_pMdi->currentSubWindow())
        pWindow->close();
}

void VPlotArea::Forget(QObject* i_pWindow)
{
    std::erase_if(m_Places, [=](const auto& i_rEntry) { return i_rEntry.first == i_pWindow; });
    if (m_Places.empty())
        m_bArranged = true;
    if (m_bArranged)
        Arrange();
    Q_EMIT CountChanged();
}

void VPlotArea::SetTabbed(bool i_bTabbed)
{
    m_rActions.Get(i_bTabbed ? EAction::Tabs : EAction::SideBySide)->setChecked(true);
    {
        const QScopedValueRollback placing(m_bPlacing, true);
        m_pMdi->setViewMode(i_bTabbed ? QMdiArea::TabbedView : QMdiArea::SubWindowView);
        for (const auto& [pWindow, place] : m_Places)
        {
            if (i_bTabbed)
                pWindow->showMaximized();
            else
                pWindow->showNormal();
        }
    }
    PlaceAll();
}

void VPlotArea::Arrange()
{
    m_bArranged = true;
    const auto places = TilePlots(m_Places.size());
    std::size_t next = 0;
    for (QMdiSubWindow* pWindow : m_pMdi->subWindowList())
        if (const auto found = m_Places.find(pWindow); found != m_Places.end())
            found->second = places[next++];
    PlaceAll();
}

QSize VPlotArea::SmallestPlot() const
{
    const int line = fontMetrics().lineSpacing();
    return {line * 12, line * 8};
}

void VPlotArea::PlaceAll()
{
    if (m_pMdi->viewMode() == QMdiArea::TabbedView)
        return;
    const QScopedValueRollback placing(m_bPlacing, true);
    const QSize area = m_pMdi->viewport()->size();
    for (const auto& [pWindow, place] : m_Places)
        pWindow->setGeometry(PlaceInArea(place, area, SmallestPlot()));
}

/// The operator has moved or resized it.
void VPlotArea::NotePlace(QMdiSubWindow& i_rWindow)
{
    const auto found = m_Places.find(&i_rWindow);
    if (found == m_Places.end() || i_rWindow.isMaximized() || i_rWindow.isMinimized())
        return;
    const QSize area = m_pMdi->viewport()->size();
    if (i_rWindow.geometry() == PlaceInArea(found->second, area, SmallestPlot()))
        return;
    found->second = ShareOfArea(i_rWindow.geometry(), area);
    m_bArranged = false;
}

bool VPlotArea::eventFilter(QObject* i_pObject, QEvent* i_pEvent)
{
    const bool bMoved = i_pEvent->type() == QEvent::Resize || i_pEvent->type() == QEvent::Move;
    if (bMoved && i_pObject == m_pMdi->viewport())
        PlaceAll();
    else if (bMoved && !m_bPlacing && m_pMdi->viewMode() == QMdiArea::SubWindowView)
    {
        if (auto* pWindow = qobject_cast<QMdiSubWindow*>(i_pObject); pWindow && pWindow->isVisible())
            NotePlace(*pWindow);
    }
    return QWidget::eventFilter(i_pObject, i_pEvent);
}

void VPlotArea::Save(WindowLayout& o_rLayout) const
{
    o_rLayout.bTabbed = m_pMdi->viewMode() == QMdiArea::TabbedView;
    const QList<QMdiSubWindow*> windows = m_pMdi->subWindowList();
    o_rLayout.Plots.clear();
    for (QMdiSubWindow* pWindow : windows)
        if (const auto found = m_Places.find(pWindow); found != m_Places.end())
            o_rLayout.Plots.push_back(found->second);
    o_rLayout.Current = std::max(0, static_cast<int>(windows.indexOf(m_pMdi->currentSubWindow())));
}

bool VPlotArea::Restore(const WindowLayout& i_rLayout, std::string& o_rError)
{
    SetTabbed(i_rLayout.bTabbed);
    while (Count() < static_cast<int>(i_rLayout.Plots.size()))
        if (!OpenPlot(o_rError))
            return false;
    const QList<QMdiSubWindow*> windows = m_pMdi->subWindowList();
    for (qsizetype i = 0; i < windows.size() && i < std::ssize(i_rLayout.Plots); ++i)
        m_Places[windows[i]] = i_rLayout.Plots[static_cast<std::size_t>(i)];
    m_bArranged = i_rLayout.Plots == TilePlots(i_rLayout.Plots.size());
    PlaceAll();
    if (i_rLayout.Current < windows.size())
        m_pMdi->setActiveSubWindow(windows[i_rLayout.Current]);
    return true;
}

std::vector<QWidget*> VPlotArea::Contents() const
{
    std::vector<QWidget*> contents;
    for (const QMdiSubWindow* pWindow : m_pMdi->subWindowList())
        if (const auto* pFrame = qobject_cast<VPlotFrame*>(pWindow->widget()))
            contents.push_back(pFrame->Content());
    return contents;
}

void VPlotArea::FocusCurrent()
{
    if (QMdiSubWindow* pWindow = m_pMdi->currentSubWindow())
        pWindow->setFocus(Qt::ShortcutFocusReason);
    else
        setFocus(Qt::ShortcutFocusReason);
}

} // namespace Studio

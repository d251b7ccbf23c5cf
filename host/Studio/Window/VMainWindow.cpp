#include "Studio/Window/VMainWindow.h"

#include "Services/Postal/VUiPostalService.h"
#include "Services/Time/VTimeController.h"
#include "Studio/Common/Paths.h"
#include "Studio/Common/PlainLabels.h"
#include "Studio/Common/VMainActions.h"
#include "Studio/Common/WidgetKeys.h"
#include "Studio/Common/WindowLayout.h"
#include "Studio/Files/VChangedFilesBar.h"
#include "Studio/Files/VFileActions.h"
#include "Studio/Files/VLoadingBar.h"
#include "Studio/Files/VOpenFiles.h"
#include "Studio/Files/VStartPage.h"
#include "Studio/Log/VLogModel.h"
#include "Studio/Log/VLogPanel.h"
#include "Studio/Log/VNoticeBar.h"
#include "Studio/Plots/PlotStates.h"
#include "Studio/Plots/VPlotArea.h"
#include "Studio/Session/VLiveActions.h"
#include "Studio/Session/VStudioSession.h"
#include "Studio/Transport/VEventList.h"
#include "Studio/Transport/VTransport.h"
#include "Studio/Transport/VTransportBar.h"
#include "Studio/Tree/VChannelPanel.h"
#include "Studio/Window/VShortcutsDialog.h"

#include <QtCore/QMimeData>
#include <QtCore/QUrl>
#include <QtGui/QAction>
#include <QtGui/QCloseEvent>
#include <QtGui/QDragEnterEvent>
#include <QtGui/QDropEvent>
#include <QtGui/QScreen>
#include <QtWidgets/QDockWidget>
#include <QtWidgets/QMenu>
#include <QtWidgets/QMenuBar>
#include <QtWidgets/QPushButton>
#include <QtWidgets/QStackedWidget>
#include <QtWidgets/QToolBar>
#include <QtWidgets/QVBoxLayout>

#include <utility>
#include <vector>

namespace Studio
{

namespace
{

std::filesystem::path LayoutFile(const VStudioSession& i_rSession)
{
    return i_rSession.SettingsFolder().empty() ? std::filesystem::path()
                                               : i_rSession.SettingsFolder() / "window-layout.json";
}

std::filesystem::path StatesFile(const VStudioSession& i_rSession)
{
    return i_rSession.SettingsFolder().empty() ? std::filesystem::path()
                                               : i_rSession.SettingsFolder() / "window-states.json";
}

std::vector<std::filesystem::path> LocalFiles(const QMimeData& i_rData)
{
    std::vector<std::filesystem::path> paths;
    for (const QUrl& rUrl : i_rData.urls())
        if (rUrl.isLocalFile())
            paths.push_back(PathFromText(rUrl.toLocalFile().toStdString()));
    return paths;
}

QSize UsualSize(const QWidget& i_rWindow)
{
    const QSize wished(i_rWindow.fontMetrics().averageCharWidth() * 230, i_rWindow.fontMetrics().lineSpacing() * 58);
    return wished.boundedTo(i_rWindow.screen()->availableSize() * 9 / 10);
}

} // namespace

VMainWindow::VMainWindow(VStudioSession& i_rSession, VLogModel* i_pLog, QWidget* i_pParent)
    : QMainWindow(i_pParent), m_rSession(i_rSession), m_Subscriptions(i_rSession.Host().Ledger())
{
    setAcceptDrops(true);
    new VWidgetKeys(this);
    new VPlainLabels(this);
    m_pActions = new VMainActions(this);
    m_pFiles = new VOpenFiles(m_rSession, this);
    m_pTransport = new VTransport(m_rSession, this);
    BuildCentre();
    BuildTransport();
    BuildPanels(i_pLog ? *i_pLog : *new VLogModel(VLogModel::UsualLimit, this));
    BuildMenus();
    ConnectTransport();
    ConnectOther();
    resize(UsualSize(*this));
    ShowCentre();
    ShowTitle();
}

VMainWindow::~VMainWindow() = default;

void VMainWindow::BuildCentre()
{
    auto* pColumn = new QWidget(this);
    auto* pLayout = new QVBoxLayout(pColumn);
    pLayout->setContentsMargins(0, 0, 0, 0);
    pLayout->setSpacing(0);
    m_pNotices = new VNoticeBar(pColumn);
    pLayout->addWidget(new VLoadingBar(m_pFiles->Loader(), pColumn));
    pLayout->addWidget(new VChangedFilesBar(*m_pFiles, pColumn));
    pLayout->addWidget(m_pNotices);

    m_pCentre = new QStackedWidget(pColumn);
    auto* pStart = new VStartPage(*m_pActions, m_pFiles->Recent(), m_pCentre);
    connect(pStart, &VStartPage::OpenRequested, this,
            [this](const QString& i_rPath) { OpenFile(PathFromText(i_rPath.toStdString())); });
    m_pStartPage = pStart;
    m_pPlots = new VPlotArea(m_rSession, *m_pActions, m_pCentre);
    m_pNoPlots = new QWidget(m_pCentre);
    auto* pNew = new QPushButton(tr("&New Graph Plots window (Ctrl+T)"), m_pNoPlots);
    connect(pNew, &QPushButton::clicked, m_pActions->Get(EAction::NewPlot), &QAction::trigger);
    auto* pNoPlotsLayout = new QVBoxLayout(m_pNoPlots);
    pNoPlotsLayout->addWidget(pNew, 0, Qt::AlignCenter);
    for (QWidget* pPage : {m_pStartPage, m_pNoPlots, static_cast<QWidget*>(m_pPlots)})
        m_pCentre->addWidget(pPage);
    pLayout->addWidget(m_pCentre, 1);
    setCentralWidget(pColumn);
}

void VMainWindow::BuildTransport()
{
    auto* pBar = new QToolBar(tr("Transport"), this);
    pBar->setObjectName(QStringLiteral("transport"));
    pBar->setMovable(false);
    pBar->toggleViewAction()->setVisible(false); // always there
    pBar->addWidget(new VTransportBar(m_rSession, *m_pTransport, *m_pActions, pBar));
    addToolBar(Qt::BottomToolBarArea, pBar);
}

void VMainWindow::BuildPanels(VLogModel& i_rLog)
{
    m_pChannels = new VChannelPanel(m_rSession, *m_pActions, this);
    m_pLog = new VLogPanel(i_rLog, this);
    auto* pChannels = AddPanel("channels", tr("Channels"), m_pChannels, Qt::LeftDockWidgetArea, EAction::ShowChannels);
    auto* pEvents = AddPanel("events", tr("Events"), new VEventList(*m_pTransport, this), Qt::LeftDockWidgetArea,
                             EAction::ShowEvents);
    m_pLogDock = AddPanel("logPanel", tr("Log"), m_pLog, Qt::BottomDockWidgetArea, EAction::ShowLog);
    m_pLogDock->hide();
    ShowWhichPanels();
    const int width = fontMetrics().averageCharWidth() * 42;
    resizeDocks({pChannels, pEvents}, {width, width}, Qt::Horizontal);
    resizeDocks({pChannels, pEvents}, {3, 1}, Qt::Vertical);
    resizeDocks({m_pLogDock}, {fontMetrics().lineSpacing() * 12}, Qt::Vertical);
}

QDockWidget* VMainWindow::AddPanel(const char* i_pName, const QString& i_rTitle, QWidget* i_pPanel,
                                   Qt::DockWidgetArea i_Area, EAction i_Action)
{
    auto* pDock = new QDockWidget(i_rTitle, this);
    pDock->setObjectName(QString::fromLatin1(i_pName));
    pDock->setWidget(i_pPanel);
    addDockWidget(i_Area, pDock);
    QAction* pAction = m_pActions->Get(i_Action);
    connect(pAction, &QAction::triggered, pDock, &QWidget::setVisible);
    // A panel behind another's tab, or of a window that is not shown yet, is not hidden.
    connect(pDock->toggleViewAction(), &QAction::toggled, pAction, &QAction::setChecked);
    return pDock;
}

void VMainWindow::ShowWhichPanels()
{
    const std::pair<const char*, EAction> panels[] = {
        {"channels", EAction::ShowChannels}, {"events", EAction::ShowEvents}, {"logPanel", EAction::ShowLog}};
    for (const auto& [pName, action] : panels)
        m_pActions->Get(action)->setChecked(!findChild<QDockWidget*>(QString::fromLatin1(pName))->isHidden());
}

void VMainWindow::BuildMenus()
{
    m_pActions->AddMenus(*menuBar());
    new VLiveActions(m_rSession, *m_pActions->Menu(EMenu::Live), *this,
                     [this](const std::string& i_rText) { ShowMessage(i_rText); });
    m_pFileActions = new VFileActions(m_rSession, *m_pActions, *m_pFiles, *m_pNotices, *this);
    m_pFileActions->AddRecentMenu(*m_pActions);
    connect(m_pFileActions, &VFileActions::ProblemsRequested, this, &VMainWindow::ShowLogOfProblems);
}

void VMainWindow::ConnectTransport()
{
    const auto on = [this](EAction i_Action, auto i_Function)
    {
        connect(m_pActions->Get(i_Action), &QAction::triggered, m_pTransport, i_Function);
    };
    VTransport* pTransport = m_pTransport;
    on(EAction::Play, &VTransport::TogglePlay);
    on(EAction::NextFrame, [pTransport] { pTransport->StepBy(1); });
    on(EAction::PreviousFrame, [pTransport] { pTransport->StepBy(-1); });
    on(EAction::TenFramesOn, [pTransport] { pTransport->StepBy(10); });
    on(EAction::TenFramesBack, [pTransport] { pTransport->StepBy(-10); });
    on(EAction::FirstFrame, &VTransport::GoToStart);
    on(EAction::LastFrame, &VTransport::GoToEnd);
    on(EAction::NextEvent, [pTransport] { pTransport->GoToEvent(1); });
    on(EAction::PreviousEvent, [pTransport] { pTransport->GoToEvent(-1); });
    on(EAction::Faster, [pTransport] { pTransport->ChangeSpeed(1); });
    on(EAction::Slower, [pTransport] { pTransport->ChangeSpeed(-1); });
    on(EAction::NormalSpeed, [pTransport] { pTransport->SetSpeed(1.0); });
    on(EAction::Loop, &VTransport::SetLooping);
    on(EAction::LoopStart, &VTransport::MarkLoopStart);
    on(EAction::LoopEnd, &VTransport::MarkLoopEnd);
    on(EAction::ClearLoop, &VTransport::ClearMarks);
    on(EAction::Live, [pTransport] { pTransport->SetLive(true); });
    on(EAction::Review, [pTransport] { pTransport->SetLive(false); });
}

void VMainWindow::ConnectOther()
{
    connect(m_pChannels, &VChannelPanel::Left, m_pPlots, &VPlotArea::FocusCurrent);
    connect(m_pActions->Get(EAction::FindChannel), &QAction::triggered, this,
            [this]
            {
                if (QAction* pShow = m_pActions->Get(EAction::ShowChannels); !pShow->isChecked())
                    pShow->trigger();
                m_pChannels->FocusSearch();
            });
    connect(m_pPlots, &VPlotArea::Failed, m_pNotices, [this](const QString& i_rText) { m_pNotices->Add(i_rText); });
    connect(m_pPlots, &VPlotArea::CountChanged, this, &VMainWindow::ShowCentre);
    connect(m_pActions->Get(EAction::Shortcuts), &QAction::triggered, this,
            [this]
            {
                VShortcutsDialog dialog(*menuBar(), this);
                dialog.exec();
            });
    m_Subscriptions.Subscribe(
        m_rSession.Host().TimeController()->CurrentSourceChanged(),
        [this]
        {
            ShowCentre();
            ShowTitle();
        },
        m_rSession.Host().Ui());
}

bool VMainWindow::Restore(std::string& o_rError)
{
    WindowLayout layout = ReadLayout(LayoutFile(m_rSession)).value_or(WindowLayout());
    if (layout.Plots.empty())
        layout.Plots = TilePlots(1);
    if (!layout.Geometry.isEmpty())
        restoreGeometry(layout.Geometry); // puts it onto a screen that is there
    if (!layout.Panels.isEmpty())
        restoreState(layout.Panels);
    ShowWhichPanels();
    if (!m_pPlots->Restore(layout, o_rError))
        return false;
    if (const auto pStates = StatesFile(m_rSession).empty() ? nullptr : ReadPlotStates(StatesFile(m_rSession)))
    {
        const auto contents = m_pPlots->Contents();
        for (std::size_t i = 0; i < contents.size(); ++i)
            if (contents[i])
                LoadPlotState(*pStates, i, *contents[i]);
    }
    return true;
}

void VMainWindow::SaveLayout() const
{
    WindowLayout layout;
    layout.Geometry = saveGeometry();
    layout.Panels = saveState();
    m_pPlots->Save(layout);
    WriteLayout(LayoutFile(m_rSession), layout);
    if (!StatesFile(m_rSession).empty())
        SavePlotStates(StatesFile(m_rSession), m_pPlots->Contents());
}

void VMainWindow::closeEvent(QCloseEvent* i_pEvent)
{
    if (!m_rSession.MayLoseLive())
        return i_pEvent->ignore();
    SaveLayout();
    QMainWindow::closeEvent(i_pEvent);
}

void VMainWindow::dragEnterEvent(QDragEnterEvent* i_pEvent)
{
    if (!LocalFiles(*i_pEvent->mimeData()).empty())
        i_pEvent->acceptProposedAction();
}

void VMainWindow::dropEvent(QDropEvent* i_pEvent)
{
    OpenFiles(LocalFiles(*i_pEvent->mimeData()));
    i_pEvent->acceptProposedAction();
}

void VMainWindow::OpenFiles(std::span<const std::filesystem::path> i_Paths)
{
    m_pFileActions->Open(i_Paths);
}

void VMainWindow::ShowLogOfProblems()
{
    m_pLogDock->show();
    m_pLogDock->raise();
    m_pLog->ShowProblems();
}

/// Nothing open: what to do. No plots: how to get one.
void VMainWindow::ShowCentre()
{
    QWidget* pPage = m_pPlots->Count() > 0 ? static_cast<QWidget*>(m_pPlots) : m_pNoPlots;
    m_pCentre->setCurrentWidget(m_rSession.CurrentContextName().empty() ? m_pStartPage : pPage);
}

/// The file that is shown, or the context where there is none.
void VMainWindow::ShowTitle()
{
    const std::string context = m_rSession.CurrentContextName();
    const std::string file = TextFromPath(m_rSession.FileOf(context).filename());
    QString name = QString::fromStdString(file.empty() ? context : file);
    name.replace(QLatin1String("[*]"), QLatin1String("[*][*]")); // of the name, not the mark of what is unsaved
    setWindowTitle(name.isEmpty() ? tr("Graph Plots Studio[*]") : tr("%1[*] – Graph Plots Studio").arg(name));
}

bool VMainWindow::OpenPlot(std::string& o_rError)
{
    return m_pPlots->OpenPlot(o_rError);
}

void VMainWindow::ShowMessage(const std::string& i_rText)
{
    m_pNotices->Add(QString::fromStdString(i_rText));
}

} // namespace Studio

#include "Studio/VMainWindow.h"

#include "Channels/VChannelContext.h"
#include "Channels/VChannelService.h"
#include "Services/VSelectionSource.h"
#include "Services/VTimeController.h"
#include "Services/VUiPostalService.h"
#include "Studio/ChannelLeaves.h"
#include "Studio/Paths.h"
#include "Studio/VChannelTreeModel.h"
#include "Studio/VPlotFrame.h"
#include "Studio/VStudioSession.h"
#include "Studio/VTransportBar.h"

#include <QtGui/QAction>
#include <QtGui/QKeySequence>
#include <QtWidgets/QDockWidget>
#include <QtWidgets/QFileDialog>
#include <QtWidgets/QMdiArea>
#include <QtWidgets/QMdiSubWindow>
#include <QtWidgets/QMenu>
#include <QtWidgets/QMenuBar>
#include <QtWidgets/QStatusBar>
#include <QtWidgets/QToolBar>
#include <QtWidgets/QTreeView>

namespace Studio
{

VMainWindow::VMainWindow(VStudioSession& i_rSession, QWidget* i_pParent)
    : QMainWindow(i_pParent), m_rSession(i_rSession), m_Subscriptions(i_rSession.Host().Ledger())
{
    setWindowTitle(tr("Graph Plots Studio"));
    m_pArea = new QMdiArea(this);
    setCentralWidget(m_pArea);
    BuildTree();
    m_pTransport = new VTransportBar(m_rSession, this);
    auto* pBar = new QToolBar(tr("Transport"), this);
    pBar->setObjectName(QStringLiteral("transport"));
    pBar->setMovable(false);
    pBar->addWidget(m_pTransport);
    addToolBar(Qt::BottomToolBarArea, pBar);
    BuildMenus();
    statusBar();
    resize(1280, 800);
    Subscribe();
    ShowTreeOfCurrentContext();
}

VMainWindow::~VMainWindow() = default;

void VMainWindow::BuildTree()
{
    m_pTreeModel = new VChannelTreeModel(this);
    m_pTree = new QTreeView(this);
    m_pTree->setModel(m_pTreeModel);
    m_pTree->setHeaderHidden(true);
    m_pTree->setUniformRowHeights(true);
    auto* pDock = new QDockWidget(tr("Channels"), this);
    pDock->setObjectName(QStringLiteral("channels"));
    pDock->setFeatures(QDockWidget::DockWidgetMovable | QDockWidget::DockWidgetClosable);
    pDock->setWidget(m_pTree);
    addDockWidget(Qt::LeftDockWidgetArea, pDock);
    resizeDocks({pDock}, {240}, Qt::Horizontal);
    connect(m_pTreeModel, &VChannelTreeModel::TickedChanged, this, &VMainWindow::SetSelection);
}

void VMainWindow::BuildMenus()
{
    QMenu* pFile = menuBar()->addMenu(tr("&File"));
    pFile->addAction(tr("&Open…"), QKeySequence(QKeySequence::Open), this, &VMainWindow::ChooseFile);
    pFile->addSeparator();
    pFile->addAction(tr("&Quit"), QKeySequence(QKeySequence::Quit), this, &QWidget::close);

    QMenu* pPlay = menuBar()->addMenu(tr("&Playback"));
    pPlay->addAction(tr("&Play or pause"), QKeySequence(Qt::Key_Space), m_pTransport, &VTransportBar::TogglePlay);
    pPlay->addAction(tr("&Next frame"), QKeySequence(Qt::CTRL | Qt::Key_Right), this,
                     [this] { m_pTransport->StepBy(1); });
    pPlay->addAction(tr("P&revious frame"), QKeySequence(Qt::CTRL | Qt::Key_Left), this,
                     [this] { m_pTransport->StepBy(-1); });

    QMenu* pWindow = menuBar()->addMenu(tr("&Window"));
    pWindow->addAction(tr("New &Graph Plots window"), QKeySequence(QKeySequence::New), this,
                       [this]
                       {
                           std::string error;
                           OpenPlot(error);
                       });
    pWindow->addAction(tr("&Tile"), m_pArea, &QMdiArea::tileSubWindows);
    pWindow->addAction(tr("&Cascade"), m_pArea, &QMdiArea::cascadeSubWindows);
}

void VMainWindow::Subscribe()
{
    auto& rHost = m_rSession.Host();
    m_Subscriptions.Subscribe(
        rHost.TimeController()->CurrentSourceChanged(), [this] { ShowTreeOfCurrentContext(); }, rHost.Ui());
    m_Subscriptions.Subscribe(
        m_rSession.Channels().ContextListChanged(), [this] { ShowTreeOfCurrentContext(); }, rHost.Ui());
    m_Subscriptions.Subscribe(
        rHost.Selection()->Changed(), [this](bool) { TakeSelection(); }, rHost.Ui());
}

void VMainWindow::ShowTreeOfCurrentContext()
{
    const auto pContext = m_rSession.CurrentContext();
    if (!pContext)
    {
        m_pTreeModel->SetLeaves({});
        return;
    }
    const auto channels = ListChannels(*pContext);
    std::vector<TQL::SelectionItem> known;
    for (const SelectableChannel& rChannel : channels)
        known.push_back(rChannel.Item);
    m_pTreeModel->SetLeaves(MakeLeaves(channels));
    const auto items = m_Selection.Show(pContext->GetName(), known);
    m_pTreeModel->SetTicked(items);
    m_pTree->expandToDepth(channels.size() > 200 ? 0 : 1);
    m_rSession.Host().Selection()->Set(items);
}

void VMainWindow::TakeSelection()
{
    const auto items = AllItems(*m_rSession.Host().Selection()->GetSelection());
    if (HoldSameItems(items, m_pTreeModel->Ticked()))
        return;
    m_pTreeModel->SetTicked(items);
    m_Selection.Remember(m_pTreeModel->Ticked());
}

void VMainWindow::SetSelection()
{
    m_Selection.Remember(m_pTreeModel->Ticked());
    m_rSession.Host().Selection()->Set(m_pTreeModel->Ticked());
}

void VMainWindow::ChooseFile()
{
    const QStringList paths = QFileDialog::getOpenFileNames(this, tr("Open recordings"), QString(),
                                                            tr("Motion files (*.c3d *.C3D);;All files (*)"));
    for (const QString& rPath : paths)
        OpenFile(PathFromText(rPath.toStdString()));
}

void VMainWindow::OpenFile(const std::filesystem::path& i_rPath)
{
    std::string name, error;
    if (m_rSession.OpenFile(i_rPath, name, error).IsError())
    {
        ShowMessage(error);
        return;
    }
    m_rSession.ShowContext(name);
    ShowMessage("Opened " + TextFromPath(i_rPath));
}

bool VMainWindow::OpenPlot(std::string& o_rError)
{
    auto* pFrame = new VPlotFrame;
    QMdiSubWindow* pWindow = m_pArea->addSubWindow(pFrame);
    pWindow->setAttribute(Qt::WA_DeleteOnClose);
    if (pFrame->Open(m_rSession, o_rError).IsError())
    {
        delete pWindow;
        ShowMessage(o_rError);
        return false;
    }
    pFrame->setWindowTitle(tr("Graph Plots %1").arg(++m_PlotNumber));
    if (m_pArea->subWindowList().size() == 1)
        pWindow->showMaximized();
    else
    {
        pWindow->show();
        m_pArea->tileSubWindows();
    }
    return true;
}

void VMainWindow::ShowMessage(const std::string& i_rText)
{
    statusBar()->showMessage(QString::fromStdString(i_rText));
}

} // namespace Studio

#include "Studio/Tree/VChannelPanel.h"

#include "Channels/Contexts/VChannelContext.h"
#include "Channels/VChannelService.h"
#include "Services/Postal/VUiPostalService.h"
#include "Services/Selection/VSelectionSource.h"
#include "Services/Time/VTimeController.h"
#include "Studio/Common/VMainActions.h"
#include "Studio/Session/VStudioSession.h"
#include "Studio/Tree/ChannelLeaves.h"
#include "Studio/Tree/VChannelFilterModel.h"
#include "Studio/Tree/VChannelTreeModel.h"
#include "Studio/Tree/VChannelTreeView.h"

#include <QtGui/QAction>
#include <QtGui/QKeyEvent>
#include <QtWidgets/QHBoxLayout>
#include <QtWidgets/QLabel>
#include <QtWidgets/QLineEdit>
#include <QtWidgets/QMessageBox>
#include <QtWidgets/QPushButton>
#include <QtWidgets/QToolButton>
#include <QtWidgets/QVBoxLayout>

#include <utility>

namespace Studio
{

namespace
{

constexpr int mostExpanded = 200; // channels; of more only the subjects are unfolded at first

} // namespace

VChannelPanel::VChannelPanel(VStudioSession& i_rSession, VMainActions& i_rActions, QWidget* i_pParent)
    : QWidget(i_pParent), m_rSession(i_rSession), m_Subscriptions(i_rSession.Host().Ledger())
{
    BuildSearch();
    BuildTree();
    auto* pLayout = new QVBoxLayout(this);
    pLayout->setContentsMargins(0, 0, 0, 0);
    pLayout->addWidget(m_pSearch);
    pLayout->addWidget(m_pTree, 1);
    pLayout->addWidget(MakeFoot(i_rActions));
    pLayout->addWidget(m_pCount);
    connect(i_rActions.Get(EAction::TickShown), &QAction::triggered, this,
            [this] { m_pShown->Tick(m_pShown->AllLeaves(), true); });
    connect(i_rActions.Get(EAction::UntickAll), &QAction::triggered, this,
            [this]
            {
                m_pModel->SetTicked({});
                SetSelection();
            });
    Subscribe();
    ShowCurrentContext();
}

VChannelPanel::~VChannelPanel() = default;

void VChannelPanel::BuildSearch()
{
    m_pSearch = new QLineEdit(this);
    m_pSearch->setObjectName(QStringLiteral("channelSearch"));
    m_pSearch->setAccessibleName(tr("Search channels"));
    m_pSearch->setPlaceholderText(tr("Search channels (Ctrl+F)"));
    m_pSearch->setToolTip(tr("Words of names, kinds, units or components; all of them must fit.\n"
                             "For example: walker1 knee, or device V"));
    m_pSearch->setClearButtonEnabled(true);
    m_pSearch->setAcceptDrops(false); // a file that is dropped here is to be opened, too
    m_pSearch->installEventFilter(this);
    connect(m_pSearch, &QLineEdit::textChanged, this, &VChannelPanel::Search);
}

void VChannelPanel::BuildTree()
{
    m_pModel = new VChannelTreeModel(this);
    m_pShown = new VChannelFilterModel(*m_pModel, this);
    m_pTree = new VChannelTreeView(this);
    m_pTree->setModel(m_pShown);
    connect(m_pModel, &VChannelTreeModel::TickedChanged, this, &VChannelPanel::SetSelection);
    connect(m_pTree, &VChannelTreeView::Left, this, &VChannelPanel::Left);
    connect(m_pTree, &VChannelTreeView::ToggleRequested, this,
            [this] { m_pShown->Toggle(m_pTree->selectionModel()->selectedRows()); });
}

QWidget* VChannelPanel::MakeFoot(VMainActions& i_rActions)
{
    auto* pFoot = new QWidget(this);
    auto* pLayout = new QHBoxLayout(pFoot);
    pLayout->setContentsMargins(0, 0, 0, 0);
    for (const EAction action : {EAction::TickShown, EAction::UntickAll})
    {
        auto* pButton = new QToolButton(pFoot);
        pButton->setDefaultAction(i_rActions.Get(action));
        pButton->setFocusPolicy(Qt::TabFocus);
        pLayout->addWidget(pButton);
    }
    pLayout->addStretch(1);
    m_pCount = new QLabel(this);
    m_pCount->setObjectName(QStringLiteral("tickedCount"));
    m_pCount->setSizePolicy(QSizePolicy::Ignored, QSizePolicy::Preferred); // a longer text makes nothing wider
    return pFoot;
}

void VChannelPanel::Subscribe()
{
    auto& rHost = m_rSession.Host();
    m_Subscriptions.Subscribe(
        rHost.TimeController()->CurrentSourceChanged(), [this] { ShowCurrentContext(); }, rHost.Ui());
    m_Subscriptions.Subscribe(
        m_rSession.Channels().ContextListChanged(), [this] { ShowCurrentContext(); }, rHost.Ui());
    m_Subscriptions.Subscribe(
        rHost.Selection()->Changed(), [this](bool) { TakeSelection(); }, rHost.Ui());
}

void VChannelPanel::FocusSearch()
{
    m_pSearch->setFocus(Qt::ShortcutFocusReason);
    m_pSearch->selectAll();
}

bool VChannelPanel::eventFilter(QObject* i_pObject, QEvent* i_pEvent)
{
    if (i_pObject == m_pSearch && i_pEvent->type() == QEvent::KeyPress)
        return HandleSearchKey(static_cast<QKeyEvent*>(i_pEvent)->key());
    return QWidget::eventFilter(i_pObject, i_pEvent);
}

bool VChannelPanel::HandleSearchKey(int i_Key)
{
    switch (i_Key)
    {
    case Qt::Key_Escape:
        if (m_pSearch->text().isEmpty())
            Q_EMIT Left();
        m_pSearch->clear();
        return true;
    case Qt::Key_Down:
    case Qt::Key_Return:
    case Qt::Key_Enter:
        if (const QModelIndexList found = m_pShown->AllLeaves(); !found.isEmpty())
        {
            m_pTree->setCurrentIndex(found.front());
            m_pTree->setFocus(Qt::TabFocusReason);
        }
        return true;
    default:
        return false;
    }
}

void VChannelPanel::Search(const QString& i_rText)
{
    m_pShown->SetSearch(i_rText);
    ExpandTree();
    RefreshCount();
}

/// What is found is all in view.
void VChannelPanel::ExpandTree()
{
    if (m_pShown->IsSearching())
        m_pTree->expandAll();
    else
        m_pTree->expandToDepth(m_pModel->LeafCount() > mostExpanded ? 0 : 1);
}

/// The same channels again leave the tree as the operator has it.
void VChannelPanel::SetLeaves(std::vector<ChannelTreeLeaf> i_Leaves)
{
    if (i_Leaves == m_Leaves)
        return;
    m_Leaves = std::move(i_Leaves);
    m_pModel->SetLeaves(m_Leaves);
    ExpandTree();
}

void VChannelPanel::ShowCurrentContext()
{
    const auto pContext = m_rSession.CurrentContext();
    const auto pGlobal = m_rSession.Channels().GetGlobalChannels();
    std::vector<std::shared_ptr<const void>> from;
    for (const auto& rpSource : {pContext, pGlobal})
        if (rpSource)
            from.insert(from.end(), {rpSource, rpSource->GetChannels()});
    if (from == m_From) // another context came or went, maybe one of thousands
        return;
    m_From = std::move(from);
    if (pContext)
    {
        const auto things = ListThings(*pContext, pGlobal.get());
        std::vector<TQL::SelectionItem> known = ItemsByRank(things);
        if (pContext->GetChannels()->empty()) // monitors alone are nothing to begin with
            known.clear();
        SetLeaves(MakeLeaves(things));
        // Words for the channels of another recording would leave nothing of this one.
        const bool bOther = std::exchange(m_ShownContext, pContext->GetName()) != pContext->GetName();
        if (bOther && m_pModel->LeafCount() > 0 && m_pShown->AllLeaves().isEmpty())
            m_pSearch->clear();
        const auto items = m_Selection.Show(pContext->GetName(), known);
        m_pModel->SetTicked(items);
        m_rSession.Host().Selection()->Set(items);
    }
    else
        SetLeaves({});
    RefreshCount();
}

void VChannelPanel::TakeSelection()
{
    const auto items = AllItems(*m_rSession.Host().Selection()->GetSelection());
    if (HoldSameItems(items, m_pModel->Ticked()))
        return;
    m_pModel->SetTicked(items);
    m_Selection.Remember(m_pModel->Ticked());
    RefreshCount();
}

/// Thousands of traces take memory and time for each. Who has agreed is asked again at twice as many.
bool VChannelPanel::MayPlot(std::size_t i_Count)
{
    if (i_Count <= MostUnasked)
        m_PlottedUnasked = MostUnasked;
    if (i_Count <= m_PlottedUnasked)
        return true;
    QMessageBox box(QMessageBox::Question, tr("Plot many channels"), tr("Plot %1 channels?").arg(i_Count),
                    QMessageBox::Cancel, this);
    box.setObjectName(QStringLiteral("plotMany"));
    box.setInformativeText(tr("Each gets a trace of its own. So many need much memory, and the window becomes slow."));
    const QAbstractButton* pPlot = box.addButton(tr("&Plot all"), QMessageBox::AcceptRole);
    box.setDefaultButton(QMessageBox::Cancel);
    box.exec();
    if (box.clickedButton() != pPlot)
        return false;
    m_PlottedUnasked = i_Count * 2;
    return true;
}

void VChannelPanel::SetSelection()
{
    if (!MayPlot(m_pModel->Ticked().size()))
    {
        m_pModel->SetTicked(m_rSession.Host().Selection()->Items());
        return RefreshCount();
    }
    m_Selection.Remember(m_pModel->Ticked());
    m_rSession.Host().Selection()->Set(m_pModel->Ticked());
    RefreshCount();
}

void VChannelPanel::RefreshCount()
{
    const int all = m_pModel->LeafCount();
    QString text = tr("%1 of %2 ticked").arg(m_pModel->Ticked().size()).arg(all);
    if (m_pShown->IsSearching())
        text = tr("%1 found, %2").arg(m_pShown->AllLeaves().size()).arg(text);
    m_pCount->setText(all == 0 ? QString() : text);
}

} // namespace Studio

#include "Studio/Log/VLogPanel.h"

#include "Studio/Log/VLogModel.h"

#include <QtGui/QAction>
#include <QtGui/QClipboard>
#include <QtGui/QGuiApplication>
#include <QtGui/QKeySequence>
#include <QtWidgets/QComboBox>
#include <QtWidgets/QHBoxLayout>
#include <QtWidgets/QHeaderView>
#include <QtWidgets/QPushButton>
#include <QtWidgets/QScrollBar>
#include <QtWidgets/QTreeView>
#include <QtWidgets/QVBoxLayout>

#include <algorithm>

namespace Studio
{

void VSeverityFilter::SetMostDetail(int i_Severity)
{
    m_MostDetail = i_Severity;
    invalidateFilter();
}

bool VSeverityFilter::filterAcceptsRow(int i_Row, const QModelIndex& i_rParent) const
{
    return sourceModel()->index(i_Row, 0, i_rParent).data(VLogModel::SeverityRole).toInt() <= m_MostDetail;
}

VLogPanel::VLogPanel(VLogModel& i_rModel, QWidget* i_pParent) : QWidget(i_pParent), m_rModel(i_rModel)
{
    BuildView();
    auto* pLayout = new QVBoxLayout(this);
    pLayout->setContentsMargins(0, 0, 0, 0);
    pLayout->addWidget(MakeHead());
    pLayout->addWidget(m_pView, 1);
}

void VLogPanel::BuildView()
{
    m_pShown = new VSeverityFilter(this);
    m_pShown->setSourceModel(&m_rModel);
    m_pView = new QTreeView(this);
    m_pView->setObjectName(QStringLiteral("log"));
    m_pView->setAccessibleName(tr("Log"));
    m_pView->setModel(m_pShown);
    m_pView->setRootIsDecorated(false);
    m_pView->setUniformRowHeights(true);
    m_pView->setSelectionMode(QAbstractItemView::ExtendedSelection);
    const QFontMetrics metrics = m_pView->fontMetrics();
    m_pView->header()->resizeSection(0, metrics.horizontalAdvance(QStringLiteral("00:00:00.000")) * 5 / 4);
    m_pView->header()->resizeSection(1, metrics.horizontalAdvance(QStringLiteral("Severity")) * 3 / 2);
    m_pView->header()->resizeSection(2, metrics.horizontalAdvance(QStringLiteral("ChannelSystem")) * 5 / 4);
    connect(m_pShown, &QAbstractItemModel::rowsAboutToBeInserted, this,
            [this]
            {
                const QScrollBar* pBar = m_pView->verticalScrollBar();
                m_bAtEnd = pBar->value() >= pBar->maximum();
            });
    connect(m_pShown, &QAbstractItemModel::rowsInserted, this,
            [this]
            {
                if (m_bAtEnd)
                    m_pView->scrollToBottom();
            });
}

QWidget* VLogPanel::MakeHead()
{
    auto* pHead = new QWidget(this);
    auto* pLayout = new QHBoxLayout(pHead);
    pLayout->setContentsMargins(0, 0, 0, 0);
    m_pSeverity = new QComboBox(pHead);
    m_pSeverity->setObjectName(QStringLiteral("logSeverity"));
    m_pSeverity->setAccessibleName(tr("What is shown"));
    m_pSeverity->addItem(tr("Everything"), static_cast<int>(TQL::ELogSeverity::Detail));
    m_pSeverity->addItem(tr("Warnings and errors"), static_cast<int>(TQL::ELogSeverity::Warning));
    m_pSeverity->addItem(tr("Errors"), static_cast<int>(TQL::ELogSeverity::Error));
    connect(m_pSeverity, &QComboBox::currentIndexChanged, this,
            [this](int i_Row) { m_pShown->SetMostDetail(m_pSeverity->itemData(i_Row).toInt()); });
    pLayout->addWidget(m_pSeverity);
    pLayout->addStretch(1);

    auto* pCopy = new QPushButton(tr("Cop&y"), pHead);
    pCopy->setObjectName(QStringLiteral("logCopy"));
    pCopy->setToolTip(tr("Copies the selected lines, or all when none is selected"));
    connect(pCopy, &QPushButton::clicked, this, &VLogPanel::Copy);
    auto* pCopyKey = new QAction(m_pView);
    pCopyKey->setShortcuts(QKeySequence::Copy);
    pCopyKey->setShortcutContext(Qt::WidgetShortcut);
    connect(pCopyKey, &QAction::triggered, this, &VLogPanel::Copy);
    m_pView->addAction(pCopyKey);
    auto* pClear = new QPushButton(tr("Clea&r"), pHead);
    pClear->setObjectName(QStringLiteral("logClear"));
    connect(pClear, &QPushButton::clicked, this, [this] { m_rModel.Clear(); });
    pLayout->addWidget(pCopy);
    pLayout->addWidget(pClear);
    return pHead;
}

void VLogPanel::ShowProblems()
{
    m_pSeverity->setCurrentIndex(m_pSeverity->findData(static_cast<int>(TQL::ELogSeverity::Warning)));
    m_pView->scrollToBottom();
}

void VLogPanel::Copy() const
{
    QModelIndexList rows = m_pView->selectionModel()->selectedRows();
    std::sort(rows.begin(), rows.end());
    if (rows.isEmpty())
        for (int row = 0; row < m_pShown->rowCount(); ++row)
            rows.append(m_pShown->index(row, 0));
    QString text;
    for (const QModelIndex& rRow : rows)
        text += m_rModel.LineOf(m_pShown->mapToSource(rRow).row()) + QLatin1Char('\n');
    QGuiApplication::clipboard()->setText(text);
}

} // namespace Studio

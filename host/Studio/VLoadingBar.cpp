#include "Studio/VLoadingBar.h"

#include "Studio/VRecordingLoader.h"

#include <QtWidgets/QHBoxLayout>
#include <QtWidgets/QLabel>
#include <QtWidgets/QProgressBar>
#include <QtWidgets/QToolButton>
#include <QtWidgets/QVBoxLayout>

namespace Studio
{

namespace
{

constexpr int progressSteps = 1000;

} // namespace

VLoadingBar::VLoadingBar(VRecordingLoader& i_rLoader, QWidget* i_pParent) : QWidget(i_pParent)
{
    setObjectName(QStringLiteral("loading"));
    auto* pLayout = new QVBoxLayout(this);
    pLayout->setContentsMargins(6, 2, 6, 2);
    pLayout->setSpacing(2);
    hide();
    connect(&i_rLoader, &VRecordingLoader::Started, this,
            [this, &i_rLoader](int i_Number, const QString& i_rFileName) { AddRow(i_rLoader, i_Number, i_rFileName); });
    connect(&i_rLoader, &VRecordingLoader::Progressed, this,
            [this](int i_Number, double i_Fraction)
            {
                if (const auto row = m_Rows.find(i_Number); row != m_Rows.end())
                    row->second.pBar->setValue(static_cast<int>(i_Fraction * progressSteps));
            });
    connect(&i_rLoader, &VRecordingLoader::Finished, this, &VLoadingBar::RemoveRow);
    connect(&i_rLoader, &VRecordingLoader::Failed, this, &VLoadingBar::RemoveRow);
    connect(&i_rLoader, &VRecordingLoader::Cancelled, this, &VLoadingBar::RemoveRow);
}

void VLoadingBar::AddRow(VRecordingLoader& i_rLoader, int i_Number, const QString& i_rFileName)
{
    auto* pRow = new QWidget(this);
    auto* pLayout = new QHBoxLayout(pRow);
    pLayout->setContentsMargins(0, 0, 0, 0);
    auto* pName = new QLabel(tr("Opening %1").arg(i_rFileName), pRow);
    pName->setTextFormat(Qt::PlainText);
    auto* pBar = new QProgressBar(pRow);
    pBar->setRange(0, progressSteps);
    pBar->setTextVisible(false);
    pBar->setMaximumHeight(12);
    pBar->setAccessibleName(tr("Progress of %1").arg(i_rFileName));
    auto* pCancel = new QToolButton(pRow);
    pCancel->setObjectName(QStringLiteral("cancelLoading"));
    pCancel->setText(tr("Cancel"));
    pCancel->setAccessibleName(tr("Cancel opening %1").arg(i_rFileName));
    connect(pCancel, &QToolButton::clicked, &i_rLoader, [&i_rLoader, i_Number] { i_rLoader.Cancel(i_Number); });
    pLayout->addWidget(pName);
    pLayout->addWidget(pBar, 1);
    pLayout->addWidget(pCancel);
    layout()->addWidget(pRow);
    m_Rows[i_Number] = {pRow, pBar};
    show();
}

void VLoadingBar::RemoveRow(int i_Number)
{
    const auto row = m_Rows.find(i_Number);
    if (row == m_Rows.end())
        return;
    row->second.pWidget->hide();
    row->second.pWidget->deleteLater(); // its own button may have been pressed
    m_Rows.erase(row);
    setVisible(!m_Rows.empty());
}

} // namespace Studio

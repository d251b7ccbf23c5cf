#include "Studio/Files/VLoadingBar.h"

#include "Studio/Files/VRecordingLoader.h"

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

VLoadingBar::VLoadingBar(VRecordingLoader& i_rLoader, QWidget* i_pParent) : QWidget(i_pParent), m_rLoader(i_rLoader)
{
    setObjectName(QStringLiteral("loading"));
    auto* pLayout = new QVBoxLayout(this);
    pLayout->setContentsMargins(6, 2, 6, 2);
    pLayout->setSpacing(2);
    BuildRest();
    hide();
    connect(&i_rLoader, &VRecordingLoader::Started, this, &VLoadingBar::Add);
    connect(&i_rLoader, &VRecordingLoader::Progressed, this,
            [this](int i_Number, double i_Fraction)
            {
                if (const auto row = m_Rows.find(i_Number); row != m_Rows.end())
                    row->second.pBar->setValue(static_cast<int>(i_Fraction * progressSteps));
            });
    connect(&i_rLoader, &VRecordingLoader::Finished, this, &VLoadingBar::Remove);
    connect(&i_rLoader, &VRecordingLoader::Failed, this, &VLoadingBar::Remove);
    connect(&i_rLoader, &VRecordingLoader::Cancelled, this, &VLoadingBar::Remove);
}

void VLoadingBar::BuildRest()
{
    m_pRest = new QWidget(this);
    auto* pLayout = new QHBoxLayout(m_pRest);
    pLayout->setContentsMargins(0, 0, 0, 0);
    m_pRestText = new QLabel(m_pRest);
    m_pRestText->setObjectName(QStringLiteral("loadingRest"));
    auto* pCancel = new QToolButton(m_pRest);
    pCancel->setObjectName(QStringLiteral("cancelAllLoading"));
    pCancel->setText(tr("Cancel all"));
    connect(pCancel, &QToolButton::clicked, &m_rLoader, &VRecordingLoader::CancelAll);
    pLayout->addWidget(m_pRestText, 1);
    pLayout->addWidget(pCancel);
    m_pRest->hide();
    layout()->addWidget(m_pRest);
}

void VLoadingBar::Add(int i_Number, const QString& i_rFileName)
{
    if (m_Rows.size() < Most)
        AddRow(i_Number, i_rFileName);
    else
        m_Waiting.emplace(i_Number, i_rFileName);
    ShowRest();
    show();
}

void VLoadingBar::AddRow(int i_Number, const QString& i_rFileName)
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
    connect(pCancel, &QToolButton::clicked, &m_rLoader, [this, i_Number] { m_rLoader.Cancel(i_Number); });
    pLayout->addWidget(pName);
    pLayout->addWidget(pBar, 1);
    pLayout->addWidget(pCancel);
    auto* pRows = static_cast<QVBoxLayout*>(layout());
    pRows->insertWidget(pRows->indexOf(m_pRest), pRow);
    m_Rows[i_Number] = {pRow, pBar};
}

void VLoadingBar::Remove(int i_Number)
{
    if (const auto row = m_Rows.find(i_Number); row != m_Rows.end())
    {
        row->second.pWidget->hide();
        row->second.pWidget->deleteLater(); // its own button may have been pressed
        m_Rows.erase(row);
        if (!m_Waiting.empty())
        {
            const auto next = m_Waiting.extract(m_Waiting.begin());
            AddRow(next.key(), next.mapped());
        }
    }
    else
        m_Waiting.erase(i_Number);
    ShowRest();
    setVisible(!m_Rows.empty());
}

void VLoadingBar::ShowRest()
{
    if (!m_Waiting.empty())
        m_pRestText->setText(tr("and %1 more").arg(m_Waiting.size()));
    m_pRest->setVisible(!m_Waiting.empty());
}

} // namespace Studio

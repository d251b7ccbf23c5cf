#include "Studio/Files/VStartPage.h"

#include "Recordings/FileFormats.h"
#include "Studio/Common/Paths.h"
#include "Studio/Common/PlainLabels.h"
#include "Studio/Common/VMainActions.h"
#include "Studio/Files/VRecentFiles.h"

#include <QtGui/QAction>
#include <QtWidgets/QHBoxLayout>
#include <QtWidgets/QLabel>
#include <QtWidgets/QPushButton>
#include <QtWidgets/QVBoxLayout>

namespace Studio
{

namespace
{

constexpr int mostRecent = 5;

QPushButton* MakeButton(const char* i_pName, const QString& i_rText, QAction* i_pAction, QWidget* i_pParent)
{
    auto* pButton = new QPushButton(i_rText, i_pParent);
    pButton->setObjectName(QString::fromLatin1(i_pName));
    QObject::connect(pButton, &QPushButton::clicked, i_pAction, &QAction::trigger);
    return pButton;
}

} // namespace

VStartPage::VStartPage(VMainActions& i_rActions, VRecentFiles& i_rRecent, QWidget* i_pParent)
    : QWidget(i_pParent), m_rRecent(i_rRecent)
{
    setObjectName(QStringLiteral("startPage"));
    auto* pTitle = new QLabel(tr("Drop a motion file here, or press Ctrl+O"), this);
    QFont font = pTitle->font();
    font.setPointSizeF(font.pointSizeF() * 1.6);
    pTitle->setFont(font);
    pTitle->setAlignment(Qt::AlignCenter);
    pTitle->setWordWrap(true);
    auto* pKinds = new QLabel(QString::fromStdString(Recordings::ListFormatNames()), this);
    pKinds->setAlignment(Qt::AlignCenter);
    pKinds->setEnabled(false);

    auto* pButtons = new QWidget(this);
    auto* pRow = new QHBoxLayout(pButtons);
    pRow->addWidget(MakeButton("startOpen", tr("&Open a file…"), i_rActions.Get(EAction::OpenFile), pButtons));
    pRow->addWidget(MakeButton("startSample", tr("Try the &sample"), i_rActions.Get(EAction::OpenSample), pButtons));
    pRow->addWidget(
        MakeButton("startLive", tr("Start a si&mulation"), i_rActions.Get(EAction::StartSimulation), pButtons));
    m_pRecent = new QWidget(this);
    auto* pRecentColumn = new QVBoxLayout(m_pRecent);
    m_pRecentTitle = new QLabel(tr("Opened last:"), m_pRecent);
    pRecentColumn->addWidget(m_pRecentTitle, 0, Qt::AlignCenter);

    auto* pLayout = new QVBoxLayout(this);
    pLayout->addStretch(2);
    pLayout->addWidget(pTitle);
    pLayout->addWidget(pKinds);
    pLayout->addWidget(pButtons, 0, Qt::AlignCenter);
    pLayout->addWidget(m_pRecent, 0, Qt::AlignCenter);
    pLayout->addStretch(3);
    connect(&m_rRecent, &VRecentFiles::Changed, this, &VStartPage::ShowRecent);
    ShowRecent();
}

void VStartPage::ShowRecent()
{
    for (QPushButton* pButton : m_pRecent->findChildren<QPushButton*>())
        pButton->deleteLater();
    int shown = 0;
    m_pRecentTitle->hide();
    for (const VRecentFiles::Entry& rEntry : m_rRecent.List())
    {
        if (rEntry.bMissing || shown == mostRecent)
            continue;
        ++shown;
        m_pRecentTitle->show();
        const QString path = QString::fromStdString(TextFromPath(rEntry.Path));
        const QString name = QString::fromStdString(TextFromPath(rEntry.Path.filename()));
        auto* pButton = new QPushButton(WithoutMnemonics(name), m_pRecent);
        pButton->setToolTip(path);
        pButton->setFlat(true);
        connect(pButton, &QPushButton::clicked, this, [this, path] { Q_EMIT OpenRequested(path); });
        m_pRecent->layout()->addWidget(pButton);
    }
}

} // namespace Studio

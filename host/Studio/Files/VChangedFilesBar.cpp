#include "Studio/Files/VChangedFilesBar.h"

#include "Studio/Files/VOpenFiles.h"

#include <QtWidgets/QHBoxLayout>
#include <QtWidgets/QLabel>
#include <QtWidgets/QPushButton>
#include <QtWidgets/QVBoxLayout>

namespace Studio
{

VChangedFilesBar::VChangedFilesBar(VOpenFiles& i_rFiles, QWidget* i_pParent) : QWidget(i_pParent)
{
    setObjectName(QStringLiteral("changedFiles"));
    auto* pLayout = new QVBoxLayout(this);
    pLayout->setContentsMargins(6, 2, 6, 2);
    pLayout->setSpacing(2);
    hide();
    connect(&i_rFiles, &VOpenFiles::ChangedOnDisk, this,
            [this, &i_rFiles](const QString& i_rContextName, const QString& i_rFileName)
            { AddRow(i_rFiles, i_rContextName, i_rFileName); });
    connect(&i_rFiles, &VOpenFiles::ChangeTaken, this, &VChangedFilesBar::RemoveRow);
}

void VChangedFilesBar::AddRow(VOpenFiles& i_rFiles, const QString& i_rContextName, const QString& i_rFileName)
{
    if (m_Rows.contains(i_rContextName))
        return;
    auto* pRow = new QWidget(this);
    auto* pLayout = new QHBoxLayout(pRow);
    pLayout->setContentsMargins(0, 0, 0, 0);
    auto* pText = new QLabel(tr("%1 has changed since it was opened.").arg(i_rFileName), pRow);
    pText->setTextFormat(Qt::PlainText);
    auto* pRead = new QPushButton(tr("Read &again"), pRow);
    pRead->setObjectName(QStringLiteral("readAgain"));
    auto* pKeep = new QPushButton(tr("&Keep as it is"), pRow);
    pKeep->setObjectName(QStringLiteral("keepAsItIs"));
    connect(pRead, &QPushButton::clicked, &i_rFiles, [&i_rFiles, i_rContextName] { i_rFiles.Reload(i_rContextName); });
    connect(pKeep, &QPushButton::clicked, this, [this, i_rContextName] { RemoveRow(i_rContextName); });
    pLayout->addWidget(pText);
    pLayout->addWidget(pRead);
    pLayout->addWidget(pKeep);
    pLayout->addStretch(1);
    layout()->addWidget(pRow);
    m_Rows[i_rContextName] = pRow;
    show();
}

void VChangedFilesBar::RemoveRow(const QString& i_rContextName)
{
    const auto row = m_Rows.find(i_rContextName);
    if (row == m_Rows.end())
        return;
    row->second->hide();
    row->second->deleteLater(); // its own button may have been pressed
    m_Rows.erase(row);
    setVisible(!m_Rows.empty());
}

} // namespace Studio

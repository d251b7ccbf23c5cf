#include "Studio/Log/VNoticeBar.h"

#include <QtWidgets/QHBoxLayout>
#include <QtWidgets/QLabel>
#include <QtWidgets/QPushButton>
#include <QtWidgets/QVBoxLayout>

#include <algorithm>
#include <utility>

namespace Studio
{

VNoticeBar::VNoticeBar(QWidget* i_pParent) : QWidget(i_pParent)
{
    setObjectName(QStringLiteral("notices"));
    auto* pLayout = new QVBoxLayout(this);
    pLayout->setContentsMargins(6, 2, 6, 2);
    pLayout->setSpacing(2);
    hide();
}

void VNoticeBar::Add(const QString& i_rText)
{
    Add(i_rText, {}, {});
}

void VNoticeBar::Set(const QString& i_rTopic, const QString& i_rText, const QString& i_rButton,
                     std::function<void()> i_Do)
{
    Clear(i_rTopic);
    auto* pRow = new QWidget(this);
    pRow->setObjectName(i_rTopic);
    auto* pLayout = new QHBoxLayout(pRow);
    pLayout->setContentsMargins(0, 0, 0, 0);
    auto* pText = new QLabel(i_rText, pRow);
    pText->setObjectName(QStringLiteral("noticeText"));
    pText->setTextFormat(Qt::PlainText);
    pText->setWordWrap(true);
    pText->setTextInteractionFlags(Qt::TextSelectableByMouse);
    pLayout->addWidget(pText, 1);
    if (i_Do)
    {
        auto* pButton = new QPushButton(i_rButton, pRow);
        pButton->setObjectName(QStringLiteral("noticeButton"));
        connect(pButton, &QPushButton::clicked, this,
                [this, pRow, execute = std::move(i_Do)]
                {
                    Remove(pRow);
                    execute();
                });
        pLayout->addWidget(pButton);
    }
    auto* pClose = new QPushButton(tr("&Dismiss"), pRow);
    pClose->setObjectName(QStringLiteral("noticeClose"));
    connect(pClose, &QPushButton::clicked, this, [this, pRow] { Remove(pRow); });
    pLayout->addWidget(pClose);
    layout()->addWidget(pRow);
    m_Rows.push_back(pRow);
    if (m_Rows.size() > Most)
        Remove(m_Rows.front());
    show();
}

void VNoticeBar::Clear(const QString& i_rTopic)
{
    const auto row =
        std::ranges::find_if(m_Rows, [&](const QWidget* i_pRow) { return i_pRow->objectName() == i_rTopic; });
    if (!i_rTopic.isEmpty() && row != m_Rows.end())
        Remove(*row);
}

void VNoticeBar::Remove(QWidget* i_pRow)
{
    std::erase(m_Rows, i_pRow);
    i_pRow->hide();
    i_pRow->deleteLater(); // its own button may have been pressed
    setVisible(!m_Rows.empty());
}

} // namespace Studio

#include "Studio/Window/VShortcutsDialog.h"

#include <QtCore/QCoreApplication>
#include <QtGui/QAction>
#include <QtGui/QKeySequence>
#include <QtWidgets/QDialogButtonBox>
#include <QtWidgets/QHeaderView>
#include <QtWidgets/QMenu>
#include <QtWidgets/QMenuBar>
#include <QtWidgets/QTreeWidget>
#include <QtWidgets/QVBoxLayout>

#include <map>

namespace Studio
{

namespace
{

/// Keys that only one widget takes.
constexpr struct
{
    const char* pGroup;
    const char* pText;
    const char* pKeys;
} widgetKeys[] = {
    {QT_TRANSLATE_NOOP("Shortcuts", "Search field"), QT_TRANSLATE_NOOP("Shortcuts", "Clear the search, then leave"),
     "Esc"},
    {QT_TRANSLATE_NOOP("Shortcuts", "Search field"), QT_TRANSLATE_NOOP("Shortcuts", "Go to what was found"), "Down"},
    {QT_TRANSLATE_NOOP("Shortcuts", "Channel tree"), QT_TRANSLATE_NOOP("Shortcuts", "Tick or untick the selected rows"),
     "Space"},
    {QT_TRANSLATE_NOOP("Shortcuts", "Channel tree"), QT_TRANSLATE_NOOP("Shortcuts", "Leave the tree"), "Esc"},
    {QT_TRANSLATE_NOOP("Shortcuts", "Event list"), QT_TRANSLATE_NOOP("Shortcuts", "Go to the event"), "Return"},
    {QT_TRANSLATE_NOOP("Shortcuts", "Log"), QT_TRANSLATE_NOOP("Shortcuts", "Copy the selected lines"), "Ctrl+C"},
};

QString KeysText(const QList<QKeySequence>& i_rKeys)
{
    QStringList texts;
    for (const QKeySequence& rKey : i_rKeys)
        texts.append(rKey.toString(QKeySequence::NativeText));
    return texts.join(QCoreApplication::translate("Shortcuts", " or "));
}

QString WithoutMnemonic(QString i_Text)
{
    return i_Text.remove(QLatin1Char('&'));
}

void AddActions(const QMenu& i_rMenu, const QString& i_rGroup, bool i_bWithoutKeys, std::vector<ShortcutRow>& o_rRows)
{
    for (const QAction* pAction : i_rMenu.actions())
        if (pAction->menu())
            AddActions(*pAction->menu(), i_rGroup, false, o_rRows);
        else if (!pAction->isSeparator() && (i_bWithoutKeys || !pAction->shortcuts().isEmpty()))
            o_rRows.push_back({i_rGroup, WithoutMnemonic(pAction->text()), KeysText(pAction->shortcuts())});
}

} // namespace

std::vector<ShortcutRow> ListShortcuts(const QMenuBar& i_rBar)
{
    std::vector<ShortcutRow> rows;
    for (const QAction* pAction : i_rBar.actions())
        if (pAction->menu())
            AddActions(*pAction->menu(), WithoutMnemonic(pAction->text()), true, rows);
    for (const auto& rRow : widgetKeys)
        rows.push_back({QCoreApplication::translate("Shortcuts", rRow.pGroup),
                        QCoreApplication::translate("Shortcuts", rRow.pText),
                        KeysText({QKeySequence(QString::fromLatin1(rRow.pKeys))})});
    return rows;
}

VShortcutsDialog::VShortcutsDialog(const QMenuBar& i_rBar, QWidget* i_pParent) : QDialog(i_pParent)
{
    setObjectName(QStringLiteral("shortcutsDialog"));
    setWindowTitle(tr("Keyboard shortcuts"));
    auto* pList = new QTreeWidget(this);
    pList->setAccessibleName(windowTitle());
    pList->setColumnCount(2);
    pList->setHeaderLabels({tr("Action"), tr("Keys")});
    pList->header()->setSectionResizeMode(QHeaderView::ResizeToContents);
    std::map<QString, QTreeWidgetItem*> groups;
    for (const ShortcutRow& rRow : ListShortcuts(i_rBar))
    {
        QTreeWidgetItem*& rpGroup = groups[rRow.Group];
        if (!rpGroup)
            rpGroup = new QTreeWidgetItem(pList, {rRow.Group});
        new QTreeWidgetItem(rpGroup, {rRow.Text, rRow.Keys.isEmpty() ? tr("in the menu") : rRow.Keys});
    }
    pList->expandAll();
    auto* pButtons = new QDialogButtonBox(QDialogButtonBox::Close, this);
    connect(pButtons, &QDialogButtonBox::rejected, this, &QDialog::reject);
    auto* pLayout = new QVBoxLayout(this);
    pLayout->addWidget(pList);
    pLayout->addWidget(pButtons);
    resize(fontMetrics().averageCharWidth() * 70, fontMetrics().lineSpacing() * 36);
}

} // namespace Studio

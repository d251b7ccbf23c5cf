#pragma once

#include <QtWidgets/QDialog>

#include <vector>

class QMenuBar;

namespace Studio
{

/// One line of the list of keys.
struct ShortcutRow
{
    QString Group; ///< the menu, or the part of the window
    QString Text;
    QString Keys;
};

/// All actions of the menus with their keys as they are now, of submenus those that have keys, and then the keys that
/// belong to single widgets.
std::vector<ShortcutRow> ListShortcuts(const QMenuBar& i_rBar);

/// What can be done from the keyboard. UI thread.
class VShortcutsDialog : public QDialog
{
    Q_OBJECT

public:
    explicit VShortcutsDialog(const QMenuBar& i_rBar, QWidget* i_pParent = nullptr);
};

} // namespace Studio

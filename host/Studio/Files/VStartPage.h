#pragma once

#include <QtWidgets/QWidget>

namespace Studio
{

class VMainActions;
class VRecentFiles;

/// What the window shows while nothing is open: what to do, and buttons that do it. Actions and files outlive it. UI
/// thread.
class VStartPage : public QWidget
{
    Q_OBJECT

public:
    VStartPage(VMainActions& i_rActions, VRecentFiles& i_rRecent, QWidget* i_pParent = nullptr);

Q_SIGNALS:
    void OpenRequested(const QString& i_rPath); ///< a recent file

private:
    void ShowRecent();

    VRecentFiles& m_rRecent;
    QWidget* m_pRecent = nullptr;
    QWidget* m_pRecentTitle = nullptr;
};

} // namespace Studio

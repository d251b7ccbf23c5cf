#pragma once

#include <QtCore/QObject>
#include <QtCore/QString>

#include <filesystem>
#include <span>

class QMenu;
class QWidget;

namespace Studio
{

class VMainActions;
class VNoticeBar;
class VOpenFiles;
class VStudioSession;

/// What the menu of files does: asks for files and opens them, shows the first one that is read, and tells the operator
/// of failures and warnings. Owned by the window; everything that it is given outlives it. UI thread.
class VFileActions : public QObject
{
    Q_OBJECT

public:
    VFileActions(VStudioSession& i_rSession, VMainActions& i_rActions, VOpenFiles& i_rFiles, VNoticeBar& i_rNotices,
                 QWidget& i_rWindow);

    /// Puts the recent files into the menu of files, once that is there.
    void AddRecentMenu(VMainActions& i_rActions);

    void Open(std::span<const std::filesystem::path> i_Paths);
    void Open(const std::filesystem::path& i_rPath) { Open({&i_rPath, 1}); }

Q_SIGNALS:
    void ProblemsRequested(); ///< the operator wants to see warnings and errors in the log

private:
    void ChooseFiles();
    void OpenSample();
    void StartSimulation();
    void FillRecentMenu(QMenu& o_rMenu);
    void TakeOpened(const QString& i_rContextName);
    void TellWarnings(const QString& i_rFile, int i_Count);
    void TellRefused(const QString& i_rMessage);
    void ForgetNotices();

    VStudioSession& m_rSession;
    VOpenFiles& m_rFiles;
    VNoticeBar& m_rNotices;
    QWidget& m_rWindow;
    bool m_bShowNext = false; ///< the next file that is read is to be shown
    int m_Refused = 0;        ///< files, since files were opened last
    int m_Warned = 0;
};

} // namespace Studio

#pragma once

#include "Services/Common/VHostSubscriptions.h"

#include <QtWidgets/QMainWindow>

#include <filesystem>
#include <memory>
#include <span>
#include <string>

class QDockWidget;
class QStackedWidget;

namespace Studio
{

class VChannelPanel;
class VFileActions;
class VLogModel;
class VLogPanel;
class VMainActions;
class VNoticeBar;
class VOpenFiles;
class VPlotArea;
class VStudioSession;
class VTransport;
class VWidgetKeys;
enum class EAction;

/// The studio's window: puts its parts together and brings messages from one to the other. The parts do the work. The
/// session outlives it. UI thread.
class VMainWindow : public QMainWindow
{
    Q_OBJECT

public:
    /// i_pLog receives from before the window on and outlives it; null: the window has one of its own.
    explicit VMainWindow(VStudioSession& i_rSession, VLogModel* i_pLog = nullptr, QWidget* i_pParent = nullptr);
    ~VMainWindow() override;

    /// Puts everything as it was left, with at least one Graph Plots window. The error is one line.
    bool Restore(std::string& o_rError);

    /// Opens recordings in the background; the first one that is read is shown. What cannot be read is told in a
    /// notice.
    void OpenFiles(std::span<const std::filesystem::path> i_Paths);
    void OpenFile(const std::filesystem::path& i_rPath) { OpenFiles({&i_rPath, 1}); }

    /// Opens another Graph Plots window.
    bool OpenPlot(std::string& o_rError);

    /// A notice for the operator, until it is dismissed.
    void ShowMessage(const std::string& i_rText);

    VMainActions& Actions() { return *m_pActions; }
    VOpenFiles& Files() { return *m_pFiles; }

protected:
    void closeEvent(QCloseEvent* i_pEvent) override;
    void dragEnterEvent(QDragEnterEvent* i_pEvent) override;
    void dropEvent(QDropEvent* i_pEvent) override;

private:
    void BuildCentre();
    void BuildPanels(VLogModel& i_rLog);
    QDockWidget* AddPanel(const char* i_pName, const QString& i_rTitle, QWidget* i_pPanel, Qt::DockWidgetArea i_Area,
                          EAction i_Action);
    void ShowWhichPanels(); ///< in the menu
    void BuildTransport();
    void BuildMenus();
    void ConnectTransport();
    void ConnectOther();
    void ShowLogOfProblems();
    void ShowCentre();
    void ShowTitle();
    void SaveLayout() const;

    VStudioSession& m_rSession;
    VMainActions* m_pActions = nullptr;
    VOpenFiles* m_pFiles = nullptr;
    VFileActions* m_pFileActions = nullptr;
    VTransport* m_pTransport = nullptr;
    QStackedWidget* m_pCentre = nullptr;
    QWidget* m_pStartPage = nullptr;
    QWidget* m_pNoPlots = nullptr;
    VPlotArea* m_pPlots = nullptr;
    VNoticeBar* m_pNotices = nullptr;
    VChannelPanel* m_pChannels = nullptr;
    VLogPanel* m_pLog = nullptr;
    QDockWidget* m_pLogDock = nullptr;
    Services::VHostSubscriptions m_Subscriptions;
};

} // namespace Studio

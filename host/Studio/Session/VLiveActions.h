#pragma once

#include "Streaming/VOscInput.h"

#include <QtCore/QObject>
#include <QtCore/QStringList>

#include <filesystem>
#include <functional>
#include <string>

class QAction;
class QMenu;
class QWidget;

namespace Studio
{

class VLiveSaver;
class VStudioSession;

/// The menu of live data: listen for OSC messages, replay the recording that is shown, stop, save
/// what was captured. Owned by the window; the session outlives it. UI thread.
class VLiveActions : public QObject
{
    Q_OBJECT

public:
    /// The actions go to the end of the menu. i_Tell gets a line for the operator.
    VLiveActions(VStudioSession& i_rSession, QMenu& i_rMenu, QWidget& i_rWindow,
                 std::function<void(const std::string&)> i_Tell);
    ~VLiveActions() override;

    void Listen(const Streaming::VOscInput::Options& i_rOptions);
    void Replay(double i_Speed);
    void SaveTo(const std::filesystem::path& i_rPath);

private:
    void AddReplayMenu(QMenu& i_rMenu);
    void Refresh(); ///< which actions have a meaning now
    void AskAndListen();
    void AskAndSave();
    void TellSaved(const QString& i_rPath, const QStringList& i_rRemarks);

    VStudioSession& m_rSession;
    QWidget& m_rWindow;
    const std::function<void(const std::string&)> m_Tell;
    VLiveSaver* m_pSaver = nullptr;
    QMenu* m_pReplay = nullptr;
    QAction* m_pLoop = nullptr;
    QAction* m_pStop = nullptr;
    QAction* m_pSave = nullptr;
};

} // namespace Studio

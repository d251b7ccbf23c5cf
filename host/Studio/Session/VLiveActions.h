#pragma once

#include "Streaming/VOscInput.h"

#include <QtCore/QObject>
#include <QtCore/QStringList>

#include <cstdint>
#include <filesystem>
#include <functional>
#include <memory>
#include <string>

class QAction;
class QMenu;
class QWidget;

namespace Channels
{
class VChannelContext;
}

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

    /// Asks what shall become of unsaved live data: save them, which ends the capture and takes its time, or lose them.
    /// False when they shall stay as they are, or could not be saved.
    bool AskBeforeLoss();

private:
    void AddReplayMenu(QMenu& i_rMenu);
    void Refresh(); ///< which actions have a meaning now
    void AskAndListen();
    void AskAndSave();
    std::filesystem::path AskPath(); ///< empty: none was chosen
    bool SaveAndWait();
    void MarkUnsaved(); ///< in the window's title
    void TellSaved(const QString& i_rPath, const QStringList& i_rRemarks);

    VStudioSession& m_rSession;
    QWidget& m_rWindow;
    const std::function<void(const std::string&)> m_Tell;
    bool m_bAsking = false;
    VLiveSaver* m_pSaver = nullptr;
    std::shared_ptr<const Channels::VChannelContext> m_pSaving; ///< null when nothing is saved
    std::int64_t m_SavingUntil = 0;                             ///< tick
    QMenu* m_pReplay = nullptr;
    QAction* m_pLoop = nullptr;
    QAction* m_pStop = nullptr;
    QAction* m_pSave = nullptr;
};

} // namespace Studio

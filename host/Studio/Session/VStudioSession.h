#pragma once

#include "Recordings/Common/VRecording.h"
#include "Services/VHostServices.h"
#include "Streaming/VOscInput.h"
#include "Studio/Session/LiveInput.h"
#include "TQL/IResult.h"

#include <QtCore/QPointer>
#include <QtWidgets/QWidget>

#include <cstdint>
#include <filesystem>
#include <functional>
#include <map>
#include <memory>
#include <string>
#include <utility>
#include <vector>

namespace Channels
{
class VChannelContext;
class VChannelService;
class VLiveContext;
} // namespace Channels

namespace Services
{
class VContextTimeFeed;
class VPluginHost;
} // namespace Services

namespace Studio
{

class VLiveCapture;
class VOscCapture;

/// What the studio has open: the host's services, the recordings and the live capture as contexts with their times, and
/// the module. It knows no windows; contents are made for whoever gives a frame. Made after the application object and
/// destroyed before it, after all windows. UI thread.
class VStudioSession
{
public:
    struct Options
    {
        bool bCheck = false;       ///< watch how the module keeps the rules of its host
        std::string UserDirectory; ///< UTF-8; empty: the desktop's
    };

    explicit VStudioSession(const Options& i_rOptions);
    ~VStudioSession();
    VStudioSession(const VStudioSession&) = delete;
    VStudioSession& operator=(const VStudioSession&) = delete;

    Services::VHostServices& Host() { return *m_pHost; }
    Channels::VChannelService& Channels() { return *m_pChannels; }

    /// Reads a recording and adds it. On failure o_rError is one line, and everything else stays as it was.
    [[nodiscard]] TQL::IResult OpenFile(const std::filesystem::path& i_rPath, std::string& o_rContextName,
                                        std::string& o_rError);

    /// Adds a recording as a context and a time source in review mode; returns their name. i_rPath is the file that it
    /// was read from. What its reader had to guess goes to the log.
    std::string AddRecording(Recordings::VRecording i_Recording, const std::filesystem::path& i_rPath = {});

    /// Puts a recording that was read again in the place of the one in a context; false when there is no such. The time
    /// stays where it is as far as the new range allows. Channels are told again by subject, name and kind, so plots
    /// and ticks of those that are still there go on; the others are gone.
    bool ReplaceRecording(const std::string& i_rContextName, Recordings::VRecording i_Recording);

    /// Closes a recording: its context, time source and file are forgotten; the one next to it in the order of the
    /// names becomes the current one if it was. False when no recording bears the name.
    bool CloseRecording(const std::string& i_rContextName);

    /// The file that a context was read from; empty when there is none.
    std::filesystem::path FileOf(const std::string& i_rContextName) const;

    /// Where what the operator chose is kept between runs; empty when nothing shall be kept.
    const std::filesystem::path& SettingsFolder() const { return m_SettingsFolder; }

    /// Starts the simulated capture as the context "Live", in place of one that runs. The capture begins with
    /// i_HistoryFrames frames behind it.
    void StartLive(std::uint32_t i_Subjects, std::int64_t i_HistoryFrames = 0);

    /// Listens for Open Sound Control messages and shows them as the context "Live", in place of another live input.
    /// Its channels come with the first messages, after the rate was measured if the options state none. On failure
    /// o_rError is one line, and another live input goes on unless it listened too.
    [[nodiscard]] TQL::IResult StartOsc(const Streaming::VOscInput::Options& i_rOptions, std::string& o_rError);
    std::uint16_t OscPort() const; ///< where it listens; 0 when it does not

    /// Replays a recording that is open as the context "Live", in place of another live input, so many times as fast as
    /// it was recorded: from 0.01 to 100. On failure o_rError is one line and everything stays as it was.
    [[nodiscard]] TQL::IResult StartReplay(const std::string& i_rContextName, double i_Speed, bool i_bLoop,
                                           std::string& o_rError);
    bool CanReplay(const std::string& i_rContextName) const; ///< it is a recording

    /// Gets sentences for the operator while a live input loses data; empty for nobody. Clear it before it dies.
    void SetLiveWarning(std::function<void(const std::string&)> i_Warn) { m_LiveWarning = std::move(i_Warn); }

    /// The live input that runs, or the last one when none does.
    LiveInput GetLiveInput() const;

    /// Whether what is live came from outside and is in no file yet. What was simulated or replayed can be had again.
    bool HasUnsavedLive() const;
    /// What a context had up to a tick is in a file.
    void NoteSaved(const std::shared_ptr<const Channels::VChannelContext>& i_rpContext, std::int64_t i_EndTick);
    /// Asks the operator before unsaved live data are lost; false: they shall not be. Clear it before it dies.
    void SetAskBeforeLoss(std::function<bool()> i_Ask) { m_AskBeforeLoss = std::move(i_Ask); }
    /// Call it before something that takes the live data away.
    bool MayLoseLive() const { return !HasUnsavedLive() || !m_AskBeforeLoss || m_AskBeforeLoss(); }

    bool IsLive() const; ///< some live input runs, or is paused
    void StopLive();     ///< the context stays, with what it has
    void SetLivePaused(bool i_bPaused);
    bool IsLivePaused() const; ///< false when there is no capture

    /// Makes a context the current one. False for an unknown name.
    bool ShowContext(const std::string& i_rName);
    std::string CurrentContextName() const; ///< empty when there is none
    /// The context that is current, null when there is none.
    std::shared_ptr<Channels::VChannelContext> CurrentContext() const;

    /// Loads the module that makes the contents. The message is one line.
    [[nodiscard]] TQL::IResult LoadModule(const std::filesystem::path& i_rPath, std::string& o_rError);

    /// Makes a Graph Plots content as a child of the frame.
    [[nodiscard]] TQL::IResult OpenContent(const QPointer<QWidget>& i_rpFrame, QPointer<QWidget>& o_rpContent,
                                           std::string& o_rError);

    /// Ends the capture, closes the contents and unloads the module. The windows may be open still.
    void Close();

    /// What the strict host found wrong so far.
    std::vector<std::string> Faults() const { return m_pHost->Faults(); }

private:
    void TellSelection();
    void AddContext(const std::shared_ptr<Channels::VChannelContext>& i_rpContext, int i_TimeMode);
    void AddLive(const std::shared_ptr<Channels::VLiveContext>& i_rpContext, double i_FramesPerSecond);

    std::filesystem::path m_SettingsFolder;
    std::map<std::string, std::filesystem::path> m_Files; ///< by context name
    std::unique_ptr<Services::VHostServices> m_pHost;
    std::shared_ptr<Channels::VChannelService> m_pChannels;
    std::map<std::string, std::unique_ptr<Services::VContextTimeFeed>> m_TimeFeeds; ///< by context name
    std::unique_ptr<VLiveCapture> m_pCapture;
    std::unique_ptr<VOscCapture> m_pOsc;
    std::function<void(const std::string&)> m_LiveWarning;
    std::function<bool()> m_AskBeforeLoss;
    LiveInput m_LastInput;                                ///< as it was started; its end when it was stopped
    std::weak_ptr<Channels::VChannelContext> m_pCaptured; ///< from outside
    std::int64_t m_SavedUntil = 0;                        ///< tick of it
    std::unique_ptr<Services::VPluginHost> m_pPlugin;
};

} // namespace Studio

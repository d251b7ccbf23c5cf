#pragma once

#include "Services/Common/VHostSubscriptions.h"
#include "Studio/Transport/EventRows.h"
#include "TQL/ITick.h"

#include <QtCore/QObject>
#include <QtCore/QTimer>

#include <cstdint>
#include <memory>
#include <string>
#include <vector>

namespace Services
{
class VTimeController;
}

namespace Studio
{

class VStudioSession;

/// What the transport shows. Frames are those of the current context, by the numbers that its file and the plots give
/// them; First and Last are both included.
struct TransportState
{
    bool bSource = false;   ///< there is a context
    bool bRange = false;    ///< it has frames: what follows the flags below says which
    bool bLiveData = false; ///< the context is a capture, in whichever view
    bool bLive = false;     ///< it is followed as it comes
    bool bRunning = false;  ///< the capture runs, or review plays
    bool bLooping = false;
    double Speed = 1.0;
    std::int64_t First = 0;
    std::int64_t Last = 0;
    std::int64_t Frame = 0;
    std::int64_t Tick = 0;
    std::int64_t FramePeriod = TQL::DefaultFramePeriod;
    TQL::TickRange Marks; ///< empty when there are none
};

/// Moves the current context in time: play, speed, steps, events, loop, and the switch between live and review. What
/// has no meaning at the moment does nothing. Owned by the window; the session outlives it. UI thread.
class VTransport : public QObject
{
    Q_OBJECT

public:
    explicit VTransport(VStudioSession& i_rSession, QObject* i_pParent = nullptr);
    ~VTransport() override;

    TransportState State() const;
    const std::vector<EventRow>& Events() const { return m_Events; } ///< of the current recording, by time

    void TogglePlay(); ///< in live it holds the capture
    void SetSpeed(double i_Speed);
    void ChangeSpeed(int i_Direction); ///< to the next offered one, faster (1) or slower (-1)
    void SeekToFrame(std::int64_t i_Frame);
    void StepBy(std::int64_t i_Frames);
    void GoToStart();
    void GoToEnd();
    void GoToEvent(int i_Direction); ///< the next (1) or the previous (-1) one
    void SetLooping(bool i_bLooping);
    void MarkLoopStart(); ///< at the current frame, and loop
    void MarkLoopEnd();
    void ClearMarks();

    /// Shows the capture as it comes, whichever context is current; false shows what has been captured so far.
    void SetLive(bool i_bLive);
    bool HasCapture() const; ///< there is a live context to switch to

Q_SIGNALS:
    void Changed();       ///< any of the state; at most once in 40 ms while time runs
    void EventsChanged(); ///< another context, other events

private:
    void FollowCurrent();
    void ReadEvents();
    void TellSoon();

    VStudioSession& m_rSession;
    const std::shared_ptr<Services::VTimeController> m_pController;
    std::vector<EventRow> m_Events;
    std::vector<std::int64_t> m_EventFrames;
    QTimer m_Tell; ///< a capture moves faster than anyone reads
    Services::VHostSubscriptions m_Subscriptions;
    Services::VHostSubscriptions m_SourceSubscription; ///< of the current source
};

} // namespace Studio

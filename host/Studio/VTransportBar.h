#pragma once

#include "Services/VHostSubscriptions.h"

#include <QtCore/QTimer>
#include <QtWidgets/QWidget>

#include <cstdint>
#include <memory>

class QComboBox;
class QLabel;
class QSlider;
class QSpinBox;
class QToolButton;

namespace Services
{
class VTimeController;
}

namespace Studio
{

class VStudioSession;

/// The bar at the foot of the window: which context is shown (the live capture or a recording), play and pause, and
/// where it stands. In review the slider and the frame number seek; in live they follow, and pause holds the capture.
/// The session outlives it. UI thread.
class VTransportBar : public QWidget
{
    Q_OBJECT

public:
    explicit VTransportBar(VStudioSession& i_rSession, QWidget* i_pParent = nullptr);
    ~VTransportBar() override;

    /// Plays or pauses, whichever is not the case.
    void TogglePlay();

    /// Moves by frames in review; no effect in live.
    void StepBy(std::int64_t i_Frames);

private:
    void BuildControls();
    void Subscribe();
    void RefreshSources();
    void RefreshCurrent();
    void RefreshTime();
    void RefreshTimeSoon();
    void SeekToFrame(std::int64_t i_Frame);
    bool IsLive() const;

    VStudioSession& m_rSession;
    const std::shared_ptr<Services::VTimeController> m_pController;
    QComboBox* m_pContexts = nullptr;
    QToolButton* m_pPlay = nullptr;
    QSlider* m_pSlider = nullptr;
    QSpinBox* m_pFrame = nullptr;
    QLabel* m_pTime = nullptr;
    QTimer m_TimeRefresh; ///< a capture moves faster than anyone reads
    Services::VHostSubscriptions m_Subscriptions;
    Services::VHostSubscriptions m_SourceSubscription; ///< of the current source
};

} // namespace Studio

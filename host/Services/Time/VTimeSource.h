#pragma once

#include "OrvanePluginInterface/ITimeController.h"
#include "Services/Common/VThreadCheck.h"
#include "Services/Postal/VDeferredSignal.h"
#include "TQL/ITick.h"

#include <memory>
#include <mutex>

namespace Services
{

/// One time: in live mode the current tick is always that of the latest frame, in review mode it stays inside the
/// range. Held by shared pointer, owned by the source map of the controller. Setters may be called on any thread;
/// StateChanged and ModeChanged are raised later, on the UI postal service. There is no state while the range is empty.
class VTimeSource : public OrvanePluginInterface::ITimeSource
{
public:
    /// i_Mode is an OrvanePluginInterface::ETimeMode.
    VTimeSource(int i_Mode, const std::shared_ptr<TQL::IPostalService>& i_rpUiPostalService,
                ThreadCheckPointer i_pCheck = nullptr);

    int GetMode() const override;
    bool GetTimeState(OrvanePluginInterface::TimeState& o_rState) const override;
    std::shared_ptr<TQL::IChangeSignal> StateChanged() const override;
    std::shared_ptr<TQL::IChangeSignal> SecondStateChanged() const override; ///< the same signal

    void SetMode(int i_Mode);
    /// Ticks, last exclusive; i_FramePeriod ticks, above 0.
    void SetRange(const TQL::TickRange& i_rRange, std::int64_t i_FramePeriod);
    /// Clamped to the range. No effect in live mode.
    void SetCurrentTick(std::int64_t i_Tick);

    // As GetMode and GetTimeState tell them, for the host and on any thread.
    int Mode() const;
    TQL::TickRange Range() const;
    std::int64_t FramePeriod() const;
    std::int64_t CurrentTick() const;

    /// The mode changed. For the controller, which tells the rest; not part of the interface that a plug-in sees.
    const std::shared_ptr<NotificationSystem::VChangeSignal>& ModeChanged() const { return m_ModeSignal.Signal(); }

private:
    void SettleLocked();

    const ThreadCheckPointer m_pCheck;
    mutable std::mutex m_Mutex;
    int m_Mode;                                           // guarded by m_Mutex
    TQL::TickRange m_Range;                               // guarded by m_Mutex
    std::int64_t m_FramePeriod = TQL::DefaultFramePeriod; // guarded by m_Mutex
    std::int64_t m_CurrentTick = 0;                       // guarded by m_Mutex
    VDeferredSignal m_StateSignal;
    VDeferredSignal m_ModeSignal;
};

} // namespace Services

#include "Services/Time/VTimeSource.h"

#include "Services/Time/TimeRules.h"

namespace Services
{

using namespace OrvanePluginInterface;

VTimeSource::VTimeSource(int i_Mode, const std::shared_ptr<TQL::IPostalService>& i_rpUiPostalService,
                         ThreadCheckPointer i_pCheck)
    : m_pCheck(std::move(i_pCheck))
    , m_Mode(i_Mode)
    , m_StateSignal(i_rpUiPostalService)
    , m_ModeSignal(i_rpUiPostalService)
{
}

int VTimeSource::GetMode() const
{
    CheckThread(m_pCheck, "ITimeSource::GetMode");
    return Mode();
}

bool VTimeSource::GetTimeState(TimeState& o_rState) const
{
    CheckThread(m_pCheck, "ITimeSource::GetTimeState");
    const std::lock_guard lock(m_Mutex);
    if (m_Range.IsEmpty())
        return false;
    o_rState = {};
    o_rState.FirstTick = m_Range.First;
    o_rState.LengthTicks = m_Range.Last - m_Range.First;
    o_rState.FramePeriodTicks = m_FramePeriod;
    o_rState.CurrentTick = m_CurrentTick;
    return true;
}

std::shared_ptr<TQL::IChangeSignal> VTimeSource::StateChanged() const
{
    CheckThread(m_pCheck, "ITimeSource::StateChanged");
    return m_StateSignal.Signal();
}

std::shared_ptr<TQL::IChangeSignal> VTimeSource::SecondStateChanged() const
{
    CheckThread(m_pCheck, "ITimeSource::SecondStateChanged");
    return m_StateSignal.Signal();
}

void VTimeSource::SetMode(int i_Mode)
{
    {
        const std::lock_guard lock(m_Mutex);
        if (m_Mode == i_Mode)
            return;
        m_Mode = i_Mode;
        SettleLocked();
    }
    m_ModeSignal.RaiseLater();
    m_StateSignal.RaiseLater();
}

void VTimeSource::SetRange(const TQL::TickRange& i_rRange, std::int64_t i_FramePeriod)
{
    {
        const std::lock_guard lock(m_Mutex);
        if (m_Range == i_rRange && m_FramePeriod == i_FramePeriod)
            return;
        m_Range = i_rRange;
        m_FramePeriod = i_FramePeriod;
        SettleLocked();
    }
    m_StateSignal.RaiseLater();
}

void VTimeSource::SetCurrentTick(std::int64_t i_Tick)
{
    {
        const std::lock_guard lock(m_Mutex);
        const std::int64_t tick = ClampToFrames(i_Tick, m_Range, m_FramePeriod);
        if (m_Mode == ETimeMode::Live || m_CurrentTick == tick)
            return;
        m_CurrentTick = tick;
    }
    m_StateSignal.RaiseLater();
}

/// Puts the current tick where mode and range want it.
void VTimeSource::SettleLocked()
{
    m_CurrentTick = m_Mode == ETimeMode::Live ? LatestFrameTick(m_Range, m_FramePeriod)
                                              : ClampToFrames(m_CurrentTick, m_Range, m_FramePeriod);
}

int VTimeSource::Mode() const
{
    const std::lock_guard lock(m_Mutex);
    return m_Mode;
}

TQL::TickRange VTimeSource::Range() const
{
    const std::lock_guard lock(m_Mutex);
    return m_Range;
}

std::int64_t VTimeSource::FramePeriod() const
{
    const std::lock_guard lock(m_Mutex);
    return m_FramePeriod;
}

std::int64_t VTimeSource::CurrentTick() const
{
    const std::lock_guard lock(m_Mutex);
    return m_CurrentTick;
}

} // namespace Services

#include "Services/Time/VTimeController.h"

#include "NotificationSystem/WeakCallback.h"
#include "Services/Time/TimeRules.h"

namespace Services
{

using namespace OrvanePluginInterface;

VTimeController::VTimeController(std::shared_ptr<TQL::IPostalService> i_pUiPostalService, ThreadCheckPointer i_pCheck)
    : m_pUiPostalService(std::move(i_pUiPostalService))
    , m_pCheck(std::move(i_pCheck))
    , m_SourceListSignal(m_pUiPostalService)
    , m_CurrentSourceSignal(m_pUiPostalService)
    , m_PlaySignal(m_pUiPostalService)
    , m_pSourceMap(std::make_shared<VSourceMap>(m_SourceListSignal.Signal(), m_pCheck))
{
}

std::shared_ptr<ISourceMap> VTimeController::GetSourceMap() const
{
    CheckThread(m_pCheck, "ITimeController::GetSourceMap");
    return m_pSourceMap;
}

void VTimeController::GetCurrentSourceName(std::string& o_rName) const
{
    CheckThread(m_pCheck, "ITimeController::GetCurrentSourceName");
    o_rName = m_CurrentName;
}

std::shared_ptr<ITimeSource> VTimeController::GetCurrentSource() const
{
    CheckThread(m_pCheck, "ITimeController::GetCurrentSource");
    return m_pSourceMap->FindSource(m_CurrentName);
}

void VTimeController::SeekTo(std::int64_t i_Tick)
{
    CheckThread(m_pCheck, "ITimeController::SeekTo");
    if (const auto pSource = CurrentReview())
        pSource->SetCurrentTick(i_Tick);
}

std::shared_ptr<TQL::IChangeSignal> VTimeController::SourceListChanged() const
{
    CheckThread(m_pCheck, "ITimeController::SourceListChanged");
    return m_SourceListSignal.Signal();
}

std::shared_ptr<TQL::IChangeSignal> VTimeController::CurrentSourceChanged() const
{
    CheckThread(m_pCheck, "ITimeController::CurrentSourceChanged");
    return m_CurrentSourceSignal.Signal();
}

std::shared_ptr<TQL::IChangeSignal> VTimeController::PlayChanged() const
{
    return m_PlaySignal.Signal();
}

std::shared_ptr<VTimeSource> VTimeController::AddSource(const std::string& i_rName, int i_Mode)
{
    const auto pSource = std::make_shared<VTimeSource>(i_Mode, m_pUiPostalService, m_pCheck);
    m_pSourceMap->Insert(i_rName, pSource);
    m_SourceListSignal.RaiseLater();
    if (i_rName == m_CurrentName)
        FollowCurrent();
    return pSource;
}

bool VTimeController::RemoveSource(const std::string& i_rName)
{
    if (!m_pSourceMap->Erase(i_rName))
        return false;
    m_Marks.erase(i_rName);
    if (i_rName == m_CurrentName)
    {
        m_CurrentName.clear();
        FollowCurrent();
    }
    m_SourceListSignal.RaiseLater();
    return true;
}

std::shared_ptr<VTimeSource> VTimeController::FindSource(std::string_view i_Name) const
{
    return m_pSourceMap->FindSource(i_Name);
}

bool VTimeController::SetCurrentSource(const std::string& i_rName)
{
    if (!i_rName.empty() && !m_pSourceMap->FindSource(i_rName))
        return false;
    if (i_rName == m_CurrentName)
        return true;
    m_CurrentName = i_rName;
    FollowCurrent();
    return true;
}

/// The object behind the current name is another one now.
void VTimeController::FollowCurrent()
{
    SetPlaying(false, m_Rate);
    m_ModeSubscription.Drain();
    if (const auto pSource = m_pSourceMap->FindSource(m_CurrentName))
    {
        const auto raise = NotificationSystem::MakeWeakCallback(weak_from_this(), &VTimeController::HandleModeChanged);
        m_ModeSubscription.Subscribe(std::shared_ptr<TQL::IChangeSignal>(pSource->ModeChanged()), raise, nullptr);
    }
    m_CurrentSourceSignal.RaiseLater();
}

void VTimeController::HandleModeChanged()
{
    if (!CurrentReview())
        SetPlaying(false, m_Rate);
    m_CurrentSourceSignal.RaiseLater();
}

void VTimeController::Play(double i_Rate)
{
    const auto pSource = CurrentReview();
    if (!pSource || pSource->Range().IsEmpty() || i_Rate == 0.0)
        return;
    const TQL::TickRange range = pSource->Range();
    if (!m_bLooping && AdvancePlay(pSource->CurrentTick(), 0, i_Rate, range, pSource->FramePeriod()).bEnded)
        pSource->SetCurrentTick(i_Rate > 0.0 ? range.First : range.Last);
    SetPlaying(true, i_Rate);
}

void VTimeController::Pause()
{
    SetPlaying(false, m_Rate);
}

void VTimeController::SetRate(double i_Rate)
{
    if (i_Rate != 0.0)
        SetPlaying(m_bPlaying, i_Rate);
}

void VTimeController::SetLooping(bool i_bLooping)
{
    if (m_bLooping == i_bLooping)
        return;
    m_bLooping = i_bLooping;
    m_PlaySignal.RaiseLater();
}

void VTimeController::SetMarks(const TQL::TickRange& i_rMarks)
{
    if (m_CurrentName.empty())
        return;
    if (i_rMarks.IsEmpty())
        m_Marks.erase(m_CurrentName);
    else
        m_Marks[m_CurrentName] = i_rMarks;
    m_PlaySignal.RaiseLater();
}

TQL::TickRange VTimeController::Marks() const
{
    const auto found = m_Marks.find(m_CurrentName);
    return found != m_Marks.end() ? found->second : TQL::TickRange();
}

void VTimeController::Advance(std::int64_t i_ElapsedTicks)
{
    const auto pSource = CurrentReview();
    if (!m_bPlaying || !pSource)
        return;
    if (m_bLooping)
    {
        const TQL::TickRange loop = LoopRange(Marks(), pSource->Range(), pSource->FramePeriod());
        pSource->SetCurrentTick(
            AdvanceLoop(pSource->CurrentTick(), i_ElapsedTicks, m_Rate, loop, pSource->FramePeriod()));
        return;
    }
    const PlayStep step =
        AdvancePlay(pSource->CurrentTick(), i_ElapsedTicks, m_Rate, pSource->Range(), pSource->FramePeriod());
    pSource->SetCurrentTick(step.Tick);
    if (step.bEnded)
        Pause();
}

/// The current source when it can be moved, else null.
std::shared_ptr<VTimeSource> VTimeController::CurrentReview() const
{
    const auto pSource = m_pSourceMap->FindSource(m_CurrentName);
    return pSource && pSource->Mode() == ETimeMode::Review ? pSource : nullptr;
}

void VTimeController::SetPlaying(bool i_bPlaying, double i_Rate)
{
    if (m_bPlaying == i_bPlaying && m_Rate == i_Rate)
        return;
    m_bPlaying = i_bPlaying;
    m_Rate = i_Rate;
    m_PlaySignal.RaiseLater();
}

} // namespace Services

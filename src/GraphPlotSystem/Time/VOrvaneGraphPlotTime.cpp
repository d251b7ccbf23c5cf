#include "GraphPlotSystem/Time/VOrvaneGraphPlotTime.h"

#include "GraphPlotSystem/Time/PlotTimeRules.h"
#include "NotificationSystem/VDispatchCollapsers.h"
#include "NotificationSystem/WeakCallback.h"

#include <utility>

namespace GraphPlotUI
{

using NotificationSystem::MakeWeakCallback;
namespace ETimeMode = OrvanePluginInterface::ETimeMode;

VOrvaneGraphPlotTime::VOrvaneGraphPlotTime(std::shared_ptr<TQL::IPostalService> i_pUiPostalService,
                                           std::shared_ptr<OrvanePluginInterface::ITimeController> i_pController)
    : VBaseGraphPlotTime(std::move(i_pUiPostalService))
    , m_pController(std::move(i_pController))
    , m_pRefreshCollapser(NotificationSystem::MakeCollapserDontPost(UiPostalService()))
{
}

VOrvaneGraphPlotTime::~VOrvaneGraphPlotTime() = default;

void VOrvaneGraphPlotTime::OnPostCreation()
{
    for (const auto& rpSignal : {m_pController->SourceListChanged(), m_pController->CurrentSourceChanged()})
    {
        m_ControllerSubscriptions.Subscribe(
            rpSignal, MakeWeakCallback(WeakSelf(this), &VOrvaneGraphPlotTime::RefreshSource), m_pRefreshCollapser);
    }
    PostRefresh();
}

void VOrvaneGraphPlotTime::PostRefresh()
{
    m_pRefreshCollapser->Post(MakeWeakCallback(WeakSelf(this), &VOrvaneGraphPlotTime::RefreshSource));
}

std::shared_ptr<OrvanePluginInterface::ITimeSource> VOrvaneGraphPlotTime::ChooseSource() const
{
    std::string currentName;
    m_pController->GetCurrentSourceName(currentName);
    if (m_PreferredSources.empty() || m_PreferredSources.contains(currentName))
        return m_pController->GetCurrentSource();

    std::shared_ptr<OrvanePluginInterface::ITimeSource> pFirst;
    std::shared_ptr<OrvanePluginInterface::ITimeSource> pLive;
    m_pController->GetSourceMap()->ForEach(
        [&](const std::string&, const std::shared_ptr<OrvanePluginInterface::ITimeSource>& i_rpSource)
        {
            if (!pFirst)
                pFirst = i_rpSource;
            if (!pLive && i_rpSource && i_rpSource->GetMode() == ETimeMode::Live)
                pLive = i_rpSource;
        });
    return pLive ? pLive : pFirst;
}

void VOrvaneGraphPlotTime::RefreshSource()
{
    if (!m_bActive)
        return;
    m_SourceSubscriptions.Drain();
    m_pSource = ChooseSource();
    if (!m_pSource)
        return;

    const auto pCollapser = NotificationSystem::MakeCollapserDontPost(UiPostalService());
    const auto sample = MakeWeakCallback(WeakSelf(this), &VOrvaneGraphPlotTime::Sample);
    const auto pFirst = m_pSource->StateChanged();
    const auto pSecond = m_pSource->SecondStateChanged();
    m_SourceSubscriptions.Subscribe(pFirst, sample, pCollapser);
    if (pSecond && pSecond != pFirst)
        m_SourceSubscriptions.Subscribe(pSecond, sample, pCollapser);
    pCollapser->Post(sample);

    const int mode = m_pSource->GetMode();
    m_bRelative = mode != ETimeMode::Review;
    Values values = GetValues();
    values.bLive = mode == ETimeMode::Live;
    values.bReview = mode == ETimeMode::Review;
    SetValues(values);
}

void VOrvaneGraphPlotTime::Sample()
{
    OrvanePluginInterface::TimeState state;
    if (!m_pSource || !m_pSource->GetTimeState(state))
        return;
    const auto sample = SamplePlotTime(state, m_bRelative);
    if (!sample)
        return;
    Values values = GetValues();
    values.LatestFrame = sample->LatestFrame;
    values.SessionRange = sample->SessionRange;
    values.CurrentTime = sample->CurrentTime;
    values.FramePeriod = sample->FramePeriod;
    SetValues(values);
}

void VOrvaneGraphPlotTime::SetCurrentTime(qlonglong i_Frame)
{
    OrvanePluginInterface::TimeState state;
    if (!m_pSource || IsLive() || !m_pSource->GetTimeState(state))
        return;
    if (const auto tick = SeekTickOfFrame(state, i_Frame, m_bRelative))
        m_pController->SeekTo(*tick);
}

void VOrvaneGraphPlotTime::SetActive(bool i_bActive)
{
    if (m_bActive == i_bActive)
        return;
    m_bActive = i_bActive;
    if (i_bActive)
        PostRefresh();
    else
        m_SourceSubscriptions.Drain();
}

bool VOrvaneGraphPlotTime::HasSource(const std::string& i_rName) const
{
    return m_pController->GetSourceMap()->Find(i_rName) != nullptr;
}

void VOrvaneGraphPlotTime::SetPreferredSources(const std::set<std::string>& i_rNames)
{
    if (m_PreferredSources == i_rNames)
        return;
    m_PreferredSources = i_rNames;
    PostRefresh();
}

} // namespace GraphPlotUI

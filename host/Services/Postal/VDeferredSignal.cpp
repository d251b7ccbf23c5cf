#include "Services/Postal/VDeferredSignal.h"

#include "NotificationSystem/VDispatchCollapsers.h"

namespace Services
{

VDeferredSignal::VDeferredSignal(const std::shared_ptr<TQL::IPostalService>& i_rpPostalService)
    : m_pCollapser(NotificationSystem::MakeCollapserDontPost(i_rpPostalService))
    , m_pSignal(std::make_shared<NotificationSystem::VChangeSignal>())
{
}

void VDeferredSignal::RaiseLater() const
{
    m_pCollapser->Post([pSignal = m_pSignal] { pSignal->Invoke(); });
}

} // namespace Services

#pragma once

#include "NotificationSystem/VMultiCallbackPostal.h"

#include <memory>

namespace Services
{

/// Raises a signal later, from a postal service, once for a burst: so the raising call may hold what it likes. A member
/// of whoever owns the signal. Any thread.
class VDeferredSignal
{
public:
    explicit VDeferredSignal(const std::shared_ptr<TQL::IPostalService>& i_rpPostalService);

    void RaiseLater() const;
    const std::shared_ptr<NotificationSystem::VChangeSignal>& Signal() const { return m_pSignal; }

private:
    std::shared_ptr<TQL::IPostalService> m_pCollapser;
    std::shared_ptr<NotificationSystem::VChangeSignal> m_pSignal;
};

} // namespace Services

#pragma once

#include "NotificationSystem/IAsioPostalService.h"

#include <memory>
#include <utility>

namespace Services
{

/// Hands every operation on to a postal service of the host, as an object of its own: signals keep the postal services
/// of their subscribers, and so the plug-in's can be told from the host's. Any thread. TService is the interface.
template <typename TService>
class VCheckedPostalServiceBase : public TService
{
public:
    explicit VCheckedPostalServiceBase(std::shared_ptr<TService> i_pService) : m_pService(std::move(i_pService)) {}

    void Post(TQL::IPostalService::Job i_Job, std::uint64_t i_Tag) override
    {
        m_pService->Post(std::move(i_Job), i_Tag);
    }

    void GetDispatchTraits(TQL::DispatchTraits& o_rTraits) const override { m_pService->GetDispatchTraits(o_rTraits); }

protected:
    const std::shared_ptr<TService> m_pService;
};

using VCheckedPostalService = VCheckedPostalServiceBase<TQL::IPostalService>;

class VCheckedAsioPostalService : public VCheckedPostalServiceBase<TQL::IAsioPostalService>
{
public:
    using VCheckedPostalServiceBase::VCheckedPostalServiceBase;

    const std::shared_ptr<NotificationSystem::Executor>& GetExecutor() const override
    {
        return m_pService->GetExecutor();
    }

    const std::shared_ptr<boost::asio::io_context>& GetContext() const override { return m_pService->GetContext(); }
};

} // namespace Services

#pragma once

#include "NotificationSystem/IAsioPostalService.h"

namespace NotificationSystem
{

/// Runs its jobs one at a time, in the order of posting, on some thread of its parent's pool. A parent that is serial
/// already lends its own executor: no second strand is built on top. Thread-safe; keeps its parent alive.
class VAsioPostalServiceStrand : public TQL::IAsioPostalService
{
public:
    explicit VAsioPostalServiceStrand(std::shared_ptr<TQL::IAsioPostalService> i_pParent);

    void Post(Job i_Job, std::uint64_t i_Tag = 0) override;
    void GetDispatchTraits(TQL::DispatchTraits& o_rTraits) const override;
    const std::shared_ptr<Executor>& GetExecutor() const override { return m_pExecutor; }
    const std::shared_ptr<boost::asio::io_context>& GetContext() const override { return m_pContext; }

private:
    std::shared_ptr<TQL::IAsioPostalService> m_pParent;
    std::shared_ptr<boost::asio::io_context> m_pContext;
    std::shared_ptr<Executor> m_pExecutor;
    Executor m_PostingExecutor;
};

std::shared_ptr<VAsioPostalServiceStrand> MakeStrand(std::shared_ptr<TQL::IAsioPostalService> i_pParent);

} // namespace NotificationSystem

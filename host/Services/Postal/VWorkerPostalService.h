#pragma once

#include "NotificationSystem/IAsioPostalService.h"

#include <chrono>
#include <cstddef>
#include <memory>

namespace Services
{

/// Runs jobs on a pool of threads behind one io_context, in no order; strands and timers stand on the same io_context.
/// Any thread may post. A job that throws is logged and the pool goes on. Owned by the host, destroyed after everything
/// that posts.
class VWorkerPostalService : public TQL::IAsioPostalService
{
public:
    /// At least two threads, whatever is asked for.
    explicit VWorkerPostalService(std::size_t i_ThreadCount = 2);
    ~VWorkerPostalService() override; ///< stops
    VWorkerPostalService(const VWorkerPostalService&) = delete;
    VWorkerPostalService& operator=(const VWorkerPostalService&) = delete;

    void Post(Job i_Job, std::uint64_t i_Tag = 0) override;
    void GetDispatchTraits(TQL::DispatchTraits& o_rTraits) const override; ///< nothing promised
    const std::shared_ptr<NotificationSystem::Executor>& GetExecutor() const override { return m_pExecutor; }
    const std::shared_ptr<boost::asio::io_context>& GetContext() const override { return m_pContext; }

    /// Waits until the io_context has no work left: jobs, strands and timers. False when some is left after the time
    /// given, for example because a timer starts itself again and again. Not from a job.
    [[nodiscard]] bool Drain(std::chrono::milliseconds i_Patience = std::chrono::seconds(5));

    /// Lets the running jobs end, drops the others and ends the threads. Later posts are never run. Not from a job.
    void Stop();

    std::size_t ThreadCount() const;

private:
    class Pool;

    std::shared_ptr<boost::asio::io_context> m_pContext;
    std::shared_ptr<NotificationSystem::Executor> m_pExecutor;
    std::shared_ptr<Pool> m_pPool;
};

} // namespace Services

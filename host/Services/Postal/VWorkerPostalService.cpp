#include "Services/Postal/VWorkerPostalService.h"

#include "Services/Postal/JobGuard.h"

#include <algorithm>
#include <atomic>
#include <condition_variable>
#include <mutex>
#include <optional>
#include <thread>
#include <vector>

namespace Services
{

/// The threads. When the io_context runs out of work they rest here until a drain lets them go on.
class VWorkerPostalService::Pool : public std::enable_shared_from_this<VWorkerPostalService::Pool>
{
public:
    explicit Pool(std::shared_ptr<boost::asio::io_context> i_pContext)
        : m_pContext(std::move(i_pContext)), m_Work(boost::asio::make_work_guard(*m_pContext))
    {
    }

    void Start(std::size_t i_Count)
    {
        for (std::size_t i = 0; i < i_Count; ++i)
            m_Threads.emplace_back([pThis = shared_from_this()] { pThis->RunThread(); });
    }

    bool Drain(std::chrono::milliseconds i_Patience)
    {
        const std::lock_guard drainLock(m_DrainMutex);
        std::unique_lock lock(m_Mutex);
        if (m_bStopping)
            return true;
        const auto allRest = [this]
        {
            return m_bStopping || m_Resting == m_Threads.size();
        };
        m_Work.reset();
        const bool bDrained = m_Changed.wait_for(lock, i_Patience, allRest);
        if (m_bStopping)
            return bDrained;
        m_Work.emplace(boost::asio::make_work_guard(*m_pContext));
        if (!bDrained && !m_pContext->stopped())
            return false;
        m_Changed.wait(lock, allRest);
        m_pContext->restart();
        m_Resting = 0; // counted here, not where the threads wake up: the next drain may come before that
        ++m_Generation;
        m_Changed.notify_all();
        return true;
    }

    void Stop()
    {
        {
            const std::lock_guard lock(m_Mutex);
            if (m_bStopping.exchange(true))
                return;
            m_Work.reset();
        }
        m_pContext->stop();
        m_Changed.notify_all();
        for (std::thread& rThread : m_Threads)
        {
            if (rThread.get_id() == std::this_thread::get_id())
                rThread.detach(); // the last owner was a job of this pool; the thread ends after that job
            else
                rThread.join();
        }
    }

    bool IsStopping() const { return m_bStopping; }
    std::size_t ThreadCount() const { return m_Threads.size(); }

private:
    void RunThread()
    {
        for (;;)
        {
            for (bool bEnded = false; !bEnded;)
                RunGuarded(
                    [&]
                    {
                        m_pContext->run();
                        bEnded = true;
                    },
                    "the worker pool");
            std::unique_lock lock(m_Mutex);
            ++m_Resting;
            m_Changed.notify_all();
            m_Changed.wait(lock,
                           [this, generation = m_Generation] { return m_bStopping || m_Generation != generation; });
            if (m_bStopping)
                return;
        }
    }

    using WorkGuard = boost::asio::executor_work_guard<boost::asio::io_context::executor_type>;

    const std::shared_ptr<boost::asio::io_context> m_pContext;
    std::mutex m_DrainMutex; // one drain at a time; taken before m_Mutex
    std::mutex m_Mutex;
    std::condition_variable m_Changed;
    std::optional<WorkGuard> m_Work;      // guarded by m_Mutex
    std::size_t m_Resting = 0;            // guarded by m_Mutex
    std::uint64_t m_Generation = 0;       // guarded by m_Mutex
    std::atomic<bool> m_bStopping{false}; // written under m_Mutex
    std::vector<std::thread> m_Threads;   // fixed once started
};

VWorkerPostalService::VWorkerPostalService(std::size_t i_ThreadCount)
    : m_pContext(std::make_shared<boost::asio::io_context>())
    , m_pExecutor(std::make_shared<NotificationSystem::Executor>(m_pContext->get_executor()))
    , m_pPool(std::make_shared<Pool>(m_pContext))
{
    m_pPool->Start(std::max<std::size_t>(i_ThreadCount, 2));
}

VWorkerPostalService::~VWorkerPostalService()
{
    m_pPool->Stop();
}

void VWorkerPostalService::Post(Job i_Job, std::uint64_t)
{
    if (!m_pPool->IsStopping())
        boost::asio::post(*m_pExecutor, std::move(i_Job));
}

void VWorkerPostalService::GetDispatchTraits(TQL::DispatchTraits& o_rTraits) const
{
    o_rTraits = {};
}

bool VWorkerPostalService::Drain(std::chrono::milliseconds i_Patience)
{
    return m_pPool->Drain(i_Patience);
}

void VWorkerPostalService::Stop()
{
    m_pPool->Stop();
}

std::size_t VWorkerPostalService::ThreadCount() const
{
    return m_pPool->ThreadCount();
}

} // namespace Services

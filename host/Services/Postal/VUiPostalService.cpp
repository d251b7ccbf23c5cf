#include "Services/Postal/VUiPostalService.h"

#include "Services/Postal/JobGuard.h"

#include <QtCore/QCoreApplication>
#include <QtCore/QEvent>
#include <QtCore/QObject>
#include <QtCore/QThread>

#include <atomic>
#include <deque>
#include <mutex>
#include <utility>

namespace Services
{

/// The queue, shared with the object in the UI thread that Qt delivers to: one event a job.
class VUiPostalService::State : public std::enable_shared_from_this<VUiPostalService::State>
{
public:
    ~State() { Close(); }

    /// Once, after a shared pointer owns this.
    void Start() { m_pReceiver = new Receiver(weak_from_this()); }

    void Push(Job i_Job)
    {
        const std::lock_guard lock(m_Mutex);
        if (!m_pReceiver)
            return;
        m_Jobs.push_back(std::move(i_Job));
        QCoreApplication::postEvent(m_pReceiver, new QEvent(JobEvent()));
    }

    bool RunOne()
    {
        Job job;
        {
            const std::lock_guard lock(m_Mutex);
            if (m_Jobs.empty())
                return false;
            job = std::move(m_Jobs.front());
            m_Jobs.pop_front();
        }
        ++m_Depth;
        RunGuarded(job, "the UI thread");
        job = nullptr; // what it holds may run code of a module too, so it belongs to the run
        --m_Depth;
        ++m_JobsRun;
        return true;
    }

    void Close()
    {
        std::deque<Job> dropped; // destroyed without the lock: what a job holds may post
        QObject* pReceiver = nullptr;
        {
            const std::lock_guard lock(m_Mutex);
            dropped.swap(m_Jobs);
            pReceiver = std::exchange(m_pReceiver, nullptr);
        }
        if (!pReceiver)
            return;
        if (m_Depth == 0 && QThread::currentThread() == pReceiver->thread())
            delete pReceiver;
        else
            pReceiver->deleteLater();
    }

    std::size_t Pending() const
    {
        const std::lock_guard lock(m_Mutex);
        return m_Jobs.size();
    }

    std::uint64_t JobsRun() const { return m_JobsRun; }

private:
    class Receiver : public QObject
    {
    public:
        explicit Receiver(std::weak_ptr<State> i_pState) : m_pState(std::move(i_pState)) {}

        bool event(QEvent* i_pEvent) override
        {
            if (i_pEvent->type() != JobEvent())
                return QObject::event(i_pEvent);
            if (const auto pState = m_pState.lock())
                pState->RunOne();
            return true;
        }

    private:
        const std::weak_ptr<State> m_pState;
    };

    static QEvent::Type JobEvent()
    {
        static const auto type = static_cast<QEvent::Type>(QEvent::registerEventType());
        return type;
    }

    mutable std::mutex m_Mutex;
    std::deque<Job> m_Jobs;         // guarded by m_Mutex
    QObject* m_pReceiver = nullptr; // guarded by m_Mutex; lives in the UI thread, null once closed
    std::atomic<int> m_Depth{0};    // of jobs that run now; above 1 in a nested event loop
    std::atomic<std::uint64_t> m_JobsRun{0};
};

VUiPostalService::VUiPostalService() : m_pState(std::make_shared<State>())
{
    m_pState->Start();
}

VUiPostalService::~VUiPostalService()
{
    m_pState->Close();
}

void VUiPostalService::Post(Job i_Job, std::uint64_t)
{
    m_pState->Push(std::move(i_Job));
}

void VUiPostalService::GetDispatchTraits(TQL::DispatchTraits& o_rTraits) const
{
    o_rTraits = {TQL::DispatchTraits::KindSerial, TQL::DispatchTraits::FlagOrdered};
}

std::size_t VUiPostalService::Drain(std::size_t i_Limit)
{
    const std::shared_ptr<State> pState = m_pState;
    std::size_t count = 0;
    while (count < i_Limit && pState->RunOne())
        ++count;
    return count;
}

void VUiPostalService::Close()
{
    m_pState->Close();
}

std::size_t VUiPostalService::Pending() const
{
    return m_pState->Pending();
}

std::uint64_t VUiPostalService::JobsRun() const
{
    return m_pState->JobsRun();
}

} // namespace Services

#pragma once

#include "TQL/IPostalService.h"

#include <deque>
#include <mutex>
#include <utility>

namespace TestSupport
{

/// Queues jobs and runs them when the test says so, in order, on the thread that says it. Thread-safe.
class ManualPostalService : public TQL::IPostalService
{
public:
    void Post(Job i_Job, std::uint64_t i_Tag = 0) override
    {
        const std::lock_guard lock(m_Mutex);
        m_Jobs.emplace_back(std::move(i_Job), i_Tag);
    }

    void GetDispatchTraits(TQL::DispatchTraits& o_rTraits) const override
    {
        o_rTraits = {TQL::DispatchTraits::KindSerial, TQL::DispatchTraits::FlagOrdered};
    }

    std::size_t Pending() const
    {
        const std::lock_guard lock(m_Mutex);
        return m_Jobs.size();
    }

    /// Runs the first job. False when there is none.
    bool RunOne()
    {
        Job job;
        {
            const std::lock_guard lock(m_Mutex);
            if (m_Jobs.empty())
                return false;
            job = std::move(m_Jobs.front().first);
            m_LastTag = m_Jobs.front().second;
            m_Jobs.pop_front();
        }
        job();
        return true;
    }

    /// Runs the jobs that wait now; those that they post stay. Returns how many ran.
    std::size_t RunPending()
    {
        const std::size_t count = Pending();
        for (std::size_t i = 0; i < count; ++i)
            RunOne();
        return count;
    }

    /// Runs until nothing waits, at most i_Limit jobs.
    std::size_t RunAll(std::size_t i_Limit = 10000)
    {
        std::size_t count = 0;
        while (count < i_Limit && RunOne())
            ++count;
        return count;
    }

    std::uint64_t LastTag() const { return m_LastTag; }

private:
    mutable std::mutex m_Mutex;
    std::deque<std::pair<Job, std::uint64_t>> m_Jobs; // guarded by m_Mutex
    std::uint64_t m_LastTag = 0;
};

} // namespace TestSupport

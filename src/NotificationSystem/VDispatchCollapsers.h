#pragma once

#include "TQL/IPostalService.h"

#include <memory>
#include <mutex>

namespace NotificationSystem
{

/// Turns a burst of posts into one run of the first job: while one job waits in the wrapped service, further posts are
/// dropped. For jobs that take no data. Post throws std::bad_weak_ptr unless a shared pointer holds the collapser; a
/// queued job keeps it alive. The mutex is held while posting, so the wrapped service must not run jobs inside Post.
class VDispatchCollapserDontPostIfAnotherQueued
    : public TQL::IPostalService,
      public std::enable_shared_from_this<VDispatchCollapserDontPostIfAnotherQueued>
{
public:
    explicit VDispatchCollapserDontPostIfAnotherQueued(std::shared_ptr<TQL::IPostalService> i_pWrapped);

    void Post(Job i_Job, std::uint64_t i_Tag = 0) override;
    void GetDispatchTraits(TQL::DispatchTraits& o_rTraits) const override;

private:
    void Run(const Job& i_rJob);

    std::mutex m_Mutex;
    const std::shared_ptr<TQL::IPostalService> m_pWrapped;
    bool m_bQueued = false; // guarded by m_Mutex
};

/// Turns a burst of posts into one run of the last job: each post replaces the job that waits, and the posts before it
/// run as empty shells. For jobs that carry data. Same rules of life and locking as its sibling above.
class VDispatchCollapserDontDispatchIfAnotherQueued
    : public TQL::IPostalService,
      public std::enable_shared_from_this<VDispatchCollapserDontDispatchIfAnotherQueued>
{
public:
    explicit VDispatchCollapserDontDispatchIfAnotherQueued(std::shared_ptr<TQL::IPostalService> i_pWrapped);

    void Post(Job i_Job, std::uint64_t i_Tag = 0) override;
    void GetDispatchTraits(TQL::DispatchTraits& o_rTraits) const override;

private:
    void Run(std::uint32_t i_SequenceNumber);

    std::mutex m_Mutex;
    const std::shared_ptr<TQL::IPostalService> m_pWrapped;
    std::uint32_t m_SequenceNumber = 0; // guarded by m_Mutex
    Job m_LatestJob;                    // guarded by m_Mutex
};

/// Null for a null service.
std::shared_ptr<VDispatchCollapserDontPostIfAnotherQueued>
MakeCollapserDontPost(std::shared_ptr<TQL::IPostalService> i_pService);

/// Null for a null service.
std::shared_ptr<VDispatchCollapserDontDispatchIfAnotherQueued>
MakeCollapserDontDispatch(std::shared_ptr<TQL::IPostalService> i_pService);

} // namespace NotificationSystem

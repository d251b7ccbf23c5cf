#include "NotificationSystem/VDispatchCollapsers.h"

#include "TQL/IMultiCallback.h"

#include <utility>

namespace NotificationSystem
{
namespace
{

void RunJob(const TQL::IPostalService::Job& i_rJob)
{
    try
    {
        i_rJob();
    }
    catch (const TQL::VDeregisterWeakCallbackException&)
    {
        // A dead target: nothing to run. The multi-callback behind the job hears of it by itself.
    }
}

} // namespace

VDispatchCollapserDontPostIfAnotherQueued::VDispatchCollapserDontPostIfAnotherQueued(
    std::shared_ptr<TQL::IPostalService> i_pWrapped)
    : m_pWrapped(std::move(i_pWrapped))
{
}

void VDispatchCollapserDontPostIfAnotherQueued::Post(Job i_Job, std::uint64_t i_Tag)
{
    const auto pSelf = shared_from_this();
    std::shared_ptr<const Job> pJob; // destroyed after the mutex is free, also where the wrapped service drops it
    const std::lock_guard lock(m_Mutex);
    if (m_bQueued)
        return;
    pJob = std::make_shared<const Job>(std::move(i_Job));
    m_pWrapped->Post([pSelf, pJob] { pSelf->Run(*pJob); }, i_Tag);
    m_bQueued = true;
}

void VDispatchCollapserDontPostIfAnotherQueued::Run(const Job& i_rJob)
{
    {
        const std::lock_guard lock(m_Mutex);
        m_bQueued = false;
    }
    RunJob(i_rJob);
}

void VDispatchCollapserDontPostIfAnotherQueued::GetDispatchTraits(TQL::DispatchTraits& o_rTraits) const
{
    m_pWrapped->GetDispatchTraits(o_rTraits);
}

VDispatchCollapserDontDispatchIfAnotherQueued::VDispatchCollapserDontDispatchIfAnotherQueued(
    std::shared_ptr<TQL::IPostalService> i_pWrapped)
    : m_pWrapped(std::move(i_pWrapped))
{
}

void VDispatchCollapserDontDispatchIfAnotherQueued::Post(Job i_Job, std::uint64_t i_Tag)
{
    const auto pSelf = shared_from_this();
    Job replaced; // destroyed after the mutex is free: it may own what calls back here
    const std::lock_guard lock(m_Mutex);
    replaced = std::exchange(m_LatestJob, std::move(i_Job));
    const std::uint32_t sequenceNumber = ++m_SequenceNumber;
    m_pWrapped->Post([pSelf, sequenceNumber] { pSelf->Run(sequenceNumber); }, i_Tag);
}

void VDispatchCollapserDontDispatchIfAnotherQueued::Run(std::uint32_t i_SequenceNumber)
{
    Job job;
    {
        const std::lock_guard lock(m_Mutex);
        if (m_SequenceNumber != i_SequenceNumber || !m_LatestJob)
            return;
        job = std::exchange(m_LatestJob, nullptr);
    }
    RunJob(job);
}

void VDispatchCollapserDontDispatchIfAnotherQueued::GetDispatchTraits(TQL::DispatchTraits& o_rTraits) const
{
    m_pWrapped->GetDispatchTraits(o_rTraits);
}

std::shared_ptr<VDispatchCollapserDontPostIfAnotherQueued>
MakeCollapserDontPost(std::shared_ptr<TQL::IPostalService> i_pService)
{
    if (!i_pService)
        return nullptr;
    return std::make_shared<VDispatchCollapserDontPostIfAnotherQueued>(std::move(i_pService));
}

std::shared_ptr<VDispatchCollapserDontDispatchIfAnotherQueued>
MakeCollapserDontDispatch(std::shared_ptr<TQL::IPostalService> i_pService)
{
    if (!i_pService)
        return nullptr;
    return std::make_shared<VDispatchCollapserDontDispatchIfAnotherQueued>(std::move(i_pService));
}

} // namespace NotificationSystem

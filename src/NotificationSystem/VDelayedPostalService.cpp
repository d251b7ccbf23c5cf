#include "NotificationSystem/VDelayedPostalService.h"

#include "NotificationSystem/VDispatchCollapsers.h"

#include <limits>
#include <mutex>

namespace NotificationSystem
{
namespace Detail
{

using Clock = std::chrono::system_clock;

Clock::time_point SaturatedExpiry(Clock::time_point i_Now, std::int64_t i_DelayMilliseconds)
{
    using Ratio = std::ratio_divide<std::milli, Clock::period>;
    static_assert(Ratio::den == 1, "a clock unit is at most a millisecond");
    const Clock::rep now = i_Now.time_since_epoch().count();
    Clock::rep delay = 0;
    Clock::rep expiry = 0;
    const bool bOverflow = __builtin_mul_overflow(i_DelayMilliseconds, Clock::rep{Ratio::num}, &delay) ||
                           __builtin_add_overflow(now, delay, &expiry);
    if (bOverflow)
        return i_DelayMilliseconds < 0 ? Clock::time_point::min() : Clock::time_point::max();
    return Clock::time_point(Clock::duration(expiry));
}

class VDelayedPostalService::Implementation : public std::enable_shared_from_this<Implementation>
{
public:
    Implementation(std::shared_ptr<TQL::IPostalService> i_pWrapped, std::shared_ptr<boost::asio::io_context> i_pContext,
                   std::int64_t i_DelayMilliseconds)
        : m_pWrapped(std::move(i_pWrapped))
        , m_pContext(std::move(i_pContext))
        , m_DelayMilliseconds(i_DelayMilliseconds)
        , m_Timer(*m_pContext)
    {
    }

    void Post(Job i_Job, std::uint64_t i_Tag)
    {
        const std::lock_guard lock(m_Mutex);
        CancelLocked();
        try
        {
            m_Timer.expires_at(SaturatedExpiry(Clock::now(), m_DelayMilliseconds));
        }
        catch (const boost::system::system_error& rError)
        {
            throw boost::system::system_error(rError.code(), "expires_from_now");
        }
        // The error code is not looked at: a cancelled wait posts its job at once instead of losing it.
        m_Timer.async_wait(
            [pSelf = shared_from_this(), job = std::move(i_Job), tag = i_Tag](const boost::system::error_code&) mutable
            { pSelf->m_pWrapped->Post(std::move(job), tag); });
    }

    void Cancel()
    {
        const std::lock_guard lock(m_Mutex);
        CancelLocked();
    }

    const TQL::IPostalService& Wrapped() const { return *m_pWrapped; }

private:
    void CancelLocked()
    {
        try
        {
            m_Timer.cancel();
        }
        catch (const boost::system::system_error& rError)
        {
            throw boost::system::system_error(rError.code(), "cancel");
        }
    }

    std::shared_ptr<TQL::IPostalService> m_pWrapped;
    std::shared_ptr<boost::asio::io_context> m_pContext;
    const std::int64_t m_DelayMilliseconds;
    std::mutex m_Mutex;
    boost::asio::basic_waitable_timer<Clock> m_Timer; // guarded by m_Mutex
};

VDelayedPostalService::VDelayedPostalService(std::shared_ptr<TQL::IPostalService> i_pWrapped,
                                             std::shared_ptr<boost::asio::io_context> i_pContext,
                                             std::int64_t i_DelayMilliseconds)
    : m_pImplementation(
          std::make_shared<Implementation>(std::move(i_pWrapped), std::move(i_pContext), i_DelayMilliseconds))
{
}

VDelayedPostalService::~VDelayedPostalService()
{
    try
    {
        m_pImplementation->Cancel();
    }
    catch (const boost::system::system_error&)
    {
        // The wait then ends by itself: the implementation lives until its handler has run.
    }
}

void VDelayedPostalService::Post(Job i_Job, std::uint64_t i_Tag)
{
    m_pImplementation->Post(std::move(i_Job), i_Tag);
}

void VDelayedPostalService::GetDispatchTraits(TQL::DispatchTraits& o_rTraits) const
{
    m_pImplementation->Wrapped().GetDispatchTraits(o_rTraits);
}

} // namespace Detail

std::shared_ptr<VDispatchCollapserDontDispatchIfAnotherQueued>
MakeDelayedCollapsed(std::shared_ptr<TQL::IPostalService> i_pWrapped,
                     std::shared_ptr<boost::asio::io_context> i_pContext, std::int64_t i_DelayMilliseconds)
{
    return MakeCollapserDontDispatch(std::make_shared<Detail::VDelayedPostalService>(
        std::move(i_pWrapped), std::move(i_pContext), i_DelayMilliseconds));
}

} // namespace NotificationSystem

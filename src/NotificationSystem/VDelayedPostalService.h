#pragma once

#include "NotificationSystem/Asio.h"
#include "TQL/IPostalService.h"

#include <chrono>
#include <memory>

namespace NotificationSystem
{

class VDispatchCollapserDontDispatchIfAnotherQueued;

namespace Detail
{

/// Hands a job to the wrapped service after a delay, by a timer in the given io_context. Only one wait is pending: a
/// second Post before the delay ends sends the first job on at once and starts a full delay for the second. No job is
/// lost: one whose wait is cancelled, also by the destruction of this service, is posted at once. Thread-safe.
/// Post throws boost::system::system_error ("cancel", "expires_from_now") when the timer fails.
class VDelayedPostalService : public TQL::IPostalService
{
public:
    VDelayedPostalService(std::shared_ptr<TQL::IPostalService> i_pWrapped,
                          std::shared_ptr<boost::asio::io_context> i_pContext, std::int64_t i_DelayMilliseconds);
    ~VDelayedPostalService() override;
    VDelayedPostalService(const VDelayedPostalService&) = delete;
    VDelayedPostalService& operator=(const VDelayedPostalService&) = delete;

    void Post(Job i_Job, std::uint64_t i_Tag = 0) override;
    void GetDispatchTraits(TQL::DispatchTraits& o_rTraits) const override;

private:
    class Implementation;
    std::shared_ptr<Implementation> m_pImplementation;
};

/// The moment i_Delay milliseconds after i_Now, saturating at the ends of the clock in both directions.
std::chrono::system_clock::time_point SaturatedExpiry(std::chrono::system_clock::time_point i_Now,
                                                      std::int64_t i_DelayMilliseconds);

} // namespace Detail

/// A delayed service under a collapser that runs only the latest job: the shape of a repeating update loop.
std::shared_ptr<VDispatchCollapserDontDispatchIfAnotherQueued>
MakeDelayedCollapsed(std::shared_ptr<TQL::IPostalService> i_pWrapped,
                     std::shared_ptr<boost::asio::io_context> i_pContext, std::int64_t i_DelayMilliseconds);

} // namespace NotificationSystem

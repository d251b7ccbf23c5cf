#pragma once

#include "TQL/IPostalService.h"

#include <cstddef>
#include <memory>

namespace Services
{

/// Runs jobs on the UI thread, from the Qt event loop, in the order of posting and never inside Post. Made on the UI
/// thread; any thread may post and may let go of it. Jobs that still wait when it is destroyed are dropped. A job that
/// throws is logged and the next one runs.
class VUiPostalService : public TQL::IPostalService
{
public:
    VUiPostalService();
    ~VUiPostalService() override;
    VUiPostalService(const VUiPostalService&) = delete;
    VUiPostalService& operator=(const VUiPostalService&) = delete;

    void Post(Job i_Job, std::uint64_t i_Tag = 0) override;
    void GetDispatchTraits(TQL::DispatchTraits& o_rTraits) const override; ///< serial and ordered

    /// Runs what waits, and what that posts, without the event loop; at most i_Limit jobs. Returns how many ran. UI
    /// thread, for the unloading of a plug-in.
    std::size_t Drain(std::size_t i_Limit = 100000);

    /// Drops what waits and what is posted from now on.
    void Close();

    std::size_t Pending() const;
    std::uint64_t JobsRun() const; ///< since the beginning

private:
    class State;
    std::shared_ptr<State> m_pState;
};

} // namespace Services

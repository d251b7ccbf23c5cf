#pragma once

#include <memory>
#include <thread>

namespace Services
{

class VFaultList;

/// Notes every operation that belongs to the UI thread and was called on another one. The thread that makes this object
/// is the UI thread. One for the whole host, shared by its services; any thread.
class VThreadCheck
{
public:
    explicit VThreadCheck(std::shared_ptr<VFaultList> i_pFaults);

    /// Records a fault that names the operation, for example "IHostCoreServices::GetChannelService".
    void CheckUiThread(const char* i_pOperation) const;

private:
    const std::shared_ptr<VFaultList> m_pFaults;
    const std::thread::id m_UiThread;
};

/// What the services hold: null checks nothing.
using ThreadCheckPointer = std::shared_ptr<const VThreadCheck>;

inline void CheckUiThread(const ThreadCheckPointer& i_rpCheck, const char* i_pOperation)
{
    if (i_rpCheck)
        i_rpCheck->CheckUiThread(i_pOperation);
}

} // namespace Services

#pragma once

#include "Services/Common/HostOperations.h"

#include <memory>
#include <thread>

namespace Services
{

class VFaultList;

/// Notes every operation that belongs to the UI thread and was called on another one. The thread that makes this object
/// is the UI thread. One for the whole host, shared by its services, which have none where nothing is checked; any
/// thread.
class VThreadCheck
{
public:
    explicit VThreadCheck(std::shared_ptr<VFaultList> i_pFaults);

    /// Records a fault that names the operation when this thread may not call it.
    void Check(const HostOperation& i_rOperation) const;

private:
    const std::shared_ptr<VFaultList> m_pFaults;
    const std::thread::id m_UiThread;
};

/// What the services hold: null checks nothing.
using ThreadCheckPointer = std::shared_ptr<const VThreadCheck>;

inline void CheckThread(const ThreadCheckPointer& i_rpCheck, const HostOperation& i_rOperation)
{
    if (i_rpCheck)
        i_rpCheck->Check(i_rOperation);
}

} // namespace Services

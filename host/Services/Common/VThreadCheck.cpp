#include "Services/Common/VThreadCheck.h"

#include "Services/Common/VFaultList.h"

#include <string>

namespace Services
{

VThreadCheck::VThreadCheck(std::shared_ptr<VFaultList> i_pFaults)
    : m_pFaults(std::move(i_pFaults)), m_UiThread(std::this_thread::get_id())
{
}

void VThreadCheck::Check(const HostOperation& i_rOperation) const
{
    if (i_rOperation.Threads == EThreads::Ui && std::this_thread::get_id() != m_UiThread)
        m_pFaults->Add(std::string(i_rOperation.pName) + " was called on another thread than the UI thread");
}

} // namespace Services

#include "Services/VThreadCheck.h"

#include "Services/VFaultList.h"

#include <string>

namespace Services
{

VThreadCheck::VThreadCheck(std::shared_ptr<VFaultList> i_pFaults)
    : m_pFaults(std::move(i_pFaults)), m_UiThread(std::this_thread::get_id())
{
}

void VThreadCheck::CheckUiThread(const char* i_pOperation) const
{
    if (m_pFaults->IsOn() && std::this_thread::get_id() != m_UiThread)
        m_pFaults->Add(std::string(i_pOperation) + " was called on another thread than the UI thread");
}

} // namespace Services

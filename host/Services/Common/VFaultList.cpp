#include "Services/Common/VFaultList.h"

#include "TQL/Log.h"

#include <algorithm>

namespace Services
{

VFaultList::VFaultList(bool i_bOn) : m_bOn(i_bOn) {}

void VFaultList::Add(const std::string& i_rFault)
{
    if (!m_bOn)
        return;
    {
        const std::lock_guard lock(m_Mutex);
        if (std::ranges::find(m_Faults, i_rFault) != m_Faults.end())
            return;
        m_Faults.push_back(i_rFault);
    }
    TQL::Log::Write(TQL::Log::GetCategory("Host"), TQL::ELogSeverity::Warning, i_rFault);
}

std::vector<std::string> VFaultList::Faults() const
{
    const std::lock_guard lock(m_Mutex);
    return m_Faults;
}

} // namespace Services

#include "Services/Time/VTimeControllerRegistry.h"

namespace Services
{

using namespace OrvanePluginInterface;

VTimeControllerRegistry::VTimeControllerRegistry(ThreadCheckPointer i_pCheck) : m_pCheck(std::move(i_pCheck)) {}

void VTimeControllerRegistry::GetTimeController(std::string_view i_Name,
                                                std::shared_ptr<ITimeController>& o_rpController) const
{
    CheckThread(m_pCheck, "ITimeControllerRegistry::GetTimeController");
    const auto found = m_Controllers.find(i_Name);
    o_rpController = found == m_Controllers.end() ? nullptr : found->second;
}

void VTimeControllerRegistry::Add(const std::string& i_rName, std::shared_ptr<ITimeController> i_pController)
{
    m_Controllers.insert_or_assign(i_rName, std::move(i_pController));
}

} // namespace Services

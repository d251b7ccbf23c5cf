#include "Services/Ui/VContentRegistry.h"

#include "OrvanePluginInterface/IWorkspaceContent.h"
#include "TQL/Log.h"

namespace Services
{
namespace
{

void Warn(const char* i_pFormat, const std::string& i_rName)
{
    TQL::Log::Format(TQL::Log::GetCategory("Host"), TQL::ELogSeverity::Warning, i_pFormat, i_rName);
}

} // namespace

VContentRegistry::VContentRegistry(ThreadCheckPointer i_pCheck)
    : m_pCheck(std::move(i_pCheck)), m_pChanged(std::make_shared<NotificationSystem::VChangeSignal>())
{
}

void VContentRegistry::RegisterContent(const std::string& i_rName,
                                       std::shared_ptr<OrvanePluginInterface::IWorkspaceContentFactory> i_pFactory)
{
    CheckThread(m_pCheck, "IWorkspaceContentRegistry::RegisterContent");
    if (!i_pFactory)
    {
        Warn("The content \"%1%\" was registered without a factory", i_rName);
        return;
    }
    if (m_Factories.contains(i_rName))
        Warn("The content \"%1%\" was registered twice; the later one stands", i_rName);
    m_Factories.insert_or_assign(i_rName, std::move(i_pFactory));
    m_pChanged->Invoke();
}

void VContentRegistry::UnregisterContent(const std::string& i_rName)
{
    CheckThread(m_pCheck, "IWorkspaceContentRegistry::UnregisterContent");
    if (m_Factories.erase(i_rName) != 0)
        m_pChanged->Invoke();
}

std::set<std::string> VContentRegistry::Names() const
{
    std::set<std::string> names;
    for (const auto& [name, pFactory] : m_Factories)
        names.insert(name);
    return names;
}

std::shared_ptr<OrvanePluginInterface::IWorkspaceContentFactory>
VContentRegistry::Find(const std::string& i_rName) const
{
    const auto found = m_Factories.find(i_rName);
    return found == m_Factories.end() ? nullptr : found->second;
}

} // namespace Services

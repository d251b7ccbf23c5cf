#pragma once

#include "NotificationSystem/VMultiCallbackPostal.h"
#include "OrvanePluginInterface/IHostUiServices.h"
#include "Services/Common/VThreadCheck.h"

#include <map>
#include <memory>
#include <set>
#include <string>

namespace Services
{

/// The kinds of window that plug-ins offer. Keeps each factory until it is unregistered. Owned by the host services. UI
/// thread.
class VContentRegistry : public OrvanePluginInterface::IWorkspaceContentRegistry
{
public:
    explicit VContentRegistry(ThreadCheckPointer i_pCheck = nullptr);

    /// A second factory of one name replaces the first, a null one is refused; both leave a warning in the log.
    void RegisterContent(const std::string& i_rName,
                         std::shared_ptr<OrvanePluginInterface::IWorkspaceContentFactory> i_pFactory) override;
    void UnregisterContent(const std::string& i_rName) override;

    std::set<std::string> Names() const;
    std::shared_ptr<OrvanePluginInterface::IWorkspaceContentFactory>
    Find(const std::string& i_rName) const; ///< or null

    /// A kind was added or removed; raised inside the call. For the host's menus.
    std::shared_ptr<TQL::IChangeSignal> Changed() const { return m_pChanged; }

private:
    const ThreadCheckPointer m_pCheck;
    std::map<std::string, std::shared_ptr<OrvanePluginInterface::IWorkspaceContentFactory>> m_Factories;
    const std::shared_ptr<NotificationSystem::VChangeSignal> m_pChanged;
};

} // namespace Services

#pragma once

#include "OrvanePluginInterface/ITimeController.h"
#include "Services/Common/VThreadCheck.h"

#include <map>
#include <memory>
#include <string>

namespace Services
{

/// The time controllers by name. Owned by the host services, which add "default" before any plug-in is loaded. UI
/// thread.
class VTimeControllerRegistry : public OrvanePluginInterface::ITimeControllerRegistry
{
public:
    static constexpr const char* DefaultName = "default";

    explicit VTimeControllerRegistry(ThreadCheckPointer i_pCheck = nullptr);

    void GetTimeController(std::string_view i_Name,
                           std::shared_ptr<OrvanePluginInterface::ITimeController>& o_rpController) const override;

    void Add(const std::string& i_rName, std::shared_ptr<OrvanePluginInterface::ITimeController> i_pController);

private:
    const ThreadCheckPointer m_pCheck;
    std::map<std::string, std::shared_ptr<OrvanePluginInterface::ITimeController>, std::less<>> m_Controllers;
};

} // namespace Services

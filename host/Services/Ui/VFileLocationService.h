#pragma once

#include "OrvanePluginInterface/IHostCoreServices.h"
#include "Services/Common/VThreadCheck.h"

#include <string>
#include <vector>

namespace Services
{

/// Where the operator's files lie: one folder a kind below a base folder. Owned by the host services. UI thread.
class VFileLocationService : public OrvanePluginInterface::IFileLocationService
{
public:
    /// i_BaseDirectory in UTF-8; when empty the folder for application data of the desktop.
    explicit VFileLocationService(std::string i_BaseDirectory = {}, ThreadCheckPointer i_pCheck = nullptr);

    std::string GetExtension(int i_Kind) const override; ///< with its dot; empty for an unknown kind
    std::vector<std::string>
    GetUserDirectories(int i_Kind) const override; ///< made when absent; none for an unknown kind

private:
    const std::string m_BaseDirectory;
    const ThreadCheckPointer m_pCheck;
};

} // namespace Services

#pragma once

#include "OrvanePluginInterface/IPlugin.h"
#include "TQL/IResult.h"

#include <filesystem>
#include <string>

namespace Services
{

/// A plug-in module in memory with its three exports resolved. Owned by the plug-in host. UI thread.
class VModuleLibrary
{
public:
    VModuleLibrary() = default;
    ~VModuleLibrary(); ///< closes
    VModuleLibrary(const VModuleLibrary&) = delete;
    VModuleLibrary& operator=(const VModuleLibrary&) = delete;

    /// Maps the module. NotFound for a missing file, InvalidFormat for one that is no module, NotSupported for a
    /// missing export; the message is one line. i_bKeepMapped leaves the code in memory for ever: what a module
    /// registers with Qt (types, singletons) is kept by Qt until the process ends.
    [[nodiscard]] TQL::IResult Open(const std::filesystem::path& i_rPath, bool i_bKeepMapped, std::string& o_rMessage);

    void Close();
    /// Gives up the module without unmapping it, because something still needs its code.
    void Abandon();
    bool IsOpen() const { return m_pHandle != nullptr; }

    OrvanePluginInterface::CreatePluginFunction Create = nullptr;
    OrvanePluginInterface::DestroyPluginFunction Destroy = nullptr;
    OrvanePluginInterface::PluginBuildRevisionFunction BuildRevision = nullptr;

private:
    void* m_pHandle = nullptr;
};

} // namespace Services

#pragma once

#include "Services/Checking/VLifeCycleCheck.h"
#include "Services/VModuleLibrary.h"

#include <QtCore/QPointer>
#include <QtWidgets/QWidget>

#include <cstdint>
#include <filesystem>
#include <functional>
#include <memory>
#include <set>
#include <string>
#include <vector>

namespace Services
{

class VGraphicsAudit;
class VHandlerAudit;
class VHostServices;

/// Loads one plug-in module, opens its contents and unloads it so that none of its code is left queued or subscribed.
/// The host services outlive it. UI thread.
class VPluginHost
{
public:
    /// i_bKeepMapped as in VModuleLibrary::Open.
    explicit VPluginHost(VHostServices& i_rServices, bool i_bKeepMapped = true);
    ~VPluginHost(); ///< unloads
    VPluginHost(const VPluginHost&) = delete;
    VPluginHost& operator=(const VPluginHost&) = delete;

    /// Maps the module and drives CreatePlugin, CanLoad, LoadQmlModules, Initialise. When a step fails all is undone
    /// and the message says in one line what is wrong. AlreadyPresent when a module is loaded.
    [[nodiscard]] TQL::IResult Load(const std::filesystem::path& i_rPath, std::string& o_rMessage);

    bool IsLoaded() const { return m_pPlugin != nullptr; }
    std::uint64_t BuildRevision() const; ///< 0 when no module is loaded

    /// The kinds of content that this module has registered.
    const std::set<std::string>& ContentNames() const { return m_ContentNames; }

    /// Makes a content of that kind as a child of the frame; deleting the widget closes it. Null for an unknown kind or
    /// when the module makes none.
    QPointer<QWidget> OpenContent(const std::string& i_rName, QPointer<QWidget> i_pFrame);

    /// Deletes the contents that are still open.
    void CloseContents();

    /// Closes the contents, drains the postal services, unregisters, then Shutdown, UnloadResources, DestroyPlugin, and
    /// unmaps. OkButPartial when something still needs the module's code, which then stays mapped: a leaked
    /// subscription or a pool that does not come to rest; the faults of the services name it. Ok when nothing was
    /// loaded. The host's own timers on the worker pool must have been stopped. A checking host also finds what the
    /// plug-in holds and, when no window of the program shows OpenGL any more, which OpenGL objects it left.
    [[nodiscard]] TQL::IResult Unload();

private:
    void Note(ELifeCycleCall i_Call);
    [[nodiscard]] TQL::IResult Start(std::string& o_rMessage);
    void DropFromHost();
    void EndPlugin();
    void CallPlugin(ELifeCycleCall i_Call, const std::function<void()>& i_rCall);
    [[nodiscard]] bool SweepSubscriptions();
    [[nodiscard]] bool FindHandlers();
    [[nodiscard]] bool FindInUse();
    void FindGraphics();
    void ForgetClosedContents();

    VHostServices& m_rServices;
    const bool m_bKeepMapped;
    VModuleLibrary m_Library;
    OrvanePluginInterface::IPlugin* m_pPlugin = nullptr; ///< the module's; ended only by its DestroyPlugin
    VLifeCycleCheck m_LifeCycle;
    bool m_bQmlLoaded = false;
    bool m_bInitialised = false;
    std::set<std::string> m_ContentNames;
    std::set<std::string> m_RootProperties;
    std::vector<QPointer<QWidget>> m_Contents;
    std::unique_ptr<VHandlerAudit> m_pHandlers;  ///< of the life that runs
    std::unique_ptr<VGraphicsAudit> m_pGraphics; ///< the same; null where nothing is checked
};

} // namespace Services

#pragma once

#include <cstdint>
#include <string>

namespace OrvanePluginInterface
{

class IHostCoreServices;
class IHostUiServices;

/// A plug-in module as the host drives it. Every call comes on the UI thread, in this order: CanLoad, LoadQmlModules,
/// Initialise, then at the end Shutdown, UnloadResources, and destruction through the module's own DestroyPlugin.
/// Both service objects outlive the plug-in object.
class IPlugin
{
public:
    virtual ~IPlugin() = default;

    virtual const std::string& QueryText1() const = 0; ///< reserved, empty
    virtual const std::string& QueryText2() const = 0; ///< reserved, empty
    virtual bool Hook1() { return true; }
    virtual bool Hook2() { return true; }
    virtual bool Hook3() { return true; }
    virtual bool Hook4() { return true; }
    virtual bool CanLoad() { return true; }
    virtual bool LoadQmlModules(IHostCoreServices&, IHostUiServices&) { return true; }
    virtual bool Initialise(IHostCoreServices&, IHostUiServices&) { return true; }
    virtual bool Hook5() { return true; }
    virtual void UnloadResources() {}
    virtual void Shutdown() {}
};

/// The three functions that a module exports, by their undecorated names.
using CreatePluginFunction = IPlugin* (*)();             ///< "CreatePlugin": null when memory is short
using DestroyPluginFunction = void (*)(IPlugin*);        ///< "DestroyPlugin": null is allowed
using PluginBuildRevisionFunction = std::uint64_t (*)(); ///< "PluginBuildRevision": callable before everything

} // namespace OrvanePluginInterface

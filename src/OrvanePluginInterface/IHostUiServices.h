#pragma once

#include <memory>
#include <string>
#include <utility>
#include <vector>

class QObject;
class QQmlEngine;

namespace CoreGraphics
{
class Resources;
}

namespace TQL
{
class IQuickWidget;
}

namespace OrvanePluginInterface
{

class IOpaqueService;
class IWorkspaceContentFactory;

/// The one QML engine of the host. UI thread.
class IQmlEngineHost
{
public:
    virtual QQmlEngine* GetEngine() = 0;
    /// A null object leaves the property present, with no value.
    virtual void SetRootContextProperty(const std::string& i_rName, QObject* i_pObject) = 0;
    virtual ~IQmlEngineHost() = default;
};

/// The kinds of window that an operator can open. UI thread. Keeps the factory until it is unregistered.
class IWorkspaceContentRegistry
{
public:
    virtual void RegisterContent(const std::string& i_rName, std::shared_ptr<IWorkspaceContentFactory> i_pFactory) = 0;
    virtual void UnregisterContent(const std::string& i_rName) = 0;
    virtual ~IWorkspaceContentRegistry() = default;
};

/// Reads and writes the properties of a widget's scene that live in a workspace file. UI thread.
class IQuickWidgetPersistence
{
public:
    using Entries = std::vector<std::pair<std::string, std::string>>;

    /// Asks the widget to emit its save signal, then copies its map. A null widget gives an empty list.
    virtual void ReadProperties(TQL::IQuickWidget* i_pWidget, Entries& o_rEntries) = 0;
    /// Fills the map, then asks for the load signal. A null widget does nothing.
    virtual void WriteProperties(const Entries& i_rEntries, TQL::IQuickWidget* i_pWidget) = 0;
    virtual ~IQuickWidgetPersistence() = default;
};

/// The host's services for the user interface. UI thread. A getter that cannot deliver throws.
/// Before the first widget the host sets Qt::AA_ShareOpenGLContexts and the OpenGL graphics API of Qt Quick, and leaves
/// the default surface format at the compatibility profile.
class IHostUiServices
{
public:
    virtual bool IsDevelopmentBuild() = 0;
    virtual void GetQmlEngineHost(std::shared_ptr<IQmlEngineHost>& o_rpService) = 0;
    virtual void GetContentRegistry(std::shared_ptr<IWorkspaceContentRegistry>& o_rpService) = 0;
    virtual void GetResources(std::shared_ptr<CoreGraphics::Resources>& o_rpService) = 0; ///< always the same object
    virtual void GetQuickWidgetPersistence(std::shared_ptr<IQuickWidgetPersistence>& o_rpService) = 0;
    virtual void GetLastFactoryService(std::shared_ptr<IOpaqueService>& o_rpService) = 0; ///< may give null
    virtual ~IHostUiServices() = default;
};

} // namespace OrvanePluginInterface

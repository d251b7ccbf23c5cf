#pragma once

#include <QtCore/QObject>
#include <QtCore/QPointer>
#include <QtCore/QStringList>
#include <QtCore/QUrl>

#include <functional>
#include <memory>

class QQmlComponent;
class QQmlEngine;

namespace TQL::IO
{

/// Where the component of a relative name is: in the first of the folders that holds it, otherwise in the resources.
/// Empty when it is nowhere.
QUrl FindComponentUrl(const QString& i_rName, const QStringList& i_rFolders);

/// Loads QML components by name for native code, on an engine that outlives it, and tells the log how that went.
/// Folders are searched only when that was asked for, as in a development build; else components come from the
/// resources. UI thread.
class QmlComponentFactory
{
public:
    QmlComponentFactory(QQmlEngine* i_pEngine, bool i_bUseFolders);

    /// The component, ready or still loading. Null, with an error in the log, when it is nowhere or does not compile.
    std::shared_ptr<QQmlComponent> CreateComponent(const QString& i_rName, const QStringList& i_rFolders = {}) const;

    using ObjectCallback = std::function<void(std::unique_ptr<QObject>)>;

    /// Makes an object of the component and hands it over: before returning when the component is ready, otherwise
    /// when it has loaded, for as long as the component lives. Null on failure.
    static void CreateObject(const std::shared_ptr<QQmlComponent>& i_rpComponent, ObjectCallback i_Callback);

private:
    const QPointer<QQmlEngine> m_pEngine;
    const bool m_bUseFolders;
};

} // namespace TQL::IO

#pragma once

#include <QtCore/QString>
#include <QtCore/QStringList>
#include <QtCore/QUrl>
#include <QtCore/QVariant>

class QObject;
class QQmlPropertyMap;
class QQuickWidget;

namespace TQL
{

/// A widget that shows a QML scene, as the host knows it. UI thread.
class IQuickWidget
{
public:
    virtual ~IQuickWidget() = default;

    virtual void SetContextProperty(const QString& i_rName, QObject* i_pObject) = 0;
    virtual void SetContextProperty(const QString& i_rName, const QVariant& i_rValue) = 0;
    virtual void AddImportPath(const QString& i_rFolder) = 0;
    virtual QStringList ImportPaths() const = 0;

    /// Finds a component by a relative name: first in the folders, in order, then in the Qt resources, and loads it.
    virtual void SetSource(const QString& i_rRelativeName, const QStringList& i_rFolders) = 0;
    virtual QUrl Source() const = 0;
    virtual void SetSearchFolders(const QStringList& i_rFolders) = 0;
    virtual QStringList SearchFolders() const = 0;

    virtual QQmlPropertyMap* PersistentProperties() const = 0;
    virtual void EmitPreSave() = 0;
    virtual void EmitPostLoad() = 0;
    virtual QQuickWidget* Widget() = 0;
};

} // namespace TQL

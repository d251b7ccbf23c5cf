#include "IOInterfaceQt/QmlComponentFactory.h"

#include "TQL/Log.h"

#include <QtCore/QDir>
#include <QtCore/QFileInfo>
#include <QtQml/QQmlComponent>
#include <QtQml/QQmlEngine>

namespace TQL::IO
{
namespace
{

template <typename... Args>
void LogLine(ELogSeverity i_Severity, const LogText& i_rFormat, const Args&... i_rArgs)
{
    static const VLogCategory& s_rCategory = Log::GetCategory("QmlComponentFactory");
    Log::Format(s_rCategory, i_Severity, i_rFormat, i_rArgs...);
}

void LogStatus(const QQmlComponent& i_rComponent)
{
    const std::string name = i_rComponent.url().toString().toStdString();
    switch (i_rComponent.status())
    {
    case QQmlComponent::Ready:
        LogLine(ELogSeverity::Detail, "Component %1% ready.", name);
        break;
    case QQmlComponent::Loading:
        LogLine(ELogSeverity::Detail, "Component %1% loading.", name);
        break;
    case QQmlComponent::Error:
        LogLine(ELogSeverity::Error, "Component %1% failed to load: %2%.", name,
                i_rComponent.errorString().trimmed().toStdString());
        break;
    case QQmlComponent::Null:
        LogLine(ELogSeverity::Error, "Component %1% was null.", name);
        break;
    }
}

std::unique_ptr<QObject> MakeObject(QQmlComponent& i_rComponent)
{
    if (!i_rComponent.isReady())
        return nullptr;
    std::unique_ptr<QObject> pObject(i_rComponent.create(i_rComponent.creationContext()));
    if (!pObject)
        LogLine(ELogSeverity::Error, "Component %1% was null.", i_rComponent.url().toString().toStdString());
    return pObject;
}

} // namespace

QUrl FindComponentUrl(const QString& i_rName, const QStringList& i_rFolders)
{
    const QString name = QDir::cleanPath(i_rName);
    for (const QString& rFolder : i_rFolders)
    {
        const QString file = QDir::cleanPath(rFolder + QLatin1Char('/') + name);
        if (QFileInfo(file).isFile())
            return QUrl::fromLocalFile(file);
    }
    return QFileInfo(QStringLiteral(":/") + name).isFile() ? QUrl(QStringLiteral("qrc:/") + name) : QUrl();
}

QmlComponentFactory::QmlComponentFactory(QQmlEngine* i_pEngine, bool i_bUseFolders)
    : m_pEngine(i_pEngine), m_bUseFolders(i_bUseFolders)
{
}

std::shared_ptr<QQmlComponent> QmlComponentFactory::CreateComponent(const QString& i_rName,
                                                                    const QStringList& i_rFolders) const
{
    const QUrl url = FindComponentUrl(i_rName, m_bUseFolders ? i_rFolders : QStringList());
    if (url.isEmpty() || !m_pEngine)
    {
        LogLine(ELogSeverity::Error, "Component %1% was null.", i_rName.toStdString());
        return nullptr;
    }
    auto pComponent = std::make_shared<QQmlComponent>(m_pEngine.data(), url);
    LogStatus(*pComponent);
    if (pComponent->isError() || pComponent->isNull())
        return nullptr;
    if (pComponent->isLoading())
        QObject::connect(pComponent.get(), &QQmlComponent::statusChanged, pComponent.get(),
                         [pLoading = pComponent.get()] { LogStatus(*pLoading); });
    return pComponent;
}

void QmlComponentFactory::CreateObject(const std::shared_ptr<QQmlComponent>& i_rpComponent, ObjectCallback i_Callback)
{
    if (!i_rpComponent || !i_rpComponent->isLoading())
    {
        i_Callback(i_rpComponent ? MakeObject(*i_rpComponent) : nullptr);
        return;
    }
    QObject::connect(
        i_rpComponent.get(), &QQmlComponent::statusChanged, i_rpComponent.get(),
        [pComponent = i_rpComponent.get(), callback = std::move(i_Callback)](QQmlComponent::Status i_Status)
        {
            if (i_Status != QQmlComponent::Loading)
                callback(MakeObject(*pComponent));
        });
}

} // namespace TQL::IO

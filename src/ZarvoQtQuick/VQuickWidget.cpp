#include "ZarvoQtQuick/VQuickWidget.h"

#include "IOInterfaceQt/DenyNetworkAccess.h"
#include "IOInterfaceQt/QmlComponentFactory.h"
#include "TQL/Log.h"

#include <QtQml/QQmlComponent>
#include <QtQml/QQmlContext>
#include <QtQml/QQmlEngine>
#include <QtQml/QQmlPropertyMap>
#include <QtQuick/QQuickItem>

namespace ZarvoQtQuick
{
namespace
{

template <typename... Args>
void LogLine(TQL::ELogSeverity i_Severity, const TQL::LogText& i_rFormat, const Args&... i_rArgs)
{
    static const TQL::VLogCategory& s_rCategory = TQL::Log::GetCategory("QuickWidget");
    TQL::Log::Format(s_rCategory, i_Severity, i_rFormat, i_rArgs...);
}

std::string JoinErrors(const QList<QQmlError>& i_rErrors)
{
    QStringList lines;
    for (const QQmlError& rError : i_rErrors)
        lines.append(rError.toString());
    return lines.join(QLatin1Char('\n')).toStdString();
}

} // namespace

VQuickWidget::VQuickWidget(QQmlEngine* i_pEngine, QWidget* i_pParent)
    : QQuickWidget(i_pEngine ? i_pEngine : new QQmlEngine, i_pParent)
{
    if (!i_pEngine)
    {
        engine()->setParent(this);
        TQL::IO::DenyNetworkAccess(*engine());
    }
    m_pContext = new QQmlContext(engine()->rootContext(), this);
    m_pPersistentProperties = new QQmlPropertyMap(this);
    m_pContext->setContextProperty(QStringLiteral("contextQuickWidget"), this);
    m_pContext->setContextProperty(QStringLiteral("contextPersistentProperties"), m_pPersistentProperties);
    setFocusPolicy(Qt::StrongFocus);
    setAttribute(Qt::WA_OpaquePaintEvent);
    setAttribute(Qt::WA_AlwaysStackOnTop);
    connect(this, &QQuickWidget::sceneGraphError, this,
            [](QQuickWindow::SceneGraphError i_Error, const QString& i_rMessage)
            {
                const char* pFormat = i_Error == QQuickWindow::ContextNotAvailable
                                          ? "Scene graph error, context unavailable: %1%."
                                          : "Unknown scene graph error: %1%.";
                LogLine(TQL::ELogSeverity::Error, pFormat, i_rMessage.toStdString());
            });
}

VQuickWidget::~VQuickWidget()
{
    ClearSource();
}

void VQuickWidget::SetContextProperty(const QString& i_rName, QObject* i_pObject)
{
    m_pContext->setContextProperty(i_rName, i_pObject);
}

void VQuickWidget::SetContextProperty(const QString& i_rName, const QVariant& i_rValue)
{
    m_pContext->setContextProperty(i_rName, i_rValue);
}

void VQuickWidget::AddImportPath(const QString& i_rFolder)
{
    if (!engine()->importPathList().contains(i_rFolder))
        engine()->addImportPath(i_rFolder);
}

QStringList VQuickWidget::ImportPaths() const
{
    return engine()->importPathList();
}

void VQuickWidget::SetSource(const QString& i_rRelativeName, const QStringList& i_rFolders)
{
    ClearSource();
    m_SearchFolders = i_rFolders;
    m_Source = TQL::IO::FindComponentUrl(i_rRelativeName, m_SearchFolders);
    if (m_Source.isEmpty())
    {
        LogLine(TQL::ELogSeverity::Error,
                "Component resource file %1% not found, have you forgotten to add the resource to the relevant qrc "
                "file?",
                i_rRelativeName.toStdString());
        return;
    }
    m_pComponent = new QQmlComponent(engine(), m_Source, this);
    if (m_pComponent->isLoading())
        connect(m_pComponent, &QQmlComponent::statusChanged, this, &VQuickWidget::OnComponentStatus);
    else
        OnComponentStatus();
}

void VQuickWidget::OnComponentStatus()
{
    if (m_pComponent->isError())
        LogLine(TQL::ELogSeverity::Error, "Error loading component %1%:\n%2%", m_Source.toString().toStdString(),
                JoinErrors(m_pComponent->errors()));
    else if (m_pComponent->isReady())
        CreateRoot();
}

void VQuickWidget::CreateRoot()
{
    QObject* pRoot = m_pComponent->create(m_pContext);
    if (!pRoot)
    {
        LogLine(TQL::ELogSeverity::Error, "Error loading component %1%:\n%2%", m_Source.toString().toStdString(),
                JoinErrors(m_pComponent->errors()));
        return;
    }
    setContent(m_Source, m_pComponent, pRoot);
    LogLine(TQL::ELogSeverity::Detail, "Loaded component %1%.", m_Source.toString().toStdString());
}

void VQuickWidget::ClearSource()
{
    setSource(QUrl()); // deletes the root and the component that it came from
    m_pComponent = nullptr;
    m_Source.clear();
}

void VQuickWidget::EmitPreSave()
{
    Q_EMIT prePersistentPropertiesSave();
}

void VQuickWidget::EmitPostLoad()
{
    Q_EMIT postPersistentPropertiesLoad();
}

QPoint VQuickWidget::mapToGlobal(int i_X, int i_Y) const
{
    return QWidget::mapToGlobal(QPoint(i_X, i_Y));
}

} // namespace ZarvoQtQuick

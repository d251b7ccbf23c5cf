#include "Services/Ui/VQmlEngineHost.h"

#include "IOInterfaceQt/DenyNetworkAccess.h"

#include <QtCore/QString>
#include <QtQml/QQmlContext>
#include <QtQml/QQmlEngine>

namespace Services
{

VQmlEngineHost::VQmlEngineHost(ThreadCheckPointer i_pCheck)
    : m_pCheck(std::move(i_pCheck)), m_pEngine(std::make_unique<QQmlEngine>())
{
    TQL::IO::DenyNetworkAccess(*m_pEngine);
}

VQmlEngineHost::~VQmlEngineHost() = default;

QQmlEngine* VQmlEngineHost::GetEngine()
{
    CheckThread(m_pCheck, "IQmlEngineHost::GetEngine");
    return m_pEngine.get();
}

void VQmlEngineHost::SetRootContextProperty(const std::string& i_rName, QObject* i_pObject)
{
    CheckThread(m_pCheck, "IQmlEngineHost::SetRootContextProperty");
    m_pEngine->rootContext()->setContextProperty(QString::fromStdString(i_rName), i_pObject);
    if (i_pObject)
        m_NamesWithObject.insert(i_rName);
    else
        m_NamesWithObject.erase(i_rName);
}

void VQmlEngineHost::ReleaseUnused()
{
    m_pEngine->clearComponentCache();
    m_pEngine->collectGarbage();
}

} // namespace Services

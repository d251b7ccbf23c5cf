#pragma once

#include "OrvanePluginInterface/IHostUiServices.h"
#include "Services/Common/VThreadCheck.h"

#include <memory>
#include <set>
#include <string>

namespace Services
{

/// Owns the one QML engine of the host, which has no network access: texts of files and messages come near it. Owned by
/// the host services; destroyed before the application object and after every widget. UI thread.
class VQmlEngineHost : public OrvanePluginInterface::IQmlEngineHost
{
public:
    explicit VQmlEngineHost(ThreadCheckPointer i_pCheck = nullptr);
    ~VQmlEngineHost() override;

    QQmlEngine* GetEngine() override; ///< never null
    void SetRootContextProperty(const std::string& i_rName, QObject* i_pObject) override;

    /// The names of the properties that have an object now.
    const std::set<std::string>& PropertiesWithObject() const { return m_NamesWithObject; }

    /// Lets go of compiled components and garbage; before a module goes. Singletons of QML stay: clearing them takes
    /// the engine's own "Qt" along, and then no further scene works.
    void ReleaseUnused();

private:
    const ThreadCheckPointer m_pCheck;
    std::unique_ptr<QQmlEngine> m_pEngine;
    std::set<std::string> m_NamesWithObject;
};

} // namespace Services

#include "Services/VPluginHost.h"

#include "OrvanePluginInterface/IWorkspaceContent.h"
#include "Services/VContentRegistry.h"
#include "Services/VFaultList.h"
#include "Services/VHostServices.h"
#include "Services/VQmlEngineHost.h"
#include "Services/VSubscriptionAudit.h"
#include "Services/VTimeController.h"
#include "TQL/Log.h"

#include <algorithm>
#include <exception>
#include <iterator>

namespace Services
{
namespace
{

void LogLine(TQL::ELogSeverity i_Severity, const std::string& i_rText)
{
    TQL::Log::Write(TQL::Log::GetCategory("Host"), i_Severity, i_rText, "Services/VPluginHost", __LINE__);
}

std::set<std::string> Difference(const std::set<std::string>& i_rAfter, const std::set<std::string>& i_rBefore)
{
    std::set<std::string> added;
    std::ranges::set_difference(i_rAfter, i_rBefore, std::inserter(added, added.end()));
    return added;
}

} // namespace

VPluginHost::VPluginHost(VHostServices& i_rServices, bool i_bKeepMapped)
    : m_rServices(i_rServices), m_bKeepMapped(i_bKeepMapped)
{
}

VPluginHost::~VPluginHost()
{
    static_cast<void>(Unload()); // what went wrong is in the log and among the faults
}

TQL::IResult VPluginHost::Load(const std::filesystem::path& i_rPath, std::string& o_rMessage)
{
    if (m_Library.IsOpen())
    {
        o_rMessage = "A module is loaded already";
        return TQL::Result::AlreadyPresent;
    }
    const TQL::IResult opened = m_Library.Open(i_rPath, m_bKeepMapped, o_rMessage);
    if (opened.IsError())
        return opened;
    m_LifeCycle = {};
    const std::set<std::string> contentsBefore = m_rServices.Contents()->Names();
    const std::set<std::string> propertiesBefore = m_rServices.EngineHost()->PropertiesWithObject();
    std::string reason;
    TQL::IResult started = TQL::Result::FailedWithException;
    try
    {
        started = Start(reason);
    }
    catch (const std::exception& rException)
    {
        reason = std::string("it threw: ") + rException.what();
    }
    m_ContentNames = Difference(m_rServices.Contents()->Names(), contentsBefore);
    m_RootProperties = Difference(m_rServices.EngineHost()->PropertiesWithObject(), propertiesBefore);
    if (started.IsSuccess())
        return started;
    o_rMessage = "The module \"" + i_rPath.string() + "\" did not start: " + reason;
    static_cast<void>(Unload());
    return started;
}

TQL::IResult VPluginHost::Start(std::string& o_rMessage)
{
    m_pPlugin = m_Library.Create();
    if (!m_pPlugin)
    {
        o_rMessage = "CreatePlugin gave no plug-in";
        return TQL::Result::AllocationFailure;
    }
    Note(ELifeCycleCall::CreatePlugin);
    Note(ELifeCycleCall::CanLoad);
    if (!m_pPlugin->CanLoad())
    {
        o_rMessage = "CanLoad says no";
        return TQL::Result::NotPermitted;
    }
    Note(ELifeCycleCall::LoadQmlModules);
    m_bQmlLoaded = true;
    if (!m_pPlugin->LoadQmlModules(m_rServices, m_rServices))
    {
        o_rMessage = "LoadQmlModules failed";
        return TQL::Result::Failed;
    }
    Note(ELifeCycleCall::Initialise);
    m_bInitialised = true;
    if (!m_pPlugin->Initialise(m_rServices, m_rServices))
    {
        o_rMessage = "Initialise failed";
        return TQL::Result::Failed;
    }
    return TQL::Result::Ok;
}

std::uint64_t VPluginHost::BuildRevision() const
{
    return m_Library.IsOpen() ? m_Library.BuildRevision() : 0;
}

QPointer<QWidget> VPluginHost::OpenContent(const std::string& i_rName, QPointer<QWidget> i_pFrame)
{
    ForgetClosedContents();
    const auto pFactory = m_ContentNames.contains(i_rName) ? m_rServices.Contents()->Find(i_rName) : nullptr;
    if (!pFactory)
    {
        LogLine(TQL::ELogSeverity::Warning, "No module offers a content \"" + i_rName + "\"");
        return nullptr;
    }
    QPointer<QWidget> pWidget;
    try
    {
        pFactory->CreateContent(pWidget, m_rServices.TimeController(), i_pFrame);
    }
    catch (const std::exception& rException)
    {
        LogLine(TQL::ELogSeverity::Error, "The content \"" + i_rName + "\" cannot be made: " + rException.what());
    }
    if (!pWidget)
        return nullptr;
    if (pWidget->parentWidget() != i_pFrame)
        pWidget->setParent(i_pFrame);
    Note(ELifeCycleCall::CreateContent);
    m_Contents.push_back(pWidget);
    return pWidget;
}

void VPluginHost::CloseContents()
{
    for (const QPointer<QWidget>& rpContent : m_Contents)
        delete rpContent.data();
    ForgetClosedContents();
}

/// The host closes a content by deleting its widget, so closing is seen afterwards.
void VPluginHost::ForgetClosedContents()
{
    const auto isClosed = [](const QPointer<QWidget>& i_rpContent)
    {
        return i_rpContent.isNull();
    };
    for (auto closed = std::erase_if(m_Contents, isClosed); closed > 0; --closed)
        Note(ELifeCycleCall::CloseContent);
}

TQL::IResult VPluginHost::Unload()
{
    if (!m_Library.IsOpen())
        return TQL::Result::Ok;
    CloseContents();
    bool bAtRest = m_rServices.DrainPosts();
    DropFromHost();
    bAtRest = m_rServices.DrainPosts() && bAtRest;
    EndPlugin();
    bAtRest = m_rServices.DrainPosts() && bAtRest;
    const bool bUnsubscribed = SweepSubscriptions();
    m_rServices.EngineHost()->ReleaseUnused();
    if (!bAtRest)
        m_rServices.FaultList()->Add("The postal services did not come to rest after the plug-in had ended");
    Note(ELifeCycleCall::UnloadModule);
    if (bAtRest && bUnsubscribed)
    {
        m_Library.Close();
        return TQL::Result::Ok;
    }
    LogLine(TQL::ELogSeverity::Warning, "The module stays in memory: something in the host still needs its code");
    m_Library.Abandon();
    return TQL::Result::OkButPartial;
}

/// Takes out what keeps objects of the module from inside the host: root context properties, factories,
/// compiled components.
void VPluginHost::DropFromHost()
{
    VQmlEngineHost& rEngineHost = *m_rServices.EngineHost();
    for (const std::string& rName : m_RootProperties)
        rEngineHost.SetRootContextProperty(rName, nullptr);
    m_RootProperties.clear();
    for (const std::string& rName : m_ContentNames)
        m_rServices.Contents()->UnregisterContent(rName);
    m_ContentNames.clear();
    rEngineHost.ReleaseUnused();
}

/// Undoes the calls that were made, in reverse.
void VPluginHost::EndPlugin()
{
    if (!m_pPlugin)
        return;
    if (m_bInitialised)
    {
        Note(ELifeCycleCall::Shutdown);
        m_pPlugin->Shutdown();
    }
    if (m_bQmlLoaded)
    {
        Note(ELifeCycleCall::UnloadResources);
        m_pPlugin->UnloadResources();
    }
    Note(ELifeCycleCall::DestroyPlugin);
    m_Library.Destroy(std::exchange(m_pPlugin, nullptr));
    m_bInitialised = false;
    m_bQmlLoaded = false;
}

/// False when a subscription of the module is left.
bool VPluginHost::SweepSubscriptions()
{
    VSubscriptionAudit audit(m_rServices.Ledger());
    m_rServices.WatchSignals(audit);
    audit.Sweep();
    const bool bAtRest = m_rServices.DrainPosts();
    audit.Purge();
    const std::vector<std::string> leaks = audit.Leaks();
    for (const std::string& rLeak : leaks)
        m_rServices.FaultList()->Add(rLeak);
    return bAtRest && leaks.empty();
}

void VPluginHost::Note(ELifeCycleCall i_Call)
{
    const std::string fault = m_LifeCycle.Note(i_Call);
    if (!fault.empty())
        m_rServices.FaultList()->Add(fault);
}

} // namespace Services

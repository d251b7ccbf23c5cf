#include "Services/VPluginHost.h"

#include "CoreGraphics/Resources.h"
#include "OrvanePluginInterface/IWorkspaceContent.h"
#include "Services/Checking/VGraphicsAudit.h"
#include "Services/Checking/VHandlerAudit.h"
#include "Services/Checking/VSubscriptionAudit.h"
#include "Services/Common/VFaultList.h"
#include "Services/Time/VTimeController.h"
#include "Services/Ui/VContentRegistry.h"
#include "Services/Ui/VQmlEngineHost.h"
#include "Services/VHostServices.h"
#include "TQL/Log.h"

#include <algorithm>
#include <exception>
#include <iterator>

namespace Services
{
namespace
{

constexpr std::chrono::milliseconds c_ShortPatience{500};

void LogLine(TQL::ELogSeverity i_Severity, const std::string& i_rText)
{
    TQL::Log::Write(TQL::Log::GetCategory("Host"), i_Severity, i_rText);
}

/// What the exception that is being handled says.
std::string ReasonThrown()
{
    try
    {
        throw;
    }
    catch (const std::exception& rException)
    {
        return rException.what();
    }
    catch (...)
    {
        return "something that is no std::exception";
    }
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
    m_pHandlers = std::make_unique<VHandlerAudit>(m_rServices.Preferences(), m_rServices.Ledger());
    m_pGraphics = m_rServices.FaultList()->IsOn() ? std::make_unique<VGraphicsAudit>() : nullptr;
    const std::set<std::string> contentsBefore = m_rServices.Contents()->Names();
    const std::set<std::string> propertiesBefore = m_rServices.EngineHost()->PropertiesWithObject();
    std::string reason;
    TQL::IResult started = TQL::Result::FailedWithException;
    try
    {
        started = Start(reason);
    }
    catch (...)
    {
        reason = "it threw: " + ReasonThrown();
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
    catch (...)
    {
        const std::string reason = ReasonThrown();
        LogLine(TQL::ELogSeverity::Error, "The content \"" + i_rName + "\" cannot be made: " + reason);
        m_rServices.FaultList()->Add("CreateContent threw: " + reason);
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
    // Until its shutdown a plug-in may keep a timer running, so not all has to come to rest.
    static_cast<void>(m_rServices.DrainPosts(c_ShortPatience));
    DropFromHost();
    static_cast<void>(m_rServices.DrainPosts(c_ShortPatience));
    EndPlugin();
    const bool bAtRest = m_rServices.DrainPosts(m_rServices.Options().Patience);
    const bool bUnsubscribed = SweepSubscriptions();
    const bool bNoHandlers = FindHandlers();
    m_rServices.EngineHost()->ReleaseUnused();
    m_rServices.Graphics()->Release();
    if (!bAtRest)
        m_rServices.FaultList()->Add(
            "IPostalService::Post: jobs of the plug-in, or a timer on the worker pool, went on "
            "after Shutdown and did not come to rest");
    const bool bNothingInUse = FindInUse();
    FindGraphics();
    Note(ELifeCycleCall::UnloadModule);
    if (bAtRest && bUnsubscribed && bNoHandlers && bNothingInUse)
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
        CallPlugin(ELifeCycleCall::Shutdown, [this] { m_pPlugin->Shutdown(); });
    }
    if (m_bQmlLoaded)
    {
        CallPlugin(ELifeCycleCall::UnloadResources, [this] { m_pPlugin->UnloadResources(); });
    }
    CallPlugin(ELifeCycleCall::DestroyPlugin, [this] { m_Library.Destroy(std::exchange(m_pPlugin, nullptr)); });
    m_bInitialised = false;
    m_bQmlLoaded = false;
}

/// The end of a plug-in goes on whatever one of its calls throws.
void VPluginHost::CallPlugin(ELifeCycleCall i_Call, const std::function<void()>& i_rCall)
{
    Note(i_Call);
    try
    {
        i_rCall();
    }
    catch (...)
    {
        const std::string text = std::string(ToText(i_Call)) + " threw: " + ReasonThrown();
        LogLine(TQL::ELogSeverity::Error, text);
        m_rServices.FaultList()->Add(text);
    }
}

/// False when a subscription of the module is left.
bool VPluginHost::SweepSubscriptions()
{
    VSubscriptionAudit audit(m_rServices.Ledger());
    m_rServices.WatchSignals(audit);
    audit.Sweep();
    const bool bAtRest = m_rServices.DrainPosts(m_rServices.Options().Patience);
    audit.Purge();
    const std::vector<std::string> leaks = audit.Leaks();
    for (const std::string& rLeak : leaks)
        m_rServices.FaultList()->Add(rLeak);
    return bAtRest && leaks.empty();
}

/// False when a handler of the module, or what subscribed to it, is left in the preferences store.
bool VPluginHost::FindHandlers()
{
    const std::vector<std::string> leftovers = m_pHandlers->Leftovers();
    for (const std::string& rLeftover : leftovers)
        m_rServices.FaultList()->Add(rLeftover);
    return leftovers.empty();
}

/// False when the module has something of the host's that it may be called through.
bool VPluginHost::FindInUse()
{
    const std::vector<std::string> texts = m_rServices.FindInUse();
    for (const std::string& rText : texts)
        m_rServices.FaultList()->Add(rText);
    return texts.empty();
}

void VPluginHost::FindGraphics()
{
    if (!m_pGraphics)
        return;
    if (VGraphicsAudit::IsAWindowOpen())
        LogLine(TQL::ELogSeverity::Information, "OpenGL objects are not looked for while a window shows OpenGL");
    else
        for (const std::string& rText : m_pGraphics->Leftovers())
            m_rServices.FaultList()->Add(rText);
    m_pGraphics.reset();
}

void VPluginHost::Note(ELifeCycleCall i_Call)
{
    const std::string fault = m_LifeCycle.Note(i_Call);
    if (!fault.empty())
        m_rServices.FaultList()->Add(fault);
}

} // namespace Services

#include "ChannelSystem/IChannelSelectionManager.h"
#include "ChannelSystem/IChannelTypeRegistry.h"
#include "ChannelSystemSelection/VChannelSelectionManager.h"
#include "FakeChannels.h"
#include "OrvanePluginInterface/IChannelMigrationService.h"
#include "OrvanePluginInterface/ITimeController.h"
#include "Services/Common/HostOperations.h"
#include "Services/Selection/VSelectionSource.h"
#include "Services/Time/VTimeController.h"
#include "Services/Ui/VContentRegistry.h"
#include "Services/Ui/VQmlEngineHost.h"
#include "Services/VHostServices.h"
#include "support/LogGuard.h"

#include <gmock/gmock.h>

#include <functional>
#include <thread>

namespace Services
{
namespace
{

using namespace OrvanePluginInterface;
using std::string;

class ChannelsWithSelection : public Fakes::FakeChannelService
{
public:
    explicit ChannelsWithSelection(std::shared_ptr<TQL::IChannelSelectionManager> i_pManager)
        : m_pManager(std::move(i_pManager))
    {
    }

    std::shared_ptr<TQL::IChannelSelectionManager> GetSelectionManager() const override { return m_pManager; }

private:
    const std::shared_ptr<TQL::IChannelSelectionManager> m_pManager;
};

/// A host that checks, with a call of each operation that its table lists, as a plug-in makes it.
class ThreadCheckTest : public ::testing::Test
{
protected:
    template <typename THost, typename T>
    static std::shared_ptr<T> Get(THost& i_rHost, void (THost::*i_pGetter)(std::shared_ptr<T>&))
    {
        std::shared_ptr<T> pService;
        (i_rHost.*i_pGetter)(pService);
        return pService;
    }

    void SetUp() override
    {
        const auto pManager = TQL::MakeShared<ChannelSystemSelection::VChannelSelectionManager>(m_Services.Selection());
        m_Services.SetChannelService(std::make_shared<ChannelsWithSelection>(pManager));
        m_Services.TimeController()->AddSource("Live", ETimeMode::Live);
        AddServices();
        AddSmallServices();
        AddTime();
        AddChannels();
        AddSelection();
    }

    void Add(const char* i_pName, std::function<void()> i_Call) { m_Calls.emplace_back(i_pName, std::move(i_Call)); }

    template <typename THost, typename T>
    void AddGetter(const char* i_pName, void (THost::*i_pGetter)(std::shared_ptr<T>&))
    {
        Add(i_pName, [this, i_pGetter] { Get(static_cast<THost&>(m_Services), i_pGetter); });
    }

    void AddServices()
    {
        using Core = IHostCoreServices;
        using Ui = IHostUiServices;
        AddGetter("IHostCoreServices::GetFileLocationService", &Core::GetFileLocationService);
        AddGetter("IHostCoreServices::GetPreferencesStore", &Core::GetPreferencesStore);
        AddGetter("IHostCoreServices::GetFourthFactoryService", &Core::GetFourthFactoryService);
        AddGetter("IHostCoreServices::GetFifthFactoryService", &Core::GetFifthFactoryService);
        AddGetter("IHostCoreServices::GetSixthFactoryService", &Core::GetSixthFactoryService);
        AddGetter("IHostCoreServices::GetUiPostalService", &Core::GetUiPostalService);
        AddGetter("IHostCoreServices::GetWorkerPostalService", &Core::GetWorkerPostalService);
        AddGetter("IHostCoreServices::GetTimeControllerRegistry", &Core::GetTimeControllerRegistry);
        AddGetter("IHostCoreServices::GetHostProfile", &Core::GetHostProfile);
        AddGetter("IHostCoreServices::GetChannelService", &Core::GetChannelService);
        Add("IHostCoreServices::HasChannelBrowser", [this] { m_Services.HasChannelBrowser(); });
        AddGetter("IHostUiServices::GetQmlEngineHost", &Ui::GetQmlEngineHost);
        AddGetter("IHostUiServices::GetContentRegistry", &Ui::GetContentRegistry);
        AddGetter("IHostUiServices::GetResources", &Ui::GetResources);
        AddGetter("IHostUiServices::GetQuickWidgetPersistence", &Ui::GetQuickWidgetPersistence);
        AddGetter("IHostUiServices::GetLastFactoryService", &Ui::GetLastFactoryService);
        Add("IHostUiServices::IsDevelopmentBuild", [this] { m_Services.IsDevelopmentBuild(); });
    }

    void AddSmallServices()
    {
        const auto pProfile = Get<IHostCoreServices>(m_Services, &IHostCoreServices::GetHostProfile);
        Add("IHostProfile::GetProfileWord", [=] { pProfile->GetProfileWord(); });
        Add("IHostProfile::GetProfileService",
            [=, p = std::shared_ptr<IOpaqueService>()]() mutable { pProfile->GetProfileService(p); });
        const auto pFiles = Get<IHostCoreServices>(m_Services, &IHostCoreServices::GetFileLocationService);
        Add("IFileLocationService::GetExtension", [=] { pFiles->GetExtension(16); });
        Add("IFileLocationService::GetUserDirectories", [=] { pFiles->GetUserDirectories(0); });
        const auto pEngine = Get<IHostUiServices>(m_Services, &IHostUiServices::GetQmlEngineHost);
        Add("IQmlEngineHost::GetEngine", [=] { pEngine->GetEngine(); });
        Add("IQmlEngineHost::SetRootContextProperty", [=] { pEngine->SetRootContextProperty("p", nullptr); });
        const auto pContents = Get<IHostUiServices>(m_Services, &IHostUiServices::GetContentRegistry);
        Add("IWorkspaceContentRegistry::RegisterContent", [=] { pContents->RegisterContent("", nullptr); });
        Add("IWorkspaceContentRegistry::UnregisterContent", [=] { pContents->UnregisterContent(""); });
        const auto pPersistence = Get<IHostUiServices>(m_Services, &IHostUiServices::GetQuickWidgetPersistence);
        Add("IQuickWidgetPersistence::ReadProperties",
            [=, e = IQuickWidgetPersistence::Entries()]() mutable { pPersistence->ReadProperties(nullptr, e); });
        Add("IQuickWidgetPersistence::WriteProperties", [=] { pPersistence->WriteProperties({}, nullptr); });
    }

    void AddTime()
    {
        const auto pRegistry = Get<IHostCoreServices>(m_Services, &IHostCoreServices::GetTimeControllerRegistry);
        std::shared_ptr<ITimeController> pTime;
        pRegistry->GetTimeController("default", pTime);
        Add("ITimeControllerRegistry::GetTimeController",
            [=, p = pTime]() mutable { pRegistry->GetTimeController("", p); });
        Add("ITimeController::GetSourceMap", [=] { pTime->GetSourceMap(); });
        Add("ITimeController::GetCurrentSourceName",
            [=, name = string()]() mutable { pTime->GetCurrentSourceName(name); });
        Add("ITimeController::GetCurrentSource", [=] { pTime->GetCurrentSource(); });
        Add("ITimeController::SeekTo", [=] { pTime->SeekTo(0); });
        Add("ITimeController::SourceListChanged", [=] { pTime->SourceListChanged(); });
        Add("ITimeController::CurrentSourceChanged", [=] { pTime->CurrentSourceChanged(); });
        const auto pMap = pTime->GetSourceMap();
        Add("ISourceMap::GetNames", [=] { pMap->GetNames(); });
        Add("ISourceMap::Find", [=] { pMap->Find(""); });
        Add("ISourceMap::ForEach", [=] { pMap->ForEach([](auto&&...) {}); });
        Add("ISourceMap::Changed", [=] { pMap->Changed(); });
        const auto pSource = pMap->Find("Live");
        Add("ITimeSource::GetMode", [=] { pSource->GetMode(); });
        Add("ITimeSource::GetTimeState", [=, state = TimeState()]() mutable { pSource->GetTimeState(state); });
        Add("ITimeSource::StateChanged", [=] { pSource->StateChanged(); });
        Add("ITimeSource::SecondStateChanged", [=] { pSource->SecondStateChanged(); });
    }

    void AddChannels()
    {
        const auto pChannels = Get<IHostCoreServices>(m_Services, &IHostCoreServices::GetChannelService);
        Add("IChannelService::GetContextByName", [=] { pChannels->GetContextByName(""); });
        Add("IChannelService::ContextListChanged", [=] { pChannels->ContextListChanged(); });
        Add("IChannelService::TypeListChanged", [=] { pChannels->TypeListChanged(); });
        Add("IChannelService::GetChannelTypes", [=] { pChannels->GetChannelTypes(0, ""); });
        Add("IChannelService::GetTypeParameters", [=] { pChannels->GetTypeParameters(""); });
        Add("IChannelService::CreateDerivedChannel", [=] { pChannels->CreateDerivedChannel("Derivative", {}, {}); });
        Add("IChannelService::CreateDerivedChannel of \"Cache\"",
            [=] { pChannels->CreateDerivedChannel("Cache", {}, {}); });
        Add("IChannelService::GetChannel", [=] { pChannels->GetChannel({}); });
        Add("IChannelService::GetSelectionManager", [=] { pChannels->GetSelectionManager(); });
        Add("IChannelService::GetSubTypeTable",
            [=, r = TQL::SubTypeRecord()]() mutable { (void)pChannels->GetSubTypeTable(0, r); });
        const auto pTypes = Get<IHostCoreServices>(m_Services, &IHostCoreServices::GetFourthFactoryService);
        Add("IChannelTypeRegistry::GetTypes", [=, v = std::vector<string>()]() mutable { pTypes->GetTypes(0, v); });
        Add("IChannelTypeRegistry::GetSpecifier",
            [=, s = TQL::VChannelSpecifier()]() mutable { (void)pTypes->GetSpecifier("", s); });
        std::vector<std::shared_ptr<TQL::IChannel>> made;
        Add("IChannelTypeRegistry::CreateChannels", [=]() mutable { (void)pTypes->CreateChannels("", {}, made); });
        Add("IChannelTypeRegistry::CreateGlobalChannels",
            [=]() mutable { (void)pTypes->CreateGlobalChannels("", "", made); });
        Add("IChannelTypeRegistry::CanComputeMagnitude", [=] { pTypes->CanComputeMagnitude("", ""); });
        Add("IChannelTypeRegistry::TypeListChanged", [=] { pTypes->TypeListChanged(); });
        const auto pMigration = Get<IHostCoreServices>(m_Services, &IHostCoreServices::GetFifthFactoryService);
        Add("IChannelMigrationService::Migrate",
            [=]() mutable { (void)pMigration->Migrate(nullptr, "Live", made, made); });
    }

    void AddSelection()
    {
        const auto pSource = Get<IHostCoreServices>(m_Services, &IHostCoreServices::GetSixthFactoryService);
        Add("ISelectionSource::GetSelection", [=] { pSource->GetSelection(); });
        Add("ISelectionSource::Set", [=] { pSource->Set({}); });
        Add("ISelectionSource::Add", [=] { pSource->Add({}); });
        Add("ISelectionSource::Changed", [=] { pSource->Changed(); });
        Add("ISelectionSource::RootSegment", [=] { pSource->RootSegment(0); });
        Add("ISelectionSource::GetDevices",
            [=, v = std::vector<TQL::SelectionItem>()]() mutable { (void)pSource->GetDevices(v); });
        const auto pManager =
            Get<IHostCoreServices>(m_Services, &IHostCoreServices::GetChannelService)->GetSelectionManager();
        std::set<string> types;
        Add("IChannelSelectionManager::GetSelectedChannelIds",
            [=, v = std::vector<TQL::IChannelInstanceId>()]() mutable { pManager->GetSelectedChannelIds("", "", v); });
        Add("IChannelSelectionManager::GetSelectedTypeCounts",
            [=, m = std::map<string, std::uint64_t>()]() mutable { pManager->GetSelectedTypeCounts(0, m); });
        Add("IChannelSelectionManager::GetSelectedChannelTypes",
            [=]() mutable { pManager->GetSelectedChannelTypes(0, types); });
        Add("IChannelSelectionManager::GetGlobalChannelTypes",
            [=]() mutable { pManager->GetGlobalChannelTypes(0, types); });
        Add("IChannelSelectionManager::SelectionChanged", [=] { pManager->SelectionChanged(); });
        Add("IChannelSelectionManager::GetSelectionKind",
            [=, kind = TQL::ESelectionKind()]() mutable { (void)pManager->GetSelectionKind("", kind); });
        Add("IChannelSelectionManager::SelectThingsOf", [=] { pManager->SelectThingsOf(nullptr, false); });
        Add("IChannelSelectionManager::RegisterChannelType",
            [=] { pManager->RegisterChannelType("", TQL::ESelectionKind::Global, 0); });
    }

    TestSupport::LogGuard m_Log;
    VHostServices m_Services{HostOptions{.bChecking = true, .UserDirectory = "/nonexistent"}};
    std::vector<std::pair<string, std::function<void()>>> m_Calls;
};

TEST_F(ThreadCheckTest, NamesEachOperationThatIsCalledOnAThreadThatMayNot)
{
    std::vector<string> called;
    for (const auto& [name, call] : m_Calls)
    {
        called.push_back(name);
        const auto* pRow =
            std::ranges::find(HostOperations, std::string_view(name), &std::pair<std::string_view, EThreads>::first);
        ASSERT_NE(pRow, HostOperations.end()) << name;
        std::vector<string> expected = m_Services.Faults();
        call();
        EXPECT_EQ(m_Services.Faults(), expected) << name << " on the UI thread is no fault";
        std::thread(call).join();
        if (pRow->second == EThreads::Ui)
            expected.push_back(name + " was called on another thread than the UI thread");
        EXPECT_EQ(m_Services.Faults(), expected);
    }
    std::vector<string> listed;
    for (const auto& rRow : HostOperations)
        listed.emplace_back(rRow.first);
    EXPECT_THAT(called, ::testing::UnorderedElementsAreArray(listed)) << "each operation of the table is tried";

    const std::size_t count = m_Services.Faults().size();
    std::thread([this] { m_Services.HasChannelBrowser(); }).join();
    EXPECT_EQ(m_Services.Faults().size(), count) << "one text a fault";
}

} // namespace
} // namespace Services

#include "ChannelSystem/IChannelTypeRegistry.h"
#include "CoreGraphics/Resources.h"
#include "FakeChannels.h"
#include "NotificationSystem/IAsioPostalService.h"
#include "OrvanePluginInterface/ITimeController.h"
#include "Services/Checking/VSubscriptionAudit.h"
#include "Services/Common/VFaultList.h"
#include "Services/Common/VHostSubscriptions.h"
#include "Services/Postal/VWorkerPostalService.h"
#include "Services/Selection/VSelectionSource.h"
#include "Services/Time/VTimeController.h"
#include "Services/Ui/VContentRegistry.h"
#include "Services/Ui/VQmlEngineHost.h"
#include "Services/VGlobalLogSink.h"
#include "Services/VHostServices.h"
#include "support/LogGuard.h"
#include "support/ManualPostalService.h"

#include <gmock/gmock.h>

#include <filesystem>
#include <thread>

namespace Services
{
namespace
{

using namespace OrvanePluginInterface;
using ::testing::ElementsAre;

/// What a getter of the host gives.
template <typename THost, typename T>
std::shared_ptr<T> Get(THost& i_rHost, void (THost::*i_pGetter)(std::shared_ptr<T>&))
{
    std::shared_ptr<T> pService;
    (i_rHost.*i_pGetter)(pService);
    return pService;
}

class HostServicesTest : public ::testing::Test
{
protected:
    static HostOptions Options(bool i_bChecking)
    {
        return {.bChecking = i_bChecking, .ProfileWord = 5, .UserDirectory = ::testing::TempDir() + "HostServices"};
    }

    TestSupport::LogGuard m_Log;
};

TEST_F(HostServicesTest, GivesTheSameServicesEveryTime)
{
    VHostServices services(Options(false));
    IHostCoreServices& rCore = services;
    IHostUiServices& rUi = services;
    EXPECT_THROW(Get(rCore, &IHostCoreServices::GetChannelService), std::runtime_error);
    const auto pChannels = std::make_shared<Fakes::FakeChannelService>();
    services.SetChannelService(pChannels);
    EXPECT_EQ(Get(rCore, &IHostCoreServices::GetChannelService), pChannels);

    EXPECT_NE(Get(rUi, &IHostUiServices::GetResources), nullptr);
    EXPECT_EQ(Get(rUi, &IHostUiServices::GetResources), Get(rUi, &IHostUiServices::GetResources));
    EXPECT_FALSE(Get(rUi, &IHostUiServices::GetResources)->UsesSearchFolders());
    EXPECT_NE(Get(rUi, &IHostUiServices::GetQmlEngineHost)->GetEngine(), nullptr);
    EXPECT_EQ(Get(rCore, &IHostCoreServices::GetHostProfile)->GetProfileWord(), 5u);
    EXPECT_NE(Get(rCore, &IHostCoreServices::GetPreferencesStore), nullptr);
    EXPECT_EQ(Get(rCore, &IHostCoreServices::GetPreferencesStore), Get(rCore, &IHostCoreServices::GetPreferencesStore));
    EXPECT_NE(Get(rCore, &IHostCoreServices::GetFifthFactoryService), nullptr);

    std::shared_ptr<ITimeController> pController;
    Get(rCore, &IHostCoreServices::GetTimeControllerRegistry)->GetTimeController("default", pController);
    EXPECT_EQ(pController, services.TimeController());

    TQL::VChannelSpecifier specifier;
    EXPECT_EQ(Get(rCore, &IHostCoreServices::GetFourthFactoryService)->GetSpecifier("any", specifier),
              TQL::Result::NotFound);

    const auto pFiles = Get(rCore, &IHostCoreServices::GetFileLocationService);
    EXPECT_EQ(pFiles->GetExtension(IFileLocationService::KindGraphFile).front(), '.');
    const auto folders = pFiles->GetUserDirectories(IFileLocationService::KindGraphFile);
    ASSERT_EQ(folders.size(), 1u);
    EXPECT_TRUE(std::filesystem::is_directory(folders.front()));
    EXPECT_TRUE(pFiles->GetUserDirectories(3).empty());
}

TEST_F(HostServicesTest, ChecksNothingUnlessAsked)
{
    VHostServices services(Options(false));
    std::thread([&] { services.HasChannelBrowser(); }).join();
    EXPECT_THAT(services.Faults(), ElementsAre());
    std::shared_ptr<TQL::IAsioPostalService> pWorker;
    const auto count = services.Worker().use_count();
    services.GetWorkerPostalService(pWorker);
    EXPECT_EQ(pWorker, services.Worker()) << "nothing stands between";
    EXPECT_EQ(services.Worker().use_count(), count + 1);
    EXPECT_THAT(services.FindInUse(), ElementsAre());
}

TEST(VSubscriptionAudit, TellsTheDeadAndTheHostsOwnFromLeaks)
{
    const auto pLedger = std::make_shared<VHostSubscriptionLedger>();
    const auto pPostal = std::make_shared<TestSupport::ManualPostalService>();
    const auto pSignal = std::make_shared<NotificationSystem::VChangeSignal>();
    const auto pBoolSignal = std::make_shared<NotificationSystem::VMultiCallbackPostal<void(bool)>>();
    VSubscriptionAudit audit(pLedger);
    audit.Watch("One", pSignal);
    audit.Watch("Same", pSignal);
    audit.Watch("Bool", pBoolSignal);
    audit.Watch("Null", std::shared_ptr<TQL::IChangeSignal>());
    EXPECT_THAT(audit.Leaks(), ElementsAre());

    VHostSubscriptions own(pLedger);
    own.Subscribe(
        std::shared_ptr<TQL::IChangeSignal>(pSignal), [] {}, pPostal);
    std::weak_ptr<TestSupport::ManualPostalService> pModulePostal;
    {
        const auto pPostalOfModule = std::make_shared<TestSupport::ManualPostalService>();
        pModulePostal = pPostalOfModule;
        pSignal->Add([] { throw TQL::VDeregisterWeakCallbackException(); }, pPostalOfModule);
    }
    pBoolSignal->AddDirect([](bool) { throw TQL::VDeregisterWeakCallbackException(); });
    EXPECT_THAT(audit.Leaks(), ElementsAre("One still has 1 subscriber(s) of the plug-in",
                                           "Bool still has 1 subscriber(s) of the plug-in"));
    audit.Sweep();
    pModulePostal.lock()->RunAll();
    audit.Purge();
    EXPECT_THAT(audit.Leaks(), ElementsAre());
    EXPECT_TRUE(pModulePostal.expired()) << "a postal service of the module must not stay in a signal";

    const auto handle = pSignal->AddDirect([] {});
    audit.Sweep();
    EXPECT_THAT(audit.Leaks(), ElementsAre("One still has 1 subscriber(s) of the plug-in"));
    pSignal->Remove(handle);
    own.Drain();
    EXPECT_EQ(pSignal->Count(), 0u);
    EXPECT_EQ(pLedger->Count(pSignal.get()), 0u);
}

TEST(VGlobalLogSink, KeepsTheNewestLinesAndTellsOnce)
{
    const auto pPostal = std::make_shared<TestSupport::ManualPostalService>();
    std::FILE* pFile = std::tmpfile();
    ASSERT_NE(pFile, nullptr);
    {
        const VGlobalLogSink sink(3, pPostal, pFile);
        int told = 0;
        sink.LinesChanged()->AddDirect([&] { ++told; });
        TQL::VLogCategory& rCategory = TQL::Log::GetCategory("Sink");
        for (const char* pText : {"a", "b", "c", "d"})
            TQL::Log::Write(rCategory, TQL::ELogSeverity::Warning, pText, {"here", 1});
        TQL::Log::Write(rCategory, TQL::ELogSeverity::Detail, "below the threshold", {"here", 1});
        std::vector<std::string> lines;
        for (const VGlobalLogSink::Line& rLine : sink.Lines())
            lines.push_back(rLine.Text);
        EXPECT_THAT(lines, ElementsAre("warning Sink: b", "warning Sink: c", "warning Sink: d"));
        EXPECT_EQ(told, 0) << "never while the log is locked";
        pPostal->RunAll();
        EXPECT_EQ(told, 1);
    }
    TQL::Log::Write(TQL::Log::GetCategory("Sink"), TQL::ELogSeverity::Warning, "after the sink", {"here", 1});
    std::rewind(pFile);
    std::string written(200, '\0');
    written.resize(std::fread(written.data(), 1, written.size(), pFile));
    EXPECT_EQ(written, "warning Sink: a\nwarning Sink: b\nwarning Sink: c\nwarning Sink: d\n");
    std::fclose(pFile);
}

} // namespace
} // namespace Services

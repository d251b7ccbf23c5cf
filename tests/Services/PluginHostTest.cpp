#include "FakeChannels.h"
#include "Services/Common/VHostSubscriptions.h"
#include "Services/Postal/VUiPostalService.h"
#include "Services/Time/VTimeController.h"
#include "Services/Ui/VContentRegistry.h"
#include "Services/Ui/VQmlEngineHost.h"
#include "Services/VHostServices.h"
#include "Services/VPluginHost.h"
#include "support/LogGuard.h"

#include <gmock/gmock.h>

#include <QtCore/QCoreApplication>
#include <QtQml/QQmlContext>
#include <QtQml/QQmlEngine>

#include <fstream>

#include <dlfcn.h>

namespace Services
{
namespace
{

using ::testing::ElementsAre;
using ::testing::UnorderedElementsAre;

std::filesystem::path Module(const std::string& i_rName)
{
    return std::filesystem::path(FIXTURE_FOLDER) / (i_rName + ".so");
}

bool IsMapped(const std::filesystem::path& i_rPath)
{
    void* pHandle = dlopen(i_rPath.c_str(), RTLD_NOW | RTLD_NOLOAD);
    if (pHandle)
        dlclose(pHandle);
    return pHandle != nullptr;
}

/// A strict host whose modules are really unmapped.
class PluginHostTest : public ::testing::Test
{
protected:
    PluginHostTest()
    {
        m_Services.SetChannelService(m_pChannels);
        m_pChannels->AddContext("Live", ChannelSystem::EContextType::Live);
        m_Services.TimeController()->AddSource("Live", OrvanePluginInterface::ETimeMode::Live);
        QCoreApplication::processEvents();
    }

    /// Turns the event loop until nothing waits.
    void Spin()
    {
        while (m_Services.Ui()->Pending() != 0)
            QCoreApplication::processEvents();
    }

    /// What the fixture wrote since the last time.
    std::vector<std::string> Told()
    {
        std::vector<std::string> texts;
        for (const TestSupport::LogGuard::Entry& rEntry : m_Log.Take())
            if (rEntry.Category == "Fixture")
                texts.push_back(rEntry.Text);
        return texts;
    }

    TestSupport::LogGuard m_Log;
    const std::shared_ptr<Fakes::FakeChannelService> m_pChannels = std::make_shared<Fakes::FakeChannelService>();
    VHostServices m_Services{HostOptions{.bChecking = true, .UserDirectory = "/nonexistent"}};
    VPluginHost m_Host{m_Services, false};
};

TEST_F(PluginHostTest, DrivesALifeTwiceAndLeavesNothing)
{
    for (int life = 0; life < 2; ++life)
    {
        std::string message;
        ASSERT_TRUE(m_Host.Load(Module("FixtureGood"), message).IsSuccess()) << message;
        EXPECT_THAT(Told(), ElementsAre("CanLoad", "LoadQmlModules", "Initialise"));
        EXPECT_EQ(m_Host.BuildRevision(), 4711u);
        EXPECT_THAT(m_Host.ContentNames(), ElementsAre("Fixture Window"));
        EXPECT_EQ(m_Host.Load(Module("FixtureGood"), message), TQL::Result::AlreadyPresent);

        QWidget frame;
        const QPointer<QWidget> pFirst = m_Host.OpenContent("Fixture Window", &frame);
        const QPointer<QWidget> pSecond = m_Host.OpenContent("Fixture Window", &frame);
        ASSERT_TRUE(pFirst && pSecond);
        EXPECT_EQ(pFirst->parentWidget(), &frame);
        m_Services.TimeController()->AddSource("Walk", OrvanePluginInterface::ETimeMode::Review);
        Spin();
        EXPECT_THAT(Told(), ElementsAre("content: sources changed", "content: sources changed"));

        delete pFirst.data(); // the operator closes one; the other is left to the unloading
        EXPECT_EQ(m_Host.Unload(), TQL::Result::Ok);
        EXPECT_TRUE(pSecond.isNull());
        std::vector<std::string> told = Told();
        ASSERT_EQ(told.size(), 10u);
        EXPECT_THAT(std::vector<std::string>(told.begin() + 6, told.end()),
                    ElementsAre("factory gone", "Shutdown", "UnloadResources", "destroyed"));
        told.resize(6);
        EXPECT_THAT(told, UnorderedElementsAre("content closed", "content closed", "late job on the UI thread",
                                               "late job on the UI thread", "late job by way of the workers",
                                               "late job by way of the workers"))
            << "the jobs of closing contents run before anything that they use is taken away";
        EXPECT_FALSE(IsMapped(Module("FixtureGood")));
        EXPECT_TRUE(m_Services.Contents()->Names().empty());
        const QQmlContext* pRoot = m_Services.EngineHost()->GetEngine()->rootContext();
        EXPECT_EQ(pRoot->contextProperty("fixtureObject").value<QObject*>(), nullptr);
        EXPECT_THAT(m_Services.Faults(), ElementsAre());

        // With the code unmapped, whatever of it were still queued or subscribed would crash here.
        m_Services.TimeController()->RemoveSource("Walk");
        Spin();
    }
}

TEST_F(PluginHostTest, RefusesAModuleThatIsNone)
{
    struct Case
    {
        std::filesystem::path Path;
        TQL::IResult Expected;
        const char* pText;
    };
    const std::filesystem::path textFile = std::filesystem::path(::testing::TempDir()) / "NoModule.so";
    std::ofstream(textFile) << "this is a text\n";
    const Case cases[] = {
        {Module("Absent"), TQL::Result::NotFound, "does not exist"},
        {::testing::TempDir(), TQL::Result::InvalidFormat, "cannot be loaded: "},
        {textFile, TQL::Result::InvalidFormat, "cannot be loaded: "},
        {Module("FixtureNoCreate"), TQL::Result::NotSupported, "does not export CreatePlugin"},
        {Module("FixtureNoDestroy"), TQL::Result::NotSupported, "does not export DestroyPlugin"},
        {Module("FixtureNoRevision"), TQL::Result::NotSupported, "does not export PluginBuildRevision"},
    };
    for (const Case& rCase : cases)
    {
        std::string message;
        EXPECT_EQ(m_Host.Load(rCase.Path, message), rCase.Expected) << rCase.Path;
        EXPECT_NE(message.find(rCase.pText), std::string::npos) << message;
        EXPECT_EQ(message.find('\n'), std::string::npos) << "one line";
        EXPECT_FALSE(m_Host.IsLoaded());
        EXPECT_FALSE(IsMapped(rCase.Path));
    }
    EXPECT_THAT(m_Services.Faults(), ElementsAre());
}

TEST_F(PluginHostTest, UndoesALifeThatEndsEarly)
{
    struct Case
    {
        const char* pModule;
        TQL::IResult Expected;
        const char* pText;
        std::vector<std::string> Told;
    };
    const Case cases[] = {
        {"FixtureNullPlugin", TQL::Result::AllocationFailure, "CreatePlugin gave no plug-in", {}},
        {"FixtureCannotLoad", TQL::Result::NotPermitted, "CanLoad says no", {"CanLoad", "destroyed"}},
        {"FixtureQmlFails",
         TQL::Result::Failed,
         "LoadQmlModules failed",
         {"CanLoad", "LoadQmlModules", "UnloadResources", "destroyed"}},
        {"FixtureInitialiseFails",
         TQL::Result::Failed,
         "Initialise failed",
         {"CanLoad", "LoadQmlModules", "Initialise", "factory gone", "Shutdown", "UnloadResources", "destroyed"}},
        {"FixtureInitialiseThrows",
         TQL::Result::FailedWithException,
         "it threw: the fixture throws",
         {"CanLoad", "LoadQmlModules", "Initialise", "factory gone", "Shutdown", "UnloadResources", "destroyed"}},
    };
    for (const Case& rCase : cases)
    {
        std::string message;
        EXPECT_EQ(m_Host.Load(Module(rCase.pModule), message), rCase.Expected) << rCase.pModule;
        EXPECT_NE(message.find(rCase.pText), std::string::npos) << message;
        EXPECT_EQ(Told(), rCase.Told) << rCase.pModule;
        EXPECT_TRUE(m_Services.Contents()->Names().empty()) << rCase.pModule;
        EXPECT_FALSE(IsMapped(Module(rCase.pModule))) << rCase.pModule;
    }
    EXPECT_THAT(m_Services.Faults(), ElementsAre());
}

TEST_F(PluginHostTest, NamesALeakedSubscriptionAndKeepsItsCode)
{
    VHostSubscriptions own(m_Services.Ledger());
    own.Subscribe(
        m_Services.TimeController()->CurrentSourceChanged(), [] {}, m_Services.Ui());
    own.Subscribe(
        m_Services.TimeController()->SourceListChanged(), [] {}, nullptr);
    std::string message;
    ASSERT_TRUE(m_Host.Load(Module("FixtureLeaksSubscription"), message).IsSuccess()) << message;
    EXPECT_EQ(m_Host.Unload(), TQL::Result::OkButPartial);
    EXPECT_THAT(m_Services.Faults(),
                ElementsAre("ITimeController::CurrentSourceChanged still has 1 subscriber(s) of the plug-in"));
    EXPECT_TRUE(IsMapped(Module("FixtureLeaksSubscription"))) << "what is subscribed must not dangle";
    Told();
    m_Services.TimeController()->SetCurrentSource("Live");
    Spin();
    EXPECT_THAT(Told(), ElementsAre("leaked subscriber called"));
}

TEST_F(PluginHostTest, OpensOnlyWhatTheModuleOffers)
{
    QWidget frame;
    EXPECT_TRUE(m_Host.OpenContent("Fixture Window", &frame).isNull()) << "no module";
    std::string message;
    ASSERT_TRUE(m_Host.Load(Module("FixtureGood"), message).IsSuccess()) << message;
    EXPECT_TRUE(m_Host.OpenContent("Other Window", &frame).isNull());
    EXPECT_FALSE(m_Host.OpenContent("Fixture Window", nullptr).isNull()) << "the unloading closes a frameless one too";
}

} // namespace
} // namespace Services

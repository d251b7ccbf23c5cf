#include "ChannelSystemSelection/VChannelSelectionManager.h"
#include "Channels/Contexts/VRecordedContext.h"
#include "Channels/VChannelService.h"
#include "Services/Common/VHostSubscriptions.h"
#include "Services/Postal/VWorkerPostalService.h"
#include "Services/Selection/VSelectionSource.h"
#include "Services/VHostServices.h"
#include "Services/VPluginHost.h"
#include "StoreInterface/IHandlerCallback.h"
#include "StoreInterface/IStore.h"
#include "support/LogGuard.h"

#include <gmock/gmock.h>

#include <algorithm>
#include <cstdlib>

namespace Services
{
namespace
{

using std::string;
using ::testing::ElementsAre;
using ::testing::HasSubstr;

/// A strict host with a channel of its own.
struct Host
{
    Host()
    {
        const auto pManager = TQL::MakeShared<ChannelSystemSelection::VChannelSelectionManager>(Services.Selection());
        Services.Ledger()->Add(Services.Selection()->Changed().get());
        pChannels->SetSelectionManager(pManager);
        Recordings::RecordedChannel channel;
        channel.Name = "sine";
        channel.ComponentNames = {""};
        channel.Samples = {0.0f, 1.0f, 0.0f, -1.0f};
        Recordings::VRecording recording;
        recording.Range = channel.GetTickRange();
        recording.Channels.push_back(std::move(channel));
        pChannels->AddContext(std::make_shared<Channels::VRecordedContext>(
            "walk", pChannels->GetSubTypes(), std::make_shared<const Recordings::VRecording>(std::move(recording))));
        Services.SetChannelService(pChannels);
    }

    void Load(const char* i_pModule)
    {
        string message;
        EXPECT_TRUE(Plugin.Load(string(FIXTURE_FOLDER) + "/" + i_pModule + ".so", message).IsSuccess()) << message;
    }

    static HostOptions Options()
    {
        HostOptions options;
        options.bChecking = true;
        options.Patience = std::chrono::milliseconds(200);
        options.UserDirectory = "/nonexistent";
        return options;
    }

    const std::shared_ptr<Channels::VChannelService> pChannels = std::make_shared<Channels::VChannelService>();
    VHostServices Services{Options()};
    VPluginHost Plugin{Services, false};
};

TEST(Checking, NamesWhatAModuleDoesWrong)
{
    const struct
    {
        const char* pModule;
        const char* pFault; ///< empty for none
        TQL::IResult Unloaded = TQL::Result::OkButPartial;
    } rows[] = {
        {"FixtureGood", "", TQL::Result::Ok},
        {"FixtureContentThrows", "CreateContent threw: the fixture throws", TQL::Result::Ok},
        {"FixtureShutdownThrows", "Shutdown threw: the fixture throws", TQL::Result::Ok},
        {"FixtureOtherThread", "IHostCoreServices::HasChannelBrowser was called on another thread than the UI thread",
         TQL::Result::Ok},
        {"FixtureChannelsOnOtherThread",
         "IChannelService::GetChannelTypes was called on another thread than the UI thread", TQL::Result::Ok},
        {"FixtureReleasesTwice", "IChannelStore::ReleaseLease was called with a token that is not held, of \"sine\"",
         TQL::Result::Ok},
        {"FixtureLeavesTexture", "OpenGL still has 1 texture(s) of the plug-in", TQL::Result::Ok},
        {"FixtureLeaksSubscription", "ITimeController::CurrentSourceChanged still has 1 subscriber(s) of the plug-in"},
        {"FixtureLeaksSelectionSubscription",
         "IChannelSelectionManager::SelectionChanged still has 1 subscriber(s) of the plug-in"},
        {"FixtureLeaksChannel",
         "IChannelService::GetChannel, CreateDerivedChannel: the plug-in has not given back 1, of \"sine\""},
        {"FixtureLeaksChannelSubscription",
         "IChannelChangeNotifier::AddOutputChangedCallback: the plug-in has not given back 1, of \"sine\""},
        {"FixtureLeavesLease", "IChannelStore::AcquireLease: the plug-in has not given back 1, of \"sine\""},
        {"FixtureLeavesHandler", "IStore::GetHandlerCallback: the plug-in still holds the handler of "
                                 "\"User/Preferences/Fixture\", with 1 subscriber(s)"},
        {"FixtureLeavesStrand",
         "IHostCoreServices::GetWorkerPostalService: the plug-in still holds the service in 1 place(s)"},
    };
    TestSupport::LogGuard guard;
    for (const auto& rRow : rows)
    {
        Host host; // what one has leaked must not be found with the next
        host.Load(rRow.pModule);
        host.Plugin.OpenContent("Fixture Window", nullptr);
        EXPECT_EQ(host.Plugin.Unload(), rRow.Unloaded) << rRow.pModule;
        const auto log = guard.Take(); // with the errors of the one that throws
        const bool bNoGraphics = std::ranges::any_of(log, [](const auto& i_r) { return i_r.Text == "no OpenGL"; });
        if (bNoGraphics)
            EXPECT_EQ(std::getenv("DISPLAY"), nullptr) << "OpenGL is missed";
        else if (*rRow.pFault == '\0')
            EXPECT_THAT(host.Services.Faults(), ElementsAre()) << rRow.pModule;
        else
            EXPECT_THAT(host.Services.Faults(), ElementsAre(rRow.pFault)) << rRow.pModule;
    }
}

TEST(Checking, NamesWorkThatGoesOnAfterShutdown)
{
    const TestSupport::LogGuard guard;
    Host host;
    host.Load("FixtureSkipsShutdown");
    EXPECT_EQ(host.Plugin.Unload(), TQL::Result::OkButPartial);
    host.Services.Worker()->Stop(); // or its jobs would go on until the end
    EXPECT_THAT(host.Services.Faults(),
                ElementsAre("IPostalService::Post: jobs of the plug-in, or a timer on the worker pool, went on after "
                            "Shutdown and did not come to rest",
                            HasSubstr("IHostCoreServices::GetWorkerPostalService: the plug-in still holds")));
}

TEST(Checking, TheHostsOwnHandlersAreNoFault)
{
    const TestSupport::LogGuard guard;
    Host host;
    const auto pStore = host.Services.Preferences();
    const auto handlerOf = [&](const char* i_pPath)
    {
        return pStore->GetHandlerCallback({{pStore->GetEntry(Store::EntryPath(i_pPath))}, {}});
    };
    const auto pBefore = handlerOf("User/Preferences/Before");
    host.Load("FixtureGood");
    const auto pDialogue = handlerOf("User/Preferences/Dialogue");
    host.Services.Ledger()->Add(pDialogue.get());
    EXPECT_EQ(host.Plugin.Unload(), TQL::Result::Ok);
    EXPECT_THAT(host.Services.Faults(), ElementsAre());
}

TEST(Checking, ACheckedChannelIsTheHostsChannelToThePlugin)
{
    const TestSupport::LogGuard guard;
    Host host;
    std::shared_ptr<ChannelSystem::IChannelService> pService;
    host.Services.GetChannelService(pService);
    const TQL::IChannelInstanceId id{"walk", "ModelSetSamplesOutput", 0, 0, "sine"};
    const auto pChannel = pService->GetChannel(id);
    ASSERT_TRUE(pChannel);
    EXPECT_EQ(pService->GetChannel(id), pChannel) << "the same one while it is held";
    EXPECT_EQ(pChannel->GetInstanceId(), host.pChannels->GetChannel(id)->GetInstanceId());

    const auto pCache = pService->CreateDerivedChannel("Cache", {}, {pChannel});
    ASSERT_TRUE(pCache) << "the host gets its own channel back";
    std::vector<std::shared_ptr<TQL::IChannel>> inputs;
    pCache->GetDependentChannels(inputs);
    EXPECT_THAT(inputs, ElementsAre(pChannel));
    const auto pOutput = pCache->GetOutput();
    EXPECT_EQ(pCache->GetOutput(), pOutput) << "the same one until data are replaced";
    EXPECT_EQ(pOutput->GetChannel(), pCache);
    std::vector<float> samples(4);
    TQL::TickRange range;
    pOutput->GetBlock()->GetRange(range);
    EXPECT_TRUE(pOutput->GetBlock()->ReadSamples(range, samples).IsSuccess());
    EXPECT_THAT(samples, ElementsAre(0.0f, 1.0f, 0.0f, -1.0f));

    ASSERT_TRUE(host.pChannels->RemoveContext("walk").IsSuccess());
    EXPECT_TRUE(pOutput->IsStale());
    EXPECT_EQ(pChannel->GetOutput(), nullptr);
    EXPECT_THAT(host.Services.FindInUse(),
                ElementsAre("IChannel::GetOutput: the plug-in has not given back 1, of \"sine\"",
                            "IChannelService::GetChannel, CreateDerivedChannel: the plug-in has not given back 2, of "
                            "\"sine\" and others",
                            "IHostCoreServices::GetChannelService: the plug-in still holds the service in 1 place(s)"));
}

} // namespace
} // namespace Services

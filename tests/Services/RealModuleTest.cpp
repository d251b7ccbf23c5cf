#include "ChannelSystemSelection/VChannelSelectionManager.h"
#include "Channels/Common/ChannelTypes.h"
#include "Channels/Contexts/VRecordedContext.h"
#include "Channels/VChannelService.h"
#include "FakeChannels.h"
#include "Services/Common/VHostSubscriptions.h"
#include "Services/Selection/VSelectionSource.h"
#include "Services/Time/VContextTimeFeed.h"
#include "Services/Time/VTimeController.h"
#include "Services/Ui/VQmlEngineHost.h"
#include "Services/VHostServices.h"
#include "Services/VPluginHost.h"
#include "StoreInterface/ScopedAccess.h"
#include "StoreInterface/TypedAccess.h"
#include "support/LogGuard.h"

#include <gmock/gmock.h>

#include <QtCore/QCoreApplication>
#include <QtCore/QDir>
#include <QtCore/QElapsedTimer>
#include <QtCore/QTemporaryDir>
#include <QtQml/QQmlEngine>
#include <QtQml/QQmlError>
#include <QtQuick/QQuickWindow>
#include <QtQuickWidgets/QQuickWidget>
#include <QtWidgets/QVBoxLayout>

#include <algorithm>
#include <cmath>
#include <functional>

namespace Services
{
namespace
{

using ::testing::ElementsAre;

/// A preference as a preferences dialogue finds it: its name, and its value before and after it is switched.
std::string SwitchPreference(VHostServices& i_rServices, const char* i_pKey)
{
    std::shared_ptr<TQL::IStore> pStore;
    i_rServices.GetPreferencesStore(pStore);
    const TQL::ScopedWrite writer(*pStore);
    const auto entry = pStore->GetEntry(Store::EntryPath("User/Preferences/Graph Plots") / i_pKey);
    bool bValue = false;
    EXPECT_TRUE(TQL::GetValue(*writer, entry, bValue));
    EXPECT_TRUE(writer->SetValue(entry, Store::MakeValue(!bValue)).IsSuccess());
    return writer->GetDisplayName(entry).value_or("") + (bValue ? ": on to off" : ": off to on");
}

/// The real module in the strict host: two whole lives in one process, with a window, a live context that grows and a
/// change to a recording, and nothing left behind.
TEST(RealModule, LivesTwiceInTheStrictHostWithoutAFault)
{
    TestSupport::LogGuard log;
    const QTemporaryDir folder;
    VHostServices services({.bChecking = true, .UserDirectory = folder.path().toStdString()});
    const auto pChannels = std::make_shared<Fakes::FakeChannelService>();
    services.SetChannelService(pChannels);
    VTimeController& rTime = *services.TimeController();
    const auto pLive = pChannels->AddContext("Live", ChannelSystem::EContextType::Live);
    pLive->SetFrames(0, 120);
    const VContextTimeFeed liveFeed(pLive, rTime.AddSource("Live", OrvanePluginInterface::ETimeMode::Live),
                                    services.Ledger());
    const auto pWalk = pChannels->AddContext("Walk", ChannelSystem::EContextType::Recorded);
    pWalk->SetFrames(10, 500);
    const VContextTimeFeed walkFeed(pWalk, rTime.AddSource("Walk", OrvanePluginInterface::ETimeMode::Review),
                                    services.Ledger());

    std::string warnings; // of the scenes; a broken binding shows nowhere else
    QObject::connect(services.EngineHost()->GetEngine(), &QQmlEngine::warnings,
                     [&](const QList<QQmlError>& i_rErrors)
                     {
                         for (const QQmlError& rError : i_rErrors)
                             warnings += rError.toString().toStdString() + "\n";
                     });

    VPluginHost host(services);
    for (int life = 0; life < 2; ++life)
    {
        rTime.SetCurrentSource("Live");
        std::string message;
        ASSERT_TRUE(host.Load(REAL_MODULE, message).IsSuccess()) << message;
        EXPECT_EQ(host.BuildRevision(), 158731u);
        ASSERT_THAT(host.ContentNames(), ElementsAre("Graph Plots"));
        EXPECT_EQ(SwitchPreference(services, "EnableRotationUnwrapping"),
                  life == 0 ? "Enable rotation unwrapping: on to off" : "Enable rotation unwrapping: off to on");

        QWidget frame;
        frame.resize(640, 360);
        auto* pLayout = new QVBoxLayout(&frame);
        const QPointer<QWidget> pContent = host.OpenContent("Graph Plots", &frame);
        ASSERT_FALSE(pContent.isNull());
        pLayout->addWidget(pContent);
        frame.show();
        for (int frames = 121; frames < 160; ++frames)
        {
            pLive->SetFrames(0, frames);
            QCoreApplication::processEvents();
        }
        rTime.SetCurrentSource("Walk");
        QCoreApplication::processEvents();
        rTime.SeekTo(100 * TQL::DefaultFramePeriod);
        QCoreApplication::processEvents();

        if (life == 1)
            delete pContent.data();
        EXPECT_EQ(host.Unload(), TQL::Result::Ok) << "life " << life;
        EXPECT_TRUE(pContent.isNull());
        EXPECT_EQ(warnings, "") << "life " << life;
        EXPECT_THAT(services.Faults(), ElementsAre()) << "life " << life;
        rTime.SetCurrentSource("");
        QCoreApplication::processEvents();
    }
}

/// The last folders of what an engine has beyond some paths.
QStringList FoldersBeyond(const QStringList& i_rPaths, const QStringList& i_rBefore)
{
    QStringList folders;
    for (const QString& rPath : i_rPaths)
        if (!i_rBefore.contains(rPath))
            folders += rPath.section(QStringLiteral("/src/"), -1);
    return folders;
}

/// What the module takes of its host besides its windows.
TEST(RealModule, FollowsTheDefaultTimeAndReadsItsSourcesInADevelopmentBuildAlone)
{
    TestSupport::LogGuard log;
    for (const bool bDevelopment : {false, true})
    {
        HostOptions options;
        options.bChecking = true;
        options.bDevelopmentBuild = bDevelopment;
        VHostServices services(options);
        services.SetChannelService(std::make_shared<Fakes::FakeChannelService>());
        const QQmlEngine& rEngine = *services.EngineHost()->GetEngine();
        const QStringList before = rEngine.importPathList();
        const QString prefix = QStringLiteral("qml");
        const QStringList searchBefore = QDir::searchPaths(prefix);
        const auto pListChanged = services.TimeController()->SourceListChanged();
        const std::size_t followers = pListChanged->Count();

        VPluginHost host(services);
        std::string message;
        ASSERT_TRUE(host.Load(REAL_MODULE, message).IsSuccess()) << message;
        using Folders = QStringList;
        EXPECT_EQ(FoldersBeyond(rEngine.importPathList(), before),
                  bDevelopment ? Folders({QStringLiteral("GraphPlotUIOrvane"), QStringLiteral("GraphPlotUI/qml")})
                               : Folders());
        EXPECT_EQ(FoldersBeyond(QDir::searchPaths(prefix), searchBefore),
                  bDevelopment ? Folders(QStringLiteral("GraphPlotUIOrvane")) : Folders());
        EXPECT_EQ(pListChanged->Count(), followers + 1) << "the time that is not of a window";
        EXPECT_EQ(host.Unload(), TQL::Result::Ok);
        EXPECT_EQ(pListChanged->Count(), followers);
        EXPECT_THAT(services.Faults(), ElementsAre());
    }
}

/// Turns the event loop until the condition holds, for at most 20 s.
bool WaitFor(const std::function<bool()>& i_rCondition)
{
    QElapsedTimer clock;
    clock.start();
    while (!i_rCondition() && !clock.hasExpired(20'000))
    {
        QCoreApplication::processEvents(QEventLoop::AllEvents | QEventLoop::WaitForMoreEvents, 20);
        QCoreApplication::sendPostedEvents(nullptr, QEvent::DeferredDelete);
    }
    return i_rCondition();
}

std::shared_ptr<const Recordings::VRecording> MakeSine()
{
    Recordings::RecordedChannel channel;
    channel.Name = "sine";
    channel.ComponentNames = {""};
    for (int row = 0; row < 1200; ++row)
        channel.Samples.push_back(std::sin(static_cast<float>(row) / 20.0f));
    Recordings::VRecording recording;
    recording.Range = channel.GetTickRange();
    recording.Channels.push_back(std::move(channel));
    return std::make_shared<const Recordings::VRecording>(std::move(recording));
}

/// One window of the module and how often it was drawn.
struct Window
{
    explicit Window(VPluginHost& i_rHost)
    {
        Frame.resize(400, 300);
        pContent = i_rHost.OpenContent("Graph Plots", &Frame);
        (new QVBoxLayout(&Frame))->addWidget(pContent);
        QObject::connect(pContent->findChild<QQuickWidget*>()->quickWindow(), &QQuickWindow::afterRendering, &Frame,
                         [this] { ++Drawn; });
        Frame.show();
    }

    QWidget Frame;
    QPointer<QWidget> pContent;
    int Drawn = 0;
};

/// Two windows that plot while the recording plays, one closed in the middle of it, and the module loaded again.
TEST(RealModule, GivesBackAllThatItTakesWhilePlaying)
{
    const TestSupport::LogGuard log;
    HostOptions options;
    options.bChecking = true;
    VHostServices services(options);
    const auto pChannels = std::make_shared<Channels::VChannelService>();
    const auto pManager = TQL::MakeShared<ChannelSystemSelection::VChannelSelectionManager>(services.Selection());
    services.Ledger()->Add(services.Selection()->Changed().get());
    for (const Channels::ChannelType& rType : Channels::GetChannelTypeTable())
        pManager->RegisterChannelType(rType.Name, rType.Kind, static_cast<std::uint32_t>(rType.Flags));
    pChannels->SetSelectionManager(pManager);
    services.SetChannelService(pChannels);
    const auto pContext = std::make_shared<Channels::VRecordedContext>("walk", pChannels->GetSubTypes(), MakeSine());
    pChannels->AddContext(pContext);
    VTimeController& rTime = *services.TimeController();
    const VContextTimeFeed feed(pContext, rTime.AddSource("walk", OrvanePluginInterface::ETimeMode::Review),
                                services.Ledger());
    rTime.SetCurrentSource("walk");
    rTime.SetLooping(true);
    services.Selection()->Set(
        {Channels::SelectionOfChannel(pContext->GetChannels()->front()->GetInstanceId()).value()});

    const bool bDraws = qEnvironmentVariableIsSet("DISPLAY");
    VPluginHost host(services);
    for (int life = 0; life < 2; ++life)
    {
        std::string message;
        ASSERT_TRUE(host.Load(REAL_MODULE, message).IsSuccess()) << message;
        auto pFirst = std::make_unique<Window>(host);
        {
            Window second(host);
            rTime.Play(1.0);
            const auto holdsOutputs = [&]
            {
                const auto inUse = services.FindInUse();
                return std::ranges::any_of(inUse,
                                           [](const auto& i_r) { return i_r.starts_with("IChannel::GetOutput"); });
            };
            EXPECT_TRUE(WaitFor(holdsOutputs)) << "the check sees what the module reads";
            if (bDraws)
            {
                EXPECT_TRUE(WaitFor([&] { return pFirst->Drawn > 5 && second.Drawn > 5; }));
            }
            pFirst.reset();
            const int drawn = second.Drawn;
            EXPECT_TRUE(rTime.IsPlaying());
            if (bDraws)
            {
                // A window that shows the same as before draws no frame.
                const auto resize = [&]
                {
                    second.Frame.resize(second.Frame.width() ^ 1, second.Frame.height());
                };
                EXPECT_TRUE(WaitFor([&] { return resize(), second.Drawn > drawn + 5; })) << "the other goes on";
            }
        }
        EXPECT_EQ(host.Unload(), TQL::Result::Ok) << "life " << life;
        EXPECT_THAT(services.Faults(), ElementsAre()) << "life " << life;
        EXPECT_THAT(services.FindInUse(), ElementsAre()) << "life " << life;
    }
}

} // namespace
} // namespace Services

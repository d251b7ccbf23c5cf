#include "FakeChannels.h"
#include "Services/VContextTimeFeed.h"
#include "Services/VHostServices.h"
#include "Services/VPluginHost.h"
#include "Services/VQmlEngineHost.h"
#include "Services/VTimeController.h"
#include "support/LogGuard.h"

#include <gmock/gmock.h>

#include <QtCore/QCoreApplication>
#include <QtQml/QQmlEngine>
#include <QtQml/QQmlError>
#include <QtWidgets/QVBoxLayout>

namespace Services
{
namespace
{

using ::testing::ElementsAre;

/// The real module in the strict host: two whole lives in one process, with a window, a live context that grows and a
/// change to a recording, and nothing left behind.
TEST(RealModule, LivesTwiceInTheStrictHostWithoutAFault)
{
    TestSupport::LogGuard log;
    VHostServices services({.bChecking = true, .UserDirectory = ::testing::TempDir() + "RealModule"});
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

} // namespace
} // namespace Services

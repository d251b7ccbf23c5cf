#include "Channels/Contexts/VLiveContext.h"
#include "Channels/Contexts/VRecordedContext.h"
#include "Channels/VChannelService.h"
#include "Recordings/OpenRecording.h"
#include "Services/Time/VTimeController.h"
#include "Services/Time/VTimeSource.h"
#include "Simulation/RecordWalk.h"
#include "Simulation/VWalkSimulator.h"
#include "Studio/Session/ContextNames.h"
#include "Studio/Session/VLiveActions.h"
#include "Studio/Session/VStudioSession.h"
#include "support/LogGuard.h"

#include <gtest/gtest.h>

#include <QtCore/QTemporaryDir>
#include <QtCore/QTimer>
#include <QtCore/QtEndian>
#include <QtGui/QAction>
#include <QtNetwork/QHostAddress>
#include <QtNetwork/QUdpSocket>
#include <QtTest/QTest>
#include <QtWidgets/QAbstractButton>
#include <QtWidgets/QMenu>
#include <QtWidgets/QMessageBox>

#include <cstring>
#include <filesystem>
#include <string>
#include <vector>

namespace
{

using Studio::VStudioSession;

class LiveInput : public ::testing::Test
{
protected:
    LiveInput() : m_Folder(m_Temporary.path().toStdString()), m_Session({true, m_Folder.string()}) {}

    std::string AddWalk(std::int64_t i_Frames)
    {
        const Simulation::VWalkSimulator simulator({1, 1});
        return m_Session.AddRecording(Simulation::RecordWalk(simulator, 0, i_Frames));
    }

    std::shared_ptr<Channels::VChannelContext> Live()
    {
        return m_Session.Channels().FindContext(Studio::LiveContextName);
    }

    /// One number for one address, to where the session listens.
    void Send(const QByteArray& i_rAddress, float i_Value)
    {
        QByteArray packet = i_rAddress;
        packet.append(4 - packet.size() % 4, '\0');
        packet.append(QByteArrayLiteral(",f")).append(2, '\0');
        char value[4];
        qToBigEndian(i_Value, value);
        packet.append(value, 4);
        m_Socket.writeDatagram(packet, QHostAddress(QHostAddress::LocalHost), m_Session.OscPort());
    }

    TestSupport::LogGuard m_Log;
    QTemporaryDir m_Temporary;
    std::filesystem::path m_Folder;
    VStudioSession m_Session;
    QUdpSocket m_Socket;
};

TEST_F(LiveInput, OscMessagesBecomeChannelsOfTheLiveContext)
{
    Streaming::VOscInput::Options options;
    options.Rate = 100.0;
    std::string error;
    EXPECT_EQ(m_Session.OscPort(), 0);
    ASSERT_TRUE(m_Session.StartOsc(options, error).IsSuccess()) << error;
    ASSERT_TRUE(m_Session.ShowContext(Studio::LiveContextName)) << "there is something to show before messages come";
    EXPECT_TRUE(m_Session.IsLive());
    std::vector<std::string> warnings;
    m_Session.SetLiveWarning([&](const std::string& i_rText) { warnings.push_back(i_rText); });
    Send("/first", 1.0f);
    EXPECT_TRUE(QTest::qWaitFor([&] { return Live()->GetChannels()->size() == 1; }));
    Send("/second", 2.0f);
    EXPECT_TRUE(QTest::qWaitFor([&] { return Live()->GetChannels()->size() == 2; }));
    EXPECT_EQ(Live()->GetFramePeriod(), 1'350'000);
    const auto pSource = m_Session.Host().TimeController()->FindSource(Studio::LiveContextName);
    EXPECT_TRUE(QTest::qWaitFor([&] { return pSource->Range().Last > 0; })) << "the time follows";

    m_Socket.writeDatagram("junk", QHostAddress(QHostAddress::LocalHost), m_Session.OscPort());
    EXPECT_TRUE(QTest::qWaitFor([&] { return !warnings.empty(); }));
    EXPECT_EQ(warnings, std::vector<std::string>{"1 packet is no Open Sound Control and left out in whole or in part"});
    m_Log.Take(); // the same as a warning

    m_Session.SetLivePaused(true);
    EXPECT_TRUE(m_Session.IsLivePaused());
    m_Session.StopLive();
    EXPECT_FALSE(m_Session.IsLive());
    EXPECT_EQ(Live()->GetChannels()->size(), 2u) << "what came is still there";
    m_Session.Close();
    EXPECT_EQ(m_Session.Faults(), std::vector<std::string>());
}

TEST_F(LiveInput, APortInUseIsToldAndTheOtherInputGoesOn)
{
    VStudioSession other({true, m_Folder.string()});
    std::string error;
    Streaming::VOscInput::Options options;
    ASSERT_TRUE(other.StartOsc(options, error).IsSuccess()) << error;
    options.Receiver.Port = other.OscPort();
    m_Session.StartLive(1);
    const auto pBefore = Live();
    EXPECT_TRUE(m_Session.StartOsc(options, error).IsError());
    EXPECT_NE(error.find("is in use by another program"), std::string::npos) << error;
    EXPECT_EQ(Live(), pBefore);
    EXPECT_TRUE(m_Session.IsLive());
    // The same session may listen there again.
    EXPECT_TRUE(other.StartOsc(options, error).IsSuccess()) << error;
}

TEST_F(LiveInput, ARecordingIsReplayedOnceToItsEnd)
{
    const std::string name = AddWalk(60);
    std::string error;
    EXPECT_TRUE(m_Session.CanReplay(name));
    EXPECT_FALSE(m_Session.CanReplay("nobody"));
    EXPECT_TRUE(m_Session.StartReplay("nobody", 1.0, false, error).IsError());
    EXPECT_EQ(error, "\"nobody\" is no recording with frames; show one that has");
    EXPECT_TRUE(m_Session.StartReplay(name, 1000.0, false, error).IsError());
    EXPECT_FALSE(m_Session.IsLive());

    ASSERT_TRUE(m_Session.StartReplay(name, 8.0, false, error).IsSuccess()) << error;
    EXPECT_TRUE(m_Session.IsLive());
    EXPECT_TRUE(QTest::qWaitFor([&] { return !m_Session.IsLive(); }));
    const auto pRecorded = m_Session.Channels().FindContext(name);
    EXPECT_EQ(Live()->GetTickRange(), pRecorded->GetTickRange());
    for (const auto& rpChannel : *pRecorded->GetChannels())
    {
        TQL::IChannelInstanceId id = rpChannel->GetInstanceId();
        id.DataContextName = Studio::LiveContextName;
        EXPECT_TRUE(Live()->FindChannel(id)) << rpChannel->GetDefinition().Name;
    }
    ASSERT_TRUE(m_Session.StartReplay(name, 20.0, true, error).IsSuccess()) << error;
    EXPECT_TRUE(QTest::qWaitFor([&] { return Live()->GetTickRange().Last > 3 * pRecorded->GetTickRange().Last; }));
    EXPECT_TRUE(m_Session.IsLive());
    EXPECT_FALSE(m_Session.CanReplay(Studio::LiveContextName));
}

TEST_F(LiveInput, TheMenuReplaysStopsAndSaves)
{
    QWidget window;
    QMenu menu;
    std::vector<std::string> told;
    auto* pActions =
        new Studio::VLiveActions(m_Session, menu, window, [&](const std::string& i_rText) { told.push_back(i_rText); });
    const auto action = [&](const char* i_pName)
    {
        return menu.findChild<QAction*>(QString::fromLatin1(i_pName));
    };
    const auto enabled = [&]
    {
        Q_EMIT menu.aboutToShow();
        return std::string(menu.findChild<QMenu*>("liveReplay")->isEnabled() ? "replay " : "") +
               (action("liveStop")->isEnabled() ? "stop " : "") + (action("liveSave")->isEnabled() ? "save " : "");
    };
    EXPECT_EQ(enabled(), "");
    action("liveSave")->setEnabled(true);
    action("liveSave")->trigger();
    EXPECT_EQ(told, std::vector<std::string>{"There are no live data to save"});
    m_Session.ShowContext(AddWalk(600));
    EXPECT_EQ(enabled(), "replay ");
    menu.findChild<QAction*>("liveReplay8")->trigger();
    EXPECT_EQ(m_Session.CurrentContextName(), Studio::LiveContextName);
    EXPECT_EQ(enabled(), "stop save ");

    EXPECT_TRUE(QTest::qWaitFor([&] { return Live()->GetTickRange().Last > 20 * TQL::DefaultFramePeriod; }));
    told.clear();
    const auto path = m_Folder / "live.c3d";
    pActions->SaveTo(path); // while the replay goes on
    EXPECT_TRUE(QTest::qWaitFor([&] { return !told.empty(); }));
    EXPECT_EQ(told, std::vector<std::string>{"Saved live data as " + path.string()});
    Recordings::VRecording read;
    std::string error;
    ASSERT_TRUE(Recordings::OpenRecording(path, read, error).IsSuccess()) << error;
    EXPECT_EQ(read.Channels.size(), 69u);

    told.clear();
    pActions->SaveTo(m_Folder / "no" / "such.c3d");
    EXPECT_TRUE(QTest::qWaitFor([&] { return !told.empty(); }));
    EXPECT_TRUE(told.front().starts_with("Not saved: ")) << told.front();

    m_Session.StartLive(1, 10); // with segments, for which the format has no place
    pActions->SaveTo(path);
    EXPECT_TRUE(QTest::qWaitFor([&] { return window.findChild<QMessageBox*>("liveRemarks") != nullptr; }));
    EXPECT_TRUE(window.findChild<QMessageBox*>("liveRemarks")->informativeText().contains("segment poses"));
    action("liveStop")->trigger();
    EXPECT_FALSE(m_Session.IsLive());
}

TEST_F(LiveInput, UnsavedDataAreAskedAboutAndMarked)
{
    QWidget window;
    window.setWindowTitle(QStringLiteral("Studio[*]"));
    QMenu menu;
    auto* pActions = new Studio::VLiveActions(m_Session, menu, window, [](const std::string&) {});
    int asked = 0;
    const auto answer = [&](QMessageBox::StandardButton i_Button)
    {
        QTimer::singleShot(0, &window,
                           [&, i_Button]
                           {
                               auto* pBox = window.findChild<QMessageBox*>("liveUnsaved");
                               asked += pBox ? 1 : 0;
                               if (pBox)
                                   pBox->button(i_Button)->click();
                           });
        return m_Session.MayLoseLive();
    };
    m_Session.StartLive(1, 10);
    EXPECT_TRUE(answer(QMessageBox::Cancel)) << "a simulation can be had again";
    std::string error;
    Streaming::VOscInput::Options options;
    options.Rate = 100.0;
    ASSERT_TRUE(m_Session.StartOsc(options, error).IsSuccess()) << error;
    EXPECT_TRUE(answer(QMessageBox::Cancel)) << "nothing came yet";
    Send("/first", 1.0f);
    EXPECT_TRUE(QTest::qWaitFor([&] { return m_Session.HasUnsavedLive(); }));
    EXPECT_TRUE(QTest::qWaitFor([&] { return window.isWindowModified(); }));
    EXPECT_EQ(asked, 0);
    EXPECT_FALSE(answer(QMessageBox::Cancel));
    EXPECT_TRUE(answer(QMessageBox::Discard));
    EXPECT_EQ(asked, 2);
    pActions->SaveTo(m_Folder / "live.c3d");
    EXPECT_TRUE(QTest::qWaitFor([&] { return !m_Session.HasUnsavedLive(); }));
    EXPECT_FALSE(window.isWindowModified());
    EXPECT_TRUE(answer(QMessageBox::Cancel));
    QCoreApplication::processEvents();
    EXPECT_EQ(asked, 2);
    EXPECT_EQ(m_Session.GetLiveInput().Messages, 1u);
}

} // namespace

#include "ChannelSystem/IChannelSelectionManager.h"
#include "Channels/Contexts/VChannelContext.h"
#include "Channels/VChannelService.h"
#include "Recordings/C3d/C3dWriter.h"
#include "Services/Selection/VSelectionSource.h"
#include "Services/Time/VTimeController.h"
#include "Services/Time/VTimeSource.h"
#include "Simulation/RecordWalk.h"
#include "Simulation/VWalkSimulator.h"
#include "Studio/Common/VMainActions.h"
#include "Studio/Plots/PlotContent.h"
#include "Studio/Session/ContextNames.h"
#include "Studio/Session/VContextSelection.h"
#include "Studio/Session/VStudioSession.h"
#include "Studio/Tree/ChannelLeaves.h"
#include "Studio/Tree/VChannelPanel.h"
#include "Studio/Window/VMainWindow.h"
#include "support/LogGuard.h"

#include <gtest/gtest.h>

#include <QtCore/QCoreApplication>
#include <QtCore/QFile>
#include <QtCore/QTemporaryDir>
#include <QtCore/QTimer>
#include <QtGui/QAction>
#include <QtGui/QImage>
#include <QtTest/QTest>
#include <QtWidgets/QAbstractButton>
#include <QtWidgets/QApplication>
#include <QtWidgets/QComboBox>
#include <QtWidgets/QLabel>
#include <QtWidgets/QMessageBox>
#include <QtWidgets/QSlider>
#include <QtWidgets/QSpinBox>
#include <QtWidgets/QTreeView>

#include <filesystem>
#include <map>
#include <string>

namespace
{

using Studio::VStudioSession;

class StudioSession : public ::testing::Test
{
protected:
    StudioSession() : m_Folder(m_Temporary.path().toStdString()), m_Session({true, m_Folder.string()}) {}

    std::filesystem::path WriteWalk(const char* i_pName, std::int64_t i_Frames)
    {
        const Simulation::VWalkSimulator simulator({1, 1});
        const auto path = m_Folder / i_pName;
        std::string error;
        EXPECT_TRUE(Recordings::WriteC3d(Simulation::RecordWalk(simulator, 0, i_Frames), path, error).IsSuccess())
            << error;
        return path;
    }

    std::filesystem::path WriteText(const char* i_pName, const char* i_pText)
    {
        const auto path = m_Folder / i_pName;
        QFile file(QString::fromStdString(path.string()));
        EXPECT_TRUE(file.open(QIODevice::WriteOnly));
        file.write(i_pText);
        return path;
    }

    /// Names of contexts and of time sources, which must be the same.
    std::string Names()
    {
        std::string contexts, sources;
        for (const auto& rpContext : m_Session.Channels().GetContexts())
            contexts += rpContext->GetName() + " ";
        for (const std::string& rName : m_Session.Host().TimeController()->GetSourceMap()->GetNames())
            sources += rName + " ";
        EXPECT_EQ(contexts, sources);
        return contexts;
    }

    TestSupport::LogGuard m_Log;
    QTemporaryDir m_Temporary;
    std::filesystem::path m_Folder;
    VStudioSession m_Session;
};

TEST_F(StudioSession, ARecordingBecomesAContextWithItsTime)
{
    const auto path = WriteWalk("walk.c3d", 240);
    std::string first, second, error;
    ASSERT_TRUE(m_Session.OpenFile(path, first, error).IsSuccess()) << error;
    ASSERT_TRUE(m_Session.OpenFile(path, second, error).IsSuccess()) << error;
    EXPECT_EQ(Names(), "walk walk (2) ");
    EXPECT_EQ(m_Session.CurrentContext(), nullptr);
    ASSERT_TRUE(m_Session.ShowContext(second));
    EXPECT_EQ(m_Session.CurrentContextName(), "walk (2)");
    EXPECT_FALSE(m_Session.ShowContext("nobody"));

    const auto pContext = m_Session.CurrentContext();
    ASSERT_TRUE(pContext);
    EXPECT_EQ(pContext->GetChannels()->size(), 53u + 16u);
    const auto pSource = m_Session.Host().TimeController()->FindSource(second);
    EXPECT_EQ(pSource->GetMode(), OrvanePluginInterface::ETimeMode::Review);
    EXPECT_EQ(pSource->Range(), pContext->GetTickRange());
    EXPECT_EQ(pSource->Range().Last - pSource->Range().First, 240 * TQL::DefaultFramePeriod);
    EXPECT_EQ(m_Session.Faults(), std::vector<std::string>());
}

TEST_F(StudioSession, WhatCannotBeOpenedLeavesAllAsItWas)
{
    std::string name, error;
    ASSERT_TRUE(m_Session.OpenFile(WriteWalk("walk.c3d", 24), name, error).IsSuccess());
    ASSERT_TRUE(m_Session.ShowContext(name));
    const std::filesystem::path bad[] = {m_Folder / "missing.c3d", m_Folder, WriteText("empty.c3d", ""),
                                         WriteText("text.c3d", "Dear Sir or Madam,\n\nthis is no recording.\n")};
    for (const auto& rPath : bad)
    {
        std::string unused = "unused";
        error.clear();
        EXPECT_TRUE(m_Session.OpenFile(rPath, unused, error).IsError()) << rPath;
        EXPECT_FALSE(error.empty()) << rPath;
        EXPECT_EQ(error.find('\n'), std::string::npos) << error;
        EXPECT_EQ(unused, "unused");
        EXPECT_EQ(Names(), "walk ");
        EXPECT_EQ(m_Session.CurrentContextName(), "walk");
    }
}

TEST_F(StudioSession, TheLiveCaptureGrowsPausesAndIsReplaced)
{
    m_Session.StartLive(2, 600);
    m_Session.SetLivePaused(true);
    EXPECT_TRUE(m_Session.IsLivePaused());
    EXPECT_EQ(Names(), "Live ");
    ASSERT_TRUE(m_Session.ShowContext(Studio::LiveContextName));
    const auto pFirst = m_Session.CurrentContext();
    EXPECT_GE(pFirst->GetTickRange().Last, 600 * TQL::DefaultFramePeriod);
    EXPECT_EQ(m_Session.Host().TimeController()->FindSource("Live")->GetMode(), OrvanePluginInterface::ETimeMode::Live);

    m_Session.StartLive(1);
    EXPECT_EQ(Names(), "Live ");
    EXPECT_NE(m_Session.CurrentContext(), pFirst);
    EXPECT_FALSE(m_Session.IsLivePaused());
    m_Session.Close();
    EXPECT_EQ(m_Session.Faults(), std::vector<std::string>());
}

TEST_F(StudioSession, WhatIsSelectedIsAChannelOfTheContextShown)
{
    std::string name, error;
    ASSERT_TRUE(m_Session.OpenFile(WriteWalk("walk.c3d", 24), name, error).IsSuccess());
    ASSERT_TRUE(m_Session.ShowContext(name));
    std::shared_ptr<ChannelSystem::IChannelService> pService;
    m_Session.Host().GetChannelService(pService);
    const auto channels = Studio::ListThings(*m_Session.CurrentContext(), nullptr);
    ASSERT_EQ(channels.size(), 69u);
    for (const auto& rChannel : channels)
    {
        m_Session.Host().Selection()->Set({rChannel.Item});
        std::vector<TQL::IChannelInstanceId> ids;
        pService->GetSelectionManager()->GetSelectedChannelIds(name, rChannel.TypeName, ids);
        ASSERT_EQ(ids.size(), 1u) << rChannel.Name;
        EXPECT_TRUE(pService->GetChannel(ids.front())) << rChannel.Name;
    }
}

TEST_F(StudioSession, EveryThingOfALiveCaptureIsSelectedAndFoundAgain)
{
    m_Session.StartLive(2, 12);
    ASSERT_TRUE(m_Session.ShowContext(Studio::LiveContextName));
    std::shared_ptr<ChannelSystem::IChannelService> pService;
    m_Session.Host().GetChannelService(pService);
    const auto pManager = pService->GetSelectionManager();
    std::map<TQL::ESelectionKind, int> counts;
    for (const auto& rThing :
         Studio::ListThings(*m_Session.CurrentContext(), m_Session.Channels().GetGlobalChannels().get()))
    {
        ++counts[rThing.Item.Kind];
        const bool bSubject = rThing.Item.Kind == TQL::ESelectionKind::Subject;
        m_Session.Host().Selection()->Set({rThing.Item});
        std::vector<TQL::IChannelInstanceId> ids;
        pManager->GetSelectedChannelIds(Studio::LiveContextName, bSubject ? "SubjectSegmentPose" : rThing.TypeName,
                                        ids);
        ASSERT_EQ(ids.size(), 1u) << rThing.Name;
        const auto pChannel = pService->GetChannel(ids.front());
        ASSERT_TRUE(pChannel) << rThing.Name;
        m_Session.Host().Selection()->Set({});
        pManager->SelectThingsOf(pChannel, false);
        const auto items = Studio::AllItems(*m_Session.Host().Selection()->GetSelection());
        const TQL::SelectionItem root{TQL::ESelectionKind::Segment, rThing.Item.First, 0, {}};
        EXPECT_EQ(items, std::vector<TQL::SelectionItem>{bSubject ? root : rThing.Item}) << rThing.Name;
    }
    using enum TQL::ESelectionKind;
    EXPECT_EQ(counts,
              (std::map<TQL::ESelectionKind, int>{
                  {Label, 106}, {Segment, 40}, {Subject, 2}, {AnalogueDeviceOutput, 16}, {Camera, 8}, {Monitor, 2}}));
    m_Session.Close();
    EXPECT_EQ(m_Session.Faults(), std::vector<std::string>());
}

TEST_F(StudioSession, AModuleThatIsMissingOrNoneIsToldInOneLine)
{
    const struct
    {
        std::filesystem::path Path;
        const char* pPart;
    } rows[] = {{m_Folder / "graphplots.so", "module not found: "}, {WriteText("text.so", "no module"), "text.so"}};
    for (const auto& rRow : rows)
    {
        std::string error;
        EXPECT_TRUE(m_Session.LoadModule(rRow.Path, error).IsError());
        EXPECT_NE(error.find(rRow.pPart), std::string::npos) << error;
        EXPECT_EQ(error.find('\n'), std::string::npos) << error;
    }
    QWidget frame;
    QPointer<QWidget> pContent;
    std::string error;
    EXPECT_TRUE(m_Session.OpenContent(&frame, pContent, error).IsError());
    EXPECT_EQ(error, "the module offers no window of the kind \"Graph Plots\"; load another with --module PATH");
}

TEST_F(StudioSession, TheWindowFollowsContextTimeAndSelection)
{
    std::string name, error;
    ASSERT_TRUE(m_Session.OpenFile(WriteWalk("walk.c3d", 240), name, error).IsSuccess());
    ASSERT_TRUE(m_Session.ShowContext(name));
    Studio::VMainWindow window(m_Session);
    const auto settle = []
    {
        for (int i = 0; i < 10; ++i)
            QCoreApplication::processEvents();
    };
    settle();
    auto* pContexts = window.findChild<QComboBox*>(QStringLiteral("contexts"));
    auto* pSlider = window.findChild<QSlider*>(QStringLiteral("position"));
    auto* pFrame = window.findChild<QSpinBox*>(QStringLiteral("frame"));
    EXPECT_EQ(pContexts->currentText().toStdString(), "walk");
    EXPECT_EQ(pSlider->maximum() - pSlider->minimum(), 239);
    EXPECT_TRUE(pSlider->isEnabled());

    const auto selected = [this]
    {
        return m_Session.Host().Selection()->GetSelection()->Items(TQL::ESelectionKind::Label);
    };
    ASSERT_EQ(selected().size(), 1u) << "a first channel is ticked";
    auto* pModel = window.findChild<QTreeView*>(QStringLiteral("channelTree"))->model();
    const QModelIndex markers = pModel->index(0, 0, pModel->index(0, 0));
    pModel->setData(pModel->index(3, 0, markers), Qt::Checked, Qt::CheckStateRole);
    EXPECT_EQ(selected().size(), 2u);
    m_Session.Host().Selection()->Set({selected().back()});
    settle();
    EXPECT_EQ(pModel->index(0, 0, markers).data(Qt::CheckStateRole).toInt(), Qt::Unchecked);
    EXPECT_EQ(pModel->index(3, 0, markers).data(Qt::CheckStateRole).toInt(), Qt::Checked);

    pFrame->setValue(pFrame->minimum() + 120);
    const auto pSource = m_Session.Host().TimeController()->FindSource(name);
    EXPECT_EQ(pSource->CurrentTick() - pSource->Range().First, 120 * TQL::DefaultFramePeriod);

    window.OpenFile(m_Folder / "missing.c3d");
    EXPECT_TRUE(QTest::qWaitFor([&] { return window.findChild<QLabel*>(QStringLiteral("noticeText")) != nullptr; }));
    EXPECT_TRUE(
        window.findChild<QLabel*>(QStringLiteral("noticeText"))->text().contains(QStringLiteral("missing.c3d")));
    EXPECT_FALSE(m_Log.Take().empty()) << "and it stands in the log";
    EXPECT_EQ(m_Session.CurrentContextName(), "walk");
}

TEST_F(StudioSession, ManyChannelsArePlottedOnlyWhenTheOperatorAgrees)
{
    constexpr std::size_t many = Studio::VChannelPanel::MostUnasked + 1;
    Recordings::VRecording recording;
    recording.Name = "wide";
    recording.Range = {0, TQL::DefaultFramePeriod};
    for (std::size_t i = 0; i < many; ++i)
    {
        Recordings::RecordedChannel& rChannel = recording.Channels.emplace_back();
        rChannel.Name = "c" + std::to_string(i);
        rChannel.ComponentNames = {""};
        rChannel.Samples = {1.0f};
    }
    m_Session.ShowContext(m_Session.AddRecording(recording));
    Studio::VMainActions actions;
    const Studio::VChannelPanel panel(m_Session, actions);
    const auto tickAll = [&](const char* i_pButton)
    {
        bool bAsked = false;
        QTimer::singleShot(0, qApp,
                           [&]
                           {
                               auto* pBox = qobject_cast<QMessageBox*>(QApplication::activeModalWidget());
                               bAsked = pBox != nullptr;
                               for (auto* pButton : bAsked ? pBox->buttons() : QList<QAbstractButton*>())
                                   if (pButton->text().remove('&') == QString::fromLatin1(i_pButton))
                                       pButton->click();
                           });
        actions.Get(Studio::EAction::TickShown)->trigger();
        QCoreApplication::processEvents();
        return bAsked;
    };
    const auto selected = [this]
    {
        return m_Session.Host().Selection()->Items().size();
    };
    EXPECT_TRUE(tickAll("Cancel"));
    EXPECT_EQ(selected(), 1u) << "as before";
    EXPECT_EQ(panel.findChild<QLabel*>(QStringLiteral("tickedCount"))->text(), "1 of 1001 ticked");
    EXPECT_TRUE(tickAll("Plot all"));
    EXPECT_EQ(selected(), many);
    m_Session.Host().Selection()->Set({m_Session.Host().Selection()->Items().front()});
    ASSERT_TRUE(QTest::qWaitFor(
        [&] { return panel.findChild<QLabel*>(QStringLiteral("tickedCount"))->text() == "1 of 1001 ticked"; }));
    EXPECT_FALSE(tickAll("Plot all")) << "agreed already";
}

TEST(PlotContent, APictureIsWrittenWholeOrNotAtAll)
{
    const QTemporaryDir temporary;
    const std::filesystem::path folder = temporary.path().toStdString();
    QImage picture(64, 48, QImage::Format_RGB32);
    picture.fill(Qt::darkGreen);
    const auto path = folder / "p.png";
    std::string error;
    ASSERT_TRUE(Studio::SavePicture(picture, path, error).IsSuccess()) << error;
    const auto saved = [&]
    {
        return QImage(QString::fromStdString(path.string())).size();
    };
    EXPECT_EQ(saved(), picture.size());

    const struct
    {
        QImage Picture;
        std::filesystem::path Path;
        const char* pPart;
    } rows[] = {{picture, folder / "no" / "such" / "p.png", "folder that exists"},
                {picture, folder, "this is a folder"},
                {picture, "/dev/full", "space"},
                {QImage(), path, "the window gave no picture"}};
    for (const auto& rRow : rows)
    {
        error.clear();
        EXPECT_TRUE(Studio::SavePicture(rRow.Picture, rRow.Path, error).IsError()) << rRow.Path;
        EXPECT_NE(error.find(rRow.pPart), std::string::npos) << error;
    }
    EXPECT_EQ(saved(), picture.size()) << "the old one is still there";
}

} // namespace

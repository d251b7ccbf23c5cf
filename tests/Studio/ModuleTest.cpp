#include "Services/Selection/VSelectionSource.h"
#include "Services/Time/VTimeController.h"
#include "Services/Time/VTimeSource.h"
#include "Simulation/RecordWalk.h"
#include "Simulation/VWalkSimulator.h"
#include "Studio/Common/Paths.h"
#include "Studio/Common/VMainActions.h"
#include "Studio/Plots/PlotContent.h"
#include "Studio/Plots/VPlotFrame.h"
#include "Studio/Session/ContextNames.h"
#include "Studio/Session/VStudioSession.h"
#include "Studio/Window/VMainWindow.h"
#include "support/LogGuard.h"

#include <gtest/gtest.h>

#include <QtCore/QAbstractItemModel>
#include <QtCore/QCoreApplication>
#include <QtCore/QElapsedTimer>
#include <QtCore/QTemporaryDir>
#include <QtGui/QAction>
#include <QtQml/QQmlContext>
#include <QtQml/QQmlEngine>
#include <QtQuick/QQuickItem>
#include <QtQuickWidgets/QQuickWidget>
#include <QtWidgets/QMdiArea>
#include <QtWidgets/QMdiSubWindow>

#include <algorithm>
#include <filesystem>
#include <functional>
#include <memory>
#include <string>

namespace
{

/// Runs the event loop until the condition holds, for at most 20 s.
bool WaitFor(const std::function<bool()>& i_rCondition)
{
    QElapsedTimer clock;
    clock.start();
    while (!i_rCondition() && !clock.hasExpired(20'000))
    {
        QCoreApplication::processEvents(QEventLoop::AllEvents | QEventLoop::WaitForMoreEvents, 20);
        QCoreApplication::sendPostedEvents(nullptr, QEvent::DeferredDelete); // as the loop of a program does
    }
    return i_rCondition();
}

/// The studio with the real module, in the strict host.
class StudioModule : public ::testing::Test
{
protected:
    void SetUp() override
    {
        const auto path = Studio::DefaultModulePath(std::filesystem::path(STUDIO_PROGRAM).parent_path());
        if (!std::filesystem::exists(path))
            GTEST_SKIP() << "the module is not built";
        m_pSession = std::make_unique<Studio::VStudioSession>(
            Studio::VStudioSession::Options{true, m_Folder.path().toStdString()});
        std::string error;
        ASSERT_TRUE(m_pSession->LoadModule(path, error).IsSuccess()) << error;
    }

    void TearDown() override
    {
        if (!m_pSession)
            return;
        m_pSession->Close();
        EXPECT_EQ(m_pSession->Faults(), std::vector<std::string>());
    }

    std::string AddWalk(std::int64_t i_Frames)
    {
        const Simulation::VWalkSimulator simulator({1, 1});
        return m_pSession->AddRecording(Simulation::RecordWalk(simulator, 0, i_Frames));
    }

    QTemporaryDir m_Folder;
    TestSupport::LogGuard m_Log;
    std::unique_ptr<Studio::VStudioSession> m_pSession;
};

bool AllPlotsHaveData(const QWidget& i_rWindow, int i_Plots)
{
    const auto frames = i_rWindow.findChildren<Studio::VPlotFrame*>();
    return frames.size() == i_Plots && std::all_of(frames.begin(), frames.end(),
                                                   [](const Studio::VPlotFrame* i_pFrame)
                                                   {
                                                       QQuickWidget* pWidget =
                                                           Studio::FindQuickWidget(*i_pFrame->Content());
                                                       return pWidget && Studio::HasTraceData(*pWidget);
                                                   });
}

TEST_F(StudioModule, AnOperatorsWalkThroughTheStudioLeavesNothingBehind)
{
    const std::string walk = AddWalk(480);
    m_pSession->StartLive(1);
    m_pSession->ShowContext(Studio::LiveContextName);
    {
        Studio::VMainWindow window(*m_pSession);
        window.show();
        std::string error;
        ASSERT_TRUE(window.OpenPlot(error)) << error;
        ASSERT_TRUE(window.OpenPlot(error)) << error;
        EXPECT_TRUE(WaitFor([&] { return AllPlotsHaveData(window, 2); })) << "live";

        m_pSession->ShowContext(walk);
        EXPECT_TRUE(WaitFor([&] { return AllPlotsHaveData(window, 2); })) << "in review";
        const auto pController = m_pSession->Host().TimeController();
        window.Actions().Get(Studio::EAction::Play)->trigger();
        const auto pSource = pController->FindSource(walk);
        EXPECT_TRUE(WaitFor([&] { return pSource->CurrentTick() > pSource->Range().First; })) << "it plays";

        // One window closes in the middle of playing, the other plays on.
        window.findChild<QMdiArea*>()->subWindowList().front()->close();
        EXPECT_TRUE(WaitFor([&] { return AllPlotsHaveData(window, 1); }));
        const std::int64_t tick = pSource->CurrentTick();
        EXPECT_TRUE(WaitFor([&] { return pSource->CurrentTick() > tick || !pController->IsPlaying(); }));

        m_pSession->ShowContext(Studio::LiveContextName);
        EXPECT_TRUE(WaitFor([&] { return AllPlotsHaveData(window, 1); })) << "back to live";
    }
}

TEST_F(StudioModule, ContentsMayBeOpenWhenTheSessionCloses)
{
    m_pSession->ShowContext(AddWalk(120));
    Studio::VPlotFrame frame;
    std::string error;
    ASSERT_TRUE(frame.Open(*m_pSession, error).IsSuccess()) << error;
    frame.show();
    m_pSession->Close();
    EXPECT_EQ(frame.Content(), nullptr);
}

TEST_F(StudioModule, TheRangesOfAContentCanBeSetFromOutside)
{
    m_pSession->ShowContext(AddWalk(480));
    Studio::VPlotFrame frame;
    std::string error;
    ASSERT_TRUE(frame.Open(*m_pSession, error).IsSuccess()) << error;
    QQuickWidget* pWidget = Studio::FindQuickWidget(*frame.Content());
    ASSERT_TRUE(pWidget);
    EXPECT_TRUE(Studio::SetTimeRange(*pWidget, QPointF(10.0, 90.0)).IsSuccess());
    EXPECT_EQ(Studio::FindTraceManager(*pWidget)->property("timeRange").toPointF(), QPointF(10.0, 90.0));
    EXPECT_TRUE(Studio::SetValueRange(*pWidget, QPointF(-5.0, 5.0)).IsSuccess());
}

/// The channels that are plotted; ~ without data.
std::string Rows(const QAbstractItemModel& i_rModel)
{
    std::string text;
    for (int row = 0; row < i_rModel.rowCount(); ++row)
    {
        const QModelIndex index = i_rModel.index(row, 0);
        const bool bMissing = index.data(i_rModel.roleNames().key("activeChannelMissingData", -1)).toBool();
        text += (text.empty() ? "" : ", ") + index.data().toString().toStdString() + (bMissing ? "~" : "");
    }
    return text;
}

TEST_F(StudioModule, AMonitorIsPlottedInEveryContextAndByTheNextCapture)
{
    m_pSession->StartLive(1);
    m_pSession->ShowContext(Studio::LiveContextName);
    m_pSession->Host().Selection()->Set({{TQL::ESelectionKind::Monitor, 2, 0, ""}});
    Studio::VPlotFrame frame;
    std::string error;
    ASSERT_TRUE(frame.Open(*m_pSession, error).IsSuccess()) << error;
    frame.resize(900, 600);
    frame.show();
    QQuickWidget* pWidget = Studio::FindQuickWidget(*frame.Content());
    ASSERT_TRUE(pWidget);
    auto* pModel = qmlContext(pWidget->rootObject())
                       ->contextProperty(QStringLiteral("contextActiveChannelModel"))
                       .value<QAbstractItemModel*>();
    ASSERT_TRUE(pModel);
    int resets = 0;
    QObject::connect(pModel, &QAbstractItemModel::modelReset, pModel, [&resets] { ++resets; });
    const auto rowsAfter = [&](const std::function<void()>& i_rChange)
    {
        const int before = resets;
        i_rChange();
        EXPECT_TRUE(WaitFor([&] { return resets > before; })) << "the plot goes to another context";
        WaitFor([&] { return Rows(*pModel) == "Monitor - Channels with data"; });
        return Rows(*pModel);
    };
    const std::string expected = "Monitor - Channels with data";
    EXPECT_EQ(rowsAfter([] {}), expected);
    EXPECT_TRUE(WaitFor([&] { return Studio::HasTraceData(*pWidget); }));
    EXPECT_EQ(rowsAfter([&] { m_pSession->StartLive(1); }), expected) << "of the next capture";
    EXPECT_TRUE(WaitFor([&] { return Studio::HasTraceData(*pWidget); }));
    EXPECT_EQ(rowsAfter([&] { m_pSession->ShowContext(AddWalk(120)); }), expected) << "in a recording";
    m_pSession->StopLive();
    EXPECT_EQ(rowsAfter([&] { m_pSession->ShowContext(Studio::LiveContextName); }), expected) << "it has ended";
}

} // namespace

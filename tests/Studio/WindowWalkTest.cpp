#include "Channels/VChannelService.h"
#include "Recordings/C3d/C3dWriter.h"
#include "Services/Selection/VSelectionSource.h"
#include "Services/Time/VTimeController.h"
#include "Services/Time/VTimeSource.h"
#include "Simulation/RecordWalk.h"
#include "Simulation/VWalkSimulator.h"
#include "Studio/Common/Paths.h"
#include "Studio/Common/VMainActions.h"
#include "Studio/Plots/PlotContent.h"
#include "Studio/Plots/VPlotFrame.h"
#include "Studio/Session/VStudioSession.h"
#include "Studio/Transport/EventRows.h"
#include "Studio/Window/VMainWindow.h"
#include "support/LogGuard.h"

#include <gtest/gtest.h>

#include <QtCore/QFile>
#include <QtCore/QMimeData>
#include <QtCore/QTemporaryDir>
#include <QtCore/QUrl>
#include <QtGui/QAction>
#include <QtGui/QDragEnterEvent>
#include <QtGui/QDropEvent>
#include <QtGui/QHelpEvent>
#include <QtGui/QImage>
#include <QtQuickWidgets/QQuickWidget>
#include <QtTest/QTest>
#include <QtWidgets/QApplication>
#include <QtWidgets/QComboBox>
#include <QtWidgets/QLabel>
#include <QtWidgets/QLineEdit>
#include <QtWidgets/QMdiArea>
#include <QtWidgets/QMdiSubWindow>
#include <QtWidgets/QMessageBox>
#include <QtWidgets/QPushButton>
#include <QtWidgets/QSlider>
#include <QtWidgets/QSpinBox>
#include <QtWidgets/QStyle>
#include <QtWidgets/QStyleOptionViewItem>
#include <QtWidgets/QToolTip>
#include <QtWidgets/QTreeView>

#include <filesystem>
#include <fstream>
#include <memory>
#include <string>
#include <utility>
#include <vector>

namespace
{

constexpr std::int64_t P = TQL::DefaultFramePeriod;
constexpr std::int64_t frames = 1200;
constexpr int patience = 20'000; // ms

/// The studio as a person has it: session, window, keys and mouse.
class StudioWindow : public ::testing::Test
{
protected:
    StudioWindow() : m_Folder(m_Temporary.path().toStdString()) {}

    void SetUp() override
    {
        if (!std::filesystem::exists(Module()))
            GTEST_SKIP() << "the module is not built";
    }

    void TearDown() override { Quit(); }

    void Start()
    {
        m_pSession = std::make_unique<Studio::VStudioSession>(
            Studio::VStudioSession::Options{true, (m_Folder / "settings").string()});
        std::string error;
        ASSERT_TRUE(m_pSession->LoadModule(Module(), error).IsSuccess()) << error;
        m_pWindow = std::make_unique<Studio::VMainWindow>(*m_pSession);
        ASSERT_TRUE(m_pWindow->Restore(error)) << error;
        m_pWindow->show();
        m_pWindow->activateWindow();
        ASSERT_TRUE(QTest::qWaitForWindowActive(m_pWindow.get(), patience));
    }

    void Quit()
    {
        if (m_pWindow)
            m_pWindow->close();
        m_pWindow.reset();
        if (!m_pSession)
            return;
        m_pSession->Close();
        EXPECT_EQ(m_pSession->Faults(), std::vector<std::string>());
        m_pSession.reset();
    }

    static std::filesystem::path Module()
    {
        return Studio::DefaultModulePath(std::filesystem::path(STUDIO_PROGRAM).parent_path());
    }

    std::filesystem::path WriteWalk()
    {
        m_Walk = Simulation::RecordWalk(Simulation::VWalkSimulator({1, 1}), 0, frames);
        const auto path = m_Folder / "walk.c3d";
        std::string error;
        EXPECT_TRUE(Recordings::WriteC3d(m_Walk, path, error).IsSuccess()) << error;
        return path;
    }

    void Drop(const std::filesystem::path& i_rPath)
    {
        QMimeData data;
        data.setUrls({QUrl::fromLocalFile(QString::fromStdString(i_rPath.string()))});
        const QPoint middle = m_pWindow->rect().center();
        QDragEnterEvent enter(middle, Qt::CopyAction, &data, Qt::LeftButton, Qt::NoModifier);
        QApplication::sendEvent(m_pWindow.get(), &enter);
        ASSERT_TRUE(enter.isAccepted());
        QDropEvent drop(middle, Qt::CopyAction, &data, Qt::LeftButton, Qt::NoModifier);
        QApplication::sendEvent(m_pWindow.get(), &drop);
    }

    /// A key goes to where the focus is, as from a keyboard.
    void Press(int i_Key, Qt::KeyboardModifiers i_Modifiers = Qt::NoModifier)
    {
        QWidget* pFocus = QApplication::focusWidget();
        QTest::keyClick(pFocus ? pFocus : m_pWindow.get(), static_cast<Qt::Key>(i_Key), i_Modifiers);
    }

    void ClickTickBox(QTreeView& i_rTree, const QModelIndex& i_rIndex)
    {
        QStyleOptionViewItem option;
        option.initFrom(&i_rTree);
        option.rect = i_rTree.visualRect(i_rIndex);
        option.features = QStyleOptionViewItem::HasCheckIndicator;
        const QRect box = i_rTree.style()->subElementRect(QStyle::SE_ItemViewItemCheckIndicator, &option, &i_rTree);
        QTest::mouseClick(i_rTree.viewport(), Qt::LeftButton, Qt::NoModifier, box.center());
    }

    std::size_t Selected() const
    {
        return m_pSession->Host().Selection()->GetSelection()->Items(TQL::ESelectionKind::Label).size();
    }

    std::int64_t Frame() const
    {
        const auto pSource = m_pSession->Host().TimeController()->FindSource(m_pSession->CurrentContextName());
        return pSource ? pSource->CurrentTick() / P + 1 : -1; // the first is 1, as in the plots
    }

    template <typename T>
    T* Find(const char* i_pName) const
    {
        return m_pWindow->findChild<T*>(QString::fromLatin1(i_pName));
    }

    QList<QMdiSubWindow*> Plots() const { return Find<QMdiArea>("plots")->subWindowList(); }

    /// Whether something coloured is drawn left of the key: a trace.
    static bool ShowsTrace(QQuickWidget& i_rQuick)
    {
        const QImage picture = i_rQuick.grabFramebuffer();
        int coloured = 0;
        for (int x = 0; x < picture.width() * 6 / 10; ++x)
            for (int y = 0; y < picture.height(); ++y)
                coloured += picture.pixelColor(x, y).saturation() > 150 ? 1 : 0;
        return coloured > 50;
    }

    bool AllPlotsHaveData() const
    {
        const auto plots = m_pWindow->findChildren<Studio::VPlotFrame*>();
        return std::ranges::all_of(plots,
                                   [](const Studio::VPlotFrame* i_pFrame)
                                   {
                                       QQuickWidget* pQuick = Studio::FindQuickWidget(*i_pFrame->Content());
                                       return pQuick && Studio::HasTraceData(*pQuick) && ShowsTrace(*pQuick);
                                   });
    }

    TestSupport::LogGuard m_Log;
    QTemporaryDir m_Temporary;
    std::filesystem::path m_Folder;
    Recordings::VRecording m_Walk;
    std::unique_ptr<Studio::VStudioSession> m_pSession;
    std::unique_ptr<Studio::VMainWindow> m_pWindow;
};

TEST_F(StudioWindow, APersonsWalkByMouseAndKeyboard)
{
    const auto walk = WriteWalk();
    const std::vector<Studio::EventRow> events = Studio::ListEvents(m_Walk);
    ASSERT_GE(events.size(), 4u);
    Start();
    EXPECT_TRUE(Find<QWidget>("startPage")->isVisible());
    EXPECT_EQ(Plots().size(), 1);

    Drop(walk);
    ASSERT_TRUE(QTest::qWaitFor([&] { return m_pSession->CurrentContextName() == "walk"; }, patience));
    ASSERT_TRUE(QTest::qWaitFor([&] { return !Find<QWidget>("startPage")->isVisible(); }, patience));

    // Search, tick one by its box and two more by selecting them.
    auto* pSearch = Find<QLineEdit>("channelSearch");
    auto* pTree = Find<QTreeView>("channelTree");
    Press(Qt::Key_U, Qt::ControlModifier | Qt::ShiftModifier);
    EXPECT_EQ(Selected(), 0u);
    Press(Qt::Key_F, Qt::ControlModifier);
    ASSERT_TRUE(pSearch->hasFocus());
    const int width = Find<QWidget>("channels")->width();
    QTest::keyClicks(pSearch, "hd mark");
    QCoreApplication::processEvents();
    EXPECT_EQ(Find<QWidget>("channels")->width(), width) << "a search does not push the plot aside";
    const QModelIndex markers = pTree->model()->index(0, 0, pTree->model()->index(0, 0));
    ASSERT_EQ(pTree->model()->rowCount(markers), 4) << "LFHD, RFHD, LBHD, RBHD";
    ClickTickBox(*pTree, pTree->model()->index(3, 0, markers));
    EXPECT_EQ(Selected(), 1u);
    Press(Qt::Key_F, Qt::ControlModifier);
    Press(Qt::Key_Down);
    ASSERT_TRUE(pTree->hasFocus());
    Press(Qt::Key_Down, Qt::ShiftModifier);
    Press(Qt::Key_Space);
    EXPECT_EQ(Selected(), 3u);
    EXPECT_FALSE(m_pSession->Host().TimeController()->IsPlaying()) << "Space in the tree ticks";
    Press(Qt::Key_F, Qt::ControlModifier);
    Press(Qt::Key_Escape);
    EXPECT_EQ(pSearch->text(), "");
    Press(Qt::Key_Escape);
    EXPECT_FALSE(pSearch->hasFocus());
    EXPECT_TRUE(QTest::qWaitFor([&] { return AllPlotsHaveData(); }, patience));

    Press(Qt::Key_Space);
    EXPECT_TRUE(QTest::qWaitFor([&] { return Frame() > 1; }, patience)) << "it plays";
    Press(Qt::Key_Space);
    EXPECT_FALSE(m_pSession->Host().TimeController()->IsPlaying());
    Press(Qt::Key_Home);
    EXPECT_EQ(Frame(), 1);
    EXPECT_TRUE(QTest::qWaitFor([&] { return Find<QSpinBox>("frame")->value() == 1; }, patience));
    Press(Qt::Key_Right);
    Press(Qt::Key_Right, Qt::ShiftModifier);
    EXPECT_EQ(Frame(), 12);
    Press(Qt::Key_Left);
    EXPECT_EQ(Frame(), 11);
    Press(Qt::Key_Left, Qt::ShiftModifier);
    Press(Qt::Key_Right, Qt::ControlModifier);
    EXPECT_EQ(Frame(), events.front().Frame);
    Press(Qt::Key_End);
    EXPECT_EQ(Frame(), frames);
    Press(Qt::Key_Left, Qt::ControlModifier);
    EXPECT_EQ(Frame(), events.back().Frame);
    auto* pEvents = Find<QTreeView>("eventList");
    QTest::mouseClick(pEvents->viewport(), Qt::LeftButton, Qt::NoModifier,
                      pEvents->visualRect(pEvents->model()->index(1, 1)).center());
    EXPECT_EQ(Frame(), events[1].Frame);
    EXPECT_TRUE(QTest::qWaitFor([&] { return Find<QSpinBox>("frame")->value() == events[1].Frame; }, patience));

    // The marks of a loop stay in sight while play does not loop.
    const auto marks = [this]
    {
        auto* pSlider = Find<QSlider>("position");
        const QImage image = pSlider->grab().toImage();
        const QRgb plain = image.pixel(image.width() - 1, image.height() - 1);
        int marked = 0;
        for (int x = 0; x < image.width(); ++x)
            marked += image.pixel(x, image.height() - 1) != plain ? 1 : 0;
        return marked;
    };
    EXPECT_EQ(marks(), 0);
    QAction* pLoop = m_pWindow->Actions().Get(Studio::EAction::Loop);
    m_pWindow->Actions().Get(Studio::EAction::LoopStart)->trigger();
    EXPECT_TRUE(QTest::qWaitFor([&] { return pLoop->isChecked() && marks() > 0; }, patience));
    pLoop->trigger();
    ASSERT_FALSE(m_pSession->Host().TimeController()->IsLooping());
    QTest::qWait(1);
    EXPECT_GT(marks(), 0);
    m_pWindow->Actions().Get(Studio::EAction::ClearLoop)->trigger();

    // A second window; the first is closed while it plays, and playing goes on.
    Press(Qt::Key_T, Qt::ControlModifier);
    ASSERT_EQ(Plots().size(), 2);
    EXPECT_TRUE(QTest::qWaitFor([&] { return AllPlotsHaveData(); }, patience));
    Press(Qt::Key_Space, Qt::ControlModifier);
    Press(Qt::Key_PageUp, Qt::ControlModifier);
    Press(Qt::Key_W, Qt::ControlModifier);
    ASSERT_TRUE(QTest::qWaitFor([&] { return Plots().size() == 1; }, patience));
    EXPECT_EQ(Plots().front()->windowTitle(), "Graph Plots 2");
    const std::int64_t frame = Frame();
    EXPECT_TRUE(QTest::qWaitFor([&] { return Frame() > frame; }, patience));

    // Side by side, one made small, and so it is found again.
    Press(Qt::Key_N, Qt::ControlModifier);
    ASSERT_EQ(Plots().size(), 2);
    Press(Qt::Key_F9);
    Plots().back()->setGeometry(40, 50, 400, 300);
    const QRect place = Plots().back()->geometry();
    m_pWindow->resize(m_pWindow->size() - QSize(70, 40));
    const QSize size = m_pWindow->size();
    const QRect small = Plots().back()->geometry();
    EXPECT_NE(small, place) << "it keeps its share of the area";
    Quit();
    Start();
    EXPECT_EQ(m_pWindow->size(), size);
    ASSERT_EQ(Plots().size(), 2);
    EXPECT_EQ(Find<QMdiArea>("plots")->viewMode(), QMdiArea::SubWindowView);
    m_pWindow->OpenFile(walk);
    EXPECT_TRUE(QTest::qWaitFor([&] { return Plots().back()->geometry() == small; }, patience));
}

TEST_F(StudioWindow, AWindowThatWasLeftBrokenOpensAsForTheFirstTime)
{
    std::filesystem::create_directories(m_Folder / "settings");
    for (const char* pName : {"window-layout.json", "window-states.json", "recent-files.json"})
        std::ofstream(m_Folder / "settings" / pName) << "{ \"windowLayout\" : { \"geometry\" : \"AAAA\", \"plots\" ";
    Start();
    EXPECT_EQ(Plots().size(), 1);
    EXPECT_TRUE(Find<QWidget>("startPage")->isVisible());
    Quit();
    EXPECT_FALSE(m_Log.Take().empty()) << "it says so in the log";
    std::filesystem::remove(m_Folder / "settings" / "window-states.json");
    std::ofstream(m_Folder / "settings" / "window-layout.json")
        << R"({"windowLayout": {"geometry": "AdnQywADAAA=", "panels": "/////Q==", "plots": [[0, 0, 1, 1]]}})";
    Start();
    EXPECT_EQ(Plots().size(), 1);
    EXPECT_TRUE(m_pWindow->isVisible());
}

TEST_F(StudioWindow, WhatCannotBeReadAndWhatWasGuessedIsTold)
{
    Start();
    std::ofstream(m_Folder / "letter.c3d") << "Dear Sir or Madam";
    Drop(m_Folder / "letter.c3d");
    const auto notice = [this](const char* i_pPart)
    {
        return QTest::qWaitFor(
            [&]
            {
                for (const QLabel* pLabel : m_pWindow->findChildren<QLabel*>("noticeText"))
                    if (pLabel->isVisible() && pLabel->text().contains(QString::fromLatin1(i_pPart)))
                        return true;
                return false;
            },
            patience);
    };
    EXPECT_TRUE(notice("letter.c3d"));
    EXPECT_TRUE(Find<QWidget>("startPage")->isVisible()) << "nothing was opened";
    const auto refused = m_Log.Take();
    EXPECT_TRUE(std::ranges::any_of(refused, [](const auto& i_rEntry)
                                    { return i_rEntry.Text.find("letter.c3d") != std::string::npos; }));

    // A table without times has to be guessed at.
    std::ofstream(m_Folder / "table.csv") << "a,b\n1,2\n3,4\n5,6\n";
    Drop(m_Folder / "table.csv");
    EXPECT_TRUE(notice("table.csv was opened with"));
    EXPECT_EQ(m_pSession->CurrentContextName(), "table");
    EXPECT_EQ(m_pWindow->findChildren<QPushButton*>("noticeClose").size(), 1) << "of the file before nothing is told";
    EXPECT_FALSE(Find<QWidget>("logPanel")->isVisible());
    QTest::mouseClick(Find<QPushButton>("noticeButton"), Qt::LeftButton);
    EXPECT_TRUE(Find<QWidget>("logPanel")->isVisible());
    const QAbstractItemModel* pLog = Find<QTreeView>("log")->model();
    const auto last = [pLog]
    {
        return pLog->index(pLog->rowCount() - 1, 3).data().toString();
    };
    EXPECT_TRUE(QTest::qWaitFor([&] { return last().startsWith("table.csv:"); }, patience)) << last().toStdString();
}

TEST_F(StudioWindow, ARecordingIsNamedInTheTitleAndCanBeClosed)
{
    const auto walk = WriteWalk();
    std::filesystem::copy_file(walk, m_Folder / "a[*]b.c3d");
    Start();
    EXPECT_EQ(m_pWindow->windowTitle(), "Graph Plots Studio[*]");
    const auto shows = [this](const char* i_pTitle)
    {
        return QTest::qWaitFor([&] { return m_pWindow->windowTitle() == QString::fromUtf8(i_pTitle); }, patience);
    };
    QAction* pClose = m_pWindow->Actions().Get(Studio::EAction::CloseFile);
    m_pWindow->OpenFile(m_Folder / "a[*]b.c3d");
    ASSERT_TRUE(shows("a[*][*]b.c3d[*] – Graph Plots Studio"));
    m_pWindow->OpenFile(walk);
    ASSERT_TRUE(shows("walk.c3d[*] – Graph Plots Studio"));
    ASSERT_TRUE(QTest::qWaitFor([&] { return pClose->isEnabled() && AllPlotsHaveData(); }, patience));
    pClose->trigger();
    EXPECT_TRUE(shows("a[*][*]b.c3d[*] – Graph Plots Studio")) << "the one beside it";
    EXPECT_TRUE(QTest::qWaitFor([&] { return AllPlotsHaveData(); }, patience));
    EXPECT_EQ(m_pSession->Channels().GetContexts().size(), 1u);
    pClose->trigger();
    EXPECT_TRUE(shows("Graph Plots Studio[*]"));
    EXPECT_TRUE(QTest::qWaitFor([&] { return Find<QWidget>("startPage")->isVisible(); }, patience));
    EXPECT_FALSE(pClose->isEnabled());
    EXPECT_EQ(Find<QComboBox>("contexts")->currentText(), "");
    m_pSession->StartLive(1);
    m_pSession->ShowContext("Live");
    EXPECT_TRUE(shows("Live[*] – Graph Plots Studio"));
    EXPECT_FALSE(m_pSession->CloseRecording("Live"));
    m_pSession->StopLive();
}

TEST_F(StudioWindow, TheSliderKeepsItsSizeInANarrowWindow)
{
    Start();
    m_pWindow->resize(1, 1); // as narrow as it goes
    QTest::qWait(1);
    EXPECT_TRUE(Find<QSlider>("position")->isVisible());
    EXPECT_GT(Find<QSlider>("position")->width(), m_pWindow->width() * 3 / 4);
}

TEST_F(StudioWindow, ASearchThatFindsNothingInTheNextRecordingIsCleared)
{
    const auto walk = WriteWalk();
    std::ofstream(m_Folder / "table.csv") << "time,knee,hip\n0,1,2\n0.01,2,3\n";
    Start();
    const auto show = [&](const char* i_pFile, const std::string& i_rContext)
    {
        m_pWindow->OpenFile(m_Folder / i_pFile);
        return QTest::qWaitFor(
            [&]
            {
                const auto* pModel = Find<QTreeView>("channelTree")->model();
                return m_pSession->CurrentContextName() == i_rContext && pModel->rowCount() > 0;
            },
            patience);
    };
    ASSERT_TRUE(show("walk.c3d", "walk"));
    auto* pSearch = Find<QLineEdit>("channelSearch");
    pSearch->setText(QStringLiteral("lfhd"));
    EXPECT_TRUE(show("table.csv", "table"));
    EXPECT_TRUE(QTest::qWaitFor([&] { return pSearch->text().isEmpty(); }, patience));
    EXPECT_EQ(Find<QTreeView>("channelTree")->model()->index(0, 0).data().toString(), "Columns");
    pSearch->setText(QStringLiteral("kne"));
    EXPECT_TRUE(show("walk.c3d", "walk (2)"));
    EXPECT_EQ(pSearch->text(), "kne") << "this one finds something there, too";
}

/// Names come from files: none is ever taken for markup, wherever the window shows it.
TEST_F(StudioWindow, TextsOfFilesAreShownAsTheyAre)
{
    const QString name = QStringLiteral("<img src='/etc/x'>&<b>R&D</b>");
    std::ofstream(m_Folder / "R&D <b>.csv") << "time," << name.toStdString() << "\n0,1\n0.01,2\n0.02,3\n";
    Start();
    Drop(m_Folder / "R&D <b>.csv");
    auto* pTree = Find<QTreeView>("channelTree");
    const auto* pModel = pTree->model();
    ASSERT_TRUE(QTest::qWaitFor([&] { return pModel->rowCount(pModel->index(0, 0)) == 1; }, patience));
    const QPoint place = pTree->visualRect(pModel->index(0, 0, pModel->index(0, 0))).center();
    QHelpEvent hover(QEvent::ToolTip, place, pTree->viewport()->mapToGlobal(place));
    QApplication::sendEvent(pTree->viewport(), &hover);
    EXPECT_EQ(QToolTip::text(), name);
    const auto countShown = [&name]
    {
        int shown = 0;
        for (const QWidget* pWidget : QApplication::allWidgets())
            if (const auto* pLabel = qobject_cast<const QLabel*>(pWidget); pLabel && pLabel->isVisible())
            {
                EXPECT_EQ(pLabel->textFormat(), Qt::PlainText) << pLabel->text().toStdString();
                shown += pLabel->text() == name ? 1 : 0;
            }
        return shown;
    };
    EXPECT_EQ(countShown(), 1) << "the tool tip";
    QToolTip::hideText();
    QMessageBox box(QMessageBox::Information, name, name, QMessageBox::Ok, m_pWindow.get());
    box.setInformativeText(name);
    box.show();
    EXPECT_GE(countShown(), 2) << "both texts of the box";
    box.close();
    const QStringList buttons = [this]
    {
        QStringList texts;
        for (const auto* pButton : Find<QWidget>("startPage")->findChildren<QPushButton*>())
            texts.append(pButton->text());
        return texts;
    }();
    EXPECT_TRUE(buttons.contains(QStringLiteral("R&&D <b>.csv"))) << buttons.join(' ').toStdString();
}

TEST_F(StudioWindow, LiveCanBeReviewedAndFollowedAgain)
{
    Start();
    auto& rActions = m_pWindow->Actions();
    EXPECT_FALSE(rActions.Get(Studio::EAction::Live)->isEnabled());
    QTest::mouseClick(Find<QPushButton>("startLive"), Qt::LeftButton);
    ASSERT_TRUE(QTest::qWaitFor([&] { return Frame() > 60; }, patience));
    EXPECT_TRUE(rActions.Get(Studio::EAction::Live)->isChecked());
    Press(Qt::Key_F7);
    Press(Qt::Key_Home);
    const std::int64_t first = Frame();
    Press(Qt::Key_Right);
    EXPECT_EQ(Frame(), first + 1);
    EXPECT_TRUE(QTest::qWaitFor([&] { return AllPlotsHaveData(); }, patience)) << "of what was captured";
    Press(Qt::Key_F6);
    EXPECT_TRUE(QTest::qWaitFor([&] { return Frame() > first + 60; }, patience)) << "it follows again";
    m_pSession->StopLive();
}

TEST_F(StudioWindow, KeysThatBelongToAWidgetAreNotTaken)
{
    const auto walk = WriteWalk();
    Start();
    m_pWindow->OpenFile(walk);
    ASSERT_TRUE(QTest::qWaitFor([&] { return m_pSession->CurrentContextName() == "walk"; }, patience));
    const QAction* pStep = m_pWindow->Actions().Get(Studio::EAction::NextFrame);
    ASSERT_TRUE(QTest::qWaitFor([&] { return pStep->isEnabled(); }, patience));
    const auto pController = m_pSession->Host().TimeController();
    auto* pLoop = Find<QWidget>("loopButton");
    pLoop->setFocus();
    Press(Qt::Key_Space);
    EXPECT_TRUE(pController->IsLooping()) << "Space presses the button";
    EXPECT_FALSE(pController->IsPlaying());
    auto* pSearch = Find<QLineEdit>("channelSearch");
    pSearch->setFocus();
    QTest::keyClicks(pSearch, "l o i");
    EXPECT_EQ(pSearch->text(), "l o i");
    EXPECT_TRUE(pController->Marks().IsEmpty());
    EXPECT_FALSE(pController->IsPlaying());

    Press(Qt::Key_Escape);
    Press(Qt::Key_Escape);
    Press(Qt::Key_Right, Qt::ShiftModifier);
    EXPECT_EQ(Frame(), 11);
    Press(Qt::Key_I);
    Press(Qt::Key_Right, Qt::ShiftModifier);
    Press(Qt::Key_O);
    EXPECT_EQ(pController->Marks(), (TQL::TickRange{10 * P, 21 * P}));
    Press(Qt::Key_L);
    EXPECT_FALSE(pController->IsLooping());
}

} // namespace

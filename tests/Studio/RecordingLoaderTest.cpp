#include "Studio/Files/VLoadingBar.h"
#include "Studio/Files/VRecordingLoader.h"

#include <gtest/gtest.h>

#include <QtCore/QCoreApplication>
#include <QtCore/QTimer>
#include <QtTest/QTest>
#include <QtWidgets/QAbstractButton>
#include <QtWidgets/QLabel>
#include <QtWidgets/QProgressBar>

#include <algorithm>
#include <atomic>
#include <memory>
#include <new>
#include <string>
#include <thread>
#include <utility>

namespace
{

using Recordings::VReadProgress;
using Recordings::VRecording;
using Studio::VRecordingLoader;

/// A loader whose files are words: "bad" cannot be read, "throws" throws, "slow" goes on until it is told to stop, and
/// every other is read at once. What the loader says is kept as a text.
class RecordingLoader : public ::testing::Test
{
protected:
    RecordingLoader()
    {
        m_pLoader = std::make_unique<VRecordingLoader>(
            [this](const std::filesystem::path& i_rPath, VRecording& o_rRecording, std::string& o_rError,
                   const Recordings::ReadOptions& i_rOptions)
            {
                const TQL::IResult result =
                    Read(i_rPath.filename().string(), o_rRecording, o_rError, *i_rOptions.pProgress);
                if (i_rOptions.bResample)
                    o_rRecording.Name += " at an even rate";
                return result;
            },
            [this](VRecording i_Recording, const std::filesystem::path&, const std::string& i_rContextName)
            {
                m_Text += "take " + i_Recording.Name + " for '" + i_rContextName + "', ";
                return i_rContextName == "closed" ? std::string() : "context of " + i_Recording.Name;
            });
        const auto note = [this](const char* i_pWord, int i_Number, const QString& i_rText)
        {
            m_Text += i_pWord + std::to_string(i_Number) + " " + i_rText.toStdString() + ", ";
        };
        using L = VRecordingLoader;
        const auto* pLoader = m_pLoader.get();
        QObject::connect(pLoader, &L::Started,
                         [=](int i_Number, const QString& i_rName) { note("start ", i_Number, i_rName); });
        QObject::connect(pLoader, &L::Finished,
                         [=](int i_Number, const QString& i_rName) { note("finish ", i_Number, i_rName); });
        QObject::connect(pLoader, &L::Failed,
                         [=](int i_Number, const QString& i_rText) { note("fail ", i_Number, i_rText); });
        QObject::connect(pLoader, &L::Cancelled, [=](int i_Number) { note("cancel ", i_Number, {}); });
    }

    TQL::IResult Read(const std::string& i_rName, VRecording& o_rRecording, std::string& o_rError,
                      VReadProgress& io_rProgress)
    {
        ++m_Begun;
        if (i_rName == "throws")
            throw std::bad_alloc();
        if (i_rName == "slow")
        {
            // Half of the file is read, and the other half never comes.
            for (std::size_t i = 0; i < 128; ++i)
                (void)io_rProgress.Tell(i, 256);
            while (io_rProgress.Tell(128, 256))
                std::this_thread::yield();
            ++m_Stopped;
            return Recordings::StoppedReading(o_rError);
        }
        o_rError = "it is bad";
        o_rRecording.Name = i_rName;
        return i_rName == "bad" ? TQL::Result::InvalidFormat : TQL::Result::Ok;
    }

    bool WaitUntilIdle()
    {
        return QTest::qWaitFor([this] { return m_pLoader->IsIdle(); });
    }

    std::string m_Text;
    std::atomic<int> m_Begun{0};
    std::atomic<int> m_Stopped{0};
    std::unique_ptr<VRecordingLoader> m_pLoader;
};

TEST_F(RecordingLoader, FilesAreReadInTurnAndEachEndsOnce)
{
    EXPECT_EQ(m_pLoader->Open("/in/one"), 1);
    m_pLoader->Open("/in/bad");
    m_pLoader->Open("/in/throws");
    m_pLoader->Reload("/in/two", "old");
    m_pLoader->Reload("/in/three", "closed");
    ASSERT_TRUE(WaitUntilIdle());
    EXPECT_EQ(m_Text, "start 1 one, start 2 bad, start 3 throws, start 4 two, start 5 three, "
                      "take one for '', finish 1 context of one, fail 2 it is bad, "
                      "fail 3 throws: reading failed: std::bad_alloc., "
                      "take two for 'old', finish 4 context of two, "
                      "take three for 'closed', fail 5 three: the recording that it was to replace has been closed., ");
}

TEST_F(RecordingLoader, ResamplesWhatIsQueuedWhileThatIsWanted)
{
    m_pLoader->Open("/in/one");
    m_pLoader->SetResampling(true);
    m_pLoader->Open("/in/two");
    m_pLoader->SetResampling(false);
    m_pLoader->Open("/in/three");
    ASSERT_TRUE(WaitUntilIdle());
    EXPECT_EQ(m_Text, "start 1 one, start 2 two, start 3 three, take one for '', finish 1 context of one, "
                      "take two at an even rate for '', finish 2 context of two at an even rate, "
                      "take three for '', finish 3 context of three, ");
}

TEST_F(RecordingLoader, CancellingEndsAtOnceAndTheNextGoesOn)
{
    m_pLoader->Open("/in/slow");
    m_pLoader->Open("/in/waiting");
    m_pLoader->Open("/in/last");
    ASSERT_TRUE(QTest::qWaitFor([this] { return m_Begun == 1; }));
    m_pLoader->Cancel(2); // in the queue
    m_pLoader->Cancel(1); // being read
    m_pLoader->Cancel(1);
    m_pLoader->Cancel(99);
    ASSERT_TRUE(WaitUntilIdle());
    m_pLoader->Cancel(3);
    EXPECT_EQ(m_Text, "start 1 slow, start 2 waiting, start 3 last, cancel 2 , cancel 1 , "
                      "take last for '', finish 3 context of last, ");
    EXPECT_EQ(m_Stopped, 1);
    EXPECT_EQ(m_Begun, 2) << "what was cancelled in the queue is not read";

    m_Text.clear();
    m_pLoader->Open("/in/slow");
    m_pLoader->Open("/in/slow");
    m_pLoader->CancelAll();
    EXPECT_TRUE(m_pLoader->IsIdle());
    EXPECT_EQ(m_Text, "start 4 slow, start 5 slow, cancel 5 , cancel 4 , ");
}

TEST_F(RecordingLoader, WhatWasReadButNotTakenYetCanStillBeCancelled)
{
    m_pLoader->Open("/in/one");
    while (m_Begun == 0) // without events, so that nothing is taken
        std::this_thread::yield();
    m_pLoader->Cancel(1);
    m_pLoader->Open("/in/two");
    ASSERT_TRUE(WaitUntilIdle());
    EXPECT_EQ(m_Text, "start 1 one, cancel 1 , start 2 two, take two for '', finish 2 context of two, ");
}

TEST_F(RecordingLoader, DestroyedInTheMiddleItStopsAndHandsNothingOver)
{
    m_pLoader->Open("/in/slow");
    m_pLoader->Open("/in/one");
    ASSERT_TRUE(QTest::qWaitFor([this] { return m_Begun == 1; }));
    m_pLoader.reset();
    EXPECT_EQ(m_Stopped, 1) << "the thread has ended";
    EXPECT_EQ(m_Begun, 1);
    QCoreApplication::processEvents();
    EXPECT_EQ(m_Text, "start 1 slow, start 2 one, ");
}

TEST_F(RecordingLoader, ProgressNeverGoesBackAndIsNotQueuedUp)
{
    double last = 0.0;
    int notices = 0;
    QObject::connect(m_pLoader.get(), &VRecordingLoader::Progressed,
                     [&](int i_Number, double i_Fraction)
                     {
                         EXPECT_EQ(i_Number, 1);
                         EXPECT_GE(i_Fraction, last);
                         last = i_Fraction;
                         ++notices;
                     });
    m_pLoader->Open("/in/slow");
    ASSERT_TRUE(QTest::qWaitFor([&] { return last == 0.5; }));
    EXPECT_LE(notices, 129);
    m_pLoader->Cancel(1);
    QCoreApplication::processEvents();
    EXPECT_EQ(last, 0.5) << "nothing is told of what has ended";
}

/// Two thousand files are read before the first is handed over: still the window gets its turns between, and the bar
/// stays small.
TEST_F(RecordingLoader, ManyFilesLeaveTheWindowItsTurns)
{
    constexpr int many = 2000;
    Studio::VLoadingBar bar(*m_pLoader);
    for (int i = 0; i < many; ++i)
        m_pLoader->Open("/in/one");
    EXPECT_EQ(bar.findChildren<QProgressBar*>().size(), static_cast<qsizetype>(Studio::VLoadingBar::Most));
    EXPECT_EQ(bar.findChild<QLabel*>(QStringLiteral("loadingRest"))->text(), "and 1997 more");
    while (m_Begun < many) // without events, so that nothing is taken
        std::this_thread::yield();
    int finished = 0;
    int mostAtOnce = 0;
    int turns = 0;
    QObject::connect(m_pLoader.get(), &VRecordingLoader::Finished, [&] { ++finished; });
    QTimer window;
    QObject::connect(&window, &QTimer::timeout,
                     [&, before = 0]() mutable
                     {
                         ++turns;
                         mostAtOnce = std::max(mostAtOnce, finished - std::exchange(before, finished));
                     });
    window.start(0);
    ASSERT_TRUE(QTest::qWaitFor([this] { return m_pLoader->IsIdle(); }, 60'000));
    window.stop();
    EXPECT_EQ(finished, many);
    EXPECT_LE(mostAtOnce, 64) << turns << " turns";
    EXPECT_TRUE(bar.isHidden());
}

TEST_F(RecordingLoader, TheBarHasARowForEachFileAndItsButtonCancels)
{
    Studio::VLoadingBar bar(*m_pLoader);
    EXPECT_TRUE(bar.isHidden());
    m_pLoader->Open("/in/slow");
    m_pLoader->Open("/in/slow");
    EXPECT_FALSE(bar.isHidden());
    const auto buttons = bar.findChildren<QAbstractButton*>(QStringLiteral("cancelLoading"));
    ASSERT_EQ(buttons.size(), 2);
    auto* pProgress = bar.findChildren<QProgressBar*>().front();
    ASSERT_TRUE(QTest::qWaitFor([&] { return pProgress->value() == pProgress->maximum() / 2; }));
    buttons.front()->click();
    EXPECT_FALSE(bar.isHidden());
    buttons.back()->click();
    EXPECT_TRUE(bar.isHidden());
    EXPECT_EQ(m_Text, "start 1 slow, start 2 slow, cancel 1 , cancel 2 , ");
}

} // namespace

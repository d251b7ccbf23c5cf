#include "ChannelSystem/ISelectionSource.h"
#include "Channels/Blocks/VSourceChannel.h"
#include "Channels/Common/ChannelTypes.h"
#include "Channels/Contexts/VChannelContext.h"
#include "Channels/Contexts/VRecordedContext.h"
#include "Channels/VChannelService.h"
#include "Recordings/C3d/C3dWriter.h"
#include "Services/Time/VTimeController.h"
#include "Services/Time/VTimeSource.h"
#include "Simulation/RecordWalk.h"
#include "Simulation/VWalkSimulator.h"
#include "Studio/Files/FileSettling.h"
#include "Studio/Files/VChangedFilesBar.h"
#include "Studio/Files/VFileWatch.h"
#include "Studio/Files/VOpenFiles.h"
#include "Studio/Files/VRecentFiles.h"
#include "Studio/Session/VStudioSession.h"
#include "support/LogGuard.h"

#include <gtest/gtest.h>

#include <QtCore/QTemporaryDir>
#include <QtTest/QSignalSpy>
#include <QtTest/QTest>
#include <QtWidgets/QAbstractButton>

#include <algorithm>
#include <chrono>
#include <filesystem>
#include <fstream>
#include <string>
#include <vector>

namespace
{

using Studio::VFileSettling;
using Studio::VFileWatch;
using Studio::VRecentFiles;

void WriteText(const std::filesystem::path& i_rPath, const std::string& i_rText)
{
    std::ofstream(i_rPath, std::ios::binary) << i_rText;
}

TEST(FileSettling, AChangeCountsOnceWhenItStandsStill)
{
    using enum VFileSettling::ELook;
    const auto stamp = [](std::uintmax_t i_Size, int i_Time)
    {
        const auto time = std::filesystem::file_time_type(std::chrono::seconds(i_Time));
        return Studio::FileStamp{true, i_Size, time};
    };
    const Studio::FileStamp none;
    const struct
    {
        const char* pName;
        std::vector<Studio::FileStamp> Looks;
        std::vector<VFileSettling::ELook> Expected;
    } rows[] = {
        {"nothing happens", {stamp(5, 1), stamp(5, 1)}, {Still, Still}},
        {"grows", {stamp(6, 1), stamp(7, 2), stamp(7, 2), stamp(7, 2)}, {Moving, Moving, Changed, Still}},
        {"same size, another time", {stamp(5, 2), stamp(5, 2)}, {Moving, Changed}},
        {"goes and comes again", {none, none, none, stamp(9, 3), stamp(9, 3)}, {Moving, Still, Still, Moving, Changed}},
        {"back to what is known", {stamp(6, 2), stamp(5, 1), stamp(5, 1)}, {Moving, Moving, Still}},
        {"twice", {stamp(6, 2), stamp(6, 2), stamp(7, 3), stamp(7, 3)}, {Moving, Changed, Moving, Changed}}};
    for (const auto& rRow : rows)
    {
        VFileSettling settling(stamp(5, 1));
        for (std::size_t i = 0; i < rRow.Looks.size(); ++i)
            EXPECT_EQ(settling.Look(rRow.Looks[i]), rRow.Expected[i]) << rRow.pName << ", look " << i;
    }
}

TEST(FileWatch, HearsOfWritingReplacingAndComingBack)
{
    const QTemporaryDir temporary;
    const std::filesystem::path path = std::filesystem::path(temporary.path().toStdString()) / "wälk.csv";
    const auto other = path.parent_path() / "other.csv";
    WriteText(path, "a");
    VFileWatch watch(std::chrono::milliseconds(20));
    QSignalSpy changed(&watch, &VFileWatch::FileChanged);
    watch.Watch(path);
    int expected = 0;
    const auto expectOne = [&](const char* i_pWhat)
    {
        ++expected;
        ASSERT_TRUE(QTest::qWaitFor([&] { return changed.size() >= expected; })) << i_pWhat;
        EXPECT_EQ(changed.size(), expected) << i_pWhat;
        EXPECT_EQ(changed.back().front().toString().toStdString(), path.string());
    };
    WriteText(path, "longer");
    expectOne("written in place");
    WriteText(other, "another one, and longer");
    std::filesystem::rename(other, path);
    expectOne("replaced by renaming");
    WriteText(path, "written after it was replaced, too");
    expectOne("written again");
    std::filesystem::remove(path);
    WriteText(other, "a neighbour stirs the watch");
    WriteText(path, "back");
    expectOne("removed and made again");

    watch.Unwatch(path);
    watch.Watch(other);
    WriteText(path, "nobody looks at this one now");
    WriteText(other, "x");
    ASSERT_TRUE(QTest::qWaitFor([&] { return changed.size() > expected; }));
    EXPECT_EQ(changed.back().front().toString().toStdString(), other.string());
}

TEST(RecentFiles, AreKeptBetweenRunsNewestFirstAndTellWhatIsMissing)
{
    const QTemporaryDir temporary;
    const std::filesystem::path folder = temporary.path().toStdString();
    const auto list = folder / "new folder" / "recent-files.json";
    WriteText(folder / "a.c3d", "a");
    WriteText(folder / "b\nö.c3d", "b");
    const auto textOf = [](const VRecentFiles& i_rFiles)
    {
        std::string text;
        for (const auto& rEntry : i_rFiles.List())
            text += rEntry.Path.filename().string() + (rEntry.bMissing ? "! " : " ");
        return text;
    };
    VRecentFiles files(list);
    QSignalSpy changed(&files, &VRecentFiles::Changed);
    files.Add(folder / "a.c3d");
    files.Add(folder / "gone.c3d");
    files.Add(folder / "x" / ".." / "b\nö.c3d");
    files.Add(folder / "a.c3d");
    files.Add(folder / "a.c3d");
    EXPECT_EQ(changed.size(), 4);
    EXPECT_EQ(textOf(files), "a.c3d b\nö.c3d gone.c3d! ");
    {
        VRecentFiles others(list); // another studio
        EXPECT_EQ(textOf(others), textOf(files));
        others.Add(folder / "theirs.c3d");
    }
    files.Add(folder / "b\nö.c3d");
    EXPECT_EQ(textOf(files), "b\nö.c3d theirs.c3d! a.c3d gone.c3d! ");
    files.Remove(folder / "a.c3d");
    files.RemoveMissing();
    EXPECT_EQ(textOf(VRecentFiles(list)), "b\nö.c3d ");
    for (int i = 0; i < 30; ++i)
        files.Add(folder / std::to_string(i));
    EXPECT_EQ(files.List().size(), VRecentFiles::Most);
    EXPECT_EQ(files.List().front().Path.filename(), "29");

    for (const char* pText : {"", "[", "{\"a\": 1}", "[1, null, \"\", \"/x\", \"/x\"]"})
    {
        WriteText(list, pText);
        EXPECT_LE(VRecentFiles(list).List().size(), 1u) << pText;
    }
    TestSupport::LogGuard log; // one warning, not one for each change
    VRecentFiles nowhere("/proc/none/recent-files.json");
    nowhere.Add(folder / "a.c3d");
    nowhere.Add(folder / "b.c3d");
    EXPECT_EQ(textOf(nowhere), "b.c3d! a.c3d ");
    EXPECT_EQ(log.Take().size(), 1u);
}

class OpenFiles : public ::testing::Test
{
protected:
    OpenFiles()
        : m_Folder(m_Temporary.path().toStdString())
        , m_Session({true, (m_Folder / "settings").string()})
        , m_Files(m_Session)
    {
    }

    /// A walk whose first markers are left out.
    void WriteWalk(const std::filesystem::path& i_rPath, std::int64_t i_Frames, std::ptrdiff_t i_LeftOut)
    {
        const Simulation::VWalkSimulator simulator({1, 1});
        auto recording = Simulation::RecordWalk(simulator, 0, i_Frames);
        const auto isMarker = [](const auto& i_rChannel)
        {
            return i_rChannel.Kind == Recordings::EChannelKind::Marker;
        };
        const auto first = std::ranges::find_if(recording.Channels, isMarker);
        recording.Channels.erase(first, first + i_LeftOut);
        std::string error;
        const auto result = Recordings::WriteC3d(recording, i_rPath, error);
        EXPECT_TRUE(result.IsSuccess()) << error;
    }

    bool WaitUntilIdle()
    {
        return QTest::qWaitFor([this] { return m_Files.Loader().IsIdle(); });
    }

    TestSupport::LogGuard m_Log;
    QTemporaryDir m_Temporary;
    std::filesystem::path m_Folder;
    Studio::VStudioSession m_Session;
    Studio::VOpenFiles m_Files;
};

TEST_F(OpenFiles, AFileThatOthersChangeIsOfferedAndReadAgainInItsPlace)
{
    const auto path = m_Folder / "walk.c3d";
    WriteWalk(path, 240, 0);
    QSignalSpy offered(&m_Files, &Studio::VOpenFiles::ChangedOnDisk);
    QSignalSpy finished(&m_Files.Loader(), &Studio::VRecordingLoader::Finished);
    Studio::VChangedFilesBar bar(m_Files);
    m_Files.Open(path);
    m_Files.Open(m_Folder / "missing.c3d");
    ASSERT_TRUE(WaitUntilIdle());
    ASSERT_EQ(finished.size(), 1);
    ASSERT_TRUE(m_Session.ShowContext("walk"));
    EXPECT_EQ(m_Session.FileOf("walk"), path);
    EXPECT_EQ(m_Files.Recent().List().size(), 1u) << "only what could be read";
    const auto before = *m_Session.CurrentContext()->GetChannels();
    m_Session.Host().TimeController()->SeekTo(120 * TQL::DefaultFramePeriod);

    WriteWalk(m_Folder / "new.c3d", 120, 2);
    std::filesystem::rename(m_Folder / "new.c3d", path);
    ASSERT_TRUE(QTest::qWaitFor([&] { return offered.size() == 1; }));
    EXPECT_EQ(offered.front().at(0).toString(), QStringLiteral("walk"));
    auto* pButton = bar.findChild<QAbstractButton*>(QStringLiteral("readAgain"));
    ASSERT_TRUE(pButton);
    EXPECT_FALSE(bar.isHidden());
    pButton->click();
    EXPECT_TRUE(bar.isHidden());
    ASSERT_TRUE(WaitUntilIdle());

    EXPECT_EQ(m_Session.CurrentContextName(), "walk");
    EXPECT_EQ(m_Session.Channels().GetContexts().size(), 1u);
    const auto pContext = m_Session.CurrentContext();
    EXPECT_EQ(pContext->GetTickRange().Last, 120 * TQL::DefaultFramePeriod);
    EXPECT_EQ(m_Session.Host().TimeController()->FindSource("walk")->CurrentTick(), 119 * TQL::DefaultFramePeriod)
        << "the time stays as near as it can";
    EXPECT_FALSE(pContext->FindChannel(before[0]->GetInstanceId())) << "left out of the new file";
    const auto after = *pContext->GetChannels();
    ASSERT_EQ(after.size() + 2, before.size());
    for (std::size_t i = 0; i < after.size(); ++i)
        EXPECT_EQ(after[i]->GetInstanceId(), before[i + 2]->GetInstanceId()) << i;
    EXPECT_EQ(m_Session.Faults(), std::vector<std::string>());
}

TEST_F(OpenFiles, AContextThatIsGoneOrIsNoRecordingIsNotReplaced)
{
    Recordings::VRecording recording;
    EXPECT_FALSE(m_Session.ReplaceRecording("nobody", recording));
    m_Session.StartLive(1);
    EXPECT_FALSE(m_Session.ReplaceRecording("Live", recording));
    m_Files.Reload(QStringLiteral("Live"));
    EXPECT_TRUE(m_Files.Loader().IsIdle()) << "no file, nothing to read";
}

} // namespace

#include "UtilsFileSystem/FaultLayer.h"
#include "UtilsFileSystem/ProtectedText.h"
#include "UtilsFileSystem/TestFolder.h"
#include "UtilsFileSystem/VMemoryMappedInputFile.h"
#include "support/LogGuard.h"

#include <gtest/gtest.h>

#include <chrono>
#include <csignal>
#include <cstdlib>

#include <fcntl.h>
#include <sys/mount.h>
#include <sys/resource.h>
#include <sys/wait.h>
#include <unistd.h>

namespace TestUtilsFileSystem
{
namespace
{

using namespace UtilsFileSystem;

/// Memory where there is such a folder: thousands of saves, each brought to the disk, would take minutes.
std::filesystem::path FastFolder()
{
    const std::filesystem::path memory = "/dev/shm";
    return ::access(memory.c_str(), W_OK) == 0 ? memory : std::filesystem::temp_directory_path();
}

/// A way to begin: which of the three names exist, and what may be read afterwards.
struct Start
{
    bool bMain;
    bool bNew;
    bool bOld;

    std::string Files() const
    {
        // Beside an old file a new one is whole; alone its writer may have been cut off.
        return std::string(bMain ? "m=M " : "") + (bNew ? bOld ? "m.new=N " : "m.new=torn " : "") +
               (bOld ? "m.old=O" : "");
    }
    std::string Loaded() const { return bNew && bOld ? "N" : bMain ? "M" : bOld ? "O" : "no file"; }
};

constexpr const char* s_pSaved = "saved";

enum class EWork
{
    SaveOverwrite,
    SaveExclusive,
    Load
};

struct Case
{
    EWork Work;
    Start From;
    FaultLayer::Plan Plan;

    std::string Text() const
    {
        std::string text = "work " + std::to_string(static_cast<int>(Work)) + " from " + From.Files() + " stop at " +
                           std::to_string(Plan.StopAt) + " fail at " + std::to_string(Plan.FailAt) + " with " +
                           std::to_string(Plan.FailWith);
        for (const std::string& rRefused : Plan.Refused)
            text += " without " + rRefused;
        return text;
    }
};

/// Does the work in a child under the plan: 0 done, 1 an error, 2 more calls than planned for, or StoppedCode.
int RunCase(const Case& i_rCase, const TestFolder& i_rFolder)
{
    i_rFolder.Set(i_rCase.From.Files());
    return FaultLayer::InChild(
        [&]
        {
            TQL::IResult result;
            FaultLayer::With(i_rCase.Plan,
                             [&]
                             {
                                 if (i_rCase.Work == EWork::Load)
                                     (void)LoadText(i_rFolder / "m");
                                 else
                                     result =
                                         ProtectedSave(Writer(s_pSaved), i_rFolder / "m",
                                                       i_rCase.Work == EWork::SaveOverwrite ? EWriteMode::Overwrite
                                                                                            : EWriteMode::Exclusive);
                             });
            const int n = i_rCase.Plan.FailAt;
            return n != 0 && FaultLayer::GetCount() < n ? 2 : result.IsError() ? 1 : 0;
        });
}

void CheckWhole(const Case& i_rCase, int i_Answer, const TestFolder& i_rFolder)
{
    const std::string left = i_rFolder.Show();
    const std::string loaded = LoadText(i_rFolder / "m");
    const bool bSaved = loaded == s_pSaved && i_rCase.Work != EWork::Load;
    const bool bOldText = loaded == i_rCase.From.Loaded() || (i_rCase.From.bMain && loaded == "M") ||
                          // a name whose status cannot be had counts as missing, so the old text may come back
                          (i_rCase.From.bOld && i_rCase.Plan.FailAt != 0 && loaded == "O");
    const bool bDone = i_Answer == 0 && i_rCase.Work != EWork::Load;
    EXPECT_TRUE(bDone ? bSaved : bSaved || bOldText) << i_rCase.Text() << ": " << left << " was read as " << loaded;
    EXPECT_EQ(ProtectedSave(Writer("later"), i_rFolder / "m", EWriteMode::Overwrite), TQL::Result::Ok)
        << i_rCase.Text();
    EXPECT_EQ(i_rFolder.Show(), "m=later") << i_rCase.Text();
}

/// All kinds of work, all beginnings, all kinds of file system that there are.
void ForEachCase(const std::function<void(const Case&)>& i_rVisit)
{
    using Names = std::set<std::string>;
    for (const Names& rRefused : {Names{}, Names{"link"}, Names{"renameat2"}, Names{"link", "renameat2"}})
        for (const EWork work : {EWork::SaveOverwrite, EWork::SaveExclusive, EWork::Load})
            for (int bits = 0; bits < 8; ++bits)
                i_rVisit({work, {(bits & 1) != 0, (bits & 2) != 0, (bits & 4) != 0}, {rRefused, 0, 0, EIO, ""}});
}

TEST(ProtectedFaults, EveryCrashPointLeavesAWholeFile)
{
    TestSupport::LogGuard log;
    const TestFolder folder(FastFolder());
    int points = 0;
    ForEachCase(
        [&](Case i_Case)
        {
            int answer = FaultLayer::StoppedCode;
            for (i_Case.Plan.StopAt = 1; answer == FaultLayer::StoppedCode; ++i_Case.Plan.StopAt, ++points)
            {
                answer = RunCase(i_Case, folder);
                ASSERT_LE(i_Case.Plan.StopAt, 100);
                CheckWhole(i_Case, answer, folder);
            }
            const bool bRefused = i_Case.Work == EWork::SaveExclusive && i_Case.From.Loaded() != "no file";
            EXPECT_EQ(answer, bRefused ? 1 : 0) << i_Case.Text();
        });
    EXPECT_GT(points, 96 * 5) << "the layer does not see the calls";
    RecordProperty("points", points);
}

TEST(ProtectedFaults, EveryCallThatFailsLeavesAWholeFile)
{
    TestSupport::LogGuard log;
    const TestFolder folder(FastFolder());
    for (const int error : {EIO, EACCES, ENOSPC})
        ForEachCase(
            [&](Case i_Case)
            {
                i_Case.Plan.FailWith = error;
                int answer = 0;
                for (i_Case.Plan.FailAt = 1; answer != 2; ++i_Case.Plan.FailAt)
                {
                    answer = RunCase(i_Case, folder);
                    ASSERT_LE(i_Case.Plan.FailAt, 100);
                    if (answer != 2)
                        CheckWhole(i_Case, answer, folder);
                }
            });
}

TEST(ProtectedFaults, AWriterCutOffAnywhereIsIgnored)
{
    TestSupport::LogGuard log;
    const TestFolder folder(FastFolder());
    const std::string text = "{ \"Version\" : \"3.0\", \"Children\" : {\n}\n}";
    for (const char* pBefore : {"", "m=M", "m=M m.old=O", "m.old=O"})
    {
        for (std::size_t length = 0; length <= text.size(); ++length)
        {
            folder.Set(pBefore);
            const auto cutOff = [&](const std::string& i_rPath) -> TQL::IResult
            {
                const int file = ::open(i_rPath.c_str(), O_WRONLY | O_CREAT | O_TRUNC, 0666);
                const ssize_t written = ::write(file, text.data(), length);
                ::_exit(written == static_cast<ssize_t>(length) ? FaultLayer::StoppedCode : 1);
            };
            EXPECT_EQ(FaultLayer::InChild(
                          [&] { return ProtectedSave(cutOff, folder / "m", EWriteMode::Overwrite).IsError() ? 1 : 0; }),
                      FaultLayer::StoppedCode);
            const std::string before = pBefore;
            EXPECT_EQ(LoadText(folder / "m"), before.empty() ? "no file" : before[1] == '=' ? "M" : "O") << length;
        }
    }
}

TEST(ProtectedFaults, AKilledSaverLosesNothing)
{
    TestSupport::LogGuard log;
    const TestFolder folder;
    const char* pWanted = std::getenv("GRAPHPLOTS_TEST_KILLS"); // for a longer run
    const int kills = pWanted ? std::atoi(pWanted) : 200;
    std::mt19937 random(4711);
    const auto text = [](int i_Number)
    {
        return std::to_string(i_Number) + std::string(20000, static_cast<char>('a' + i_Number % 26));
    };
    int acknowledged = 0;
    const auto begin = std::chrono::steady_clock::now();
    ASSERT_EQ(ProtectedSave(Writer(text(0)), folder / "m", EWriteMode::Overwrite), TQL::Result::Ok);
    const std::chrono::duration<double, std::micro> oneSave = std::chrono::steady_clock::now() - begin;
    std::uniform_real_distribution<double> moment(0, 4 * oneSave.count() + 1000);
    for (int kill = 0; kill < kills; ++kill)
    {
        int ends[2];
        ASSERT_EQ(::pipe(ends), 0);
        const pid_t child = ::fork();
        if (child == 0)
        {
            for (int number = acknowledged + 1;; ++number)
                if (ProtectedSave(Writer(text(number)), folder / "m", EWriteMode::Overwrite).IsError() ||
                    ::write(ends[1], &number, sizeof(number)) != sizeof(number))
                    ::_exit(1);
        }
        ::close(ends[1]);
        ::usleep(static_cast<useconds_t>(moment(random))); // the moment is what is tried
        ::kill(child, SIGKILL);
        int status = 0;
        ::waitpid(child, &status, 0);
        EXPECT_TRUE(WIFSIGNALED(status)) << "a save failed";
        for (int number; ::read(ends[0], &number, sizeof(number)) == sizeof(number);)
            acknowledged = number;
        ::close(ends[0]);
        const std::string loaded = LoadText(folder / "m");
        if (loaded == text(acknowledged + 1)) // saved, and killed before it could say so
            ++acknowledged;
        ASSERT_TRUE(loaded == text(acknowledged)) << loaded.substr(0, 30) << " for " << acknowledged;
    }
    RecordProperty("saves", acknowledged);
    EXPECT_GT(acknowledged, 0) << "all were killed before they did anything";
}

TEST(ProtectedFaults, AFullDiskLeavesTheFileAndGivesAnError)
{
    TestSupport::LogGuard log;
    const TestFolder folder;
    folder.Set("m=M");
    const std::string large(300000, 'x');
    const auto trySave = [&] { // without room for it, and with a writer that does not look at what it is told
        const auto careless = [&](const std::string& i_rPath) -> TQL::IResult
        {
            auto [pFile, result] = OpenOutputFile(i_rPath, EOpenMode::Binary, true);
            (void)std::fwrite(large.data(), 1, large.size(), pFile->GetFile());
            return pFile->Close();
        };
        return ProtectedSave(Writer(large), folder / "m", EWriteMode::Overwrite) == TQL::Result::FileIOFailure &&
               ProtectedSave(careless, folder / "m", EWriteMode::Overwrite) == TQL::Result::FileIOFailure;
    };
    EXPECT_EQ(FaultLayer::InChild(
                  [&]
                  {
                      const rlimit limit{4096, 4096};
                      ::signal(SIGXFSZ, SIG_IGN);
                      return ::setrlimit(RLIMIT_FSIZE, &limit) == 0 && trySave() ? 0 : 1;
                  }),
              0);
    EXPECT_EQ(folder.Show(), "m=M");

    auto [pFull, result] = OpenOutputFile("/dev/full", EOpenMode::Binary, true);
    ASSERT_EQ(result, TQL::Result::Ok);
    EXPECT_EQ(pFull->Write(std::as_bytes(std::span("text", 4))), TQL::Result::Ok) << "it waits in the buffer";
    EXPECT_EQ(pFull->Close(), TQL::Result::FileIOFailure);

    if (::mount("none", (folder / "").c_str(), "tmpfs", 0, "size=64k") != 0)
        GTEST_SKIP() << "no small disk: " << std::error_code(errno, std::generic_category()).message();
    folder.Set("m=M");
    EXPECT_TRUE(trySave());
    EXPECT_EQ(folder.Show(), "m=M");
    ::umount((folder / "").c_str());
}

TEST(MappedInputFaults, FallsBackToPagesAndThenToAPlainStream)
{
    TestSupport::LogGuard log;
    const TestFolder folder;
    const std::uint64_t size = VMemoryMappedInputFile::DefaultPageSize + 10;
    folder.Put("a", "start");
    std::filesystem::resize_file(folder / "a", size); // a hole
    VMemoryMappedInputFile file;
    FaultLayer::With({{}, 0, 1, ENOMEM, "mmap"},
                     [&]
                     {
                         ASSERT_EQ(file.Open(folder / "a"), TQL::Result::Ok);
                         EXPECT_FALSE(file.GetWholeFile().second);
                         std::array<std::byte, 20> bytes;
                         EXPECT_EQ(file.Seek(size - 15), TQL::Result::Ok);
                         EXPECT_EQ(file.Read(bytes), std::pair(std::size_t(15), TQL::Result::Ok));
                         EXPECT_EQ(file.GetSwapCount(), 2u);
                     });
    file.Close();
    FaultLayer::With({{"mmap"}, 0, 0, 0, "mmap"}, [&] { // EPERM, every time
        EXPECT_EQ(file.Open(folder / "a"), TQL::Result::FileIOFailure);
        EXPECT_FALSE(file.IsOpen());
    });
    FaultLayer::With({{}, 0, 1, ENODEV, "mmap"},
                     [&]
                     {
                         EXPECT_EQ(file.Open(folder / "a"), TQL::Result::NotSupported);
                         EXPECT_EQ(FaultLayer::GetCount(), 1) << "a file system that cannot map is not asked twice";
                     });
    FaultLayer::With({{}, 0, 2, ENODEV, "mmap"},
                     [&]
                     {
                         ASSERT_EQ(file.Open(folder / "a", 1), TQL::Result::Ok);
                         std::byte byte{};
                         EXPECT_EQ(file.Seek(5000000), TQL::Result::Ok);
                         EXPECT_EQ(file.Read({&byte, 1}), std::pair(std::size_t(0), TQL::Result::NotSupported));
                     });
    EXPECT_TRUE(log.Take().empty());
    FaultLayer::With({{}, 0, 1, ENODEV, "mmap"},
                     [&]
                     {
                         auto [pStream, result] = OpenBestInputStream(folder / "a", 0, 0);
                         ASSERT_EQ(result, TQL::Result::Ok);
                         EXPECT_TRUE(dynamic_cast<VFileInputStreamVirtual*>(pStream.get()));
                     });
    const auto lines = log.Take();
    ASSERT_EQ(lines.size(), 1u);
    EXPECT_EQ(lines[0].Text, "Failed to open memory mapped input file stream " + (folder / "a") +
                                 " (NotSupported: The function is not supported), falling back to a standard input "
                                 "file stream.");
}

} // namespace
} // namespace TestUtilsFileSystem

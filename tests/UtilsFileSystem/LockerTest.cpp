#include "UtilsFileSystem/FaultLayer.h"
#include "UtilsFileSystem/FileIO.h"
#include "UtilsFileSystem/TestFolder.h"
#include "support/LogGuard.h"

#include <gtest/gtest.h>

#include <csignal>

#include <fcntl.h>
#include <sys/file.h>
#include <sys/mman.h>
#include <sys/stat.h>
#include <sys/wait.h>
#include <unistd.h>

namespace TestUtilsFileSystem
{
namespace
{

using namespace UtilsFileSystem;

/// A process that holds a file in some way until it is destroyed.
class Holder
{
public:
    explicit Holder(const std::function<void()>& i_rHold)
    {
        int ends[2];
        EXPECT_EQ(::pipe(ends), 0);
        m_Child = ::fork();
        if (m_Child == 0)
        {
            i_rHold();
            if (::write(ends[1], "", 1) != 1)
                ::_exit(1);
            for (;;)
                ::pause();
        }
        char ready = 0;
        ::close(ends[1]);
        EXPECT_EQ(::read(ends[0], &ready, 1), 1);
        ::close(ends[0]);
    }
    ~Holder()
    {
        ::kill(m_Child, SIGKILL);
        ::waitpid(m_Child, nullptr, 0);
    }
    Holder(const Holder&) = delete;
    Holder& operator=(const Holder&) = delete;

private:
    pid_t m_Child;
};

const std::string s_OwnImage = std::filesystem::read_symlink("/proc/self/exe").string();

TEST(Lockers, DescriptorsMappingsAndLocksCount)
{
    const TestFolder folder;
    folder.Set("a=1 b=2");
    const std::string path = folder / "a";
    const std::function<void()> holds[] = {
        [&] { (void)::open(path.c_str(), O_RDONLY); },
        [&]
        {
            const int file = ::open(path.c_str(), O_RDONLY);
            (void)::mmap(nullptr, 1, PROT_READ, MAP_PRIVATE, file, 0);
            ::close(file);
        },
        [&] { (void)::flock(::open(path.c_str(), O_RDONLY), LOCK_EX); },
    };
    for (const auto& rHold : holds)
    {
        const Holder holder(rHold);
        std::vector<std::string> names{"first"};
        EXPECT_TRUE(FindLockingProcesses(path, names));
        EXPECT_EQ(names, (std::vector<std::string>{"first", s_OwnImage}));
        names.clear();
        EXPECT_TRUE(FindLockingProcesses(folder / "b", names));
        EXPECT_TRUE(names.empty());
        EXPECT_FALSE(FindLockingProcesses(folder / "missing", names));
    }
}

TEST(Lockers, MoreThanTenAreNotTold)
{
    const TestFolder folder;
    folder.Set("a=1");
    std::vector<std::unique_ptr<Holder>> holders;
    for (int i = 0; i < 11; ++i)
    {
        holders.push_back(std::make_unique<Holder>([&] { (void)::open((folder / "a").c_str(), O_RDONLY); }));
        std::vector<std::string> names;
        EXPECT_EQ(FindLockingProcesses(folder / "a", names), i < 10);
        EXPECT_EQ(names.size(), i < 10 ? static_cast<std::size_t>(i + 1) : 0u);
    }
}

TEST(Lockers, WhoeverHoldsARefusedFileIsNamed)
{
    const TestFolder folder;
    folder.Set("a=1 b=2");
    const std::string path = folder / "a";
    const auto run = [&] { // in a child: it gives up what it may do
        TestSupport::LogGuard log;
        const int held = ::open(path.c_str(), O_RDONLY);
        ::chmod(path.c_str(), 0);
        ::chmod((folder / "b").c_str(), 0);
        ::chmod((folder / "").c_str(), 0555);
        if (::geteuid() == 0 && ::seteuid(65534) != 0)
            return 1;
        EXPECT_EQ(OpenInputFile(path, EOpenMode::Binary).second, TQL::Result::NotPermitted);
        EXPECT_EQ(OpenOutputFile(path, EOpenMode::Binary, true).second, TQL::Result::NotPermitted);
        EXPECT_EQ(OpenInputFileStream(path, EOpenMode::Binary).second, TQL::Result::NotPermitted);
        EXPECT_EQ(OpenOutputFileStream(path, EOpenMode::Binary, true).second, TQL::Result::NotPermitted);
        EXPECT_EQ(RemoveFile(path), TQL::Result::NotPermitted);
        EXPECT_EQ(OpenInputFile(folder / "b", EOpenMode::Binary).second, TQL::Result::NotPermitted);
        EXPECT_EQ(RemoveFile(folder / "b"), TQL::Result::NotPermitted);
        const std::string who = " locked by processes '" + s_OwnImage + "'.";
        std::vector<std::string> texts;
        for (const auto& rLine : log.Take())
            texts.push_back(rLine.Text);
        EXPECT_EQ(texts, (std::vector<std::string>{
                             "Failed to open input file " + path + who, "Failed to open output file " + path + who,
                             "Failed to open input file stream " + path + who,
                             "Failed to open output file stream " + path + who,
                             "Failed to remove file '" + path + "': file is" + who,
                             "Failed to remove file '" + (folder / "b") + "': Permission denied"}));
        ::close(held);
        return testing::Test::HasFailure() ? 1 : 0;
    };
    EXPECT_EQ(FaultLayer::InChild(run), 0);
    ::chmod((folder / "").c_str(), 0755);
}

/// Between two file systems a rename becomes a copy, which replaces the target in one step.
TEST(FileOperations, BetweenVolumes)
{
    struct stat here, there;
    const TestFolder folder;
    if (::stat((folder / "").c_str(), &here) != 0 || ::stat("/dev/shm", &there) != 0 || here.st_dev == there.st_dev)
        GTEST_SKIP() << "there is only one file system";
    const TestFolder other("/dev/shm");
    for (const bool bExists : {false, true})
    {
        folder.Set("a=1");
        other.Set(bExists ? "b=2" : "");
        EXPECT_EQ(MoveFile(folder / "a", other / "b"), bExists ? TQL::Result::AlreadyPresent : TQL::Result::Ok);
        EXPECT_EQ(folder.Show() + "|" + other.Show(), bExists ? "a=1|b=2" : "|b=1");
        folder.Set("a=1");
        ::chmod((folder / "a").c_str(), 0600);
        EXPECT_EQ(ReplaceFileByRename(folder / "a", other / "b", other / "c"), TQL::Result::Ok);
        EXPECT_EQ(folder.Show() + "|" + other.Show(), bExists ? "|b=1 c=2" : "|b=1 c=1");
        struct stat status
        {
        };
        EXPECT_EQ(::stat((other / "b").c_str(), &status), 0);
        EXPECT_EQ(status.st_mode & 0777u, 0600u);
    }
}

} // namespace
} // namespace TestUtilsFileSystem

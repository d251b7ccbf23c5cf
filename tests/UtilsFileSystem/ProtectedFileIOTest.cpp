#include "UtilsFileSystem/ProtectedFileIO.h"

#include "UtilsFileSystem/ProtectedText.h"
#include "UtilsFileSystem/TestFolder.h"
#include "support/LogGuard.h"

#include <gtest/gtest.h>

#include <optional>

namespace TestUtilsFileSystem
{
namespace
{

using namespace UtilsFileSystem;
using Severity = TQL::ELogSeverity;

/// The lines from information upwards, "severity text", with the folder cut out of them.
std::string Lines(TestSupport::LogGuard& io_rLog, const TestFolder& i_rFolder)
{
    std::string all;
    const std::string root = i_rFolder / "";
    for (const auto& rLine : io_rLog.Take())
    {
        std::string text = rLine.Text;
        for (std::size_t at; (at = text.find(root)) != std::string::npos;)
            text.erase(at, root.size());
        all += std::to_string(static_cast<int>(rLine.Severity)) + ' ' + text + '\n';
    }
    return all;
}

TEST(ProtectedLoad, EachRowOfTheTable)
{
    struct Row
    {
        const char* pBefore;
        const char* pAfter;
        const char* pText; ///< null: the reader finds nothing
        const char* pLog;
    };
    const char* const pIgnored = "3 Interrupted save detected for [m], ignoring potentially corrupt new data [m.new]\n";
    const char* const pCompleted =
        "3 Interrupted save detected for [m], attempting to complete save of new data [m.new]...\n";
    const Row rows[] = {
        {"", "", nullptr, ""},
        {"m=M", "m=M", "M", ""},
        {"m.old=O", "m=O", "O", "3 File [m] not found but backup [m.old] is present, restoring backup...\n"},
        {"m=M m.old=O", "m=M", "M", ""},
        {"m.new=N", "m.new=N", nullptr, pIgnored},
        {"m=M m.new=N", "m=M m.new=N", "M", pIgnored},
        {"m.new=N m.old=O", "m=N", "N", pCompleted},
        {"m=M m.new=N m.old=O", "m=N", "N", pCompleted},
    };
    const TestFolder folder;
    TestSupport::LogGuard log;
    for (const Row& rRow : rows)
    {
        folder.Set(rRow.pBefore);
        EXPECT_EQ(LoadText(folder / "m"), rRow.pText ? rRow.pText : "no file") << rRow.pBefore;
        EXPECT_EQ(folder.Show(), rRow.pAfter) << rRow.pBefore;
        EXPECT_EQ(Lines(log, folder), rRow.pLog) << rRow.pBefore;
    }
}

TEST(ProtectedSave, EachModeInEachState)
{
    struct Row
    {
        const char* pBefore;
        EWriteMode Mode;
        std::optional<std::string> Text; ///< none: the writer fails half way
        TQL::IResult Result;
        const char* pAfter;
    };
    const auto over = EWriteMode::Overwrite;
    const auto keep = EWriteMode::Exclusive;
    const Row rows[] = {
        {"", over, "S", TQL::Result::Ok, "m=S"},
        {"m=M", over, "S", TQL::Result::Ok, "m=S"},
        {"m=M", static_cast<EWriteMode>(7), "S", TQL::Result::Ok, "m=S"},
        {"m=M m.new=N", over, "S", TQL::Result::Ok, "m=S"},
        {"m=M m.old=O", over, "S", TQL::Result::Ok, "m=S"},
        {"m.old=O", over, "S", TQL::Result::Ok, "m=S"},
        {"m=M", over, {}, TQL::Result::Canceled, "m=M"},
        {"", over, {}, TQL::Result::Canceled, ""},
        {"m.old=O", over, {}, TQL::Result::Canceled, "m=O"},
        {"m.new=N m.old=O", over, {}, TQL::Result::Canceled, "m=N"},
        {"", keep, "S", TQL::Result::Ok, "m=S"},
        {"m.new=N", keep, "S", TQL::Result::Ok, "m=S"},
        {"m=M", keep, "S", TQL::Result::AlreadyPresent, "m=M"},
        {"m.old=O", keep, "S", TQL::Result::AlreadyPresent, "m=O"},
    };
    const TestFolder folder;
    const TestSupport::LogGuard log;
    for (const Row& rRow : rows)
    {
        folder.Set(rRow.pBefore);
        const auto writer = [&](const std::string& i_rPath) -> TQL::IResult
        {
            EXPECT_EQ(i_rPath, folder / "m.new");
            EXPECT_FALSE(folder.Show().find("m.old") != std::string::npos) << "beside it a torn new is trusted";
            const TQL::IResult written = Writer(rRow.Text.value_or("half"))(i_rPath);
            return rRow.Text ? written : TQL::Result::Canceled;
        };
        EXPECT_EQ(ProtectedSave(writer, folder / "m", rRow.Mode), rRow.Result) << rRow.pBefore;
        EXPECT_EQ(folder.Show(), rRow.pAfter) << rRow.pBefore;
    }
}

#ifndef _WIN32
TEST(ProtectedSave, ReplacesTheFileBehindALink)
{
    const TestFolder folder;
    const TestSupport::LogGuard log;
    folder.Set("m=M");
    std::filesystem::create_symlink("m", folder / "first");
    std::filesystem::create_symlink(folder / "first", folder / "link");
    std::filesystem::create_symlink("n", folder / "nowhere");
    EXPECT_EQ(ProtectedSave(Writer("S"), folder / "link", EWriteMode::Overwrite), TQL::Result::Ok);
    EXPECT_EQ(ProtectedSave(Writer("S"), folder / "nowhere", EWriteMode::Exclusive), TQL::Result::AlreadyPresent);
    EXPECT_EQ(folder.Show(), "first=S link=S m=S nowhere=");
    EXPECT_EQ(ProtectedSave(Writer("T"), folder / "nowhere", EWriteMode::Overwrite), TQL::Result::Ok);
    EXPECT_EQ(folder.Show(), "first=S link=S m=S n=T nowhere=T");
    for (const char* const pLink : {"first", "link", "nowhere"})
        EXPECT_TRUE(std::filesystem::is_symlink(folder / pLink)) << pLink;
    folder.Put("m.new", "N");
    folder.Put("m.old", "O");
    EXPECT_EQ(LoadText(folder / "link"), "N") << "what an interrupted save left lies beside the file";
    EXPECT_EQ(folder.Show(), "first=N link=N m=N n=T nowhere=T");
}
#endif

TEST(ProtectedSave, TellsWhatItDoes)
{
    const TestFolder folder;
    TestSupport::LogGuard log;
    TQL::Log::SetThreshold(TQL::Log::GetCategory("FileSystem"), Severity::Detail);
    folder.Set("m=M");
    EXPECT_EQ(ProtectedSave(Writer("S"), folder / "m", EWriteMode::Exclusive), TQL::Result::AlreadyPresent);
    EXPECT_EQ(Lines(log, folder),
              "6 Protected save: new file [m.new] could not be moved to [m]: AlreadyPresent: The data "
              "or item being set was already present\n6 Removed file 'm.new'.\n");
    EXPECT_EQ(ProtectedSave(Writer("S"), folder / "m", EWriteMode::Overwrite), TQL::Result::Ok);
    EXPECT_EQ(Lines(log, folder), "6 Protected save: new file [m.new] moved to [m].\n6 Removed file 'm.old'.\n"
                                  "6 Protected save: removed backup file [m.old].\n");
    folder.Set("m=M m.old=O");
    EXPECT_EQ(CompleteProtectedSave(folder / "m", folder / "m.new", EWriteMode::Overwrite), TQL::Result::FileNotFound);
    EXPECT_EQ(Lines(log, folder), "6 Protected save: new file [m.new] doesn't exist so it wasn't moved to [m].\n"
                                  "6 Removed file 'm.old'.\n6 Protected save: removed backup file [m.old].\n");
    TQL::Log::SetThreshold(TQL::Log::GetCategory("FileSystem"), Severity::Information);
}

TEST(ProtectedSave, NoPathAndNoCallable)
{
    const TestFolder folder;
    const TestSupport::LogGuard log;
    for (const std::string& rPath : {std::string(), (folder / "m") + '\0'})
    {
        EXPECT_EQ(ProtectedSave(Writer("S"), rPath, EWriteMode::Overwrite), TQL::Result::FileNotFound);
        EXPECT_EQ(ProtectedLoad(Writer("S"), rPath), TQL::Result::FileNotFound);
    }
    EXPECT_THROW((void)ProtectedSave({}, folder / "m", EWriteMode::Overwrite), std::bad_function_call);
    EXPECT_THROW((void)ProtectedLoad({}, folder / "m"), std::bad_function_call);
    EXPECT_EQ(folder.Show(), "");
}

} // namespace
} // namespace TestUtilsFileSystem

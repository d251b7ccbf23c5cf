#include "UtilsFileSystem/FileIO.h"

#include "UtilsFileSystem/FileResult.h"
#include "UtilsFileSystem/TestFolder.h"
#include "support/LogGuard.h"

#include <gtest/gtest.h>

#include <functional>

namespace TestUtilsFileSystem
{
namespace
{

using namespace UtilsFileSystem;
using TestSupport::LogGuard;

std::string Name(TQL::IResult i_Result)
{
    return std::string(i_Result.Name());
}

TEST(FileResult, EachErrorHasOneResult)
{
    LogGuard log;
    const std::pair<std::errc, TQL::IResult> rows[] = {
        {std::errc::file_exists, TQL::Result::AlreadyPresent},
        {std::errc::invalid_argument, TQL::Result::InvalidArgument},
        {std::errc::no_such_file_or_directory, TQL::Result::FileNotFound},
        {std::errc::is_a_directory, TQL::Result::InvalidType},
        {std::errc::not_a_directory, TQL::Result::InvalidType},
        {std::errc::not_supported, TQL::Result::NotSupported},
        {std::errc::operation_not_permitted, TQL::Result::NotPermitted},
        {std::errc::permission_denied, TQL::Result::NotPermitted},
    };
    for (const auto& [error, result] : rows)
        EXPECT_EQ(ResultFromError(std::make_error_code(error)), result) << static_cast<int>(error);
    EXPECT_EQ(ResultFromError({}), TQL::Result::Failed) << "a failure without an error is no success";
    EXPECT_TRUE(log.Take().empty());

    const auto full = std::make_error_code(std::errc::no_space_on_device);
    EXPECT_EQ(ResultFromError(full), TQL::Result::FileIOFailure);
    const auto lines = log.Take();
    ASSERT_EQ(lines.size(), 1u);
    EXPECT_EQ(lines[0].Severity, TQL::ELogSeverity::Warning);
    EXPECT_EQ(lines[0].Text, "Std error code: " + full.message());
}

TEST(FileStreams, OpenWriteSeekAndRead)
{
    const LogGuard log;
    const TestFolder folder;
    const std::string path = folder / "Gr\xC3\xA4ph \xE2\x9C\x93.json";
    for (const bool bOverwrite : {false, true})
    {
        auto [pOut, result] = OpenOutputFile(path, EOpenMode::Binary, bOverwrite);
        ASSERT_EQ(result, TQL::Result::Ok);
        EXPECT_EQ(pOut->Write(std::as_bytes(std::span("0123\n56789", 10))), TQL::Result::Ok);
        EXPECT_EQ(pOut->GetSize().first, 10u);
        EXPECT_EQ(pOut->Seek(2), TQL::Result::Ok);
        EXPECT_EQ(pOut->Write(std::as_bytes(std::span("ab", 2))), TQL::Result::Ok);
        EXPECT_EQ(pOut->Close(), TQL::Result::Ok);
        EXPECT_EQ(pOut->Close(), TQL::Result::FileNotOpen);
        EXPECT_EQ(pOut->Tell().first, TQL::InvalidPosition);
    }
    EXPECT_EQ(OpenOutputFile(path, EOpenMode::Text, false).second, TQL::Result::AlreadyPresent);
    EXPECT_EQ(OpenOutputFileStream(path, EOpenMode::Text, false).second, TQL::Result::AlreadyPresent);

    auto [pBest, result] = OpenBestInputStream(path, 0, 0);
    ASSERT_EQ(result, TQL::Result::Ok);
    VFileInputStreamVirtual plain(std::move(*OpenInputFile(path, EOpenMode::Binary).first));
    for (TQL::IInputStreamSeekable* pIn : {pBest.get(), static_cast<TQL::IInputStreamSeekable*>(&plain)})
    {
        std::array<std::byte, 8> bytes{};
        EXPECT_EQ(pIn->GetSize().first, 10u);
        EXPECT_EQ(pIn->Seek(7), TQL::Result::Ok);
        const auto [count, readResult] = pIn->Read(bytes);
        EXPECT_EQ(readResult, TQL::Result::Ok) << "the end is no error";
        EXPECT_EQ(std::string(reinterpret_cast<const char*>(bytes.data()), count), "789");
        EXPECT_EQ(pIn->Tell().first, 10u);
        EXPECT_EQ(pIn->Seek(50), TQL::Result::Ok);
        EXPECT_EQ(pIn->Read(bytes).first, 0u);
    }
    pBest.reset(); // a system that denies sharing would refuse to write now
    plain = VFileInputStreamVirtual(VFileInputStream(nullptr));
    auto [pStream, streamResult] = OpenInputFileStream(path, EOpenMode::Binary);
    ASSERT_TRUE(pStream);
    EXPECT_EQ(std::string(std::istreambuf_iterator<char>(*pStream), {}), "01ab\n56789");
    pStream->close();
    auto pText = OpenOutputFileStream(path, EOpenMode::Text, true).first;
    ASSERT_TRUE(pText);
    *pText << "line\n";
    pText->close();
#ifdef _WIN32
    EXPECT_EQ(OpenInputFile(path, EOpenMode::Binary).first->GetSize().first, 6u);
#else
    EXPECT_EQ(OpenInputFile(path, EOpenMode::Binary).first->GetSize().first, 5u);
#endif
}

TEST(FileStreams, EveryOpenGivesTheSameErrors)
{
    LogGuard log;
    const TestFolder folder;
    folder.Set("file=1");
    const std::string missing = folder / "no/such";
    const std::string cut = (folder / "file") + std::string(1, '\0') + "rest";
    const std::string tooLong = folder / std::string(300, 'x');
    struct Row
    {
        std::string Path;
        TQL::IResult Read;
        TQL::IResult Write;
    };
    std::vector<Row> rows = {{missing, TQL::Result::FileNotFound, TQL::Result::FileNotFound},
                             {"", TQL::Result::FileNotFound, TQL::Result::FileNotFound},
                             {cut, TQL::Result::FileNotFound, TQL::Result::FileNotFound}};
#ifndef _WIN32
    rows.push_back({folder / "file/below", TQL::Result::InvalidType, TQL::Result::InvalidType});
    rows.push_back({folder / ".", TQL::Result::InvalidType, TQL::Result::InvalidType});
    rows.push_back({tooLong, TQL::Result::FileIOFailure, TQL::Result::FileIOFailure});
#endif
    for (const Row& rRow : rows)
    {
        EXPECT_EQ(Name(OpenInputFile(rRow.Path, EOpenMode::Text).second), Name(rRow.Read)) << rRow.Path;
        EXPECT_EQ(Name(OpenInputFileStream(rRow.Path, EOpenMode::Text).second), Name(rRow.Read)) << rRow.Path;
        EXPECT_EQ(Name(OpenBestInputStream(rRow.Path, 0, 0).second), Name(rRow.Read)) << rRow.Path;
        EXPECT_EQ(Name(OpenOutputFile(rRow.Path, EOpenMode::Text, true).second), Name(rRow.Write)) << rRow.Path;
        EXPECT_EQ(Name(OpenOutputFileStream(rRow.Path, EOpenMode::Text, true).second), Name(rRow.Write)) << rRow.Path;
    }
    EXPECT_EQ(folder.Show(), "file=1");
}

struct OperationRow
{
    const char* pBefore;
    std::function<TQL::IResult(const TestFolder&)> Operation;
    TQL::IResult Result;
    const char* pAfter;
};

TEST(FileOperations, ResultsAndWhatIsLeft)
{
    LogGuard log;
    const auto copy = [](bool i_bOverwrite)
    {
        return [=](const TestFolder& i_rIn)
        {
            return CopyFile(i_rIn / "a", i_rIn / "b", i_bOverwrite);
        };
    };
    const auto move = [](const TestFolder& i_rIn)
    {
        return MoveFile(i_rIn / "a", i_rIn / "b");
    };
    const auto replace = [](const TestFolder& i_rIn)
    {
        return ReplaceFile(i_rIn / "a", i_rIn / "b");
    };
    const auto backup = [](const TestFolder& i_rIn)
    {
        return ReplaceFile(i_rIn / "a", i_rIn / "b", i_rIn / "c");
    };
    const auto byRename = [](const TestFolder& i_rIn)
    {
        return ReplaceFileByRename(i_rIn / "a", i_rIn / "b", i_rIn / "c");
    };
    const auto remove = [](const TestFolder& i_rIn)
    {
        return RemoveFile(i_rIn / "a");
    };
    const OperationRow rows[] = {
        {"a=1", copy(false), TQL::Result::Ok, "a=1 b=1"},
        {"a=1 b=2", copy(false), TQL::Result::AlreadyPresent, "a=1 b=2"},
        {"a=1 b=long", copy(true), TQL::Result::Ok, "a=1 b=1"},
        {"b=2", copy(true), TQL::Result::FileNotFound, "b=2"},
        {"a=1", move, TQL::Result::Ok, "b=1"},
        {"a=1 b=2", move, TQL::Result::AlreadyPresent, "a=1 b=2"},
        {"b=2", move, TQL::Result::FileNotFound, "b=2"},
        {"a=1 b=2", replace, TQL::Result::Ok, "b=1"},
        {"a=1", replace, TQL::Result::Ok, "b=1"},
        {"b=2", replace, TQL::Result::FileNotFound, "b=2"},
        {"", replace, TQL::Result::FileNotFound, ""},
        {"a=1 b=2 c=3", backup, TQL::Result::Ok, "b=1 c=2"},
        {"a=1 c=3", backup, TQL::Result::Ok, "b=1 c=3"},
        {"b=2 c=3", backup, TQL::Result::FileNotFound, "b=2 c=3"},
        {"a=1 b=2 c=3", byRename, TQL::Result::Ok, "b=1 c=2"},
        {"a=1", byRename, TQL::Result::Ok, "b=1"},
        {"a=1 b=2", remove, TQL::Result::Ok, "b=2"},
        {"b=2", remove, TQL::Result::OkButNoEffect, "b=2"},
    };
    const TestFolder folder;
    for (const OperationRow& rRow : rows)
    {
        folder.Set(rRow.pBefore);
        const std::string row = std::string(rRow.pBefore) + " -> " + rRow.pAfter;
        EXPECT_EQ(Name(rRow.Operation(folder)), Name(rRow.Result)) << row;
        EXPECT_EQ(folder.Show(), rRow.pAfter);
    }
    folder.Set("a=1");
    EXPECT_EQ(CopyFile(folder / "a", folder / "a", true), TQL::Result::AlreadyPresent);
    EXPECT_EQ(folder.Show(), "a=1") << "a copy onto itself must not empty the file";
    EXPECT_TRUE(log.Take().empty()) << "expected failures say nothing";

    std::filesystem::create_directory(folder / "b");
    EXPECT_TRUE(RemoveFile(folder / "b").IsError());
    EXPECT_TRUE(ReplaceFile(folder / "a", folder / "b", folder / "c").IsError());
    EXPECT_TRUE(ReplaceFileByRename(folder / "a", folder / "b").IsError());
    EXPECT_EQ(folder.Show(), "a=1 b/") << "a folder is never removed or replaced";
    const auto lines = log.Take();
    ASSERT_EQ(lines.size(), 2u);
    EXPECT_TRUE(lines[0].Text.starts_with("Failed to remove file '" + (folder / "b") + "': ")) << lines[0].Text;
    EXPECT_TRUE(lines[1].Text.starts_with("Failed to replace file ")) << lines[1].Text;
}

} // namespace
} // namespace TestUtilsFileSystem

#include "UtilsFileSystem/TestFolder.h"
#include "UtilsFileSystem/VMemoryMappedInputFile.h"
#include "support/LogGuard.h"

#include <gtest/gtest.h>

#include <cstring>

namespace TestUtilsFileSystem
{
namespace
{

using namespace UtilsFileSystem;

constexpr std::uint64_t s_Page = 1048576;

std::string ReadAt(VMemoryMappedInputFile& io_rFile, std::uint64_t i_Position, std::size_t i_Count)
{
    std::string text(i_Count, '?');
    EXPECT_EQ(io_rFile.Seek(i_Position), TQL::Result::Ok);
    const auto [count, result] = io_rFile.Read(std::as_writable_bytes(std::span(text)));
    EXPECT_EQ(result, TQL::Result::Ok);
    text.resize(count);
    return text;
}

std::string Pattern(std::size_t i_Size)
{
    std::string text(i_Size, ' ');
    for (std::size_t i = 0; i < i_Size; ++i)
        text[i] = static_cast<char>(i * 2654435761u >> 13);
    return text;
}

TEST(MappedInput, PagesAreKeptAndCounted)
{
    TestSupport::LogGuard log;
    TQL::Log::SetThreshold(TQL::Log::GetCategory("FileSystem"), TQL::ELogSeverity::Detail);
    const TestFolder folder;
    const std::string text = Pattern(3 * s_Page + 77);
    folder.Put("a", text);
    VMemoryMappedInputFile file;
    ASSERT_EQ(file.Open(folder / "a", 1, VMemoryMappedInputFile::OptionSequential), TQL::Result::Ok);
    EXPECT_EQ(file.Open(folder / "a", 1), TQL::Result::AlreadyPresent);
    struct Row
    {
        std::uint64_t Position;
        std::size_t Count;
        std::uint64_t Swaps;
    };
    const Row rows[] = {
        {0, 100, 1},               // mapped by Open
        {s_Page - 10, 20, 2},      // across a page end: 0, then 1
        {5, 10, 2},                // back to a page that is still mapped
        {2 * s_Page, 10, 3},       // drops page 1, used longest ago
        {7, 10, 3},                // so page 0 is there
        {s_Page, 10, 4},           // and page 1 is not; drops page 2
        {3 * s_Page + 70, 100, 5}, // the short page at the end
        {3 * s_Page + 77, 5, 5},   // the end
        {0, 3 * s_Page + 100, 9},  // all of it: 0, 1, 2 and 3 anew
    };
    for (const Row& rRow : rows)
    {
        const std::string expected = rRow.Position < text.size() ? text.substr(rRow.Position, rRow.Count) : "";
        EXPECT_TRUE(ReadAt(file, rRow.Position, rRow.Count) == expected) << rRow.Position;
        EXPECT_EQ(file.GetSwapCount(), rRow.Swaps) << rRow.Position;
    }
    EXPECT_FALSE(file.GetWholeFile().second);
    file.Close();
    const auto lines = log.Take();
    ASSERT_EQ(lines.size(), 1u);
    EXPECT_EQ(lines[0].Text, "VMemoryMappedInputStream stats: 9 swaps, 4 pages in file.");
    EXPECT_EQ(file.Tell().second, TQL::Result::FileNotOpen);
    TQL::Log::SetThreshold(TQL::Log::GetCategory("FileSystem"), TQL::ELogSeverity::Information);
}

TEST(MappedInput, OneViewCoversAWholeFile)
{
    const TestFolder folder;
    const std::string text = Pattern(2 * s_Page);
    folder.Put("a", text);
    folder.Put("empty", "");
    VMemoryMappedInputStreamVirtual stream;
    EXPECT_EQ(stream.Open(folder / "missing"), TQL::Result::FileNotFound);
    ASSERT_EQ(stream.Open(folder / "a"), TQL::Result::Ok);
    const auto [bytes, bWhole] = stream.GetFile().GetWholeFile();
    EXPECT_TRUE(bWhole);
    EXPECT_TRUE(text == std::string(reinterpret_cast<const char*>(bytes.data()), bytes.size()));
    EXPECT_EQ(stream.GetFile().GetSwapCount(), 1u);
    stream.Close();
    for (const std::uint64_t window : {0, 1})
    {
        ASSERT_EQ(stream.Open(folder / "empty", window), TQL::Result::Ok);
        std::byte byte{};
        EXPECT_EQ(stream.Read({&byte, 1}), std::pair(std::size_t(0), TQL::Result::Ok));
        EXPECT_EQ(stream.GetSize().first, 0u);
        EXPECT_EQ(stream.GetFile().GetSwapCount(), 0u);
        EXPECT_TRUE(stream.GetFile().GetWholeFile().second);
        stream.Close();
    }
}

TEST(MappedFile, ViewsOfAnOutputFileAreWritten)
{
    const TestFolder folder;
    folder.Put("a", "what was there before");
    const std::uint64_t size = 3 * s_Page;
    std::string expected(size, '\0');
    {
        VMemoryMappedFileBase file;
        EXPECT_EQ(file.OpenOutput(folder / "no/such", 1), TQL::Result::FileNotFound);
        ASSERT_EQ(file.OpenOutput(folder / "a", size), TQL::Result::Ok);
        for (const std::uint64_t offset : {std::uint64_t(0), s_Page + 12345, size - 5})
        {
            const auto [pView, result] = file.MapView(offset, 5);
            ASSERT_EQ(result, TQL::Result::Ok);
            std::memcpy(pView, "hello", 5);
            expected.replace(offset, 5, "hello");
            if (offset != 0) // the first is left to the destructor
                file.UnmapView(pView);
        }
        EXPECT_EQ(file.MapView(size - 4, 5).second, TQL::Result::InvalidArgument);
        EXPECT_EQ(file.MapView(0, 0).second, TQL::Result::InvalidArgument);
    }
    EXPECT_TRUE(folder.Show() == "a=" + expected);
}

} // namespace
} // namespace TestUtilsFileSystem

#include "StoreDocuments.h"
#include "StoreInterface/TypedValue.h"
#include "UtilsFileSystem/FaultLayer.h"
#include "UtilsFileSystem/TestFolder.h"
#include "support/LogGuard.h"

#include <gtest/gtest.h>

#include <filesystem>
#include <map>
#include <string>

#include <unistd.h>

namespace
{

using namespace StoreIOTest;
using UtilsFileSystem::EWriteMode;

/// A store that can be told from others, whose file takes several writes.
std::shared_ptr<TQL::IStore> MakeStoreOf(const std::string& i_rName)
{
    auto pStore = MakeStore();
    const TQL::ScopedWrite write(*pStore);
    for (int i = 0; i < 14; ++i)
        (void)write->SetValue(pStore->GetEntry(Store::EntryPath(i_rName) / std::to_string(i)),
                              Store::MakeValue(i_rName + std::string(10000, static_cast<char>('a' + i))));
    return pStore;
}

const std::string& FileOf(const std::string& i_rName)
{
    static std::map<std::string, std::string> s_Files;
    std::string& rFile = s_Files[i_rName];
    if (rFile.empty())
        rFile = ExportText(*MakeStoreOf(i_rName));
    return rFile;
}

/// The file of the store that a load brings, or the result.
std::string Load(const std::string& i_rPath)
{
    StoreIO::VStoreImporterJson importer;
    TQL::IResult result = importer.ReadFile(i_rPath);
    const auto pStore = MakeStore();
    if (result.IsSuccess())
        result = importer.Import(*TQL::ScopedWrite(*pStore));
    return result.IsSuccess() ? ExportText(*pStore) : std::string(result.Name());
}

/// Which of the three names exist; beside an old file a new one is whole, alone its writer may have been cut off.
void Begin(const TestUtilsFileSystem::TestFolder& i_rFolder, int i_Names)
{
    i_rFolder.Set("");
    if (i_Names & 1)
        i_rFolder.Put("m", FileOf("Main"));
    if (i_Names & 2)
        i_rFolder.Put("m.new", FileOf("New").substr(0, (i_Names & 4) ? std::string::npos : FileOf("New").size() / 2));
    if (i_Names & 4)
        i_rFolder.Put("m.old", FileOf("Old"));
}

TEST(SaveFaults, AWholeStoreIsLoadedWhereverASaveWasCutOff)
{
    TestSupport::LogGuard log;
    const std::filesystem::path memory = "/dev/shm"; // hundreds of saves, each brought to the disk, take long
    const TestUtilsFileSystem::TestFolder folder(
        ::access(memory.c_str(), W_OK) == 0 ? memory : std::filesystem::temp_directory_path());
    StoreIO::VStoreExporterJson exporter;
    ASSERT_EQ(exporter.Export(*TQL::ScopedRead(*MakeStoreOf("Saved"))), TQL::Result::Ok);
    int points = 0;
    for (const EWriteMode mode : {EWriteMode::Exclusive, EWriteMode::Overwrite})
        for (int names = 0; names < 8; ++names)
        {
            Begin(folder, names);
            const std::string before = Load(folder / "m");
            int answer = FaultLayer::StoppedCode;
            for (FaultLayer::Plan plan; answer == FaultLayer::StoppedCode && plan.StopAt < 100; ++points)
            {
                ++plan.StopAt;
                Begin(folder, names);
                answer = FaultLayer::InChild(
                    [&]
                    {
                        TQL::IResult result;
                        FaultLayer::With(plan, [&] { result = exporter.WriteToFile(folder / "m", mode); });
                        return result.IsError() ? 1 : 0;
                    });
                const std::string after = Load(folder / "m");
                const bool bKept = after == before || ((names & 1) && after == FileOf("Main"));
                EXPECT_TRUE(after == FileOf("Saved") || (bKept && answer != 0))
                    << "names " << names << ", stopped at " << plan.StopAt << ": " << after.substr(0, 100);
            }
            const bool bRefused = mode == EWriteMode::Exclusive && before != "FileNotFound";
            EXPECT_EQ(answer, bRefused ? 1 : 0) << names;
        }
    EXPECT_GT(points, 16 * 8) << "the layer does not see the calls";
    RecordProperty("points", points);
}

TEST(LoadFaults, AFileThatIsShortenedMeanwhileIsRefused)
{
    const TestUtilsFileSystem::TestFolder folder;
    folder.Put("m", FileOf("Main"));
    const auto shorten = [&]
    {
        std::filesystem::resize_file(folder / "m", 5000);
    };
    EXPECT_EQ(FaultLayer::InChild(
                  [&]
                  {
                      TestSupport::LogGuard log;
                      std::string answer;
                      FaultLayer::With({{}, 0, 0, 0, "mmap", shorten}, [&] { answer = Load(folder / "m"); });
                      const auto lines = log.Take();
                      return answer == "FileIOFailure" && lines.size() == 1 ? 0 : 1;
                  }),
              0);
}

} // namespace

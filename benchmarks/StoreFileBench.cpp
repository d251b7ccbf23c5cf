#include "Bench.h"
#include "Store/VStore.h"
#include "StoreIO/VStoreExporterJson.h"
#include "StoreIO/VStoreImporterJson.h"
#include "StoreInterface/ScopedAccess.h"
#include "StoreInterface/TypedValue.h"
#include "TQL/RapidJson.h"
#include "UtilsFileSystem/FileIO.h"
#include "UtilsFileSystem/ProtectedFileIO.h"

#include <algorithm>
#include <cmath>
#include <cstdint>
#include <cstdlib>
#include <filesystem>
#include <fstream>
#include <functional>
#include <iterator>
#include <memory>
#include <ostream>
#include <string>
#include <string_view>
#include <tuple>
#include <type_traits>
#include <utility>
#include <vector>

#include <malloc.h>
#include <unistd.h>

namespace Bench
{
namespace
{

using UtilsFileSystem::EWriteMode;

constexpr int s_Entries = 100'000;
constexpr int s_LargeEnum = 100;

enum class EUnits : std::uint32_t
{
    Millimetres,
    Metres
};

[[maybe_unused]] TQL::ISchema DescribeSchema(std::type_identity<EUnits>)
{
    return TQL::MakeEnumSchema(TQL::EType::Enum32, "EUnits", {{"Millimetres", 0}, {"Metres", 1}});
}

void Check(TQL::IResult i_Result)
{
    if (i_Result.IsError())
        std::abort();
}

/// Values as settings have them: half of them plain.
Store::StoreValue ValueOf(int i_Index)
{
    switch (i_Index % 6)
    {
    case 0:
        return Store::MakeValue(std::int32_t{i_Index});
    case 1:
        return Store::MakeValue(i_Index % 4 == 1);
    case 2:
        return Store::MakeValue(i_Index / 7.0);
    case 3:
        return Store::MakeValue("Trajectory of marker " + std::to_string(i_Index));
    case 4:
        return Store::MakeValue(EUnits{static_cast<std::uint32_t>(i_Index / 6 % 2)});
    default:
        return Store::MakeValue(std::tuple{std::uint64_t(i_Index), std::string("X"), i_Index * 0.5});
    }
}

std::string NameOf(int i_Index)
{
    return "Tree/" + std::to_string(i_Index / 100) + "/Setting" + std::to_string(i_Index);
}

std::shared_ptr<TQL::IStore> MakeStore()
{
    auto pStore = TQL::MakeShared<Store::VStore>();
    const TQL::ScopedWrite write(*pStore);
    for (int i = 0; i < s_Entries; ++i)
        Check(write->SetValue(pStore->GetEntry(Store::EntryPath(NameOf(i))), ValueOf(i)));
    return pStore;
}

/// A folder of its own, in memory where there is such a place: what is measured is not the disk.
class Folder
{
public:
    Folder()
    {
        const std::filesystem::path memory = "/dev/shm";
        const bool bMemory = access(memory.c_str(), W_OK) == 0;
        m_Path = (bMemory ? memory : std::filesystem::temp_directory_path()) / "graphplots-bench-XXXXXX";
        if (!mkdtemp(m_Path.data()))
            std::abort();
    }
    ~Folder() { std::filesystem::remove_all(m_Path); }
    Folder(const Folder&) = delete;
    Folder& operator=(const Folder&) = delete;

    std::string operator/(std::string_view i_Name) const { return m_Path + '/' + std::string(i_Name); }

private:
    std::string m_Path;
};

void AddExport(Table& o_rTable)
{
    const auto pStore = MakeStore();
    const Folder folder;
    const auto ours = [&]
    {
        StoreIO::VStoreExporterJson exporter;
        Check(exporter.Export(*TQL::ScopedRead(*pStore)));
        Check(exporter.WriteToFile(folder / "ours.json", EWriteMode::Overwrite));
    };
    StoreIO::VStoreExporterJson exported;
    Check(exported.Export(*TQL::ScopedRead(*pStore)));
    const rapidjson::Document& rDocument = exported.GetDocument();
    const auto writePlainly = [&](const std::string& i_rPath)
    {
        const auto [pFile, opened] = UtilsFileSystem::OpenOutputFile(i_rPath, UtilsFileSystem::EOpenMode::Text, true);
        Check(opened);
        std::vector<char> buffer(131072);
        rapidjson::FileWriteStream stream(pFile->GetFile(), buffer.data(), buffer.size());
        rapidjson::Writer<rapidjson::FileWriteStream> writer(stream);
        if (!rDocument.Accept(writer))
            std::abort();
        stream.Flush();
        return pFile->Close();
    };
    const auto theirs = [&]
    {
        Check(UtilsFileSystem::ProtectedSave(writePlainly, folder / "theirs.json", EWriteMode::Overwrite));
    };
    const auto [exportTime, plain] = BestSecondsPaired(15, ours, theirs);
    o_rTable.push_back({"export of 100,000 entries to a file: ours / RapidJSON", exportTime * 1e3, "ms",
                        "RapidJSON's Writer over the finished document, saved likewise", plain * 1e3,
                        exportTime / plain, EGoal::AtMost, 3.0});
}

/// A file in a new store. What is made is kept until the clock has stopped: freeing it is not part of any figure.
struct Imported
{
    explicit Imported(const std::string& i_rPath)
    {
        ReadSeconds = BestSeconds(1, [&] { Check(Importer.ReadFile(i_rPath)); });
        StageSeconds = BestSeconds(1, [&] { Check(Importer.Import(*TQL::ScopedWrite(*pStore))); });
    }

    StoreIO::VStoreImporterJson Importer;
    std::shared_ptr<TQL::IStore> pStore = TQL::MakeShared<Store::VStore>();
    double ReadSeconds = 0.0;
    double StageSeconds = 0.0; ///< with the commit
};

void SaveMany(const std::string& i_rPath)
{
    StoreIO::VStoreExporterJson exporter;
    Check(exporter.Export(*TQL::ScopedRead(*MakeStore())));
    Check(exporter.WriteToFile(i_rPath, EWriteMode::Overwrite));
}

std::string ReadAll(const std::string& i_rPath)
{
    std::ifstream file(i_rPath, std::ios::binary);
    return {std::istreambuf_iterator<char>(file), {}};
}

void AddImport(Table& o_rTable)
{
    const Folder folder;
    const std::string path = folder / "many.json";
    SaveMany(path);
    const std::string bytes = ReadAll(path);
    std::vector<std::pair<std::string, Store::StoreValue>> entries;
    for (int i = 0; i < s_Entries; ++i)
        entries.emplace_back(NameOf(i), ValueOf(i));

    double ours = 1e300;
    double parse = 1e300;
    double commit = 1e300;
    for (int i = 0; i < 7; ++i)
    {
        {
            const Imported imported(path);
            ours = std::min(ours, imported.ReadSeconds + imported.StageSeconds);
        }
        rapidjson::Document document;
        parse = std::min(parse, BestSeconds(1,
                                            [&]
                                            {
                                                rapidjson::MemoryStream stream(bytes.data(), bytes.size());
                                                document.ParseStream<rapidjson::kParseFullPrecisionFlag>(stream);
                                            }));
        const auto pStore = TQL::MakeShared<Store::VStore>();
        commit = std::min(
            commit, BestSeconds(1,
                                [&]
                                {
                                    const TQL::ScopedWrite write(*pStore);
                                    for (const auto& [name, value] : entries)
                                        Check(write->SetVerifiedValue(pStore->GetEntry(Store::EntryPath(name)), value));
                                }));
    }
    o_rTable.push_back({"import of 100,000 entries from a file: ours / parse + commit", ours * 1e3, "ms",
                        "RapidJSON's parse of the same bytes and a commit of the same values", (parse + commit) * 1e3,
                        ours / (parse + commit), EGoal::AtMost, 2.0});
}

/// A file of 1000 entries, each with the type that i_rType writes.
void SaveTypes(const std::string& i_rPath, const std::function<void(std::ostream&, int)>& i_rType)
{
    std::ofstream file(i_rPath, std::ios::binary);
    file << R"({ "Version" : "3.0", "Children" : {)";
    for (int i = 0; i < 1000; ++i)
    {
        file << (i == 0 ? "" : ",") << "\n  \"Setting" << i << R"(" : { "Value" : "\"N0\"", "Type" : "Enum32")";
        i_rType(file, i);
        file << " }";
    }
    file << "}}";
}

/// Every run needs names that were never seen before: what was once interned stays.
void AddSchemas(Table& o_rTable)
{
    const Folder folder;
    const std::string same = folder / "same.json";
    const std::string distinct = folder / "distinct.json";
    SaveTypes(same,
              [](std::ostream& o_rFile, int)
              {
                  o_rFile << R"(, "TypeName" : "EChannels", "EnumValues" : [ [ "N0", 0 ])";
                  for (int name = 1; name < s_LargeEnum; ++name)
                      o_rFile << ", [ \"N" << name << "\", " << name << " ]";
                  o_rFile << " ]";
              });
    double sameStage = 1e300;
    double sameAll = 1e300;
    double distinctStage = 1e300;
    double distinctAll = 1e300;
    int names = 0;
    for (int run = 0; run < 25; ++run)
    {
        SaveTypes(distinct, [&](std::ostream& o_rFile, int)
                  { o_rFile << R"(, "EnumValues" : [ [ "N0", 0 ], [ "Own)" << ++names << "\", 1 ] ]"; });
        const auto measure = [](const std::string& i_rPath, double& io_rStage, double& io_rAll)
        {
            const Imported imported(i_rPath);
            io_rStage = std::min(io_rStage, imported.StageSeconds);
            io_rAll = std::min(io_rAll, imported.ReadSeconds + imported.StageSeconds);
        };
        measure(same, sameStage, sameAll);
        measure(distinct, distinctStage, distinctAll);
    }
    const std::string what = "1000 entries with the same enum of " + std::to_string(s_LargeEnum) + " names";
    o_rTable.push_back({"import of " + what + ", once read: same / distinct", sameStage * 1e3, "ms",
                        "1000 entries with an enum of 2 names each of their own", distinctStage * 1e3,
                        sameStage / distinctStage, EGoal::AtMost, 1.0});
    const double sizes = static_cast<double>(std::filesystem::file_size(same)) /
                         static_cast<double>(std::filesystem::file_size(distinct));
    o_rTable.push_back(
        {"the same with reading, " + std::to_string(std::lround(sizes)) + " times the bytes: same / distinct",
         sameAll * 1e3, "ms", "1000 entries with an enum of 2 names each of their own", distinctAll * 1e3,
         sameAll / distinctAll, EGoal::Report, 0.0});
}

/// Bytes of a line of what the system tells about this process, or 0 where it does not tell.
double ProcessBytes(std::string_view i_Name)
{
    std::ifstream status("/proc/self/status");
    for (std::string name; status >> name; status.ignore(1000, '\n'))
        if (name == i_Name)
        {
            double kibibytes = 0.0;
            status >> kibibytes;
            return kibibytes * 1024.0;
        }
    return 0.0;
}

void AddMemory(Table& o_rTable)
{
    const Folder folder;
    const std::string path = folder / "many.json";
    SaveMany(path);
    const auto size = static_cast<double>(std::filesystem::file_size(path));
    malloc_trim(0);
    std::ofstream("/proc/self/clear_refs") << 5; // the peak begins anew
    const double before = ProcessBytes("VmRSS:");
    const Imported imported(path);
    const double peak = ProcessBytes("VmHWM:") - before;
    o_rTable.push_back({"memory at the peak of an import of 100,000 entries / size of the file", peak / 1e6, "MB",
                        "the file", size / 1e6, peak / size, EGoal::AtMost, 20.0});
}

} // namespace

void RunStoreFile(Table& o_rTable)
{
    AddExport(o_rTable);
    AddImport(o_rTable);
    AddSchemas(o_rTable);
    AddMemory(o_rTable);
}

} // namespace Bench

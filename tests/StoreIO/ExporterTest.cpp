#include "StoreIO/StoreDocuments.h"
#include "StoreIO/StoreFormat.h"
#include "StoreInterface/EntryFlag.h"
#include "StoreInterface/TypedValue.h"
#include "UtilsFileSystem/TestFolder.h"
#include "support/LogGuard.h"

#include <gtest/gtest.h>

#include <algorithm>
#include <cstring>
#include <limits>
#include <memory>
#include <regex>
#include <string>
#include <vector>

#include <csignal>
#include <sys/resource.h>

namespace
{

using namespace TQL;
using Store::MakeValue;
using Store::StoreValue;
using StoreIO::VStoreExporterJson;
using TestUtilsFileSystem::TestFolder;
using UtilsFileSystem::EWriteMode;

/// Counts what is written; the n-th write fails.
class CountingStream final : public IOutputStream
{
public:
    explicit CountingStream(int i_FailAt = 0) : m_FailAt(i_FailAt) {}

    IResult Write(std::span<const std::byte> i_Bytes) override
    {
        if (++Writes == m_FailAt)
            return Result::DiskFull;
        Size += i_Bytes.size();
        LongestWrite = std::max(LongestWrite, i_Bytes.size());
        return Result::Ok;
    }
    IResult Flush() override { return bFlushFails ? Result::FileIOFailure : Result::Ok; }

    std::size_t Size = 0;
    std::size_t LongestWrite = 0;
    int Writes = 0;
    bool bFlushFails = false;

private:
    int m_FailAt;
};

std::string TextOf(const VStoreExporterJson& i_rExporter)
{
    TQL::VTextOutput stream;
    EXPECT_EQ(i_rExporter.WriteToStream(stream), Result::Ok);
    return stream.Text();
}

struct Entry
{
    const char* pPath;
    StoreValue Verified;
    StoreValue Proposed = {};
    std::uint32_t Flags = 0;
};
using Entries = std::vector<Entry>;

std::shared_ptr<IStore> MakeStore(const Entries& i_rEntries)
{
    auto pStore = StoreIOTest::MakeStore();
    const ScopedWrite write(*pStore);
    for (const Entry& rEntry : i_rEntries)
    {
        const Store::EntryHandle entry = pStore->GetEntry(Store::EntryPath(rEntry.pPath));
        EXPECT_FALSE(write->EnableFlags(entry, rEntry.Flags).IsError());
        EXPECT_TRUE(rEntry.Verified.IsEmpty() || write->SetVerifiedValue(entry, rEntry.Verified).IsSuccess());
        EXPECT_TRUE(rEntry.Proposed.IsEmpty() || write->SetProposedValue(entry, rEntry.Proposed).IsSuccess());
    }
    return pStore;
}

IResult Export(VStoreExporterJson& i_rExporter, const Entries& i_rEntries)
{
    const auto pStore = MakeStore(i_rEntries);
    return i_rExporter.Export(*ScopedRead(*pStore));
}

std::vector<std::string> Errors(TestSupport::LogGuard& io_rLog)
{
    std::vector<std::string> texts;
    for (const auto& rEntry : io_rLog.Take())
        if (rEntry.Severity == ELogSeverity::Error)
            texts.push_back(rEntry.Text);
    return texts;
}

StoreValue Raw(const ISchema& i_rSchema, std::vector<std::uint8_t> i_Bytes)
{
    return {&IO::GetUniqueSchema(i_rSchema), i_Bytes};
}

StoreValue Number(std::int32_t i_Number)
{
    return MakeValue(i_Number);
}

/// The file with these children: a ' stands for a double quote, #n for the members of an entry that holds the Int32 n.
std::string File(const std::string& i_rChildren)
{
    const std::string members =
        std::regex_replace(i_rChildren, std::regex("#(\\d+)"), "'Value' : $1, 'Type' : 'Int32'");
    return std::regex_replace("{ 'Version' : '3.0', 'Children' : {" + members + "\n}\n}", std::regex("'"), "\"");
}

TEST(Exporter, LaysEntriesOutAsLines)
{
    const auto verify = Store::EntryFlag::VerifyRequired;
    const std::pair<Entries, const char*> s_Cases[] = {
        {{}, ""},
        {{{"Plot", Number(1)}, {"Plot/Child", Number(2)}},
         " \n  'Plot' : { #1, 'Children' : { \n      'Child' : { #2 }\n    }\n  }"},
        {{{"B", Number(2)}, {"A", Number(1)}}, " \n  'A' : { #1 }, \n  'B' : { #2 }"},
        {{{"A", Number(1)}, {"A/B", Number(2)}, {"A/B/C", Number(3)}},
         " \n  'A' : { #1, 'Children' : { \n      'B' : { #2, 'Children' : { \n          'C' : { #3 }\n        }\n"
         "      }\n    }\n  }"},
        {{{"N/C", Number(3)}}, " \n  'N' : { 'Children' : { \n      'C' : { #3 }\n    }\n  }"},
        {{{"N", {}, {}, Store::EntryFlag::Persistable}}, " \n  'N' : { }"},
        // The versions lead at the root only.
        {{{"A", Number(1)}, {"Versions", Number(2)}, {"A/Versions", Number(3)}, {"A/B", Number(4)}},
         " \n  'Versions' : { #2 }, \n  'A' : { #1, 'Children' : { \n      'B' : { #4 }, \n      'Versions' : { #3 "
         "}\n    }\n  }"},
        // An entry may have any name.
        {{{"Children", Number(1)}, {"Children/Children", Number(2)}},
         " \n  'Children' : { #1, 'Children' : { \n      'Children' : { #2 }\n    }\n  }"},
        {{{"a\"\n\x01\xc3\xa4", Number(1)}}, " \n  'a\\'\\n\\u0001\xc3\xa4' : { #1 }"},
        // A proposed value counts where it is asked for.
        {{{"A", Number(1), Number(2), verify}}, " \n  'A' : { 'Value-Proposed' : 2, #1 }"},
        {{{"A", {}, Number(2), verify}}, " \n  'A' : { 'Value-Proposed' : 2, 'Type' : 'Int32' }"},
        {{{"A", Number(1), {}, verify}}, " \n  'A' : { #1 }"},
        {{{"A", Number(1), Number(2)}}, " \n  'A' : { #1 }"},
    };
    for (const auto& [entries, pText] : s_Cases)
        EXPECT_EQ(StoreIOTest::ExportText(*MakeStore(entries)), File(pText));
}

TEST(Exporter, WritesEachTypeInItsForm)
{
    const ISchema real(EType::Float64);
    const ISchema units =
        MakeEnumSchema(EType::Enum32, "ELengthUnits", {{"Millimeters", 0}, {"Centimeters", 1}, {"Meters", 2}});
    ISchema subplot = MakeNamedTupleSchema(
        "SubplotConfiguration",
        {{"YAxisMinimum", real}, {"YAxisMaximum", real}, {"YAxisCacheMinimum", real}, {"YAxisCacheMaximum", real}});
    subplot.Docs = {"Configuration for a single subplot."};
    std::vector<std::uint8_t> doubles(32);
    const double numbers[] = {-1.5, 2.0, 0.0, 0.1};
    std::memcpy(doubles.data(), numbers, sizeof(numbers));
    const std::pair<StoreValue, const char*> s_Cases[] = {
        {MakeValue(true), "true, 'Type' : 'Bool'"},
        {MakeValue(std::int8_t{-128}), "-128, 'Type' : 'Int8'"},
        {MakeValue(std::numeric_limits<std::int64_t>::min()), "-9223372036854775808, 'Type' : 'Int64'"},
        {MakeValue(std::uint8_t{255}), "255, 'Type' : 'UInt8'"},
        {MakeValue(std::uint32_t{4294967295}), "4294967295, 'Type' : 'UInt32'"},
        {MakeValue(std::numeric_limits<std::uint64_t>::max()), "18446744073709551615, 'Type' : 'UInt64'"},
        {MakeValue(0.1f), "0.10000000149011612, 'Type' : 'Float32'"},
        {MakeValue(0.0), "0.0, 'Type' : 'Float64'"},
        {MakeValue("a \"b\"\t\x1f / "), "'a \\'b\\'\\t\\u001F / ', 'Type' : 'String'"},
        {Raw(ISchema(EType::Int32), {1, 2}), "0, 'Type' : 'Int32'"}, // bytes that end too early
        {Raw(units, {2, 0, 0, 0}), "'\\'Meters\\'', 'Type' : 'Enum32', 'TypeName' : 'ELengthUnits', 'EnumValues' : [ [ "
                                   "'Millimeters', 0 ], [ 'Centimeters', 1 ], [ 'Meters', 2 ] ]"},
        {MakeValue(std::vector<std::int32_t>{1, 2}),
         "'[1,2]', 'Type' : 'List', 'SubSchemas' : [ [ '', { 'Type' : 'Int32' } ] ]"},
        {Raw(subplot, doubles),
         "'[-1.5,2.0,0.0,0.1]', 'Type' : 'NamedTuple', 'TypeName' : 'SubplotConfiguration', 'SubSchemas' : [ [ "
         "'YAxisMinimum', { 'Type' : 'Float64' } ], [ 'YAxisMaximum', { 'Type' : 'Float64' } ], [ 'YAxisCacheMinimum', "
         "{ 'Type' : 'Float64' } ], [ 'YAxisCacheMaximum', { 'Type' : 'Float64' } ] ], 'Docs' : [ 'Configuration for a "
         "single subplot.' ]"},
    };
    for (const auto& [value, pText] : s_Cases)
        EXPECT_EQ(StoreIOTest::ExportText(*MakeStore({{"V", value}})),
                  File(std::string(" \n  'V' : { 'Value' : ") + pText + " }"));
}

TEST(Exporter, TellsEachEntryThatItCannotWriteAndKeepsTheDocument)
{
    TestSupport::LogGuard log;
    const std::string noValue = "Failed trying to write values for entry path '%', entry has no values set.";
    const ISchema units = MakeEnumSchema(EType::Enum8, "ESides", {{"Left", 0}, {"Right", 1}});
    const std::pair<Entry, std::string> s_Cases[] = {
        {{"Cut", Raw(ISchema(EType::String), {2, 0, 0, 0, 'a'})}, noValue},
        {{"Infinite", MakeValue(std::vector{std::numeric_limits<float>::infinity()})}, noValue},
        {{"NoName", Raw(units, {2})}, noValue},
        {{"Proposal", Raw(units, {0}), Raw(units, {7}), Store::EntryFlag::VerifyRequired}, noValue},
        {{"ProposedOnly", {}, Number(1)}, noValue},
        {{"Void", Raw(ISchema(EType::Void), {1})}, "Failed trying to write the schema for entry path '%'"},
    };
    VStoreExporterJson exporter;
    EXPECT_EQ(Export(exporter, {{"Before", Number(1)}}), Result::Ok);
    Entries entries;
    std::vector<std::string> messages;
    for (const auto& [entry, message] : s_Cases)
    {
        entries.push_back(entry);
        messages.push_back(std::string(message).replace(message.find('%'), 1, entry.pPath));
    }
    EXPECT_EQ(Export(exporter, entries), Result::Failed);
    EXPECT_EQ(Errors(log), messages);
    EXPECT_EQ(TextOf(exporter), File(" \n  'Before' : { #1 }"));
}

TEST(Exporter, KeepsOtherMembersOfItsDocument)
{
    TestSupport::LogGuard log;
    VStoreExporterJson exporter;
    exporter.GetDocument().Parse("{\"Children\":1,\"By\":[\"a text that is kept in the pool\",{},null]}");
    for (const std::int32_t number : {1, 2})
        EXPECT_EQ(Export(exporter, {{"A", Number(number)}}), Result::Ok);
    EXPECT_EQ(TextOf(exporter), "{ \"By\" : [ \"a text that is kept in the pool\", {\n  }, null ], \"Version\" : "
                                "\"3.0\", \"Children\" : { \n  \"A\" : { \"Value\" : 2, \"Type\" : \"Int32\" }\n}\n}");
    exporter.GetDocument().SetArray();
    EXPECT_EQ(Export(exporter, {}), Result::InvalidArgument);
    EXPECT_EQ(Errors(log), std::vector<std::string>{"The Json document is not of type Object or Null"});
    EXPECT_EQ(TextOf(exporter), "[ ]");
}

TEST(Exporter, WritesNoDeeperThanAnImportReads)
{
    TestSupport::LogGuard log;
    std::string path;
    for (std::size_t i = 0; i < StoreIO::MaximumPathDepth; ++i)
        path += i == 0 ? "a" : "/a";
    VStoreExporterJson exporter;
    EXPECT_EQ(Export(exporter, {{path.c_str(), Number(7)}}), Result::Ok);
    EXPECT_EQ(Export(exporter, {{(path + "/a").c_str(), Number(7)}}), Result::Failed);
    EXPECT_EQ(Export(exporter, {{std::string(StoreIO::MaximumPathSize, 'a').c_str(), Number(7)}}), Result::Ok);
    EXPECT_EQ(Export(exporter, {{std::string(StoreIO::MaximumPathSize + 1, 'a').c_str(), Number(7)}}), Result::Failed);
    EXPECT_EQ(log.Take().size(), 2u);
}

TEST(Exporter, StopsAtTheFirstFailureOfAStream)
{
    TestSupport::LogGuard log;
    VStoreExporterJson exporter;
    const std::string longText(1'000'000, 'x');
    ASSERT_EQ(Export(exporter, {{"A", MakeValue(longText)}, {"B", MakeValue(longText)}}), Result::Ok);
    CountingStream whole;
    EXPECT_EQ(exporter.WriteToStream(whole), Result::Ok);
    EXPECT_LT(whole.LongestWrite, 150'000u) << "in pieces";
    for (int i = 1; i <= whole.Writes; ++i)
    {
        CountingStream broken(i);
        EXPECT_EQ(exporter.WriteToStream(broken), Result::DiskFull);
        EXPECT_EQ(broken.Writes, i);
        EXPECT_EQ(Errors(log),
                  std::vector<std::string>{"Error streaming document : DiskFull: No space left on device"});
    }
    CountingStream unflushed;
    unflushed.bFlushFails = true;
    EXPECT_EQ(exporter.WriteToStream(unflushed), Result::FileIOFailure);
    EXPECT_EQ(Errors(log).size(), 1u);
}

TEST(Exporter, ANumberThatIsNotFiniteFailsTheWrite)
{
    TestSupport::LogGuard log;
    const TestFolder folder;
    const StoreValue s_Values[] = {MakeValue(std::numeric_limits<double>::quiet_NaN()),
                                   MakeValue(-std::numeric_limits<float>::infinity())};
    for (const StoreValue& rValue : s_Values)
    {
        folder.Set("s.json=before");
        VStoreExporterJson exporter;
        EXPECT_EQ(Export(exporter, {{"A", rValue}, {"B", Number(1)}}), Result::Ok);
        CountingStream stream;
        EXPECT_EQ(exporter.WriteToStream(stream), Result::SerialisationFailure);
        EXPECT_EQ(exporter.WriteToFile(folder / "s.json", EWriteMode::Overwrite), Result::SerialisationFailure);
        const std::string why = "SerialisationFailure: Failed during serialization/deserialization of data";
        EXPECT_EQ(Errors(log), (std::vector{"Error streaming document : " + why,
                                            "Error writing document " + (folder / "s.json") + ": " + why}));
        EXPECT_EQ(folder.Show(), "s.json=before");
    }
}

TEST(Exporter, SavesTheTextOfTheStreamAndLeavesAWholeFileBehind)
{
    TestSupport::LogGuard log;
    const TestFolder folder;
    const std::string path = folder / "s.json";
    VStoreExporterJson exporter;
    ASSERT_EQ(Export(exporter, {{"A", MakeValue(std::string(300'000, '\n'))}, {"B/C", Number(1)}}), Result::Ok);
    EXPECT_EQ(exporter.WriteToFile(path, EWriteMode::Exclusive), Result::Ok);
    EXPECT_EQ(folder.Show(), "s.json=" + TextOf(exporter));
    folder.Set("s.json=before");
    EXPECT_EQ(exporter.WriteToFile(path, EWriteMode::Exclusive), Result::AlreadyPresent);
    EXPECT_EQ(Errors(log), std::vector<std::string>{}) << "it was asked for";
    EXPECT_EQ(exporter.WriteToFile(folder / "missing/s.json", EWriteMode::Overwrite), Result::FileNotFound);
    EXPECT_EQ(Errors(log), std::vector<std::string>{"Error writing document " + (folder / "missing/s.json") +
                                                    ": FileNotFound: The file does not exist or is unreadable"});
    rlimit before{};
    ASSERT_EQ(::getrlimit(RLIMIT_FSIZE, &before), 0);
    const rlimit small{200'000, before.rlim_max};
    const auto oldHandler = std::signal(SIGXFSZ, SIG_IGN);
    ASSERT_EQ(::setrlimit(RLIMIT_FSIZE, &small), 0);
    const IResult result = exporter.WriteToFile(path, EWriteMode::Overwrite);
    ::setrlimit(RLIMIT_FSIZE, &before);
    (void)std::signal(SIGXFSZ, oldHandler);
    EXPECT_EQ(result, Result::FileIOFailure) << "no room for all of it";
    EXPECT_EQ(Errors(log).size(), 1u);
    EXPECT_EQ(folder.Show(), "s.json=before");
}

} // namespace

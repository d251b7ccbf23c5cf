#include "StoreDocuments.h"
#include "support/LogGuard.h"

#include <gtest/gtest.h>

#include <filesystem>
#include <fstream>
#include <string>

namespace
{

using namespace StoreIOTest;

std::string Named(std::string_view i_Name, std::string_view i_Members)
{
    return '"' + std::string(i_Name) + "\":{" + std::string(i_Members) + '}';
}

/// A file with these entries.
std::string File(std::string_view i_Entries)
{
    return R"({"Version":"3.0",)" + Named("Children", i_Entries) + '}';
}

/// A file with one entry "E".
std::string Entry(std::string_view i_Type, std::string_view i_Value)
{
    return File(Named("E", "\"Type\":\"" + std::string(i_Type) + "\",\"Value\":" + std::string(i_Value)));
}

std::string Repeat(std::string_view i_Text, int i_Count)
{
    std::string text;
    for (int i = 0; i < i_Count; ++i)
        text += i_Text;
    return text;
}

std::string Nest(std::string_view i_Open, std::string_view i_Inner, std::string_view i_Close, int i_Count)
{
    return Repeat(i_Open, i_Count) + std::string(i_Inner) + Repeat(i_Close, i_Count);
}

/// Reads a text into a store that holds "Kept": the name of the result, what was logged, and what the store then holds
/// beside it.
std::string Outcome(std::string_view i_Text)
{
    TestSupport::LogGuard log;
    const auto pStore = MakeStore();
    EXPECT_EQ(ImportText(*pStore, File(R"("Kept":{"Value":7,"Type":"Int32"})")), TQL::Result::Ok);
    std::string text(ImportText(*pStore, i_Text).Name());
    for (const auto& rEntry : log.Take())
        text += "; " + rEntry.Text;
    std::string values = ValuesText(*pStore);
    const std::size_t kept = values.find("Kept=Int32 7");
    EXPECT_NE(kept, std::string::npos) << values;
    return text + " | " + values.erase(kept, std::string_view("Kept=Int32 7; ").size());
}

constexpr const char* s_pPlace = ", (Element XPath=\"/Configuration/Node[@name='E']\") | ";

std::string NoSchema(const std::string& i_rText)
{
    return "Failed; Encountered 'E', and unable to set value schema from '" + i_rText +
           "'. (Element XPath=\"/Configuration/Node[@name='E']\") | ";
}

std::string TooLow(const std::string& i_rVersion)
{
    return "InvalidVersion; StoreFileReader cannot load IStore file with version " + i_rVersion +
           ", minimum supported version is 3.0 | ";
}

std::string TooHigh(const std::string& i_rVersion)
{
    return "InvalidVersion; Cannot load IStore file with version " + i_rVersion +
           ", maximum supported version is 3.0 | ";
}

std::string NoJson(const std::string& i_rProblem)
{
    return "SerialisationFailure; Error reading document: " + i_rProblem + " | ";
}

const std::string s_BadValue = std::string("Failed; Encountered 'E' with invalid 'Value'") + s_pPlace;
const std::string s_NoVersion = "InvalidVersion; The file format version element \"Version\" is invalid. | ";
const std::string s_NoString =
    "InvalidVersion; The file format version element \"Version\" is not a string type json element | ";
const std::string s_NoData = "Failed; The file has no top-level \"data\" member to read | ";
const std::string s_NoObject = "Failed; The value stored under the member \"data\" is not an object | ";
const std::string s_TooDeep = "More than 1024 levels of nesting.";

TEST(Importer, TellsWhatIsWrongWithAFileAndKeepsTheRest)
{
    const std::string longName(4097, 'n');
    const struct
    {
        std::string Text;
        std::string Outcome;
    } s_Cases[] = {
        // no JSON
        {"", NoJson("The document is empty. (byte 1)")},
        {" \n\t", NoJson("The document is empty. (byte 4)")},
        {std::string(100, '\0'), NoJson("The document is empty. (byte 1)")},
        {"\xEF\xBB\xBF{}", NoJson("Invalid value. (byte 1)")},
        {std::string("{\0}\0", 4), NoJson("Missing a name for object member. (byte 2)")},
        {File("") + "}", NoJson("The document root must not be followed by other values. (byte 32)")},
        {"// remark\n" + File(""), NoJson("Invalid value. (byte 1)")},
        {File("\"E\":{},"), NoJson("Missing a name for object member. (byte 37)")},
        {"{'Version':'3.0'}", NoJson("Missing a name for object member. (byte 2)")},
        {Entry("Float64", "NaN"), NoJson("Invalid value. (byte 60)")},
        {Entry("Float64", "-inf"), NoJson("Invalid value. (byte 61)")},
        {Entry("Float64", "Infinity"), NoJson("Invalid value. (byte 60)")},
        {Entry("Float64", "1e999"), NoJson("Number too big to be stored in double. (byte 60)")},
        {Entry("Float64", "1" + Repeat("0", 400)), NoJson("Number too big to be stored in double. (byte 60)")},
        {Entry("Float64", "-1.8e308"), NoJson("Number too big to be stored in double. (byte 60)")},
        {Entry("Float64", Repeat("7", 80) + "e308"), NoJson("Number too big to be stored in double. (byte 60)")},
        {Entry("Float64", "01"), NoJson("Missing a comma or '}' after an object member. (byte 61)")},
        {Entry("String", "\"\\uD800\""), NoJson("The surrogate pair in string is invalid. (byte 60)")},
        {Entry("String", "\"\n\""), NoJson("Invalid escape character in string. (byte 60)")},
        {Repeat("[", 10000), NoJson(s_TooDeep + " (byte 1026)")},
        {Repeat("{\"C\":", 1'000'000), NoJson(s_TooDeep + " (byte 5122)")},
        {File(Nest("\"A\":{\"Children\":{", "", "}}", 10000)), NoJson(s_TooDeep + " (byte 8722)")},
        {Entry("Int32", "1,\"Docs\":" + Nest("[", "", "]", 10000)), NoJson(s_TooDeep + " (byte 1089)")},
        // not a store
        {"[]", "InvalidFormat | "},
        {"null", "InvalidFormat | "},
        {"\"3.0\"", "InvalidFormat | "},
        {"{}", "FileNotOpen | "},
        // versions
        {R"({"Children":{}})", TooLow("1.0")},
        {R"({"Version":"2.9","Children":{}})", TooLow("2.9")},
        {R"({"Version":"-3.0","Children":{}})", TooLow("-3.0")},
        {R"({"Version":"3.-1","Children":{}})", TooLow("3.-1")},
        {R"({"Version":"3.1","Children":{}})", TooHigh("3.1")},
        {R"({"Version":"10.0","Children":{}})", TooHigh("10.0")},
        {R"({"Version":"3","Children":{}})", s_NoVersion},
        {R"({"Version":"","Children":{}})", s_NoVersion},
        {R"({"Version":"3.","Children":{}})", s_NoVersion},
        {R"({"Version":".0","Children":{}})", s_NoVersion},
        {R"({"Version":"3.0.0","Children":{}})", s_NoVersion},
        {R"({"Version":" 3.0","Children":{}})", s_NoVersion},
        {R"({"Version":"3.0\u0000","Children":{}})", s_NoVersion},
        {R"({"Version":"4294967299.0","Children":{}})", s_NoVersion},
        {R"({"Version":3.0,"Children":{}})", s_NoString},
        {R"({"Version":null,"Children":{}})", s_NoString},
        {R"({"Version":["3.0"],"Children":{}})", s_NoString},
        {R"({"Version":"3.0","Version":"9.0","Children":{}})", "Ok | "},
        // the tree
        {R"({"Version":"3.0"})", s_NoData},
        {R"({"Version":"3.0","children":{}})", s_NoData},
        {R"({"Version":"3.0","Children":null})", s_NoObject},
        {R"({"Version":"3.0","Children":[]})", s_NoObject},
        {R"({"Version":"3.0","Children":{},"Children":1,"Other":[{}]})", "Ok | "},
        {File(R"("A":{"Value":1,"Type":"Int8"},"B":7,"C":{"Value":1,"Type":"Int8"})"),
         "Failed; Expected to encounter a json object as the value of member 'B' at path '', (Element "
         "XPath=\"/Configuration\") | A=Int8 1; "},
        {File(R"("A":{"Children":{"B":null}},"C":{"Value":1,"Type":"Int8"})"),
         "Failed; Expected to encounter a json object as the value of member 'B' at path 'A', (Element "
         "XPath=\"/Configuration/Node[@name='A']\") | C=Int8 1; "},
        {File(R"("A":{"Children":[1]},"B":{"Children":"x"},"C":{})"), "Ok | "},
        {File(R"("A/B":{"Value":1,"Type":"Int8"})"), "Ok | A/B=Int8 1; "},
        {File(Named("E", R"("Value":1,"Type":"Int8")") + ',' + Named("E", R"("Value":2,"Type":"Int8")")),
         "Ok | E=Int8 2; "},
        {File(Named("E", R"("Value":1,"Type":"Int8")") + ',' + Named("E", R"("Value":2,"Type":"Bool")")),
         "Failed; Failed to set 'E' verified value: the value type does not match the entry type.; Encountered 'E', "
         "and unable to set 'Value': InvalidType: An incorrect type was provided (Element "
         "XPath=\"/Configuration/Node[@name='E']\") | E=Int8 1; "},
        {File(Named("*", R"("Value":1,"Type":"Int8")")),
         "Failed; Encountered '*', and unable to set 'Value': NotFound: The requested information, instance or type "
         "was not found (Element XPath=\"/Configuration/Node[@name='*']\") | "},
        {File(Named("", R"("Value":1,"Type":"Int8")") + ',' + Named("/E", R"("Children":{"":{"Value":1}})") + ',' +
              Named("A", R"("Children":{"":{"Value":1,"Type":"Int8"}})")),
         "Failed; Encountered '', which names no entry, (Element XPath=\"/Configuration\"); Encountered '/E', which "
         "names "
         "no entry, (Element XPath=\"/Configuration\") | A/=Int8 1; "},
        {File(Named(longName, R"("Value":1,"Type":"Int8")")),
         "Failed; Encountered a path longer than 4096 bytes or 256 levels, (Element XPath=\"/Configuration\") | "},
        {File(Named("A" + Repeat("/", 256), R"("Value":1,"Type":"Int8")")),
         "Failed; Encountered a path longer than 4096 bytes or 256 levels, (Element XPath=\"/Configuration\") | "},
        {File(Nest("\"A\":{\"Children\":{", "\"A\":{\"Value\":1}", "}}", 257)),
         "Failed; Encountered a path longer than 4096 bytes or 256 levels, (Element XPath=\"" +
             ("/Configuration" + Repeat("/Node[@name='A']", 256)) + "\") | "},
        // schemas
        {Entry("int32", "1"), NoSchema(R"({"Type":"int32"})")},
        {File(Named("E", R"("Type":5,"Value":1)")), NoSchema(R"({"Type":5})")},
        {Entry("Int8", R"(1,"Role":"Boss")"), NoSchema(R"({"Type":"Int8","Role":"Boss"})")},
        {Entry("Int8", R"(1,"Detail":65536)"), NoSchema(R"({"Type":"Int8","Detail":65536})")},
        {Entry("Array", R"("[]","Count":-1)"), NoSchema(R"({"Type":"Array","Count":-1})")},
        {Entry("Int8", R"(1,"TypeName":null)"), NoSchema(R"({"Type":"Int8","TypeName":null})")},
        {Entry("Enum8", R"("\"a\"","EnumValues":{"a":1})"), NoSchema(R"({"Type":"Enum8","EnumValues":{"a":1}})")},
        {Entry("Enum8", R"("\"a\"","EnumValues":[["a",1,2]])"),
         NoSchema(R"({"Type":"Enum8","EnumValues":[["a",1,2]]})")},
        {Entry("List", R"("[]","SubSchemas":["Int8"])"), NoSchema(R"({"Type":"List","SubSchemas":["Int8"]})")},
        {Entry("Int8", R"(1,"Docs":[ "a" , 1.5e0 ])"), NoSchema(R"({"Type":"Int8","Docs":["a",1.5]})")},
        {Entry("Int8", "1,\"Docs\":" + Nest("[", "", "]", 1000)),
         NoSchema("{\"Type\":\"Int8\",\"Docs\":" + Nest("[", "", "]", 1000) + '}')},
        {Entry("List", "\"[]\",\"SubSchemas\":" + Nest("[[\"\",{\"SubSchemas\":", "[]", "}]]", 64)),
         NoSchema("{\"Type\":\"List\",\"SubSchemas\":" + Nest("[[\"\",{\"SubSchemas\":", "[]", "}]]", 64) + '}')},
        {Entry("Int8", R"(1,"Type":"Bool","Unit":["mm",{}])"), "Ok | E=Int8 1; "},
        {File(Named("E", R"("Type":"int32","Docs":5,"Children":{"F":{"Value":1,"Type":"Int8"}})")),
         "Ok | E/F=Int8 1; "},
        {File(Named("E", R"("Type":"int32","Value":1,"Children":{"F":{"Value":1,"Type":"Int8"}})")),
         NoSchema(R"({"Type":"int32"})") + "E/F=Int8 1; "},
        // values: what is no number counts as 0, and what a number has too much is cut off
        {File(Named("E", "\"Value\":1")), s_BadValue},
        {Entry("Void", "\"\""), s_BadValue},
        {Entry("Ref", "\"1\""), s_BadValue},
        {Entry("Bool", "1"), "Ok | E=Bool false; "},
        {Entry("Int8", "300"), "Ok | E=Int8 44; "},
        {Entry("Int32", "\"abc\""), "Ok | E=Int32 0; "},
        {Entry("Int64", "1.0"), "Ok | E=Int64 0; "},
        {Entry("UInt64", "18446744073709551616"), "Ok | E=UInt64 0; "},
        {Entry("UInt16", "-1"), "Ok | E=UInt16 65535; "},
        {Entry("Float64", "{}"), "Ok | E=Float64 0.0; "},
        {Entry("Float64", "1e-999"), "Ok | E=Float64 0.0; "},
        {Entry("Float64", "0e308"), "Ok | E=Float64 0.0; "},
        {Entry("Float64", "-0e-300"), "Ok | E=Float64 -0.0; "},
        {Entry("Float64", "0." + Repeat("0", 400)), "Ok | E=Float64 0.0; "},
        {Entry("List", R"("[0.0e99]","SubSchemas":[["",{"Type":"Float32"}]])"), "Ok | E=List [0.0]; "},
        {Entry("Float64", "18446744073709551615.5"), "Ok | E=Float64 18446744073709553000.0; "},
        {Entry("Float64", "0." + Repeat("0", 400) + "1e401"), "Ok | E=Float64 1.0; "},
        {Entry("List", R"("[1.8e308]","SubSchemas":[["",{"Type":"Float64"}]])"), s_BadValue},
        {Entry("Float64", "12345678901234567890"), "Ok | E=Float64 12345678901234568000.0; "},
        {Entry("Float32", "16777217"), "Ok | E=Float32 16777216.0; "},
        {Entry("Float32", "9007199791611905"), "Ok | E=Float32 9007200328482816.0; "},
        {Entry("Float32", "1e300"), "Ok | E=Float32 no text; "},
        {Entry("String", "1"), s_BadValue},
        {Entry("String", "\"\xff\xc0\\u0000\""), "Ok | E=String \"\xff\xc0\\u0000\"; "},
        {Entry("Enum8", R"("a","EnumValues":[["a",1]])"), s_BadValue},
        {Entry("Enum8", R"("\"b\"","EnumValues":[["a",1]])"), s_BadValue},
        {Entry("Enum8", R"(1,"EnumValues":[["a",1]])"), s_BadValue},
        {Entry("List", R"([1],"SubSchemas":[["",{"Type":"Int8"}]])"), s_BadValue},
        {Entry("List", R"("[1,128]","SubSchemas":[["",{"Type":"Int8"}]])"), s_BadValue},
        {Entry("List", R"("[NaN]","SubSchemas":[["",{"Type":"Float64"}]])"), s_BadValue},
        {Entry("Array", R"("[1,2]","Count":3,"SubSchemas":[["",{"Type":"Int8"}]])"), s_BadValue},
        {Entry("Array", R"("[]","Count":0,"SubSchemas":[["",{"Type":"Int8"}]])"), s_BadValue},
        {Entry("Tuple", R"("[1]2","SubSchemas":[["",{"Type":"Int8"}]])"), s_BadValue},
        {Entry("NamedTuple", R"(" {\"b\":2 , \"a\":1}\t","SubSchemas":[["a",{"Type":"Int8"}],["b",{"Type":"Int8"}]])"),
         "Ok | E=NamedTuple [1,2]; "},
        {Entry("List", "\"" + Nest("[", "", "]", 100000) + "\",\"SubSchemas\":[[\"\",{\"Type\":\"Int8\"}]]"),
         s_BadValue},
        // both values
        {Entry("Int8", R"(1,"Value-Proposed":2)"), "Ok | E=Int8 1?2; "},
        {File(Named("E", R"("Type":"Int8","Value-Proposed":2)")), "Ok | E=Int8?2; "},
        {Entry("String", R"(1,"Value-Proposed":"p")"),
         std::string("Failed; Encountered 'E' with invalid 'Value'") + s_pPlace + "E=String?\"p\"; "},
        {Entry("String", R"(1,"Value-Proposed":2)"),
         std::string("Failed; Encountered 'E' with invalid 'Value-Proposed', (Element "
                     "XPath=\"/Configuration/Node[@name='E']\"); Encountered 'E' with invalid 'Value'") +
             s_pPlace},
        {Entry("Int8", "1,\"Value\":2"), "Ok | E=Int8 1; "},
    };
    for (const auto& rCase : s_Cases)
        EXPECT_EQ(Outcome(rCase.Text), rCase.Outcome) << rCase.Text.substr(0, 200);
}

TEST(Importer, AFileThatIsCutOffStagesNothing)
{
    const std::string file = File(
        R"("A" : { "Value-Proposed": [1, 2.5e-3, -1], "Type":"Int32", "Docs":["\"\u00e9\n", true, null, false ] })");
    EXPECT_TRUE(Outcome(file).starts_with("Failed; Encountered 'A', and unable")) << Outcome(file);
    for (std::size_t size = 0; size < file.size(); ++size)
    {
        const std::string outcome = Outcome(std::string_view(file).substr(0, size));
        EXPECT_TRUE(outcome.starts_with("SerialisationFailure; Error reading document: ")) << size << ": " << outcome;
        EXPECT_TRUE(outcome.ends_with(")| ") || outcome.ends_with(") | ")) << size << ": " << outcome;
    }
}

TEST(Importer, ReadsAStringOfAHundredMillionBytes)
{
    const auto pStore = MakeStore();
    constexpr std::size_t size = 100'000'000;
    EXPECT_EQ(ImportText(*pStore, Entry("String", '"' + std::string(size, 'x') + '"')), TQL::Result::Ok);
    const TQL::ScopedRead read(*pStore);
    EXPECT_EQ(read->GetVerifiedValue(pStore->GetEntry(Store::EntryPath("E"))).Bytes().size(), 4 + size);
}

TEST(Importer, GivesTheErrorOfAStreamThatBreaks)
{
    StoreIO::VStoreImporterJson importer;
    const std::string file = File("");
    for (const std::size_t size : {std::size_t{5}, file.size()})
    {
        TQL::VTextInput input(std::string_view(file).substr(0, size), TQL::Result::FileIOFailure);
        EXPECT_EQ(importer.ReadStream(input), TQL::Result::FileIOFailure);
        const auto pStore = MakeStore();
        EXPECT_EQ(importer.Import(*TQL::ScopedWrite(*pStore)), TQL::Result::InvalidFormat);
    }
}

TEST(Importer, ReadsFilesAndWhatAnInterruptedSaveLeft)
{
    TestSupport::LogGuard log;
    const std::filesystem::path folder = std::filesystem::path(testing::TempDir()) / "graphplots-importer";
    const std::string path = (folder / "settings.json").string();
    std::filesystem::remove_all(folder);
    std::filesystem::create_directory(folder);
    const auto write = [](const std::string& i_rPath, const std::string& i_rText)
    {
        std::ofstream(i_rPath, std::ios::binary) << i_rText;
    };
    StoreIO::VStoreImporterJson importer;

    EXPECT_EQ(importer.ReadFile(path), TQL::Result::FileNotFound);
    EXPECT_EQ(importer.ReadFile(folder.string()), TQL::Result::InvalidType);
    write(path + ".old", Entry("Int8", "1"));
    EXPECT_EQ(importer.ReadFile(path), TQL::Result::Ok);
    const auto pStore = MakeStore();
    EXPECT_EQ(importer.Import(*TQL::ScopedWrite(*pStore)), TQL::Result::Ok);
    EXPECT_EQ(ValuesText(*pStore), "E=Int8 1");

    // A failed read leaves nothing of the read before.
    EXPECT_EQ(log.Take().size(), 1U); // the backup that was restored
    for (const auto& [pText, pProblem] :
         {std::pair{"", "The document is empty. (line 1, column 1)"},
          std::pair{"{\n \"Version\" \"3.0\"}", "Missing a colon after a name of object member. (line 2, column 12)"}})
    {
        write(path, pText);
        EXPECT_EQ(importer.ReadFile(path), TQL::Result::SerialisationFailure);
        const auto messages = log.Take();
        ASSERT_EQ(messages.size(), 1U);
        EXPECT_EQ(messages[0].Text, "Error reading document " + path + ": " + pProblem);
        EXPECT_EQ(importer.Import(*TQL::ScopedWrite(*pStore)), TQL::Result::InvalidFormat);
    }
    std::filesystem::remove_all(folder);
}

} // namespace

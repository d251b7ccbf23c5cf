#include "Services/VGlobalLogSink.h"
#include "Studio/StoreLint/CheckStoreReport.h"
#include "Studio/StoreLint/StoreFileLint.h"

#include <gtest/gtest.h>

#include <fstream>
#include <sstream>

namespace
{

using Studio::MakeCheckStoreReport;

/// A store file with these entries, the first in line 2.
std::string File(const std::string& i_rEntries)
{
    return "{ \"Version\" : \"3.0\", \"Children\" : {\n" + i_rEntries + "\n} }";
}

constexpr const char* s_pUnits = "\"Type\":\"Enum32\",\"TypeName\":\"EUnits\",\"EnumValues\":[[\"mm\",0],[\"m\",1]]";
constexpr const char* s_pInts = "\"Type\":\"List\",\"SubSchemas\":[[\"\",{\"Type\":\"Int32\"}]]";

TEST(CheckStore, ShowsWhatAFileHolds)
{
    const std::string text = File(
        std::string("\"N\":{\"Children\":{\"b\":{\"Value\":true,\"Type\":\"Bool\"},\"a\":{\"Value-Proposed\":1e-7,"
                    "\"Type\":\"Float64\"}}},\n\"L\":{\"Value\":\"[1,2]\",") +
        s_pInts + "},\n\"U\":{\"Value\":\"\\\"m\\\"\"," + s_pUnits +
        "},\n\"S\":{\"Value\":\"a\\nb/\",\"Value-Proposed\":\"\",\"Type\":\"String\"},\n\"T\":{\"Value\":\"{\\\"y\\\""
        ":2,\\\"x\\\":[1,1,1]}\",\"Type\":\"NamedTuple\",\"SubSchemas\":[[\"x\",{\"Type\":\"Array\",\"Count\":3,"
        "\"SubSchemas\":[[\"\",{\"Type\":\"Int8\"}]]}],[\"y\",{\"Type\":\"UInt64\"}]]}");
    const auto report = MakeCheckStoreReport("f", text);
    EXPECT_EQ(report.Problems, 0u);
    EXPECT_EQ(report.Text, "L: List of Int32 = [1,2]\n"
                           "N\n"
                           "  a: Float64, proposed 1e-7\n"
                           "  b: Bool = true\n"
                           "S: String = \"a\\nb/\", proposed \"\"\n"
                           "T: NamedTuple (x: Array of 3 Int8, y: UInt64) = [[1,1,1],2]\n"
                           "U: EUnits = \"m\"\n"
                           "\n"
                           "f: no problems\n");
}

TEST(CheckStore, TheExampleOfTheDocumentationIsGood)
{
    std::ostringstream document;
    document << std::ifstream(GRAPHPLOTS_SOURCE_DIR "/docs/file-formats.md").rdbuf();
    const std::string begin = "```json\n";
    const std::size_t at = document.str().find(begin) + begin.size();
    const auto report = MakeCheckStoreReport("f", document.str().substr(at, document.str().find("```", at) - at));
    EXPECT_EQ(report.Text, "User\n"
                           "  Preferences\n"
                           "    Graph Plots\n"
                           "      ShowPanZoomGraphic: Bool = false\n"
                           "      TraceColourSet: ETraceColourSet = \"TracesColourDeficientMK\"\n"
                           "\n"
                           "f: no problems\n");
}

/// What stands behind the tree, without the summary.
std::string ProblemsOf(const std::string& i_rText)
{
    std::istringstream lines(MakeCheckStoreReport("f", i_rText).Text);
    std::string problems;
    for (std::string line; std::getline(lines, line);)
        if (line.starts_with("f:") && line[2] != ' ')
            problems += line.substr(2) + "\n";
    return problems;
}

TEST(CheckStore, SaysWhatIsWrongAndWhere)
{
    const Services::VGlobalLogSink quiet(0, nullptr, nullptr);
    const std::string value = "\"v\":{\"Value\":";
    const struct
    {
        std::string Text;
        const char* pExpected;
    } rows[] = {
        // No JSON
        {"", "1:1: expected '{': there is nothing in the file"},
        {"\xEF\xBB\xBF{}", "1:1: expected '{': a byte order mark stands before it; save the file as UTF-8 without one"},
        {"{} x", "1:4: expected the end of the file"},
        {"{\n\"é\" : 1\n\"b\" : 2 }", "3:1: expected ',' before the next member, or '}'"},
        {"{ \"é\" 1 }", "1:7: expected ':' between a name and its value"},
        {"{ \"a\" : [ 1, 2 ],\n}", "2:1: expected a name in double quotes (or a comma too many stands before this)"},
        {"{ \"a\" : 'x' }",
         "1:9: expected a value: a text in double quotes, a number, true, false, a list or an object"},
        {"{ \"a\" :\n[ 1,\n2", "3:2: expected ',' before the next element, or ']'; the file ends inside the list that "
                               "begins in line 2"},
        {"{ \"a\" : \"x\ty\" }",
         "1:11: expected one of \\\" \\\\ \\/ \\b \\f \\n \\r \\t \\u, for a line break \\n, for a tab \\t"},
        {std::string(1025, '['), "1:1025: expected no more than 1024 objects and lists inside one another"},
        // No store file
        {"[]", "1:1: expected an object with \"Version\" and \"Children\""},
        {"{\"Version\":\"3.0\"}", "1:1: expected a member \"Children\", an object that holds the entries"},
        {"{\"Children\":{}}", "1:1: expected a member \"Version\" with the value \"3.0\"; without it nothing is read"},
        {"{\"Version\":\"3.1\",\"Children\":{}}", "1:12: the version is \"3.1\"; only \"3.0\" can be read"},
        {"{\"Version\":3.0,\"Children\":{},\"x\":1}",
         "1:12: the version is 3.0; only \"3.0\" can be read\n1:30: unknown member \"x\" is passed over"},
        {"{\"Version\":\"3.0\",\"Children\":[]}",
         "1:29: expected an object: \"Children\" holds entries by their names"},
        // Entries
        {File("\"a\":{},\n\"n\":5,\n\"a\":{}"),
         "3:5: n: expected an object; the entries behind it on this level are not read\n"
         "4:1: a second \"a\" in one object, after that of line 2; the last one counts"},
        {File("\"a\":{\"Children\":{\"b/c\":{},\"*\":{},\"\":{}}}"),
         "2:18: a/b/c: a name with '/' is taken for several entries, one inside the other: write them so\n"
         "2:27: a/*: \"*\" stands for any name and is none\n"
         "2:34: a/: the entry's name is empty"},
        {File("\"a\":{\"value\":1,\"Type\":\"Bool\"}"),
         "2:6: a: unknown member \"value\" is passed over\n2:16: a: \"Type\" without a \"Value\" is passed over"},
        {File("\"a\":{\"Value\":1,\"Value\":2,\"Type\":\"Int8\"}"),
         "2:16: a: a second \"Value\" in one object, after that of line 2; the first counts"},
        {File("\"\xE9\":{}"), "2:1: this text is not UTF-8; save the file in that encoding"},
        // Types and values
        {File(value + "1}"), "2:5: v: expected a member \"Type\": without it the value cannot be read"},
        {File(value + "1,\"Type\":\"int\"}"), "2:23: v: \"Type\" is \"int\"; no type has that name"},
        {File(value + "1,\"Type\":\"Int8\",\"Count\":-1}"), "2:38: v: \"Count\" is -1; it cannot be read as such"},
        {File(value + "-129,\"Type\":\"Int8\"}"),
         "2:14: v: \"Value\" is -129; expected a whole number from -128 to 127"},
        {File(value + "1.0,\"Type\":\"UInt64\"}"),
         "2:14: v: \"Value\" is 1.0; expected a whole number from 0 to 18446744073709551615"},
        {File(value + "\"yes\",\"Type\":\"Bool\"}"), "2:14: v: \"Value\" is \"yes\"; expected true or false"},
        {File(value + "null,\"Type\":\"Float64\"}"), "2:14: v: \"Value\" is null; expected a number"},
        {File(value + "7,\"Type\":\"String\"}"), "2:14: v: \"Value\" is 7; expected a text in double quotes"},
        {File(value + "[1],\"Value-Proposed\":\"[1,x]\"," + s_pInts + "}"),
         "2:14: v: \"Value\" is [1]; expected the text of a list, in double quotes, for the type List of Int32\n"
         "2:35: v: \"Value-Proposed\" is \"[1,x]\"; expected the text of a list, in double quotes, for the type List "
         "of Int32"},
        {File(value + "\"m\"," + s_pUnits + "}"),
         "2:14: v: \"Value\" is \"m\"; expected \"\\\"m\\\"\", with the value's own quotes"},
        {File(value + "\"\\\"ft\\\"\"," + s_pUnits + "}"),
         "2:14: v: \"Value\" is \"\\\"ft\\\"\"; expected one of \"\\\"mm\\\"\", \"\\\"m\\\"\""},
    };
    for (const auto& rRow : rows)
        EXPECT_EQ(ProblemsOf(rRow.Text), std::string(rRow.pExpected) + "\n") << rRow.Text;
}

/// A file that an application would not take whole must never be called good, nor the place be left out.
TEST(CheckStore, FindsWhateverTheReaderRefuses)
{
    const Services::VGlobalLogSink quiet(0, nullptr, nullptr);
    const std::string good =
        File(std::string("\"U\":{\"Value\":\"\\\"m\\\"\",") + s_pUnits + "},\n\"L\":{\"Value\":\"[1,-2]\"," + s_pInts +
             ",\"Children\":{\"F\":{\"Value\":1.5e3,\"Type\":\"Float64\"},\"B\":{\"Value\":true,\"Type\":\"Bool\"}}}");
    int refused = 0;
    const auto check = [&refused](const std::string& i_rText)
    {
        Studio::LocatedValue root;
        const bool bJson = !Studio::ParseLocated(i_rText, root);
        const bool bProblems = !bJson || !Studio::FindStoreProblems(i_rText, root).empty();
        const auto report = MakeCheckStoreReport("f", i_rText);
        EXPECT_EQ(report.Problems != 0, bProblems) << "only the reader found fault:\n" << i_rText << report.Text;
        refused += bProblems ? 1 : 0;
    };
    for (std::size_t at = 0; at < good.size(); ++at)
    {
        check(good.substr(0, at));
        for (const char changed : std::string_view("{}[]\",:\\01a./* "))
            check(good.substr(0, at) + changed + good.substr(at + 1));
    }
    EXPECT_GT(refused, 1000);
    EXPECT_EQ(MakeCheckStoreReport("f", good).Problems, 0u);
}

} // namespace

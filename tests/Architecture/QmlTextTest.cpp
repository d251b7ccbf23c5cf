#include <gtest/gtest.h>

#include <filesystem>
#include <fstream>
#include <iterator>
#include <regex>
#include <set>
#include <string>

// What QML shows may come from a file or a message, so no text may be left to guess that it is rich.

namespace
{

/// May show marks, all of which the program has made: in units and in the tool tip of a subplot.
const std::set<std::string> s_MayBeMarked = {"PlainToolTip.qml", "ValueAxis.qml"};

std::string ReadWithoutComments(const std::filesystem::path& i_rPath)
{
    std::ifstream file(i_rPath);
    const std::string text{std::istreambuf_iterator<char>(file), {}};
    return std::regex_replace(text, std::regex("(^|\\s)//[^\\n]*"), "$1");
}

/// The properties of the object whose brace is open at i_Begin, without those of the objects in it.
std::string OwnProperties(const std::string& i_rText, std::size_t i_Begin)
{
    std::string properties;
    int depth = 1;
    for (std::size_t i = i_Begin; i < i_rText.size() && depth != 0; ++i)
    {
        depth += i_rText[i] == '{' ? 1 : i_rText[i] == '}' ? -1 : 0;
        if (depth == 1)
            properties += i_rText[i];
    }
    return properties;
}

/// What is wrong with the texts of a file; empty when nothing is. Counts them.
std::string FaultsOf(const std::string& i_rText, bool i_bMayBeMarked, int& io_rTexts)
{
    std::string faults;
    static const std::regex object("(?:^|[^\\w.])(Text|Label|TextEdit|TextArea|ToolTip|ItemDelegate)\\s*\\{");
    for (std::sregex_iterator it(i_rText.begin(), i_rText.end(), object), end; it != end; ++it)
    {
        ++io_rTexts;
        const std::string name = it->str(1);
        const std::string own = OwnProperties(i_rText, static_cast<std::size_t>(it->position() + it->length()));
        if (name == "ToolTip" || name == "ItemDelegate") // the style's own shows what looks like marks as marks
        {
            faults += own.find("contentItem:") == std::string::npos ? name + " without a text of its own; " : "";
            continue;
        }
        std::smatch format;
        if (!std::regex_search(own, format, std::regex("\\btextFormat:([^\\n]*)")))
            faults += name + " without a format; ";
        else if (!std::regex_search(format.str(1), std::regex("Text\\.PlainText\\s*$")) &&
                 !(i_bMayBeMarked && std::regex_search(format.str(1), std::regex("Text\\.StyledText"))))
            faults += name + " of a format that is not fixed; ";
    }
    if (std::regex_search(i_rText, std::regex("\\bToolTip\\.(text|show)\\b")))
        faults += "the style's own tool tip; ";
    return faults;
}

TEST(QmlText, HasAFixedFormat)
{
    int texts = 0;
    for (const char* pRoot : {"src", "host", "examples"})
        for (const auto& rEntry :
             std::filesystem::recursive_directory_iterator(std::filesystem::path(GRAPHPLOTS_SOURCE_DIR) / pRoot))
            if (rEntry.path().extension() == ".qml")
            {
                const bool bMayBeMarked = s_MayBeMarked.contains(rEntry.path().filename().string());
                EXPECT_EQ(FaultsOf(ReadWithoutComments(rEntry.path()), bMayBeMarked, texts), "") << rEntry.path();
            }
    EXPECT_GE(texts, 8) << "the files were not understood";
}

} // namespace

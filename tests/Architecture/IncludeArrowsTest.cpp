#include <gtest/gtest.h>

#include <filesystem>
#include <fstream>
#include <map>
#include <set>
#include <string>
#include <string_view>

// Which room may include which: the arrows of docs/architecture.md, kept by reading every include line.

namespace
{

using Rooms = std::set<std::string>;

/// Each room with those directly below it; what lies further down follows.
const std::map<std::string, Rooms> s_Below = {
    {"TQL", {}},
    {"NotificationSystem", {"TQL"}},
    {"UtilsFileSystem", {"TQL"}},
    {"StoreInterface", {"TQL"}},
    {"Store", {"StoreInterface", "NotificationSystem"}},
    {"StoreParameters", {"Store"}},
    {"StoreIO", {"Store", "UtilsFileSystem"}},
    {"ChannelSystem", {"TQL"}},
    {"OrvanePluginInterface", {"TQL"}},
    {"ChannelSystemUtils", {"ChannelSystem"}},
    {"Expressions", {"ChannelSystem"}},
    {"ChannelSystemSelection", {"NotificationSystem", "ChannelSystem"}},
    {"CoreGraphics", {"TQL"}},
    {"IOInterfaceQt", {"TQL"}},
    {"ZarvoQtQuick", {"IOInterfaceQt", "OrvanePluginInterface"}},
    {"GraphPlotSystem",
     {"NotificationSystem", "ChannelSystemUtils", "OrvanePluginInterface", "CoreGraphics", "IOInterfaceQt"}},
    {"GraphPlotUI", {"GraphPlotSystem", "ZarvoQtQuick"}},
    {"GraphPlotUIOrvane", {"GraphPlotUI", "StoreIO"}},
    {"Recordings", {"UtilsFileSystem"}},
    {"Simulation", {"Recordings"}},
    {"Channels", {"Recordings", "NotificationSystem", "Expressions"}},
    {"Streaming", {"Channels"}},
    {"Services",
     {"Channels", "OrvanePluginInterface", "CoreGraphics", "ChannelSystemSelection", "ChannelSystemUtils", "StoreIO"}},
    {"Studio", {"Services", "Simulation", "Streaming"}},
};

Rooms Reachable(const std::string& i_rRoom)
{
    Rooms reached{i_rRoom};
    for (const std::string& rBelow : s_Below.at(i_rRoom))
        reached.merge(Reachable(rBelow));
    return reached;
}

/// Those that build without Qt.
const Rooms s_WithoutQt = {"StoreInterface",
                           "Store",
                           "StoreParameters",
                           "StoreIO",
                           "UtilsFileSystem",
                           "TQL",
                           "NotificationSystem",
                           "ChannelSystem",
                           "ChannelSystemSelection",
                           "ChannelSystemUtils",
                           "Expressions",
                           "Recordings",
                           "Simulation",
                           "Channels",
                           "Streaming"};

/// What stands between the delimiters of an include line, with its opening delimiter; empty for any other line.
std::string_view IncludeOf(std::string_view i_Line)
{
    constexpr std::string_view directive = "#include ";
    if (!i_Line.starts_with(directive))
        return {};
    return i_Line.substr(directive.size(), i_Line.find_first_of("\">", directive.size() + 1) - directive.size());
}

TEST(Architecture, IncludesFollowTheArrows)
{
    int files = 0;
    int arrows = 0;
    for (const char* pRoot : {"src", "host"})
    {
        const auto folder = std::filesystem::path(GRAPHPLOTS_SOURCE_DIR) / pRoot;
        for (const auto& rEntry : std::filesystem::recursive_directory_iterator(folder))
        {
            const std::string ending = rEntry.path().extension().string();
            if (ending != ".cpp" && ending != ".h")
                continue;
            const std::string room = std::filesystem::relative(rEntry.path(), folder).begin()->string();
            ASSERT_TRUE(s_Below.contains(room)) << "a room that the plan does not know: " << room;
            const Rooms allowed = Reachable(room);
            ++files;
            std::ifstream file(rEntry.path());
            for (std::string line; std::getline(file, line);)
            {
                const std::string_view included = IncludeOf(line);
                const std::string target(included.substr(included.empty() ? 0 : 1, included.find('/') - 1));
                if (included.starts_with('"') && s_Below.contains(target))
                {
                    EXPECT_TRUE(allowed.contains(target)) << rEntry.path() << ": " << line;
                    ++arrows;
                }
                if (s_WithoutQt.contains(room))
                {
                    EXPECT_FALSE(included.starts_with("<Q")) << rEntry.path() << ": " << line;
                }
            }
        }
    }
    EXPECT_GT(files, 100) << "the sources were not found";
    EXPECT_GT(arrows, files) << "the include lines were not understood";
}

/// An example shows what an application would write: it stays small, and knows the module by its file alone.
TEST(Architecture, TheMinimalHostStaysMinimal)
{
    int lines = 0;
    const auto folder = std::filesystem::path(GRAPHPLOTS_SOURCE_DIR) / "examples" / "minimal-host";
    for (const auto& rEntry : std::filesystem::directory_iterator(folder))
    {
        std::ifstream file(rEntry.path());
        for (std::string line; std::getline(file, line); ++lines)
        {
            const std::string_view included = IncludeOf(line);
            EXPECT_FALSE(included.starts_with("\"GraphPlot") || included.starts_with("\"Studio/")) << line;
        }
    }
    EXPECT_GT(lines, 0);
    EXPECT_LE(lines, 250);
}

} // namespace

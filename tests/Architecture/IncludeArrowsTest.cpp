#include <gtest/gtest.h>

#include <filesystem>
#include <fstream>
#include <map>
#include <regex>
#include <set>
#include <string>

// Which room may include which: the arrows of docs/architecture.md, kept by reading every include line.

namespace
{

using Rooms = std::set<std::string>;

/// Each room with those directly below it; what lies further down follows.
const std::map<std::string, Rooms> s_Below = {
    {"TQL", {}},
    {"NotificationSystem", {"TQL"}},
    {"ChannelSystem", {"TQL"}},
    {"OrvanePluginInterface", {"TQL"}},
    {"ChannelSystemSelection", {"NotificationSystem", "ChannelSystem"}},
    {"CoreGraphics", {"TQL"}},
    {"IOInterfaceQt", {"TQL"}},
    {"ZarvoQtQuick", {"IOInterfaceQt", "OrvanePluginInterface"}},
    {"GraphPlotSystem",
     {"NotificationSystem", "ChannelSystem", "OrvanePluginInterface", "CoreGraphics", "IOInterfaceQt"}},
    {"GraphPlotUI", {"GraphPlotSystem", "ZarvoQtQuick"}},
    {"GraphPlotUIOrvane", {"GraphPlotUI"}},
    {"Recordings", {"TQL"}},
    {"Simulation", {"Recordings"}},
    {"Channels", {"Recordings", "NotificationSystem", "ChannelSystem"}},
    {"Services", {"Channels", "OrvanePluginInterface", "CoreGraphics", "ChannelSystemSelection"}},
    {"Studio", {"Services", "Simulation"}},
};

Rooms Reachable(const std::string& i_rRoom)
{
    Rooms reached{i_rRoom};
    for (const std::string& rBelow : s_Below.at(i_rRoom))
        reached.merge(Reachable(rBelow));
    return reached;
}

/// Those that build without Qt.
const Rooms s_WithoutQt = {"TQL",      "NotificationSystem", "ChannelSystem", "ChannelSystemSelection",
                           "Recordings", "Simulation",       "Channels"};

TEST(Architecture, IncludesFollowTheArrows)
{
    const std::regex ours("^\\s*#\\s*include\\s*\"([^/\"]+)/[^\"]*\"");
    const std::regex qt("^\\s*#\\s*include\\s*<Q");
    int files = 0;
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
            std::smatch match;
            for (std::string line; std::getline(file, line);)
            {
                if (std::regex_search(line, match, ours) && s_Below.contains(match[1]))
                {
                    EXPECT_TRUE(allowed.contains(match[1])) << rEntry.path() << ": " << line;
                }
                if (s_WithoutQt.contains(room))
                {
                    EXPECT_FALSE(std::regex_search(line, qt)) << rEntry.path() << ": " << line;
                }
            }
        }
    }
    EXPECT_GT(files, 100) << "the sources were not found";
}

} // namespace

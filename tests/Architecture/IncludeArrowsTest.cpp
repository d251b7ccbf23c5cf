#include <gtest/gtest.h>

#include <filesystem>
#include <fstream>
#include <iterator>
#include <map>
#include <set>
#include <sstream>
#include <string>
#include <string_view>

// The arrows of cmake/Arrows.txt, kept by reading every include line. Between rooms the compiler keeps them too;
// between the sub-rooms of a room only this test does.

namespace
{

using Names = std::set<std::string>;

/// The table: what stands directly below each room, and each sub-room ("Room/Sub"). A room that has sub-rooms stands
/// above all of them itself.
struct Arrows
{
    std::map<std::string, Names> m_Below;
    Names m_WithoutQt;

    /// A name with all that lies below it.
    Names Reachable(const std::string& i_rName) const
    {
        Names reached{i_rName};
        for (const std::string& rBelow : m_Below.at(i_rName))
            reached.merge(Reachable(rBelow));
        return reached;
    }

    /// The sub-room that a path inside a room lies in, else the room.
    std::string NameOf(const std::string& i_rRoom, const std::filesystem::path& i_rInside) const
    {
        const std::string name = i_rRoom + "/" + i_rInside.begin()->string();
        return m_Below.contains(name) ? name : i_rRoom;
    }
};

Arrows ReadArrows()
{
    Arrows arrows;
    std::ifstream table(std::filesystem::path(GRAPHPLOTS_SOURCE_DIR) / "cmake" / "Arrows.txt");
    std::string room;
    for (std::string line; std::getline(table, line);)
    {
        const std::size_t colon = line.find(':');
        if (line.starts_with('#') || colon == std::string::npos)
            continue;
        std::istringstream names(line.substr(colon + 1));
        const Names below{std::istream_iterator<std::string>(names), {}};
        std::string name;
        std::istringstream(line.substr(0, colon)) >> name;
        if (!line.starts_with(' '))
        {
            room = name.substr(name.find('/') + 1);
            arrows.m_Below[room] = below;
            if (!line.substr(0, colon).ends_with(" Qt"))
                arrows.m_WithoutQt.insert(room);
            continue;
        }
        const std::string self = room + "/" + name;
        arrows.m_Below[room].insert(self);
        arrows.m_Below[self];
        for (const std::string& rBelow : below)
        {
            // A sub-room that stands in no line above is not known yet: so no circle can be written.
            EXPECT_TRUE(arrows.m_Below.contains(room + "/" + rBelow)) << line;
            arrows.m_Below[self].insert(room + "/" + rBelow);
        }
    }
    return arrows;
}

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
    const Arrows table = ReadArrows();
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
            const auto path = std::filesystem::relative(rEntry.path(), folder);
            const std::string room = path.begin()->string();
            ASSERT_TRUE(table.m_Below.contains(room)) << "a room that the table does not know: " << room;
            const std::string self = table.NameOf(room, std::filesystem::relative(path, room));
            Names allowed = table.Reachable(room);
            if (self != room)
            {
                std::erase_if(allowed, [&](const std::string& i_rName)
                              { return i_rName == room || i_rName.starts_with(room + "/"); });
                allowed.merge(table.Reachable(self));
            }
            ++files;
            std::ifstream file(rEntry.path());
            for (std::string line; std::getline(file, line);)
            {
                const std::string_view included = IncludeOf(line);
                const std::filesystem::path target(included.substr(included.empty() ? 0 : 1));
                if (included.starts_with('"') && table.m_Below.contains(target.begin()->string()))
                {
                    const std::string other = target.begin()->string();
                    const std::string name =
                        other == room ? table.NameOf(other, target.lexically_relative(other)) : other;
                    EXPECT_TRUE(allowed.contains(name)) << path << ": " << line;
                    ++arrows;
                }
                if (table.m_WithoutQt.contains(room) && room != "OrvanePluginInterface")
                {
                    EXPECT_FALSE(included.starts_with("<Q")) << path << ": " << line;
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

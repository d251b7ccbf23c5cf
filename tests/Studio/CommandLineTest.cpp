#include "Studio/Commands/CommandLine.h"

#include <gtest/gtest.h>

#include <sstream>
#include <string>
#include <vector>

namespace
{

using Studio::CommandLine;
using Studio::ECommand;

std::vector<std::string> Words(const std::string& i_rText)
{
    std::istringstream stream(i_rText);
    std::vector<std::string> words;
    for (std::string word; stream >> word;)
        words.push_back(word);
    return words;
}

/// Everything that was understood, in one line.
std::string Describe(const CommandLine& i_r)
{
    static constexpr const char* names[] = {"window",      "channels", "export", "snapshot",
                                            "check-store", "record",   "help",   "version"};
    std::ostringstream text;
    text << names[static_cast<int>(i_r.Command)];
    for (const std::string& rFile : i_r.Files)
        text << " file=" << rFile;
    if (i_r.bLive)
        text << " live=" << i_r.Subjects;
    if (i_r.OscPort != 0)
        text << " osc=" << i_r.OscAddress << ":" << i_r.OscPort << "@" << i_r.OscRate;
    if (!i_r.ReplayPath.empty())
        text << " replay=" << i_r.ReplayPath << "*" << i_r.Speed << (i_r.bLoop ? " loop" : "");
    if (i_r.Seconds != 0.0)
        text << " seconds=" << i_r.Seconds;
    if (i_r.bJson)
        text << " json";
    if (!i_r.CsvPath.empty())
        text << " csv=" << i_r.CsvPath;
    if (!i_r.PicturePath.empty())
        text << " out=" << i_r.PicturePath;
    for (const std::string& rPattern : i_r.Patterns)
        text << " channel=" << rPattern;
    if (i_r.Size)
        text << " size=" << i_r.Size->first << "x" << i_r.Size->second;
    if (i_r.Range)
        text << " range=" << i_r.Range->first << ":" << i_r.Range->second;
    if (i_r.Values)
        text << " values=" << i_r.Values->first << ":" << i_r.Values->second;
    if (i_r.AfterMilliseconds)
        text << " after=" << *i_r.AfterMilliseconds;
    if (!i_r.ModulePath.empty())
        text << " module=" << i_r.ModulePath;
    if (i_r.bCheck)
        text << " check";
    return text.str();
}

TEST(CommandLine, GoodOnesAreUnderstood)
{
    static const struct
    {
        const char* pWords;
        const char* pExpected;
    } rows[] = {
        {"", "window"},
        {"a.c3d b.c3d", "window file=a.c3d file=b.c3d"},
        {"--live", "window live=2"},
        {"--live 5 a.c3d --check", "window file=a.c3d live=5 check"},
        {"--live a.c3d", "window file=a.c3d live=2"},
        {"--live=3 --module m.so", "window live=3 module=m.so"},
        {"-- --live -x.c3d", "window file=--live file=-x.c3d"},
        {"a.c3d channels", "window file=a.c3d file=channels"},
        {"channels a.c3d", "channels file=a.c3d"},
        {"channels --json a.c3d", "channels file=a.c3d json"},
        {"export a.c3d --csv o.csv", "export file=a.c3d csv=o.csv"},
        {"export a.c3d --channel L* --csv=o.csv --channel Fz?", "export file=a.c3d csv=o.csv channel=L* channel=Fz?"},
        {"snapshot a.c3d --out p.png", "snapshot file=a.c3d out=p.png"},
        {"snapshot --live --out p.png --size 1280x720 --range -1200:0 --values -0.5:1e3 --after 0 --check",
         "snapshot live=2 out=p.png size=1280x720 range=-1200:0 values=-0.5:1000 after=0 check"},
        {"check-store p.json", "check-store file=p.json"},
        {"--osc 9000", "window osc=127.0.0.1:9000@0"},
        {"a.c3d --osc 0.0.0.0:9000 --osc-rate 59.94", "window file=a.c3d osc=0.0.0.0:9000@59.94"},
        {"--replay a.c3d --speed 4 --loop", "window replay=a.c3d*4 loop"},
        {"record --osc [::1]:7 --seconds 2.5 out.c3d", "record file=out.c3d osc=::1:7@0 seconds=2.5"},
        {"--help", "help"},
        {"snapshot --help", "help"},
    };
    for (const auto& rRow : rows)
    {
        CommandLine commandLine;
        std::string error;
        EXPECT_TRUE(Studio::ParseCommandLine(Words(rRow.pWords), commandLine, error).IsSuccess())
            << rRow.pWords << ": " << error;
        EXPECT_EQ(Describe(commandLine), rRow.pExpected) << rRow.pWords;
    }
}

TEST(CommandLine, BadOnesSayWhatIsWrongAndWhatToDo)
{
    static const struct
    {
        const char* pWords;
        const char* pError;
    } rows[] = {
        {"--frob", "unknown option --frob; --help lists the options"},
        {"-x", "unknown option -x; --help lists the options"},
        {"--json", "--json does not go with graphplots-studio; --help says which options do"},
        {"channels a.c3d --out p.png", "--out does not go with channels; --help says which options do"},
        {"channels a.c3d --live", "--live does not go with channels; --help says which options do"},
        {"channels", "channels needs the path of a recording"},
        {"channels a.c3d b.c3d", "channels takes one recording at a time"},
        {"channels a.c3d --json=1", "--json takes no value; write it alone"},
        {"export --csv o.csv", "export needs the path of a recording"},
        {"export a.c3d", "export needs --csv OUT, the path of the table to write"},
        {"export a.c3d --csv", "--csv needs the path of the table to write"},
        {"export a.c3d --csv=", "--csv needs the path of the table to write, not \"\""},
        {"check-store", "check-store needs the path of a store file"},
        {"--osc",
         "--osc needs a UDP port from 1 to 65535, with an address of this machine before it if others shall send"},
        {"--osc 0", "--osc needs a UDP port from 1 to 65535, with an address of this machine before it if others shall "
                    "send, not \"0\""},
        {"--osc 9000 --live", "there is one live input at a time: give --live, --osc or --replay"},
        {"--osc-rate 100", "--osc-rate goes with --osc PORT"},
        {"--osc 9000 --osc-rate 0", "--osc-rate needs a rate from 0.1 to 100000, not \"0\""},
        {"--speed 2", "--speed and --loop go with --replay FILE"},
        {"--replay a.c3d --speed nan", "--speed needs a number from 0.01 to 100, not \"nan\""},
        {"record out.c3d", "record needs --osc PORT, --seconds N, and the path of one file to write"},
        {"record --osc 9000 --seconds 5 out.csv", "record writes C3D files; let the path end in .c3d"},
        {"check-store a.json --json", "--json does not go with check-store; --help says which options do"},
        {"snapshot --out p.png", "snapshot needs the path of a recording, or --live"},
        {"snapshot a.c3d --live --out p.png", "snapshot takes one recording or --live, not both"},
        {"snapshot a.c3d b.c3d --out p.png", "snapshot takes one recording or --live, not both"},
        {"snapshot a.c3d", "snapshot needs --out PNG, the path of the picture to write"},
        {"snapshot a.c3d --size 0x10",
         "--size needs a width and a height in pixels, for example 1280x720, not \"0x10\""},
        {"snapshot a.c3d --size 99999x10",
         "--size needs a width and a height in pixels, for example 1280x720, not \"99999x10\""},
        {"snapshot a.c3d --size 1280",
         "--size needs a width and a height in pixels, for example 1280x720, not \"1280\""},
        {"snapshot a.c3d --range 5:5", "--range needs two frames, the smaller first, for example 0:480, not \"5:5\""},
        {"snapshot a.c3d --range 9:1", "--range needs two frames, the smaller first, for example 0:480, not \"9:1\""},
        {"snapshot a.c3d --range 1:nan",
         "--range needs two frames, the smaller first, for example 0:480, not \"1:nan\""},
        {"snapshot a.c3d --values 0:inf",
         "--values needs two values, the smaller first, for example -50:1800, not \"0:inf\""},
        {"snapshot a.c3d --after -1", "--after needs milliseconds from 0 to 600000, not \"-1\""},
        {"snapshot a.c3d --after soon", "--after needs milliseconds from 0 to 600000, not \"soon\""},
        {"--live 0", "--live needs a number of subjects from 1 to 16, not \"0\""},
        {"--live 99999999999", "--live needs a number of subjects from 1 to 16, not \"99999999999\""},
        {"--live=two", "--live needs a number of subjects from 1 to 16, not \"two\""},
    };
    for (const auto& rRow : rows)
    {
        CommandLine commandLine;
        commandLine.Files = {"untouched"};
        std::string error;
        EXPECT_TRUE(Studio::ParseCommandLine(Words(rRow.pWords), commandLine, error).IsError()) << rRow.pWords;
        EXPECT_EQ(error, rRow.pError) << rRow.pWords;
        EXPECT_EQ(commandLine.Files, std::vector<std::string>{"untouched"}) << rRow.pWords;
    }
}

} // namespace

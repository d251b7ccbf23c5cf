#include "Studio/Commands/CommandLine.h"

#include "Recordings/FileFormats.h"
#include "Streaming/OscAddress.h"

#include <algorithm>
#include <cctype>
#include <charconv>
#include <cmath>
#include <string_view>

namespace Studio
{

namespace
{

constexpr unsigned Bit(ECommand i_Command)
{
    return 1u << static_cast<unsigned>(i_Command);
}

constexpr unsigned window = Bit(ECommand::Window);
constexpr unsigned channels = Bit(ECommand::Channels);
constexpr unsigned table = Bit(ECommand::Export);
constexpr unsigned snapshot = Bit(ECommand::Snapshot);
constexpr unsigned record = Bit(ECommand::Record);

/// Puts the text of an option into the struct. False when the text does not fit.
using Apply = bool (*)(CommandLine& o_rCommandLine, const std::string& i_rText);

struct OptionRow
{
    std::string_view Name;
    std::string_view Argument; ///< as the help shows it; empty for a switch
    unsigned Commands;
    Apply pApply;
    std::string_view Expected; ///< completes "--x needs ..."
};

template <typename T>
bool ReadNumber(std::string_view i_Text, T& o_rValue)
{
    const char* pEnd = i_Text.data() + i_Text.size();
    const auto [pRest, error] = std::from_chars(i_Text.data(), pEnd, o_rValue);
    return error == std::errc() && pRest == pEnd;
}

template <typename T>
bool ReadPair(std::string_view i_Text, char i_Separator, std::pair<T, T>& o_rPair)
{
    const std::size_t at = i_Text.find(i_Separator);
    return at != std::string_view::npos && ReadNumber(i_Text.substr(0, at), o_rPair.first) &&
           ReadNumber(i_Text.substr(at + 1), o_rPair.second);
}

bool ReadRange(std::string_view i_Text, std::optional<std::pair<double, double>>& o_rRange)
{
    std::pair<double, double> range;
    if (!ReadPair(i_Text, ':', range) || !std::isfinite(range.first) || !std::isfinite(range.second) ||
        range.first >= range.second)
        return false;
    o_rRange = range;
    return true;
}

bool ReadSize(std::string_view i_Text, std::optional<std::pair<int, int>>& o_rSize)
{
    std::pair<int, int> size;
    const auto fits = [](int i_Pixels)
    {
        return i_Pixels >= 1 && i_Pixels <= LargestPicture;
    };
    if (!ReadPair(i_Text, 'x', size) || !fits(size.first) || !fits(size.second))
        return false;
    o_rSize = size;
    return true;
}

bool ReadText(std::string& o_rTarget, const std::string& i_rText)
{
    o_rTarget = i_rText;
    return !i_rText.empty();
}

bool ReadAfter(std::string_view i_Text, std::optional<int>& o_rMilliseconds)
{
    constexpr int longest = 600'000;
    int milliseconds = 0;
    if (!ReadNumber(i_Text, milliseconds) || milliseconds < 0 || milliseconds > longest)
        return false;
    o_rMilliseconds = milliseconds;
    return true;
}

bool ReadBetween(std::string_view i_Text, double i_Lowest, double i_Highest, double& o_rValue)
{
    double value = 0.0;
    if (!ReadNumber(i_Text, value) || !(value >= i_Lowest && value <= i_Highest))
        return false;
    o_rValue = value;
    return true;
}

bool ReadSubjects(std::string_view i_Text, std::uint32_t& o_rSubjects)
{
    std::uint32_t subjects = 0;
    if (!ReadNumber(i_Text, subjects) || subjects < 1 || subjects > MostSubjects)
        return false;
    o_rSubjects = subjects;
    return true;
}

constexpr OptionRow options[] = {
    {"--resample", "", channels | table, [](CommandLine& o_r, const std::string&) { return o_r.bResample = true; }, ""},
    {"--json", "", channels, [](CommandLine& o_r, const std::string&) { return o_r.bJson = true; }, ""},
    {"--force", "", table | snapshot | record, [](CommandLine& o_r, const std::string&) { return o_r.bForce = true; },
     ""},
    {"--csv", "OUT", table, [](CommandLine& o_r, const std::string& i_r) { return ReadText(o_r.CsvPath, i_r); },
     "the path of the table to write"},
    {"--out", "PNG", snapshot, [](CommandLine& o_r, const std::string& i_r) { return ReadText(o_r.PicturePath, i_r); },
     "the path of the picture to write"},
    {"--channel", "PATTERN", table | snapshot,
     [](CommandLine& o_r, const std::string& i_r)
     {
         o_r.Patterns.push_back(i_r);
         return !i_r.empty();
     },
     "a channel name, in which * and ? may stand for other characters"},
    {"--size", "WxH", snapshot, [](CommandLine& o_r, const std::string& i_r) { return ReadSize(i_r, o_r.Size); },
     "a width and a height in pixels, for example 1280x720"},
    {"--range", "A:B", snapshot, [](CommandLine& o_r, const std::string& i_r) { return ReadRange(i_r, o_r.Range); },
     "two frames, the smaller first, for example 0:480"},
    {"--values", "A:B", snapshot, [](CommandLine& o_r, const std::string& i_r) { return ReadRange(i_r, o_r.Values); },
     "two values, the smaller first, for example -50:1800"},
    {"--after", "MS", snapshot,
     [](CommandLine& o_r, const std::string& i_r) { return ReadAfter(i_r, o_r.AfterMilliseconds); },
     "milliseconds from 0 to 600000"},
    {"--osc", "[ADDRESS:]PORT", window | record,
     [](CommandLine& o_r, const std::string& i_r)
     { return Streaming::ReadOscEndpoint(i_r, o_r.OscAddress, o_r.OscPort); },
     "a UDP port from 1 to 65535, with an address of this machine before it if others shall send"},
    {"--osc-rate", "HZ", window | record,
     [](CommandLine& o_r, const std::string& i_r) { return ReadBetween(i_r, 0.1, 100'000.0, o_r.OscRate); },
     "a rate from 0.1 to 100000"},
    {"--replay", "FILE", window, [](CommandLine& o_r, const std::string& i_r) { return ReadText(o_r.ReplayPath, i_r); },
     "the path of a recording"},
    {"--speed", "X", window,
     [](CommandLine& o_r, const std::string& i_r) { return ReadBetween(i_r, 0.01, 100.0, o_r.Speed); },
     "a number from 0.01 to 100"},
    {"--loop", "", window, [](CommandLine& o_r, const std::string&) { return o_r.bLoop = true; }, ""},
    {"--seconds", "N", record,
     [](CommandLine& o_r, const std::string& i_r) { return ReadBetween(i_r, 0.1, 86'400.0, o_r.Seconds); },
     "a number of seconds from 0.1 to 86400"},
    {"--module", "PATH", window | snapshot,
     [](CommandLine& o_r, const std::string& i_r) { return ReadText(o_r.ModulePath, i_r); }, "the path of a module"},
    {"--check", "", window | snapshot, [](CommandLine& o_r, const std::string&) { return o_r.bCheck = true; }, ""},
};

constexpr struct
{
    std::string_view Name;
    ECommand Command;
} commands[] = {{"channels", ECommand::Channels},
                {"export", ECommand::Export},
                {"snapshot", ECommand::Snapshot},
                {"check-store", ECommand::CheckStore},
                {"record", ECommand::Record}};

std::string_view NameOf(ECommand i_Command)
{
    for (const auto& rRow : commands)
        if (rRow.Command == i_Command)
            return rRow.Name;
    return "graphplots-studio";
}

bool IsDigits(std::string_view i_Text)
{
    return !i_Text.empty() && std::ranges::all_of(i_Text, [](unsigned char i_C) { return std::isdigit(i_C) != 0; });
}

bool IsC3dPath(std::string_view i_Path)
{
    return i_Path.ends_with(".c3d") || i_Path.ends_with(".C3D");
}

/// Walks over the words once.
class VParser
{
public:
    VParser(std::span<const std::string> i_Words, CommandLine& o_rCommandLine, std::string& o_rError)
        : m_Words(i_Words), m_rCommandLine(o_rCommandLine), m_rError(o_rError)
    {
    }

    bool Run()
    {
        ReadCommand();
        bool bOptions = true;
        while (m_Next < m_Words.size())
        {
            const std::string& rWord = m_Words[m_Next++];
            if (bOptions && rWord == "--")
                bOptions = false;
            else if (bOptions && (rWord == "--help" || rWord == "-h"))
                m_rCommandLine.Command = ECommand::Help;
            else if (bOptions && rWord == "--version")
                m_rCommandLine.Command = ECommand::Version;
            else if (bOptions && rWord.size() > 1 && rWord[0] == '-')
            {
                if (!ReadOption(rWord))
                    return false;
            }
            else
                m_rCommandLine.Files.push_back(rWord);
        }
        return m_rCommandLine.Command == ECommand::Help || m_rCommandLine.Command == ECommand::Version || IsComplete();
    }

private:
    void ReadCommand()
    {
        if (m_Words.empty())
            return;
        for (const auto& rRow : commands)
            if (m_Words[0] == rRow.Name)
            {
                m_rCommandLine.Command = rRow.Command;
                m_Next = 1;
            }
    }

    bool Fail(std::string i_Error)
    {
        m_rError = std::move(i_Error);
        return false;
    }

    bool ReadOption(const std::string& i_rWord)
    {
        const std::size_t equals = i_rWord.find('=');
        const std::string name = i_rWord.substr(0, equals);
        std::optional<std::string> argument;
        if (equals != std::string::npos)
            argument = i_rWord.substr(equals + 1);
        if (name == "--live")
            return ReadLive(argument);
        const auto* pRow = std::ranges::find(options, std::string_view(name), &OptionRow::Name);
        if (pRow == std::end(options))
            return Fail("unknown option " + name + "; --help lists the options");
        if ((pRow->Commands & Bit(m_rCommandLine.Command)) == 0)
            return Fail(name + " does not go with " + std::string(NameOf(m_rCommandLine.Command)) +
                        "; --help says which options do");
        if (pRow->Argument.empty() && argument)
            return Fail(name + " takes no value; write it alone");
        if (!pRow->Argument.empty() && !argument)
        {
            if (m_Next == m_Words.size())
                return Fail(name + " needs " + std::string(pRow->Expected));
            argument = m_Words[m_Next++];
        }
        if (!pRow->pApply(m_rCommandLine, argument.value_or("")))
            return Fail(name + " needs " + std::string(pRow->Expected) + ", not \"" + argument.value_or("") + "\"");
        return true;
    }

    bool ReadLive(std::optional<std::string> i_Argument)
    {
        if ((Bit(m_rCommandLine.Command) & (window | snapshot)) == 0)
            return Fail("--live does not go with " + std::string(NameOf(m_rCommandLine.Command)) +
                        "; --help says which options do");
        m_rCommandLine.bLive = true;
        if (!i_Argument && m_Next < m_Words.size() && IsDigits(m_Words[m_Next]))
            i_Argument = m_Words[m_Next++];
        if (i_Argument && !ReadSubjects(*i_Argument, m_rCommandLine.Subjects))
            return Fail("--live needs a number of subjects from 1 to " + std::to_string(MostSubjects) + ", not \"" +
                        *i_Argument + "\"");
        return true;
    }

    bool IsComplete()
    {
        const CommandLine& r = m_rCommandLine;
        const std::string name(NameOf(r.Command));
        if ((r.Command == ECommand::Channels || r.Command == ECommand::Export) && r.Files.size() != 1)
            return Fail(name + (r.Files.empty() ? " needs the path of a recording" : " takes one recording at a time"));
        if (r.Command == ECommand::CheckStore && r.Files.size() != 1)
            return Fail(r.Files.empty() ? "check-store needs the path of a store file"
                                        : "check-store takes one store file at a time");
        if (r.Command == ECommand::Record && (r.Files.size() != 1 || r.OscPort == 0 || r.Seconds == 0.0))
            return Fail("record needs --osc PORT, --seconds N, and the path of one file to write");
        if (r.Command == ECommand::Record && !IsC3dPath(r.Files.front()))
            return Fail("record writes C3D files; let the path end in .c3d");
        if (r.Command == ECommand::Window &&
            (r.bLive ? 1 : 0) + (r.OscPort ? 1 : 0) + (r.ReplayPath.empty() ? 0 : 1) > 1)
            return Fail("there is one live input at a time: give --live, --osc or --replay");
        if (r.OscRate != 0.0 && r.OscPort == 0)
            return Fail("--osc-rate goes with --osc PORT");
        if ((r.bLoop || r.Speed != 1.0) && r.ReplayPath.empty())
            return Fail("--speed and --loop go with --replay FILE");
        if (r.Command == ECommand::Export && r.CsvPath.empty())
            return Fail("export needs --csv OUT, the path of the table to write");
        if (r.Command != ECommand::Snapshot)
            return true;
        if (r.Files.size() + (r.bLive ? 1 : 0) != 1)
            return Fail(r.Files.empty() ? "snapshot needs the path of a recording, or --live"
                                        : "snapshot takes one recording or --live, not both");
        if (r.PicturePath.empty())
            return Fail("snapshot needs --out PNG, the path of the picture to write");
        return true;
    }

    std::span<const std::string> m_Words;
    CommandLine& m_rCommandLine;
    std::string& m_rError;
    std::size_t m_Next = 0;
};

} // namespace

TQL::IResult ParseCommandLine(std::span<const std::string> i_Words, CommandLine& o_rCommandLine, std::string& o_rError)
{
    CommandLine commandLine;
    std::string error;
    if (!VParser(i_Words, commandLine, error).Run())
    {
        o_rError = std::move(error);
        return TQL::Result::InvalidArgument;
    }
    o_rCommandLine = std::move(commandLine);
    return TQL::Result::Ok;
}

std::string HelpText()
{
    return "Usage:\n"
           "  graphplots-studio [FILE...] [--live [SUBJECTS]]\n"
           "  graphplots-studio [FILE...] --osc [ADDRESS:]PORT [--osc-rate HZ]\n"
           "  graphplots-studio [FILE...] --replay FILE [--speed X] [--loop]\n"
           "  graphplots-studio channels FILE [--json] [--resample]\n"
           "  graphplots-studio export FILE --csv OUT [--channel PATTERN]... [--resample] [--force]\n"
           "  graphplots-studio snapshot FILE|--live [SUBJECTS] --out PNG [--channel PATTERN]...\n"
           "                    [--size WxH] [--range A:B] [--values A:B] [--after MS] [--force]\n"
           "  graphplots-studio record --osc [ADDRESS:]PORT [--osc-rate HZ] --seconds N [--force] OUT.c3d\n"
           "  graphplots-studio check-store FILE\n"
           "  graphplots-studio --version\n"
           "\n"
           "Without arguments the studio opens empty and says what to do.\n"
           "  --channel PATTERN  channels by name; * stands for any characters, ? for one\n"
           "  --force            writes over another recording\n"
           "  --resample         rows at uneven times are interpolated to the nearest even rate\n"
           "  --size WxH         of the picture, in pixels\n"
           "  --range A:B        the time axis, in frames\n"
           "  --values A:B       the value axes, in the units of the channels\n"
           "  --after MS         how long to wait at most for the data to be drawn; of live data, until the picture\n"
           "  --osc PORT         listens for Open Sound Control messages from this machine; with an address of this\n"
           "                     machine before it (0.0.0.0: all) also from others\n"
           "  --osc-rate HZ      the rate at which they come (default: measured on the first ones)\n"
           "  --replay FILE      shows a recording as if it were captured now, --speed X times as fast, once or in a "
           "--loop\n"
           "  --module PATH      the Graph Plots module (default: graphplots.so beside the program)\n"
           "  --check            report at the end where the module broke the rules of its host\n"
           "\n"
           "Files that can be opened:\n" +
           Recordings::DescribeFormats() +
           "\n"
           "check-store prints what a store file (preferences, graphs) holds, and where it has problems.\n"
           "\n"
           "Exit status: 0; 1 where check-store found problems; 2 with one line on standard error that says what is\n"
           "wrong.\n";
}

} // namespace Studio

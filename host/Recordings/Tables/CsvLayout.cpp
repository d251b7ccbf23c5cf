#include "Recordings/Tables/CsvLayout.h"

#include <algorithm>
#include <array>
#include <cstdint>
#include <optional>
#include <utility>

namespace Recordings
{

namespace
{

constexpr std::size_t MostLines = 200;
constexpr std::size_t FewestLines = 8;
constexpr std::size_t EnoughBytes = 1 << 20; // with these and the fewest lines enough has been seen
constexpr std::size_t ScoredBytes = 1 << 14; // of a line, to find the separator
constexpr std::size_t LongestName = 1 << 16; // bytes of a line that goes on behind a line end between quotes
constexpr std::array Separators{'\t', ';', ',', '|', ' '}; // of equals the first wins

struct SampleLine
{
    std::string_view Text;
    std::size_t Offset = 0;
    std::size_t Number = 1;
};

/// What the cells of a line are.
struct LineShape
{
    std::size_t Numbers = 0;
    std::size_t Texts = 0;
    std::size_t Filled = 0; ///< cells up to the last that is not empty
    bool bComma = false;    ///< a number has a decimal comma
    bool bPoint = false;

    bool IsRow() const { return Numbers > 0 && Texts == 0; }
    bool IsMixedRow() const { return Numbers > 0 && Numbers >= Texts; }
};

bool HasOpenQuote(std::string_view i_Line)
{
    return std::count(i_Line.begin(), i_Line.end(), '"') % 2 != 0;
}

// A name between quotes may hold a line end: such a line goes on until its quote is closed.
bool NextSampleLine(std::string_view i_Text, VLineScanner& io_rLines, SampleLine& o_rLine)
{
    o_rLine.Offset = io_rLines.GetOffset();
    o_rLine.Number = io_rLines.GetLineCount() + 1;
    if (!io_rLines.Next(o_rLine.Text))
        return false;
    if (o_rLine.Text.size() > LongestName || !HasOpenQuote(o_rLine.Text))
        return true;
    VLineScanner ahead = io_rLines;
    for (std::string_view line; ahead.Next(line);)
    {
        const auto end = static_cast<std::size_t>(line.data() + line.size() - i_Text.data());
        if (end - o_rLine.Offset > LongestName)
            return true;
        if (!HasOpenQuote(line))
            continue;
        o_rLine.Text = i_Text.substr(o_rLine.Offset, end - o_rLine.Offset);
        io_rLines = ahead;
        return true;
    }
    return true;
}

std::vector<SampleLine> TakeSample(std::string_view i_Text)
{
    std::vector<SampleLine> sample;
    VLineScanner lines(i_Text);
    SampleLine line;
    while (sample.size() < MostLines && (sample.size() < FewestLines || lines.GetOffset() < EnoughBytes) &&
           NextSampleLine(i_Text, lines, line))
        if (!TrimBlanks(line.Text).empty())
            sample.push_back(line);
    return sample;
}

LineShape ShapeOf(std::string_view i_Line, char i_Separator)
{
    const bool bRemark = IsRemark(i_Line);
    LineShape shape;
    std::string_view cell;
    std::size_t cells = 0;
    for (bool bMore = true; NextCell(i_Line, bMore, i_Separator, cell);)
    {
        double value = 0.0;
        const ECell kind = ReadNumber(cell, i_Separator != ',', value);
        const bool bNumber = kind == ECell::Number || kind == ECell::TooLarge;
        ++cells;
        shape.Numbers += bNumber ? 1 : 0;
        shape.Texts += kind == ECell::Text ? 1 : 0;
        shape.Filled = cell.empty() ? shape.Filled : cells;
        shape.bComma |= bNumber && cell.find(',') != std::string_view::npos;
        shape.bPoint |= bNumber && cell.find('.') != std::string_view::npos;
    }
    if (bRemark)
        shape.Texts += std::exchange(shape.Numbers, 0); // may be names, but no row
    return shape;
}

char FindSeparator(const std::vector<SampleLine>& i_rSample)
{
    char best = ',';
    std::pair<std::size_t, std::size_t> most{0, 0}; // numbers in rows, and in lines that are partly numbers
    for (const char separator : Separators)
    {
        const auto stands = [&](const SampleLine& i_rLine)
        {
            return i_rLine.Text.find(separator) != std::string_view::npos;
        };
        if (std::none_of(i_rSample.begin(), i_rSample.end(), stands))
            continue;
        std::pair<std::size_t, std::size_t> score{0, 0};
        for (const SampleLine& rLine : i_rSample)
        {
            const LineShape shape = ShapeOf(rLine.Text.substr(0, ScoredBytes), separator);
            score.first += shape.IsRow() ? shape.Numbers : 0;
            score.second += shape.IsMixedRow() ? shape.Numbers : 0;
        }
        if (score > most)
        {
            most = score;
            best = separator;
        }
    }
    return best;
}

/// First line and number of lines of the longest run of lines that are rows.
struct Run
{
    std::size_t First = 0;
    std::size_t Count = 0;
};

template <typename TIsRow>
Run LongestRun(const std::vector<LineShape>& i_rShapes, const TIsRow& i_rIsRow)
{
    Run longest;
    Run run;
    for (std::size_t i = 0; i < i_rShapes.size(); ++i)
    {
        if (!i_rIsRow(i_rShapes[i]))
        {
            run = {i + 1, 0};
            continue;
        }
        if (++run.Count > longest.Count)
            longest = run;
    }
    return longest;
}

// The text columns of a line, as flags.
std::vector<bool> TextCells(std::string_view i_Line, char i_Separator)
{
    std::vector<bool> texts;
    for (const std::string_view cell : SplitCells(i_Line, i_Separator))
    {
        double value = 0.0;
        texts.push_back(ReadNumber(cell, i_Separator != ',', value) == ECell::Text);
    }
    return texts;
}

// Rows right above the run whose texts stand in columns in which rows below have texts, too, belong to the rows.
void ExtendUpwards(const std::vector<SampleLine>& i_rSample, const std::vector<LineShape>& i_rShapes, char i_Separator,
                   Run& io_rRun)
{
    std::vector<bool> below;
    for (std::size_t i = io_rRun.First; i < i_rSample.size(); ++i)
    {
        if (i_rShapes[i].Texts == 0)
            continue;
        const std::vector<bool> texts = TextCells(i_rSample[i].Text, i_Separator);
        below.resize(std::max(below.size(), texts.size()), false);
        for (std::size_t j = 0; j < texts.size(); ++j)
            below[j] = below[j] || texts[j];
    }
    while (io_rRun.First > 0 && i_rShapes[io_rRun.First - 1].IsMixedRow())
    {
        const std::vector<bool> texts = TextCells(i_rSample[io_rRun.First - 1].Text, i_Separator);
        for (std::size_t j = 0; j < texts.size(); ++j)
            if (texts[j] && (j >= below.size() || !below[j]))
                return;
        --io_rRun.First;
        ++io_rRun.Count;
    }
}

Run FindRows(const std::vector<SampleLine>& i_rSample, const std::vector<LineShape>& i_rShapes, char i_Separator)
{
    Run run = LongestRun(i_rShapes, [](const LineShape& i_rShape) { return i_rShape.IsRow(); });
    const Run mixed = LongestRun(i_rShapes, [](const LineShape& i_rShape) { return i_rShape.IsMixedRow(); });
    if (run.Count == 0 || run.Count * 2 < mixed.Count)
        return mixed; // one of the columns holds words
    ExtendUpwards(i_rSample, i_rShapes, i_Separator, run);
    return run;
}

std::vector<std::string> TextsOf(std::string_view i_Line, char i_Separator)
{
    std::vector<std::string> texts;
    for (const std::string_view cell : SplitCells(i_Line, i_Separator))
        texts.push_back(CellText(cell));
    return texts;
}

std::size_t CountFilled(const std::vector<std::string>& i_rTexts)
{
    return static_cast<std::size_t>(
        std::count_if(i_rTexts.begin(), i_rTexts.end(), [](const std::string& i_rText) { return !i_rText.empty(); }));
}

bool AreUnits(const std::vector<std::string>& i_rTexts)
{
    const auto units = static_cast<std::size_t>(std::count_if(i_rTexts.begin(), i_rTexts.end(), IsUnit));
    return units > 0 && units * 2 >= CountFilled(i_rTexts);
}

// "# time, x": the mark of a comment is no part of the first name.
void DropCommentMark(std::vector<std::string>& io_rTexts)
{
    if (io_rTexts.empty())
        return;
    std::string& rText = io_rTexts.front();
    if (rText.size() > 1 && (rText[0] == '#' || rText[0] == '%'))
        rText.erase(0, std::min(rText.find_first_not_of("#% \t"), rText.size()));
}

// Three columns a name, X, Y and Z below: the names move down to their components.
void JoinWithGroups(const std::vector<std::string>& i_rGroups, std::vector<std::string>& io_rNames)
{
    const auto isComponent = [](const std::string& i_rName)
    {
        return i_rName.size() == 1 && std::string_view("XYZxyz").find(i_rName[0]) != std::string_view::npos;
    };
    const auto components = std::count_if(io_rNames.begin(), io_rNames.end(), isComponent);
    if (components < 3 || CountFilled(i_rGroups) * 3 < static_cast<std::size_t>(components))
        return;
    std::string group;
    for (std::size_t i = 0; i < io_rNames.size(); ++i)
    {
        if (i < i_rGroups.size() && !i_rGroups[i].empty())
            group = i_rGroups[i];
        if (isComponent(io_rNames[i]) && !group.empty())
            io_rNames[i] = group + "." + io_rNames[i];
    }
}

// The number in a line such as "Sample Rate:,128,Hz", or one that stands alone.
double RateInLine(std::string_view i_Line, char i_Separator)
{
    const std::string line = SmallLetters(i_Line.substr(0, 1000));
    const auto has = [&](std::string_view i_Word)
    {
        return line.find(i_Word) != std::string::npos;
    };
    const bool bSays = has("rate") || has("freq") || has("hz") || has("fps");
    double rate = 0.0;
    std::size_t numbers = 0;
    std::size_t words = 0;
    std::string text = line;
    std::replace_if(
        text.begin(), text.end(),
        [&](char i_Character)
        { return i_Character == i_Separator || i_Character == ':' || i_Character == '=' || i_Character == '"'; },
        ' ');
    std::string_view rest = text;
    for (std::string_view word; NextWord(rest, word); ++words)
    {
        if (word.size() > 2 && word.ends_with("hz"))
            word.remove_suffix(2);
        double value = 0.0;
        if (ReadNumber(word, i_Separator != ',', value) != ECell::Number)
            continue;
        rate = value;
        ++numbers;
    }
    return numbers == 1 && (bSays || words == 1) && IsUsableRate(rate) ? rate : 0.0;
}

/// The lines above the rows.
class VHead
{
public:
    VHead(const std::vector<SampleLine>& i_rSample, const std::vector<LineShape>& i_rShapes, std::size_t i_Rows,
          char i_Separator, std::size_t i_Width)
        : m_rSample(i_rSample), m_rShapes(i_rShapes), m_Separator(i_Separator), m_Width(i_Width), m_Above(i_Rows)
    {
    }

    void Read(CsvLayout& o_rLayout)
    {
        std::vector<std::string> units;
        std::vector<std::string> names;
        if (IsHeadLine(1))
        {
            names = TextsOf(m_rSample[m_Above - 1].Text, m_Separator);
            --m_Above;
            if (AreUnits(names) && IsHeadLine(1))
            {
                units = std::exchange(names, TextsOf(m_rSample[m_Above - 1].Text, m_Separator));
                --m_Above;
            }
            DropCommentMark(names);
            if (m_Above > 0 && m_rShapes[m_Above - 1].Numbers == 0)
                JoinWithGroups(TextsOf(m_rSample[m_Above - 1].Text, m_Separator), names);
        }
        o_rLayout.bNames = !names.empty();
        AddHeads(names, units, o_rLayout);
        for (std::size_t i = 0; i < m_Above; ++i)
            if (const double rate = RateInLine(m_rSample[i].Text, m_Separator); rate > 0.0)
                o_rLayout.HintRate = rate;
    }

private:
    // Whether the line that far above what has been taken can be names or units: wide enough, and texts.
    bool IsHeadLine(std::size_t i_Above) const
    {
        if (m_Above < i_Above)
            return false;
        const LineShape& rShape = m_rShapes[m_Above - i_Above];
        return rShape.Texts > 0 && rShape.Filled * 2 > m_Width;
    }

    static void AddHeads(const std::vector<std::string>& i_rNames, const std::vector<std::string>& i_rUnits,
                         CsvLayout& io_rLayout)
    {
        const std::size_t width = std::max({io_rLayout.Heads.size(), i_rNames.size(), i_rUnits.size()});
        io_rLayout.Heads.resize(width);
        io_rLayout.bNamed.assign(width, false);
        for (std::size_t i = 0; i < width; ++i)
        {
            ColumnHead& rHead = io_rLayout.Heads[i];
            io_rLayout.bNamed[i] = i < i_rNames.size() && !i_rNames[i].empty();
            rHead.Name = io_rLayout.bNamed[i] ? i_rNames[i] : "Column " + std::to_string(i + 1);
            rHead.Units = i < i_rUnits.size() ? BareUnit(i_rUnits[i]) : UnitInName(rHead.Name);
        }
    }

    const std::vector<SampleLine>& m_rSample;
    const std::vector<LineShape>& m_rShapes;
    char m_Separator;
    std::size_t m_Width;
    std::size_t m_Above; // lines that are not taken yet
};

std::size_t WidthOf(const std::vector<LineShape>& i_rShapes, const Run& i_rRun)
{
    std::size_t width = 1;
    for (std::size_t i = i_rRun.First; i < i_rRun.First + i_rRun.Count; ++i)
        width = std::max(width, i_rShapes[i].Filled);
    return width;
}

std::vector<double> FirstNumbers(const std::vector<SampleLine>& i_rSample, const Run& i_rRun, const CellRules& i_rRules)
{
    std::vector<double> numbers;
    for (std::size_t i = i_rRun.First; i < i_rRun.First + i_rRun.Count; ++i)
    {
        std::string_view rest = i_rSample[i].Text;
        std::string_view cell;
        bool bMore = true;
        double value = 0.0;
        if (!NextCell(rest, bMore, i_rRules.Separator, cell) ||
            ReadNumber(cell, i_rRules.bDecimalComma, value) != ECell::Number)
            break;
        numbers.push_back(value);
    }
    return numbers;
}

} // namespace

bool FindCsvLayout(std::string_view i_Text, CsvLayout& o_rLayout)
{
    const std::vector<SampleLine> sample = TakeSample(i_Text);
    const char separator = FindSeparator(sample);
    std::vector<LineShape> shapes;
    bool bPoint = false;
    for (const SampleLine& rLine : sample)
        shapes.push_back(ShapeOf(rLine.Text, separator));
    const Run run = FindRows(sample, shapes, separator);
    if (run.Count == 0)
        return false;
    for (std::size_t i = run.First; i < run.First + run.Count; ++i)
        bPoint |= shapes[i].bPoint && !shapes[i].bComma;
    o_rLayout.Rules = {separator, separator != ',' && !bPoint};
    o_rLayout.BodyOffset = sample[run.First].Offset;
    o_rLayout.BodyLine = sample[run.First].Number;
    const std::size_t width = std::min(WidthOf(shapes, run), MostCells);
    o_rLayout.Heads.resize(width);
    VHead(sample, shapes, run.First, separator, width).Read(o_rLayout);
    o_rLayout.FirstTimes = FirstNumbers(sample, run, o_rLayout.Rules);
    return true;
}

} // namespace Recordings

#include "C3dBuilder.h"

#include <algorithm>
#include <bit>
#include <cmath>
#include <map>
#include <string>
#include <utility>
#include <vector>

namespace TestRecordings
{

using Recordings::EProcessor;

namespace
{

constexpr std::size_t BlockBytes = 512;

class Writer
{
public:
    Writer(EProcessor i_Processor, std::vector<std::byte>& io_rBytes) : m_Processor(i_Processor), m_rBytes(io_rBytes) {}

    void Byte(int i_Value) { m_rBytes.push_back(static_cast<std::byte>(static_cast<std::uint8_t>(i_Value & 0xFF))); }

    void Word(int i_Value)
    {
        const bool bBig = m_Processor == EProcessor::Mips;
        Byte(bBig ? i_Value >> 8 : i_Value);
        Byte(bBig ? i_Value : i_Value >> 8);
    }

    void Real(double i_Value)
    {
        const std::uint32_t bits = m_Processor == EProcessor::Dec
                                       ? VaxBits(i_Value)
                                       : std::bit_cast<std::uint32_t>(static_cast<float>(i_Value));
        const bool bHighFirst = m_Processor != EProcessor::Intel;
        Word(static_cast<int>(bHighFirst ? bits >> 16 : bits & 0xFFFFu));
        Word(static_cast<int>(bHighFirst ? bits & 0xFFFFu : bits >> 16));
    }

    void Text(const std::string& i_rText)
    {
        for (const char character : i_rText)
            Byte(character);
    }

private:
    static std::uint32_t VaxBits(double i_Value)
    {
        if (i_Value == 0.0)
            return 0;
        int exponent = 0;
        const double fraction = std::frexp(std::abs(i_Value), &exponent); // 0.5 <= fraction < 1
        const auto mantissa = static_cast<std::uint32_t>(std::lround(std::ldexp(fraction, 24)));
        const std::uint32_t sign = i_Value < 0.0 ? 0x80000000u : 0u;
        return sign | static_cast<std::uint32_t>(exponent + 128) << 23 | (mantissa & 0x7FFFFFu);
    }

    EProcessor m_Processor;
    std::vector<std::byte>& m_rBytes;
};

std::vector<std::byte> Content(const C3dSpec& i_rSpec, const ParameterSpec& i_rParameter)
{
    std::vector<std::byte> bytes;
    Writer writer(i_rSpec.Processor, bytes);
    writer.Byte(i_rParameter.Type);
    writer.Byte(static_cast<int>(i_rParameter.Dimensions.size()));
    for (const int dimension : i_rParameter.Dimensions)
        writer.Byte(dimension);
    writer.Text(i_rParameter.Characters);
    for (const double number : i_rParameter.Numbers)
    {
        if (i_rParameter.Type == 4)
            writer.Real(number);
        else if (i_rParameter.Type == 2)
            writer.Word(static_cast<int>(number));
        else
            writer.Byte(static_cast<int>(number));
    }
    return bytes;
}

void AppendRecord(const C3dSpec& i_rSpec, const std::string& i_rName, int i_Group,
                  const std::vector<std::byte>& i_rContent, bool i_bLast, std::vector<std::byte>& io_rBytes)
{
    Writer writer(i_rSpec.Processor, io_rBytes);
    const int length = static_cast<int>(i_rName.size());
    writer.Byte(i_rSpec.bLocked ? -length : length);
    writer.Byte(i_Group);
    writer.Text(i_rName);
    const auto next = static_cast<int>(2 + i_rContent.size() + 1 + i_rSpec.Description.size());
    writer.Word(i_bLast && !i_rSpec.bEndMark ? 16129 : next);
    io_rBytes.insert(io_rBytes.end(), i_rContent.begin(), i_rContent.end());
    writer.Byte(static_cast<int>(i_rSpec.Description.size()));
    writer.Text(i_rSpec.Description);
}

void AppendRecords(const C3dSpec& i_rSpec, std::vector<std::byte>& io_rBytes)
{
    std::map<std::string, int> groups;
    for (const ParameterSpec& rParameter : i_rSpec.Parameters)
        groups.emplace(rParameter.Group, static_cast<int>(groups.size()) + 1);
    const auto appendGroups = [&]
    {
        for (const auto& [rName, number] : groups)
            AppendRecord(i_rSpec, rName, -number, {}, false, io_rBytes);
    };
    if (!i_rSpec.bGroupsLast)
        appendGroups();
    for (const ParameterSpec& rParameter : i_rSpec.Parameters)
        AppendRecord(i_rSpec, rParameter.Name, groups[rParameter.Group], Content(i_rSpec, rParameter),
                     &rParameter == &i_rSpec.Parameters.back() && !i_rSpec.bGroupsLast, io_rBytes);
    if (i_rSpec.bGroupsLast)
        appendGroups();
}

void PadToBlock(std::vector<std::byte>& io_rBytes, std::byte i_Fill = std::byte{0})
{
    io_rBytes.resize((io_rBytes.size() + BlockBytes - 1) / BlockBytes * BlockBytes, i_Fill);
}

void AppendHeader(const C3dSpec& i_rSpec, std::size_t i_DataBlock, std::vector<std::byte>& io_rBytes)
{
    Writer writer(i_rSpec.Processor, io_rBytes);
    writer.Byte(static_cast<int>(i_rSpec.ParameterBlock));
    writer.Byte(0x50);
    writer.Word(static_cast<int>(i_rSpec.Points));
    writer.Word(static_cast<int>(i_rSpec.AnalogChannels * i_rSpec.AnalogSamplesPerFrame));
    writer.Word(static_cast<int>(i_rSpec.FirstFrame));
    const auto last = i_rSpec.FirstFrame + static_cast<unsigned>(i_rSpec.Frames.size()) - 1;
    writer.Word(static_cast<int>(i_rSpec.LastFrame == 0 ? last : i_rSpec.LastFrame));
    writer.Word(10);
    writer.Real(i_rSpec.bReal ? -i_rSpec.Scale : i_rSpec.Scale);
    writer.Word(i_rSpec.bPointToData ? static_cast<int>(i_DataBlock) : 0);
    writer.Word(static_cast<int>(i_rSpec.AnalogSamplesPerFrame));
    writer.Real(i_rSpec.Rate);
    io_rBytes.resize(298);
    if (!i_rSpec.Events.empty())
    {
        writer.Word(12345);
        writer.Word(static_cast<int>(i_rSpec.Events.size()));
        io_rBytes.resize(304);
        for (const HeaderEventSpec& rEvent : i_rSpec.Events)
            writer.Real(rEvent.Seconds);
        io_rBytes.resize(376);
        for (const HeaderEventSpec& rEvent : i_rSpec.Events)
            writer.Byte(rEvent.bOn ? 1 : 0);
        io_rBytes.resize(396);
        for (const HeaderEventSpec& rEvent : i_rSpec.Events)
            writer.Text((rEvent.Label + "    ").substr(0, 4));
    }
    io_rBytes.resize(BlockBytes);
}

} // namespace

ParameterSpec Integers(std::string i_Group, std::string i_Name, std::vector<double> i_Numbers)
{
    const int count = static_cast<int>(i_Numbers.size());
    return {std::move(i_Group),
            std::move(i_Name),
            2,
            count == 1 ? std::vector<int>{} : std::vector<int>{count},
            std::move(i_Numbers),
            {}};
}

ParameterSpec Reals(std::string i_Group, std::string i_Name, std::vector<double> i_Numbers)
{
    ParameterSpec parameter = Integers(std::move(i_Group), std::move(i_Name), std::move(i_Numbers));
    parameter.Type = 4;
    return parameter;
}

ParameterSpec Texts(std::string i_Group, std::string i_Name, const std::vector<std::string>& i_rTexts)
{
    std::size_t width = 1;
    for (const std::string& rText : i_rTexts)
        width = std::max(width, rText.size());
    ParameterSpec parameter{std::move(i_Group),
                            std::move(i_Name),
                            -1,
                            {static_cast<int>(width), static_cast<int>(i_rTexts.size())},
                            {},
                            {}};
    for (std::string text : i_rTexts)
    {
        text.resize(width, ' ');
        parameter.Characters += text;
    }
    return parameter;
}

std::vector<std::byte> C3dSpec::Encode(double i_Value) const
{
    std::vector<std::byte> bytes;
    Writer writer(Processor, bytes);
    if (bReal)
        writer.Real(i_Value);
    else
        writer.Word(static_cast<int>(i_Value));
    return bytes;
}

BuiltC3d BuildC3d(const C3dSpec& i_rSpec)
{
    std::vector<std::byte> section(4);
    AppendRecords(i_rSpec, section);
    if (i_rSpec.bEndMark)
        section.resize(section.size() + 2);
    PadToBlock(section, i_rSpec.bEndMark ? std::byte{0} : std::byte{0x2A});
    const std::size_t blocks = section.size() / BlockBytes;
    section[2] = i_rSpec.bSayParameterLength ? static_cast<std::byte>(blocks) : std::byte{0};
    section[3] = static_cast<std::byte>(i_rSpec.Processor);

    BuiltC3d built;
    const std::size_t dataBlock = i_rSpec.ParameterBlock + blocks + i_rSpec.EmptyBlocksBeforeData;
    AppendHeader(i_rSpec, dataBlock, built.Bytes);
    built.ParameterOffset = (i_rSpec.ParameterBlock - 1) * BlockBytes;
    built.DataOffset = (dataBlock - 1) * BlockBytes;
    built.Bytes.resize(built.ParameterOffset);
    built.Bytes.insert(built.Bytes.end(), section.begin(), section.end());
    built.Bytes.resize(built.DataOffset);
    for (const std::vector<double>& rFrame : i_rSpec.Frames)
        for (const double word : rFrame)
        {
            const std::vector<std::byte> bytes = i_rSpec.Encode(word);
            built.Bytes.insert(built.Bytes.end(), bytes.begin(), bytes.end());
        }
    return built;
}

C3dSpec SmallSpec(EProcessor i_Processor, bool i_bReal)
{
    C3dSpec spec;
    spec.Processor = i_Processor;
    spec.bReal = i_bReal;
    spec.Points = 2;
    spec.AnalogChannels = 2;
    spec.AnalogSamplesPerFrame = 2;
    spec.FirstFrame = 11;
    spec.Scale = 0.25;
    spec.Rate = 50.0;
    // Integer points are counts of the scale; reals are the values themselves.
    const double unit = i_bReal ? 0.25 : 1.0;
    for (int frame = 0; frame < 3; ++frame)
    {
        const double base = 1000.0 * (frame + 1);
        const bool bMissing = frame == 1;
        spec.Frames.push_back({base * unit, -base * unit, (base + 1) * unit, 0x0105, //
                               8.0 * unit, 16.0 * unit, 24.0 * unit, bMissing ? -1.0 : 0.0, 2048.0 + frame,
                               10.0 * (frame + 1), 2048.0 - frame, -10.0 * (frame + 1)});
    }
    spec.Parameters = {
        Integers("POINT", "USED", {2}),
        Reals("POINT", "SCALE", {i_bReal ? -0.25 : 0.25}),
        Reals("POINT", "RATE", {50}),
        Integers("POINT", "FRAMES", {3}),
        Texts("POINT", "LABELS", {"Ann:Head", "Toe"}),
        Texts("POINT", "UNITS", {"mm  "}),
        Integers("ANALOG", "USED", {2}),
        Reals("ANALOG", "RATE", {100}),
        Reals("ANALOG", "GEN_SCALE", {0.5}),
        Reals("ANALOG", "SCALE", {2, -4}),
        Integers("ANALOG", "OFFSET", {2048, 0}),
        Texts("ANALOG", "LABELS", {"Fz", "EMG 1"}),
        Texts("ANALOG", "UNITS", {"N", "V"}),
    };
    return spec;
}

} // namespace TestRecordings

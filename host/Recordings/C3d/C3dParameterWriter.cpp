#include "Recordings/C3d/C3dParameterWriter.h"

#include "Recordings/C3d/C3dHeader.h"
#include "Recordings/Text/ByteDecoder.h"

#include <algorithm>
#include <bit>
#include <utility>

namespace Recordings
{

namespace
{

constexpr std::size_t MaximumEntries = 255; // a dimension is one byte
constexpr std::size_t MaximumBlocks = 255;  // and so is the number of blocks

std::byte AsByte(std::size_t i_Value)
{
    return static_cast<std::byte>(static_cast<std::uint8_t>(i_Value));
}

std::string NameOfPart(std::string_view i_Name, std::size_t i_Part)
{
    return i_Part == 0 ? std::string(i_Name) : std::string(i_Name) + std::to_string(i_Part + 1);
}

} // namespace

void AppendC3dWord(std::uint16_t i_Value, std::vector<std::byte>& io_rBytes)
{
    io_rBytes.push_back(AsByte(i_Value & 0xFFu));
    io_rBytes.push_back(AsByte(i_Value >> 8));
}

void AppendC3dReal(float i_Value, std::vector<std::byte>& io_rBytes)
{
    const auto bits = std::bit_cast<std::uint32_t>(i_Value);
    AppendC3dWord(static_cast<std::uint16_t>(bits & 0xFFFFu), io_rBytes);
    AppendC3dWord(static_cast<std::uint16_t>(bits >> 16), io_rBytes);
}

void VC3dParameterWriter::BeginGroup(std::string_view i_Name)
{
    ++m_Group;
    AddRecord(i_Name, -m_Group, {});
}

// A record: length of the name, group, name, distance to the next record, content, length of a description (none).
void VC3dParameterWriter::AddRecord(std::string_view i_Name, int i_Group, std::span<const std::byte> i_Content)
{
    m_Records.push_back(AsByte(i_Name.size()));
    m_Records.push_back(static_cast<std::byte>(static_cast<std::int8_t>(i_Group)));
    const auto name = std::as_bytes(std::span(i_Name));
    m_Records.insert(m_Records.end(), name.begin(), name.end());
    AppendC3dWord(static_cast<std::uint16_t>(2 + i_Content.size() + 1), m_Records);
    m_Records.insert(m_Records.end(), i_Content.begin(), i_Content.end());
    m_Records.push_back(std::byte{0});
}

void VC3dParameterWriter::AddParameter(std::string_view i_Name, int i_Type, std::span<const std::uint8_t> i_Dimensions,
                                       std::span<const std::byte> i_Data)
{
    std::vector<std::byte> content{static_cast<std::byte>(static_cast<std::int8_t>(i_Type)),
                                   AsByte(i_Dimensions.size())};
    const auto dimensions = std::as_bytes(i_Dimensions);
    content.insert(content.end(), dimensions.begin(), dimensions.end());
    content.insert(content.end(), i_Data.begin(), i_Data.end());
    AddRecord(i_Name, m_Group, content);
}

void VC3dParameterWriter::AddInteger(std::string_view i_Name, std::uint16_t i_Value)
{
    std::vector<std::byte> data;
    AppendC3dWord(i_Value, data);
    AddParameter(i_Name, 2, {}, data);
}

void VC3dParameterWriter::AddReal(std::string_view i_Name, float i_Value)
{
    std::vector<std::byte> data;
    AppendC3dReal(i_Value, data);
    AddParameter(i_Name, 4, {}, data);
}

void VC3dParameterWriter::AddText(std::string_view i_Name, const std::string& i_rText)
{
    const auto length = static_cast<std::uint8_t>(i_rText.size());
    AddParameter(i_Name, -1, {&length, 1}, std::as_bytes(std::span(i_rText)));
}

template <typename Value, typename Append>
void VC3dParameterWriter::AddList(std::string_view i_Name, int i_Type, std::span<const Value> i_Values,
                                  std::size_t i_RowLength, Append i_Append)
{
    const std::size_t rows = i_Values.size() / i_RowLength;
    for (std::size_t first = 0, part = 0; first < rows; first += MaximumEntries, ++part)
    {
        const std::size_t count = std::min(MaximumEntries, rows - first);
        std::vector<std::byte> data;
        for (const Value value : i_Values.subspan(first * i_RowLength, count * i_RowLength))
            i_Append(value, data);
        std::vector<std::uint8_t> dimensions;
        if (i_RowLength > 1)
            dimensions.push_back(static_cast<std::uint8_t>(i_RowLength));
        dimensions.push_back(static_cast<std::uint8_t>(count));
        AddParameter(NameOfPart(i_Name, part), i_Type, dimensions, data);
    }
}

void VC3dParameterWriter::AddIntegers(std::string_view i_Name, std::span<const std::uint16_t> i_Values,
                                      std::size_t i_RowLength)
{
    AddList(i_Name, 2, i_Values, i_RowLength, AppendC3dWord);
}

void VC3dParameterWriter::AddReals(std::string_view i_Name, std::span<const float> i_Values, std::size_t i_RowLength)
{
    AddList(i_Name, 4, i_Values, i_RowLength, AppendC3dReal);
}

void VC3dParameterWriter::AddTexts(std::string_view i_Name, std::span<const std::string> i_Texts)
{
    for (std::size_t first = 0, part = 0; first < i_Texts.size(); first += MaximumEntries, ++part)
    {
        const auto texts = i_Texts.subspan(first, std::min(MaximumEntries, i_Texts.size() - first));
        std::size_t width = 1;
        for (const std::string& rText : texts)
            width = std::max(width, rText.size());
        std::vector<std::byte> data;
        for (const std::string& rText : texts)
        {
            const auto bytes = std::as_bytes(std::span(rText));
            data.insert(data.end(), bytes.begin(), bytes.end());
            data.insert(data.end(), width - rText.size(), std::byte{' '});
        }
        const std::uint8_t dimensions[] = {static_cast<std::uint8_t>(width), static_cast<std::uint8_t>(texts.size())};
        AddParameter(NameOfPart(i_Name, part), -1, dimensions, data);
    }
}

std::optional<std::vector<std::byte>> VC3dParameterWriter::Finish() const
{
    constexpr std::size_t headAndEndMark = 6;
    const std::size_t blocks = (headAndEndMark + m_Records.size() + C3dBlockBytes - 1) / C3dBlockBytes;
    if (blocks > MaximumBlocks)
        return std::nullopt;
    std::vector<std::byte> section{std::byte{1}, std::byte{0x50}, AsByte(blocks),
                                   static_cast<std::byte>(EProcessor::Intel)};
    section.insert(section.end(), m_Records.begin(), m_Records.end());
    section.resize(blocks * C3dBlockBytes);
    return section;
}

} // namespace Recordings

#include "Recordings/C3d/C3dParameters.h"

#include "Recordings/Text/C3dText.h"

#include <algorithm>
#include <cstdint>
#include <cstdlib>
#include <utility>

namespace Recordings
{

namespace
{

constexpr std::size_t SectionHeadBytes = 4;
constexpr std::size_t MaximumDimensions = 7;

int SignedByte(std::byte i_Byte)
{
    return static_cast<std::int8_t>(std::to_integer<std::uint8_t>(i_Byte));
}

std::size_t BytesOfType(int i_Type)
{
    return i_Type == -1 || i_Type == 1 ? 1 : i_Type == 2 ? 2 : i_Type == 4 ? 4 : 0;
}

// The parameters end where the data begin, whatever the section says of its own length: some writers leave that at 0.
std::size_t EndOfSection(const C3dHeader& i_rHeader)
{
    if (i_rHeader.DataOffset > i_rHeader.ParameterOffset)
        return i_rHeader.DataOffset;
    return i_rHeader.ParameterOffset + std::max(i_rHeader.ParameterBytes, SectionHeadBytes);
}

std::string NameOfPart(std::string_view i_Name, int i_Part)
{
    return i_Part == 1 ? std::string(i_Name) : std::string(i_Name) + std::to_string(i_Part);
}

} // namespace

TQL::IResult VC3dParameters::Read(std::span<const std::byte> i_File, const C3dHeader& i_rHeader,
                                  VC3dParameters& o_rParameters, std::string& o_rError)
{
    VC3dParameters parameters;
    parameters.m_Decoder = i_rHeader.Decoder;
    const std::size_t end = EndOfSection(i_rHeader);
    const auto section = i_File.first(std::min(end, i_File.size())).subspan(i_rHeader.ParameterOffset);
    std::size_t place = SectionHeadBytes;
    while (place != 0 && place < section.size() && SignedByte(section[place]) != 0)
    {
        if (parameters.ReadRecord(section, place))
            continue;
        if (end > i_File.size())
        {
            o_rError = "the file ends inside its parameter section. Copy it again from where it came.";
            return TQL::Result::EndOfData;
        }
        parameters.m_DamagedBehind = parameters.m_LastName.empty() ? "its start" : parameters.m_LastName;
        break;
    }
    parameters.JoinGroups();
    o_rParameters = std::move(parameters);
    return TQL::Result::Ok;
}

// Moves io_rPlace to the next record, or to 0 behind the last. False when the record does not fit into the section.
bool VC3dParameters::ReadRecord(std::span<const std::byte> i_Section, std::size_t& io_rPlace)
{
    // The length of a name is negative when the parameter is locked; the number of a group is negative in its own
    // record.
    const auto nameLength = static_cast<std::size_t>(std::abs(SignedByte(i_Section[io_rPlace])));
    const std::size_t pointerPlace = io_rPlace + 2 + nameLength;
    if (pointerPlace + 2 > i_Section.size())
        return false;
    const int group = SignedByte(i_Section[io_rPlace + 1]);
    std::string name = C3dCapitals(C3dText(i_Section.subspan(io_rPlace + 2, nameLength)));
    const std::size_t next = m_Decoder.Word(i_Section.subspan(pointerPlace));
    C3dParameter parameter;
    if (group > 0 && !ReadContent(i_Section.subspan(pointerPlace + 2), parameter))
        return false;
    const std::byte* pEnd = group > 0 ? parameter.Data.data() + parameter.Data.size() : nullptr;
    const std::size_t ownBytes = group > 0 ? static_cast<std::size_t>(pEnd - &i_Section[pointerPlace]) : 2;
    if (group == 0 || (next != 0 && next < ownBytes))
        return false;
    if (group < 0)
        m_Groups.emplace(-group, name);
    else
        m_Records[group].emplace(name, std::move(parameter));
    m_LastName = std::move(name);
    io_rPlace = next == 0 ? 0 : pointerPlace + next;
    return true;
}

bool VC3dParameters::ReadContent(std::span<const std::byte> i_Content, C3dParameter& o_rParameter) const
{
    if (i_Content.size() < 2)
        return false;
    o_rParameter.Type = SignedByte(i_Content[0]);
    std::size_t bytes = BytesOfType(o_rParameter.Type);
    const auto dimensions = std::to_integer<std::size_t>(i_Content[1]);
    if (bytes == 0 || dimensions > MaximumDimensions || 2 + dimensions > i_Content.size())
        return false;
    const auto data = i_Content.subspan(2 + dimensions);
    for (std::size_t i = 0; i < dimensions; ++i)
    {
        o_rParameter.Dimensions.push_back(std::to_integer<std::size_t>(i_Content[2 + i]));
        bytes *= o_rParameter.Dimensions.back(); // at most 4 x 255^7: no overflow
    }
    if (bytes > data.size())
        return false;
    o_rParameter.Data = data.first(bytes);
    return true;
}

// A parameter may come before the record of its group, so names meet only here.
void VC3dParameters::JoinGroups()
{
    for (auto& [rNumber, rParameters] : m_Records)
        if (const auto found = m_Groups.find(rNumber); found != m_Groups.end())
            m_ByName[found->second].merge(rParameters);
    m_Records.clear();
}

const C3dParameter* VC3dParameters::Find(std::string_view i_Group, std::string_view i_Name) const
{
    const auto group = m_ByName.find(std::string(i_Group));
    if (group == m_ByName.end())
        return nullptr;
    const auto parameter = group->second.find(std::string(i_Name));
    return parameter == group->second.end() ? nullptr : &parameter->second;
}

std::vector<std::string> VC3dParameters::Texts(std::string_view i_Group, std::string_view i_Name,
                                               std::size_t i_Limit) const
{
    std::vector<std::string> texts;
    for (int part = 1;; ++part)
    {
        const C3dParameter* pParameter = Find(i_Group, NameOfPart(i_Name, part));
        if (pParameter == nullptr || pParameter->Type != -1)
            return texts;
        const std::size_t width = pParameter->Dimensions.empty() ? 1 : pParameter->Dimensions.front();
        for (std::size_t place = 0; place < pParameter->Data.size() && texts.size() < i_Limit; place += width)
            texts.push_back(C3dText(pParameter->Data.subspan(place, width)));
    }
}

std::string VC3dParameters::Text(std::string_view i_Group, std::string_view i_Name) const
{
    const std::vector<std::string> texts = Texts(i_Group, i_Name, 1);
    return texts.empty() ? std::string() : texts.front();
}

std::vector<double> VC3dParameters::Numbers(std::string_view i_Group, std::string_view i_Name, std::size_t i_Limit,
                                            EWordKind i_Integers) const
{
    std::vector<double> numbers;
    for (int part = 1;; ++part)
    {
        const C3dParameter* pParameter = Find(i_Group, NameOfPart(i_Name, part));
        if (pParameter == nullptr || pParameter->Type == -1)
            return numbers;
        const std::size_t bytes = BytesOfType(pParameter->Type);
        for (std::size_t place = 0; place < pParameter->Data.size() && numbers.size() < i_Limit; place += bytes)
        {
            const auto data = pParameter->Data.subspan(place);
            float value = std::to_integer<std::uint8_t>(data[0]);
            if (pParameter->Type != 1)
                m_Decoder.Decode(pParameter->Type == 4 ? EWordKind::Real : i_Integers, data.data(), WordGrid(), &value);
            numbers.push_back(static_cast<double>(value));
        }
    }
}

std::optional<double> VC3dParameters::Number(std::string_view i_Group, std::string_view i_Name,
                                             EWordKind i_Integers) const
{
    const std::vector<double> numbers = Numbers(i_Group, i_Name, 1, i_Integers);
    return numbers.empty() ? std::nullopt : std::optional<double>(numbers.front());
}

} // namespace Recordings

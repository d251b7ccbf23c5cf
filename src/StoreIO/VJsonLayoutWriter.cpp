#include "StoreIO/VJsonLayoutWriter.h"

#include "StoreIO/JsonMembers.h"
#include "StoreIO/StoreFormat.h"
#include "TQL/JsonText.h"

#include <algorithm>
#include <span>

namespace StoreIO
{
namespace
{

constexpr std::size_t s_BufferSize = 131072;
constexpr std::size_t s_IndentWidth = 2;

} // namespace

VJsonLayoutWriter::VJsonLayoutWriter(TQL::IOutputStream& i_rStream) : m_rStream(i_rStream)
{
    // What is appended between two looks at the size is short.
    m_Buffer.reserve(s_BufferSize + s_BufferSize / 8);
}

TQL::IResult VJsonLayoutWriter::Write(const rapidjson::Value& i_rRoot)
{
    BeginValue(i_rRoot);
    while (!m_Levels.empty() && m_Result.IsSuccess())
    {
        WriteNext();
        EmptyFullBuffer();
    }
    if (m_Result.IsSuccess())
        EmptyBuffer();
    if (m_Result.IsSuccess())
        m_Result = m_rStream.Flush();
    return m_Result;
}

/// The value itself; of an object or list only the opening brace.
void VJsonLayoutWriter::BeginValue(const rapidjson::Value& i_rValue)
{
    switch (i_rValue.GetType())
    {
    case rapidjson::kNullType:
        m_Buffer += "null";
        break;
    case rapidjson::kFalseType:
        m_Buffer += "false";
        break;
    case rapidjson::kTrueType:
        m_Buffer += "true";
        break;
    case rapidjson::kObjectType:
        m_Levels.push_back({&i_rValue});
        m_Buffer += '{';
        break;
    case rapidjson::kArrayType:
        m_Levels.push_back({&i_rValue});
        m_Buffer += '[';
        break;
    case rapidjson::kStringType:
        WriteQuoted(i_rValue);
        break;
    case rapidjson::kNumberType:
        WriteNumber(i_rValue);
        break;
    }
}

void VJsonLayoutWriter::WriteNumber(const rapidjson::Value& i_rNumber)
{
    if (i_rNumber.IsInt64())
        TQL::JsonText::AppendNumber(m_Buffer, i_rNumber.GetInt64());
    else if (i_rNumber.IsUint64())
        TQL::JsonText::AppendNumber(m_Buffer, i_rNumber.GetUint64());
    else if (!TQL::JsonText::AppendNumber(m_Buffer, i_rNumber.GetDouble()))
        m_Result = TQL::Result::SerialisationFailure;
}

/// In pieces, so that a long text does not grow the buffer by its length.
void VJsonLayoutWriter::WriteQuoted(const rapidjson::Value& i_rText)
{
    constexpr std::size_t pieceSize = 4096;
    std::string_view text = TextOf(i_rText);
    m_Buffer += '"';
    while (text.size() > pieceSize && m_Result.IsSuccess())
    {
        TQL::JsonText::AppendEscaped(m_Buffer, text.substr(0, pieceSize));
        text.remove_prefix(pieceSize);
        EmptyFullBuffer();
    }
    TQL::JsonText::AppendEscaped(m_Buffer, text.substr(0, pieceSize));
    m_Buffer += '"';
}

/// The next member or element of the innermost level, or its end.
void VJsonLayoutWriter::WriteNext()
{
    Level& rLevel = m_Levels.back();
    const bool bObject = rLevel.pValue->IsObject();
    const rapidjson::SizeType next = rLevel.Next++;
    if (next == (bObject ? rLevel.pValue->MemberCount() : rLevel.pValue->Size()))
    {
        CloseLevel();
        return;
    }
    m_Buffer += next != 0 ? ", " : " ";
    if (!bObject)
    {
        BeginValue((*rLevel.pValue)[next]);
        return;
    }
    const auto member = rLevel.pValue->MemberBegin() + next;
    WriteMemberName(member->name);
    m_Buffer += " : ";
    BeginValue(member->value);
}

void VJsonLayoutWriter::WriteMemberName(const rapidjson::Value& i_rName)
{
    const std::size_t depth = m_Levels.size();
    if (!m_Markers.empty() && m_Markers.back() == depth)
        BreakLine();
    // The members of entries are at odd depths; an entry that has this name is at an even one.
    if (depth % 2 == 1 && TextOf(i_rName) == ChildrenMember)
        m_Markers.push_back(depth + 1);
    WriteQuoted(i_rName);
}

void VJsonLayoutWriter::CloseLevel()
{
    const std::size_t depth = m_Levels.size();
    const bool bObject = m_Levels.back().pValue->IsObject();
    m_Levels.pop_back();
    if (bObject)
        CloseObject(depth);
    else
        m_Buffer += " ]";
}

void VJsonLayoutWriter::CloseObject(std::size_t i_Depth)
{
    if (m_Markers.empty())
        BreakLine();
    else if (i_Depth > m_Markers.back())
        m_Buffer += ' ';
    else if (i_Depth == m_Markers.back())
        BreakLine();
    else if (i_Depth + 1 == m_Markers.back())
    {
        BreakLine();
        m_Markers.pop_back();
    }
    m_Buffer += '}';
}

void VJsonLayoutWriter::BreakLine()
{
    m_Buffer += '\n';
    m_Buffer.append((std::max<std::size_t>(m_Levels.size(), 1) - 1) * s_IndentWidth, ' ');
}

void VJsonLayoutWriter::EmptyBuffer()
{
    m_Result = m_rStream.Write(std::as_bytes(std::span(m_Buffer)));
    m_Buffer.clear();
}

void VJsonLayoutWriter::EmptyFullBuffer()
{
    if (m_Buffer.size() >= s_BufferSize && m_Result.IsSuccess())
        EmptyBuffer();
}

} // namespace StoreIO

#include "Studio/StoreLint/LocatedJson.h"

#include "StoreIO/StoreFormat.h"
#include "TQL/RapidJson.h"

#include <algorithm>
#include <cstdint>

namespace Studio
{
namespace
{

using EKind = LocatedValue::EKind;

/// Builds the values while the parser runs; where each ends is where the parser stands.
class VBuilder
{
public:
    VBuilder(std::string_view i_Text, const rapidjson::MemoryStream& i_rStream, LocatedValue& o_rRoot)
        : m_Text(i_Text), m_rStream(i_rStream), m_rRoot(o_rRoot)
    {
    }

    bool Null() { return Word(EKind::Null, 4); }
    bool Bool(bool i_bValue) { return Word(EKind::Bool, i_bValue ? 4 : 5); }
    bool Int(int) { return Number(); }
    bool Uint(unsigned) { return Number(); }
    bool Int64(std::int64_t) { return Number(); }
    bool Uint64(std::uint64_t) { return Number(); }
    bool Double(double) { return Number(); }
    bool RawNumber(const char*, rapidjson::SizeType, bool) { return Number(); }
    bool String(const char* i_pText, rapidjson::SizeType i_Size, bool)
    {
        LocatedValue& rValue = Place(EKind::String);
        rValue.Raw = StringBefore(m_rStream.Tell());
        rValue.Text.assign(i_pText, i_Size);
        return true;
    }
    bool Key(const char* i_pText, rapidjson::SizeType i_Size, bool)
    {
        m_Name.assign(i_pText, i_Size);
        m_RawName = StringBefore(m_rStream.Tell());
        return true;
    }
    bool StartObject() { return Start(EKind::Object); }
    bool StartArray() { return Start(EKind::List); }
    bool EndObject(rapidjson::SizeType) { return End(); }
    bool EndArray(rapidjson::SizeType) { return End(); }

    /// Where the innermost object or list begins that is open, and its kind.
    const LocatedValue* Open() const { return m_Open.empty() ? nullptr : m_Open.back(); }
    std::size_t OpenOffset() const { return m_Begins.back(); }

private:
    /// A new value. The parents of a value that is open get no further members before it ends, so they stay in place.
    LocatedValue& Place(EKind i_Kind)
    {
        LocatedValue* pValue = &m_rRoot;
        if (!m_Open.empty())
        {
            LocatedMember& rMember = m_Open.back()->Members.emplace_back();
            if (m_Open.back()->Kind == EKind::Object)
            {
                rMember.Name = std::move(m_Name);
                rMember.RawName = m_RawName;
            }
            pValue = &rMember.Value;
        }
        pValue->Kind = i_Kind;
        return *pValue;
    }

    bool Word(EKind i_Kind, std::size_t i_Size)
    {
        Place(i_Kind).Raw = m_Text.substr(m_rStream.Tell() - i_Size, i_Size);
        return true;
    }

    bool Number()
    {
        const std::string_view before = m_Text.substr(0, m_rStream.Tell());
        const std::size_t last = before.find_last_not_of("0123456789+-.eE");
        Place(EKind::Number).Raw = before.substr(last + 1); // npos + 1 is 0
        return true;
    }

    bool Start(EKind i_Kind)
    {
        if (m_Open.size() == StoreIO::MaximumJsonDepth)
            return false;
        m_Open.push_back(&Place(i_Kind));
        m_Begins.push_back(m_rStream.Tell() - 1);
        return true;
    }

    bool End()
    {
        m_Open.back()->Raw = m_Text.substr(m_Begins.back(), m_rStream.Tell() - m_Begins.back());
        m_Open.pop_back();
        m_Begins.pop_back();
        return true;
    }

    /// The string that ends there, with its quotes. Inside of it a quote has an odd number of backslashes before it.
    std::string_view StringBefore(std::size_t i_End) const
    {
        std::size_t begin = i_End - 1;
        for (std::size_t backslashes = 1; backslashes % 2 != 0;)
        {
            begin = m_Text.rfind('"', begin - 1);
            const std::size_t last = m_Text.find_last_not_of('\\', begin - 1);
            backslashes = begin - 1 - last;
        }
        return m_Text.substr(begin, i_End - begin);
    }

    const std::string_view m_Text;
    const rapidjson::MemoryStream& m_rStream;
    LocatedValue& m_rRoot;
    std::vector<LocatedValue*> m_Open;
    std::vector<std::size_t> m_Begins; ///< of those that are open
    std::string m_Name;
    std::string_view m_RawName;
};

const char* Expected(rapidjson::ParseErrorCode i_Code)
{
    switch (i_Code)
    {
    case rapidjson::kParseErrorDocumentEmpty:
        return "expected '{': there is nothing in the file";
    case rapidjson::kParseErrorDocumentRootNotSingular:
        return "expected the end of the file";
    case rapidjson::kParseErrorValueInvalid:
        return "expected a value: a text in double quotes, a number, true, false, a list or an object";
    case rapidjson::kParseErrorObjectMissName:
        return "expected a name in double quotes (or a comma too many stands before this)";
    case rapidjson::kParseErrorObjectMissColon:
        return "expected ':' between a name and its value";
    case rapidjson::kParseErrorObjectMissCommaOrCurlyBracket:
        return "expected ',' before the next member, or '}'";
    case rapidjson::kParseErrorArrayMissCommaOrSquareBracket:
        return "expected ',' before the next element, or ']'";
    case rapidjson::kParseErrorStringUnicodeEscapeInvalidHex:
        return "expected four hexadecimal digits after \\u";
    case rapidjson::kParseErrorStringUnicodeSurrogateInvalid:
        return "expected the second half of a pair of \\u escapes";
    case rapidjson::kParseErrorStringEscapeInvalid:
        return "expected one of \\\" \\\\ \\/ \\b \\f \\n \\r \\t \\u, for a line break \\n, for a tab \\t";
    case rapidjson::kParseErrorStringMissQuotationMark:
        return "expected the double quote that ends the text";
    case rapidjson::kParseErrorNumberTooBig:
        return "expected a number below 1.8e308";
    case rapidjson::kParseErrorNumberMissFraction:
        return "expected a digit after the point";
    case rapidjson::kParseErrorNumberMissExponent:
        return "expected a digit after the exponent's 'e'";
    default:
        return "expected JSON";
    }
}

std::string Explain(std::string_view i_Text, const rapidjson::ParseResult& i_rResult, const VBuilder& i_rBuilder)
{
    if (i_Text.starts_with("\xEF\xBB\xBF"))
        return "expected '{': a byte order mark stands before it; save the file as UTF-8 without one";
    if (i_rResult.Code() == rapidjson::kParseErrorTermination)
        return "expected no more than " + std::to_string(StoreIO::MaximumJsonDepth) +
               " objects and lists inside one another";
    std::string text = Expected(i_rResult.Code());
    const LocatedValue* pOpen = i_rBuilder.Open();
    if (pOpen && i_rResult.Offset() >= i_Text.size())
        text += std::string("; the file ends inside the ") + (pOpen->Kind == EKind::Object ? "object" : "list") +
                " that begins in line " + std::to_string(FindPosition(i_Text, i_rBuilder.OpenOffset()).Line);
    return text;
}

} // namespace

std::optional<TextProblem> ParseLocated(std::string_view i_Text, LocatedValue& o_rRoot)
{
    rapidjson::MemoryStream stream(i_Text.data(), i_Text.size());
    VBuilder builder(i_Text, stream, o_rRoot);
    rapidjson::Reader reader;
    const rapidjson::ParseResult result = reader.Parse<rapidjson::kParseFullPrecisionFlag>(stream, builder);
    if (result)
        return std::nullopt;
    // The parser asks whether it may go on behind a bracket.
    const std::size_t offset = result.Offset() - (result.Code() == rapidjson::kParseErrorTermination ? 1 : 0);
    return TextProblem{offset, {}, Explain(i_Text, result, builder)};
}

TextPosition FindPosition(std::string_view i_Text, std::size_t i_Offset)
{
    const std::string_view before = i_Text.substr(0, i_Offset);
    TextPosition position;
    position.Line += static_cast<std::size_t>(std::ranges::count(before, '\n'));
    const auto isFirstByte = [](char i_Byte)
    {
        return (static_cast<unsigned char>(i_Byte) & 0xC0) != 0x80;
    };
    position.Column += static_cast<std::size_t>(
        std::ranges::count_if(before.substr(before.rfind('\n') + 1), isFirstByte)); // npos + 1 is 0
    return position;
}

} // namespace Studio

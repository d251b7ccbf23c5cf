#include "StoreIO/BoundedJson.h"

#include "StoreIO/StoreFormat.h"

#include <algorithm>
#include <cassert>
#include <cmath>
#include <utility>
#include <vector>

namespace StoreIO
{
namespace
{

/// The bytes of a stream, some at a time.
class StreamBlocks
{
public:
    explicit StreamBlocks(TQL::IInputStream& i_rStream) : m_rStream(i_rStream) {}

    /// The next bytes; none at the end.
    std::span<const std::byte> Next()
    {
        if (m_bEnded)
            return {};
        const auto [count, result] = m_rStream.Read(m_Buffer);
        m_Result = result;
        m_bEnded = count < m_Buffer.size();
        return std::span<const std::byte>(m_Buffer).first(count);
    }

    TQL::IResult Result() const { return m_Result; }

private:
    TQL::IInputStream& m_rStream;
    std::vector<std::byte> m_Buffer = std::vector<std::byte>(65536);
    TQL::IResult m_Result;
    bool m_bEnded = false;
};

/// A text as the parser wants to see it: all of it, or block by block. The parser makes copies, which are then put in
/// the place of the original, so that the pointers stay in registers.
class JsonInput
{
public:
    using Ch = char;

    explicit JsonInput(std::span<const std::byte> i_Text) { Take(i_Text); }
    explicit JsonInput(StreamBlocks& i_rBlocks) : m_pBlocks(&i_rBlocks) {}

    Ch Peek() { return m_pNext != m_pEnd || Fill() ? *m_pNext : '\0'; }
    Ch Take() { return m_pNext != m_pEnd || Fill() ? *m_pNext++ : '\0'; }
    std::size_t Tell() const { return m_EndOffset - static_cast<std::size_t>(m_pEnd - m_pNext); }

    // For reading in place, which is never done.
    Ch* PutBegin() { return nullptr; }
    void Put(Ch) { assert(false); }
    std::size_t PutEnd(Ch*) { return 0; }

private:
    void Take(std::span<const std::byte> i_Bytes)
    {
        m_pNext = reinterpret_cast<const char*>(i_Bytes.data());
        m_pEnd = m_pNext + i_Bytes.size();
        m_EndOffset += i_Bytes.size();
    }

    bool Fill()
    {
        if (m_pBlocks)
            Take(m_pBlocks->Next());
        return m_pNext != m_pEnd;
    }

    const char* m_pNext = nullptr;
    const char* m_pEnd = nullptr;
    std::size_t m_EndOffset = 0; ///< of m_pEnd in the whole text
    StreamBlocks* m_pBlocks = nullptr;
};

} // namespace
} // namespace StoreIO

/// The parser may work on a copy of the input and put it back.
template <>
struct rapidjson::StreamTraits<StoreIO::JsonInput>
{
    enum
    {
        copyOptimization = 1
    };
};

namespace StoreIO
{
namespace
{

/// Stops the parser where the text is nested too deep, and at 1.8e308, which it takes for infinity.
class BoundedDocument : public rapidjson::Document
{
public:
    bool Double(double i_Number)
    {
        m_bTooBig = !std::isfinite(i_Number);
        return !m_bTooBig && rapidjson::Document::Double(i_Number);
    }
    bool StartObject() { return Enter() && rapidjson::Document::StartObject(); }
    bool StartArray() { return Enter() && rapidjson::Document::StartArray(); }
    bool EndObject(rapidjson::SizeType i_Count) { return Leave() && rapidjson::Document::EndObject(i_Count); }
    bool EndArray(rapidjson::SizeType i_Count) { return Leave() && rapidjson::Document::EndArray(i_Count); }

    std::string ProblemText(rapidjson::ParseErrorCode i_Code) const
    {
        if (m_Depth > MaximumJsonDepth)
            return "More than " + std::to_string(MaximumJsonDepth) + " levels of nesting.";
        return rapidjson::GetParseError_En(m_bTooBig ? rapidjson::kParseErrorNumberTooBig : i_Code);
    }

private:
    bool Enter() { return ++m_Depth <= MaximumJsonDepth; }
    bool Leave() { return m_Depth-- != 0; }

    std::size_t m_Depth = 0;
    bool m_bTooBig = false;
};

/// Gives what is wrong and the offset at which it is.
std::pair<std::string, std::size_t> Parse(JsonInput i_Input, rapidjson::Document& o_rDocument)
{
    BoundedDocument document;
    rapidjson::ParseResult parsed;
    const auto fill = [&](rapidjson::Document&)
    {
        parsed = rapidjson::Reader().Parse<rapidjson::kParseFullPrecisionFlag>(i_Input, document);
        return !parsed.IsError();
    };
    document.Populate(fill);
    const std::string problem = parsed.IsError() ? document.ProblemText(parsed.Code()) : "";
    o_rDocument = std::move(document);
    return {problem, parsed.Offset()};
}

std::string PlaceText(std::span<const std::byte> i_Text, std::size_t i_Offset)
{
    const auto before = i_Text.first(std::min(i_Offset, i_Text.size()));
    const auto line = std::find(before.rbegin(), before.rend(), std::byte{'\n'});
    return "line " + std::to_string(std::count(before.begin(), before.end(), std::byte{'\n'}) + 1) + ", column " +
           std::to_string(line - before.rbegin() + 1);
}

} // namespace

JsonReadResult ReadJson(std::span<const std::byte> i_Text, rapidjson::Document& o_rDocument)
{
    const auto [problem, offset] = Parse(JsonInput(i_Text), o_rDocument);
    if (problem.empty())
        return {};
    return {TQL::Result::SerialisationFailure, problem + " (" + PlaceText(i_Text, offset) + ")"};
}

JsonReadResult ReadJson(TQL::IInputStream& i_rStream, rapidjson::Document& o_rDocument)
{
    StreamBlocks blocks(i_rStream);
    const auto [problem, offset] = Parse(JsonInput(blocks), o_rDocument);
    if (blocks.Result().IsError())
    {
        o_rDocument.SetNull();
        return {blocks.Result(), {}};
    }
    if (problem.empty())
        return {};
    return {TQL::Result::SerialisationFailure, problem + " (byte " + std::to_string(offset + 1) + ")"};
}

} // namespace StoreIO

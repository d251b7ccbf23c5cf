#pragma once

#include "TQL/IStream.h"
#include "TQL/RapidJson.h"

#include <cstddef>
#include <string>
#include <string_view>
#include <vector>

namespace StoreIO
{

/// Writes a JSON document in the layout of store files: one line for each entry with its value and type on it, its
/// children indented below, so that a person can read it and compare two files line by line. Writes through a buffer of
/// its own. How deep the document is does not matter to the stack. One writer writes one document.
class VJsonLayoutWriter
{
public:
    explicit VJsonLayoutWriter(TQL::IOutputStream& i_rStream);

    /// Writes all of the document and flushes the stream. Stops at the first failure: that of the stream, or
    /// `SerialisationFailure` for a number that is not finite.
    TQL::IResult Write(const rapidjson::Value& i_rRoot);

private:
    /// An object or list that is open; Next counts the members or elements that were begun.
    struct Level
    {
        const rapidjson::Value* pValue;
        rapidjson::SizeType Next = 0;
    };

    void BeginValue(const rapidjson::Value& i_rValue);
    void WriteNumber(const rapidjson::Value& i_rNumber);
    void WriteQuoted(const rapidjson::Value& i_rText);
    void WriteNext();
    void WriteMemberName(const rapidjson::Value& i_rName);
    void CloseLevel();
    void CloseObject(std::size_t i_Depth);
    void BreakLine();
    void EmptyBuffer();
    void EmptyFullBuffer();

    TQL::IOutputStream& m_rStream;
    TQL::IResult m_Result;
    std::string m_Buffer;
    std::vector<Level> m_Levels;
    std::vector<std::size_t> m_Markers; ///< the depths of the open objects whose members are lines of their own
};

} // namespace StoreIO

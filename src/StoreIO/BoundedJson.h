#pragma once

#include "TQL/IResult.h"
#include "TQL/IStream.h"
#include "TQL/RapidJson.h"

#include <cstddef>
#include <span>
#include <string>

namespace StoreIO
{

/// What came of reading a JSON text.
struct JsonReadResult
{
    TQL::IResult Result;
    std::string Problem; ///< what is wrong with the text and where, for a person; empty unless it is no such JSON
};

/// Reads numbers to the last bit; the text is not copied as a whole. `SerialisationFailure`, and a null document, for
/// a text that is no JSON or is nested deeper than MaximumJsonDepth: whoever walks the document may recurse.
JsonReadResult ReadJson(std::span<const std::byte> i_Text, rapidjson::Document& o_rDocument);
/// The same from a stream. When the stream breaks its error is the result.
JsonReadResult ReadJson(TQL::IInputStream& i_rStream, rapidjson::Document& o_rDocument);

} // namespace StoreIO

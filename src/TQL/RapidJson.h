#pragma once

// The one place where RapidJSON is included, so that its options are the same everywhere and a repair for a compiler
// has one place.

#include "TQL/JsonText.h"

#include <rapidjson/internal/strtod.h>

#include <cstddef>

namespace rapidjson::internal
{

/// Takes the place of StrtodFullPrecision, which gives rubbish for some texts: 0e-300, whose bits have no highest one,
/// 18446744073709551615.5, which is rounded to a number of 65 bits, and 80 digits before e308, for which it looks
/// behind the end of a table. i_Approximate is exact for short numbers.
inline double StrtodCorrect(double i_Approximate, int i_Power, const char* i_pDigits, std::size_t i_Size,
                            std::size_t i_PointPosition, int i_Exponent)
{
    double exact = 0.0;
    if (StrtodFast(i_Approximate, i_Power, &exact))
        return exact;
    return TQL::JsonText::ReadDecimal({i_pDigits, i_Size}, i_Exponent - static_cast<std::int64_t>(i_Size) +
                                                               static_cast<std::int64_t>(i_PointPosition));
}

} // namespace rapidjson::internal

#define StrtodFullPrecision StrtodCorrect
#include <rapidjson/reader.h>
#undef StrtodFullPrecision

#include <rapidjson/document.h>
#include <rapidjson/error/en.h>
#include <rapidjson/filewritestream.h>
#include <rapidjson/memorystream.h>
#include <rapidjson/stringbuffer.h>
#include <rapidjson/writer.h>

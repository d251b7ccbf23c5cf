#include "Recordings/Common/UnitTable.h"

#include "Recordings/Text/TextScan.h"

#include <algorithm>

namespace Recordings
{

const UnitWord* FindUnitWord(std::string_view i_Text)
{
    const auto word = std::ranges::find(UnitWords, std::string_view(SmallLetters(i_Text)), &UnitWord::Word);
    return word == UnitWords.end() ? nullptr : &*word;
}

std::optional<double> ScaleOfUnitWord(std::string_view i_Text, std::uint16_t i_Dimension)
{
    const UnitWord* pWord = FindUnitWord(i_Text);
    if (pWord == nullptr || pWord->Base.empty())
        return std::nullopt;
    const auto base = std::ranges::find(UnitBases, pWord->Base, &UnitBase::Name);
    const auto prefix = std::ranges::find(UnitPrefixes, pWord->Prefix, &UnitPrefix::Name);
    if (base == UnitBases.end() || prefix == UnitPrefixes.end() || base->Dimension != i_Dimension)
        return std::nullopt;
    return prefix->Scale * base->Scale;
}

} // namespace Recordings

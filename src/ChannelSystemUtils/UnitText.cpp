#include "ChannelSystemUtils/UnitText.h"

#include "ChannelSystem/ComponentDescription.h"
#include "ChannelSystem/IChannel.h"
#include "ChannelSystem/IChannelService.h"

#include <algorithm>
#include <cstdlib>

namespace ChannelSystemUtils
{
namespace
{

using Exponent = boost::rational<std::int8_t>;

struct FactorText
{
    std::string Text;
    Exponent Power;
};

/// Those that the host knows, by falling exponent.
std::vector<FactorText> ReadFactors(const TQL::ComponentGroup& i_rGroup,
                                    const ChannelSystem::IChannelService& i_rService)
{
    std::vector<FactorText> factors;
    for (const TQL::UnitFactor& rFactor : i_rGroup.Factors)
        if (TQL::SubTypeRecord record; i_rService.GetSubTypeTable(rFactor.SubTypeId, record).IsSuccess())
            factors.push_back({std::move(record.UnitText), rFactor.Exponent});
    std::ranges::stable_sort(factors,
                             [](const FactorText& i_rA, const FactorText& i_rB) { return i_rB.Power < i_rA.Power; });
    return factors;
}

/// A unit may come from a file that somebody sent: nothing in it is a mark.
std::string EscapeMarks(std::string_view i_Text)
{
    std::string text;
    for (const char character : i_Text)
        switch (character)
        {
        case '<':
            text += "&lt;";
            break;
        case '>':
            text += "&gt;";
            break;
        case '&':
            text += "&amp;";
            break;
        case '"':
            text += "&quot;";
            break;
        default:
            text += character;
        }
    return text;
}

/// Of the exponent without its sign.
std::string ExponentText(const Exponent& i_rExponent, EUnitText i_Form)
{
    const int numerator = std::abs(int{i_rExponent.numerator()});
    const int denominator = i_rExponent.denominator();
    if (numerator == 1 && denominator == 1)
        return {};
    std::string text = std::to_string(numerator);
    if (denominator != 1)
        text += "/" + std::to_string(denominator);
    if (i_Form == EUnitText::Rich)
        return "<sup>" + text + "</sup>";
    return denominator != 1 ? "^(" + text + ")" : "^" + text;
}

} // namespace

std::string ComposeUnitText(const TQL::ComponentGroup& i_rGroup, const ChannelSystem::IChannelService& i_rService,
                            EUnitText i_Form)
{
    if (!i_rGroup.bUsed)
        return {};
    const std::vector<FactorText> factors = ReadFactors(i_rGroup, i_rService);
    const auto below = std::ranges::find_if(factors, [](const FactorText& i_rFactor) { return i_rFactor.Power < 0; });
    const bool bLine = below != factors.begin();
    const bool bBrackets = bLine && factors.end() - below > 1;
    std::string text;
    for (auto it = factors.begin(); it != factors.end(); ++it)
    {
        if (it == below && bLine)
            text += bBrackets ? "/(" : "/";
        else if (it != factors.begin())
            text += ".";
        text += i_Form == EUnitText::Rich ? EscapeMarks(it->Text) : it->Text;
        text += ExponentText(it->Power, i_Form);
    }
    return bBrackets ? text + ")" : text;
}

TQL::IResult ComposeUnitTexts(const std::shared_ptr<TQL::IChannel>& i_rpChannel,
                              const ChannelSystem::IChannelService& i_rService, EUnitText i_Form,
                              std::vector<std::string>& o_rTexts)
{
    o_rTexts.clear();
    if (!i_rpChannel)
        return TQL::Result::NotAvailable;
    for (const TQL::ComponentDescription description = i_rpChannel->GetDescription();
         const TQL::ComponentGroup& rGroup : description.Groups)
        o_rTexts.push_back(ComposeUnitText(rGroup, i_rService, i_Form));
    return TQL::Result::Ok;
}

std::string ComposeRunText(std::span<const std::string> i_UnitTexts)
{
    std::string text;
    for (auto it = i_UnitTexts.begin(); it != i_UnitTexts.end();)
    {
        const auto end =
            std::find_if(it, i_UnitTexts.end(), [it](const std::string& i_rText) { return i_rText != *it; });
        if (it != i_UnitTexts.begin())
            text += " ";
        text += *it;
        if (end - it > 1)
            text += "[" + std::to_string(end - it) + "]";
        it = end;
    }
    return text;
}

std::string JoinNameAndUnit(std::string_view i_Name, std::string_view i_Unit)
{
    std::string text(i_Name);
    if (!i_Unit.empty())
        text.append(" (").append(i_Unit).append(")");
    return text;
}

} // namespace ChannelSystemUtils

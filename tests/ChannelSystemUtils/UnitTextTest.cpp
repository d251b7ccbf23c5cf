#include "ChannelSystemUtils/UnitText.h"
#include "ChannelSystemUtils/FakeChannels.h"

#include <gtest/gtest.h>

using namespace ChannelSystemUtils;
using namespace FakeChannels;

namespace
{

using Exponent = boost::rational<std::int8_t>;

TEST(UnitText, ProductsOfFactors)
{
    struct Case
    {
        std::vector<TQL::UnitFactor> Factors;
        const char* pPlain;
        const char* pRich;
    };
    const Case cases[] = {
        {{}, "", ""},
        {{{Millimetre, 1}}, "mm", "mm"},
        {{{Second, -1}, {Millimetre, 1}}, "mm/s", "mm/s"},
        {{{Second, -2}, {Millimetre, 1}}, "mm/s^2", "mm/s<sup>2</sup>"},
        {{{Millimetre, 2}}, "mm^2", "mm<sup>2</sup>"},
        {{{Gram, 1}, {Millimetre, 2}, {Second, -2}}, "mm^2.g/s^2", "mm<sup>2</sup>.g/s<sup>2</sup>"},
        {{{Millimetre, 1}, {Gram, 1}, {Second, 1}}, "mm.g.s", "mm.g.s"},
        {{{Volt, 1}, {Second, -1}, {Millimetre, -2}}, "V/(s.mm^2)", "V/(s.mm<sup>2</sup>)"},
        {{{Volt, Exponent(1, 2)}}, "V^(1/2)", "V<sup>1/2</sup>"},
        {{{Volt, 1}, {Second, Exponent(-2, 4)}}, "V/s^(1/2)", "V/s<sup>1/2</sup>"},
        {{{Second, -1}}, "s", "s"}, // nothing stands above the line
        {{{Second, -2}, {Gram, -1}}, "g.s^2", "g.s<sup>2</sup>"},
        {{{NotInTheTable, 1}, {Millimetre, 1}, {NotInTheTable, -1}}, "mm", "mm"},
        {{{Volt, -128}}, "V^128", "V<sup>128</sup>"},
    };
    const Service service;
    for (const Case& rCase : cases)
    {
        EXPECT_EQ(ComposeUnitText({true, rCase.Factors}, service, EUnitText::Plain), rCase.pPlain);
        EXPECT_EQ(ComposeUnitText({true, rCase.Factors}, service, EUnitText::Rich), rCase.pRich);
        EXPECT_EQ(ComposeUnitText({false, rCase.Factors}, service, EUnitText::Plain), "");
    }
}

TEST(UnitText, OfAChannel)
{
    Service service;
    const TQL::ComponentGroup mm{true, {{Millimetre, 1}}};
    const TQL::ComponentGroup rate{true, {{Radian, 1}, {Second, -2}}};
    const auto pChannel = service.MakeChannel("A", {{mm, mm, rate, {}}, false, ""});
    std::vector<std::string> texts;
    EXPECT_EQ(ComposeUnitTexts(pChannel, service, EUnitText::Rich, texts), TQL::Result::Ok);
    EXPECT_EQ(texts, (std::vector<std::string>{"mm", "mm", "rad/s<sup>2</sup>", ""}));
    EXPECT_EQ(ComposeUnitTexts(nullptr, service, EUnitText::Rich, texts), TQL::Result::NotAvailable);
    EXPECT_TRUE(texts.empty());
}

TEST(UnitText, RunsOfEqualUnits)
{
    using List = std::vector<std::string>;
    const std::pair<List, const char*> cases[] = {
        {{}, ""},
        {{"mm"}, "mm"},
        {{"mm", "mm", "mm"}, "mm[3]"},
        {{"rad", "rad", "rad", "mm", "mm", "mm"}, "rad[3] mm[3]"},
        {{"V", "mm", "V"}, "V mm V"},
        {List(9), "[9]"}, // components without a unit
        {{"", "mm"}, " mm"},
    };
    for (const auto& [rUnits, pExpected] : cases)
        EXPECT_EQ(ComposeRunText(rUnits), pExpected);
    EXPECT_EQ(JoinNameAndUnit("Speed", "mm/s"), "Speed (mm/s)");
    EXPECT_EQ(JoinNameAndUnit("Speed", ""), "Speed");
}

} // namespace

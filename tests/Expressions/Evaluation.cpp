#include "Evaluation.h"

#include <gtest/gtest.h>

#include <algorithm>
#include <array>
#include <cmath>
#include <cstdint>
#include <numbers>
#include <sstream>

namespace TestExpressions
{

namespace
{

struct Row
{
    const char* pName;
    const char* pSymbol;
    std::uint16_t Dimension;
    double Scale;
};

constexpr std::uint16_t Unknown = Expressions::IUnitTable::UnknownDimension;
constexpr std::array<Row, 12> Bases{{
    {"meter", "m", 0, 1.0},
    {"radian", "rad", 7, 1.0},
    {"degree", "deg", 7, std::numbers::pi / 180.0},
    {"second", "s", 2, 1.0},
    {"hertz", "Hz", 9, 1.0},
    {"minute", "min", 2, 60.0},
    {"newton", "N", 10, 1.0},
    {"inch", "in", 0, 0.0254},
    {"blob", "blob", Unknown, 1.0},
    {"glob", "glob", Unknown, 1.0},
    {"frame", "frame", 31, 1.0},
    {"per frame", "1:frame", 32, 1.0},
}};
constexpr std::array<Row, 3> Prefixes{{{"", "", 0, 1.0}, {"milli", "m", 0, 1e-3}, {"centi", "c", 0, 1e-2}}};

std::uint16_t IdOf(std::string_view i_Symbol)
{
    for (std::size_t p = 0; p < Prefixes.size(); ++p)
        for (std::size_t b = 0; b < Bases.size(); ++b)
            if (std::string(Prefixes[p].pSymbol) + Bases[b].pSymbol == i_Symbol)
                return static_cast<std::uint16_t>(p * 16 + b);
    ADD_FAILURE() << "no unit " << i_Symbol;
    return 0;
}

/// "mm", "mm/s^2".
TQL::ComponentGroup GroupOf(const std::string& i_rUnit)
{
    TQL::ComponentGroup group;
    std::istringstream factors(i_rUnit);
    int sign = 1;
    for (std::string factor; i_rUnit != "1" && std::getline(factors, factor, '/'); sign = -1)
    {
        const std::size_t power = factor.find('^');
        const int exponent = power == std::string::npos ? 1 : std::stoi(factor.substr(power + 1));
        group.Factors.push_back(
            {IdOf(factor.substr(0, power)), boost::rational<std::int8_t>(static_cast<std::int8_t>(sign * exponent))});
    }
    return group;
}

std::string TextOf(const TQL::ComponentGroup& i_rGroup)
{
    std::string text;
    for (const TQL::UnitFactor& rFactor : i_rGroup.Factors)
    {
        TQL::SubTypeRecord record;
        EXPECT_TRUE(UnitTable().Find(rFactor.SubTypeId, record).IsSuccess());
        const int exponent = rFactor.Exponent.numerator();
        EXPECT_EQ(rFactor.Exponent.denominator(), 1);
        text += (text.empty() ? "" : exponent < 0 ? "/" : ".") + record.UnitText;
        if (std::abs(exponent) != 1)
            text += "^" + std::to_string(std::abs(exponent));
    }
    return text.empty() ? "1" : text;
}

} // namespace

TQL::IResult UnitTable::Find(std::uint16_t i_Id, TQL::SubTypeRecord& o_rRecord) const
{
    if (i_Id / 16 >= Prefixes.size() || i_Id % 16 >= Bases.size())
        return TQL::Result::InvalidId;
    const Row& rPrefix = Prefixes[i_Id / 16];
    const Row& rBase = Bases[i_Id % 16];
    o_rRecord = {0, rBase.Dimension, rPrefix.Scale * rBase.Scale, std::string(rPrefix.pName) + rBase.pName,
                 std::string(rPrefix.pSymbol) + rBase.pSymbol};
    return TQL::Result::Ok;
}

bool UnitTable::FindByName(std::string_view i_Prefix, std::string_view i_Base, std::uint16_t& o_rId) const
{
    const auto prefix = std::ranges::find(Prefixes, i_Prefix, &Row::pName);
    const auto base = std::ranges::find(Bases, i_Base, &Row::pName);
    if (prefix == Prefixes.end() || base == Bases.end())
        return false;
    o_rId = static_cast<std::uint16_t>((prefix - Prefixes.begin()) * 16 + (base - Bases.begin()));
    return true;
}

TQL::ComponentDescription Description(const std::string& i_rText)
{
    TQL::ComponentDescription description;
    std::istringstream words(i_rText);
    if (!i_rText.starts_with(' '))
        words >> description.FormatName;
    if (description.FormatName.ends_with('!'))
    {
        description.FormatName.pop_back();
        description.bUnitScalingOff = true;
    }
    for (std::string word; words >> word;)
    {
        const std::size_t star = word.find('*');
        const int count = star == std::string::npos ? 1 : std::stoi(word.substr(star + 1));
        description.Groups.insert(description.Groups.end(), static_cast<std::size_t>(count),
                                  GroupOf(word.substr(0, star)));
    }
    return description;
}

std::string TextOf(const TQL::ComponentDescription& i_rDescription)
{
    std::string text = i_rDescription.FormatName + (i_rDescription.bUnitScalingOff ? "!" : "");
    const auto& rGroups = i_rDescription.Groups;
    for (std::size_t i = 0; i < rGroups.size();)
    {
        std::size_t alike = 1;
        while (i + alike < rGroups.size() && rGroups[i + alike] == rGroups[i])
            ++alike;
        text += ' ' + TextOf(rGroups[i]) + (alike == 1 ? "" : "*" + std::to_string(alike));
        i += alike;
    }
    return text;
}

std::vector<float> Evaluate(const Expressions::IRowOperation& i_rOperation, const std::vector<Channel>& i_rInputs)
{
    const std::size_t margin = i_rOperation.GetMargin();
    const std::size_t rows = i_rInputs[0].Rows.size() / i_rInputs[0].Description.Groups.size();
    std::vector<std::vector<float>> padded;
    std::vector<std::span<const float>> spans;
    for (const Channel& rInput : i_rInputs)
    {
        padded.emplace_back(margin * rInput.Description.Groups.size(), NaN);
        std::vector<float>& rRows = padded.back();
        rRows.insert(rRows.end(), rInput.Rows.begin(), rInput.Rows.end());
        rRows.resize(rRows.size() + margin * rInput.Description.Groups.size(), NaN);
    }
    spans.assign(padded.begin(), padded.end());
    std::vector<float> output(rows * i_rOperation.GetDescription().Groups.size());
    i_rOperation.Run(spans, rows, output, *i_rOperation.MakeWorkspace());
    return output;
}

std::vector<float> Evaluate(std::string_view i_Expression, const std::vector<Channel>& i_rInputs)
{
    std::vector<TQL::ComponentDescription> descriptions;
    for (const Channel& rInput : i_rInputs)
        descriptions.push_back(rInput.Description);
    const auto made = Expressions::CompileExpression(i_Expression, descriptions, UnitTable());
    EXPECT_EQ(made.Error, "") << i_Expression;
    return made.pOperation ? Evaluate(*made.pOperation, i_rInputs) : std::vector<float>();
}

std::vector<float> Differentiate(int i_Order, double i_Seconds, const Channel& i_rInput)
{
    const auto made =
        Expressions::MakeDerivative(i_Order, i_Seconds == 0.0, i_Seconds, i_rInput.Description, UnitTable());
    EXPECT_EQ(made.Error, "");
    return made.pOperation ? Evaluate(*made.pOperation, {i_rInput}) : std::vector<float>();
}

std::string Outcome(std::string_view i_Expression, const std::vector<std::string>& i_rInputs)
{
    std::vector<TQL::ComponentDescription> descriptions;
    std::ranges::transform(i_rInputs, std::back_inserter(descriptions), Description);
    const auto made = Expressions::CompileExpression(i_Expression, descriptions, UnitTable());
    EXPECT_NE(made.pOperation == nullptr, made.Error.empty()) << i_Expression;
    if (!made.pOperation)
        return made.Error;
    return TextOf(made.pOperation->GetDescription()) + (made.pOperation->IsIdentity() ? " (as it is)" : "");
}

void ExpectNear(const std::vector<float>& i_rValues, const std::vector<float>& i_rExpected, double i_Tolerance,
                const std::string& i_rWhat)
{
    ASSERT_EQ(i_rValues.size(), i_rExpected.size()) << i_rWhat;
    for (std::size_t i = 0; i < i_rValues.size(); ++i)
    {
        const bool bMissing = std::isnan(i_rValues[i]) && std::isnan(i_rExpected[i]);
        ASSERT_TRUE(bMissing || std::abs(double{i_rValues[i]} - i_rExpected[i]) <= i_Tolerance)
            << i_rWhat << " at " << i << ": " << i_rValues[i] << " instead of " << i_rExpected[i];
    }
}

} // namespace TestExpressions

#include "Expressions/Units.h"

#include <algorithm>
#include <cmath>
#include <cstddef>
#include <limits>
#include <map>
#include <utility>

namespace Expressions
{

namespace
{

using Exponent = boost::rational<int>;

Exponent Widen(const boost::rational<std::int8_t>& i_rExponent)
{
    return {i_rExponent.numerator(), i_rExponent.denominator()};
}

double Power(double i_Scale, const boost::rational<std::int8_t>& i_rExponent)
{
    return std::pow(i_Scale, boost::rational_cast<double>(Widen(i_rExponent)));
}

/// A dimension, or a unit of unknown meaning, which stands beside all dimensions.
using Measure = std::pair<std::uint16_t, std::uint16_t>;

struct Meaning
{
    std::map<Measure, Exponent> Measures;
    double Scale = 1.0;
};

Meaning MeaningOf(const Unit& i_rUnit, const IUnitTable& i_rUnits)
{
    Meaning meaning;
    for (const TQL::UnitFactor& rFactor : i_rUnit)
    {
        TQL::SubTypeRecord record;
        const bool bKnown = i_rUnits.Find(rFactor.SubTypeId, record).IsSuccess();
        Measure measure{IUnitTable::UnknownDimension, rFactor.SubTypeId};
        if (bKnown && record.Dimension != IUnitTable::UnknownDimension)
        {
            measure = {record.Dimension, std::uint16_t{0}};
            meaning.Scale *= Power(record.Scale, rFactor.Exponent);
        }
        meaning.Measures[measure] += Widen(rFactor.Exponent);
    }
    std::erase_if(meaning.Measures, [](const auto& i_rMeasure) { return i_rMeasure.second.numerator() == 0; });
    return meaning;
}

} // namespace

std::optional<double> FindConversion(const Unit& i_rFrom, const Unit& i_rTo, const IUnitTable& i_rUnits)
{
    if (i_rFrom == i_rTo)
        return 1.0;
    const Meaning from = MeaningOf(i_rFrom, i_rUnits);
    const Meaning to = MeaningOf(i_rTo, i_rUnits);
    if (from.Measures != to.Measures)
        return std::nullopt;
    return from.Scale / to.Scale;
}

std::optional<double> FindRadians(const Unit& i_rFrom, const IUnitTable& i_rUnits)
{
    if (i_rFrom.empty())
        return 1.0;
    const auto radian = FindUnit("radian", i_rUnits);
    if (!radian)
        return std::nullopt;
    return FindConversion(i_rFrom, {{*radian, boost::rational<std::int8_t>(1)}}, i_rUnits);
}

std::optional<double> ReplaceUnit(Unit& io_rUnit, std::uint16_t i_Id, const IUnitTable& i_rUnits)
{
    TQL::SubTypeRecord wanted;
    if (i_rUnits.Find(i_Id, wanted).IsError() || wanted.Dimension == IUnitTable::UnknownDimension)
        return std::nullopt;
    std::optional<double> conversion;
    Unit unit;
    for (const TQL::UnitFactor& rFactor : io_rUnit)
    {
        TQL::SubTypeRecord record;
        std::uint16_t id = rFactor.SubTypeId;
        if (i_rUnits.Find(id, record).IsSuccess() && record.Dimension == wanted.Dimension)
        {
            if (!conversion)
                conversion = 1.0;
            if (id != i_Id)
                *conversion *= Power(record.Scale / wanted.Scale, rFactor.Exponent);
            id = i_Id;
        }
        if (!MultiplyUnit(unit, id, Widen(rFactor.Exponent)))
            return std::nullopt;
    }
    if (conversion)
        io_rUnit = std::move(unit);
    return conversion;
}

bool MultiplyUnit(Unit& io_rUnit, std::uint16_t i_Id, boost::rational<int> i_Exponent)
{
    constexpr int most = std::numeric_limits<std::int8_t>::max();
    const auto factor = std::ranges::find(io_rUnit, i_Id, &TQL::UnitFactor::SubTypeId);
    const bool bThere = factor != io_rUnit.end();
    const Exponent sum = bThere ? i_Exponent + Widen(factor->Exponent) : i_Exponent;
    if (std::abs(sum.numerator()) > most || sum.denominator() > most)
        return false;
    const boost::rational<std::int8_t> exponent(static_cast<std::int8_t>(sum.numerator()),
                                                static_cast<std::int8_t>(sum.denominator()));
    if (!bThere)
        io_rUnit.push_back({i_Id, exponent});
    else if (sum.numerator() == 0)
        io_rUnit.erase(factor);
    else
        factor->Exponent = exponent;
    return true;
}

bool MultiplyUnit(Unit& io_rUnit, const Unit& i_rBy)
{
    return std::ranges::all_of(i_rBy, [&](const TQL::UnitFactor& i_rFactor)
                               { return MultiplyUnit(io_rUnit, i_rFactor.SubTypeId, Widen(i_rFactor.Exponent)); });
}

std::optional<std::uint16_t> FindUnit(std::string_view i_Name, const IUnitTable& i_rUnits)
{
    constexpr std::size_t longestPrefix = 5;
    std::uint16_t id = 0;
    for (std::size_t prefix = 0; prefix <= std::min(longestPrefix, i_Name.size()); ++prefix)
        if (i_rUnits.FindByName(i_Name.substr(0, prefix), i_Name.substr(prefix), id))
            return id;
    return std::nullopt;
}

std::string TextOfUnit(const Unit& i_rUnit, const IUnitTable& i_rUnits)
{
    std::string text;
    for (const TQL::UnitFactor& rFactor : i_rUnit)
    {
        TQL::SubTypeRecord record;
        if (i_rUnits.Find(rFactor.SubTypeId, record).IsError())
            continue;
        text += text.empty() ? "" : ".";
        text += record.UnitText;
        const int numerator = rFactor.Exponent.numerator();
        const int denominator = rFactor.Exponent.denominator();
        if (denominator != 1)
            text += "^(" + std::to_string(numerator) + "/" + std::to_string(denominator) + ")";
        else if (numerator != 1)
            text += "^" + std::to_string(numerator);
    }
    return text.empty() ? "no unit" : text;
}

} // namespace Expressions

#pragma once

#include "Expressions/CompileExpression.h"
#include "Expressions/IUnitTable.h"
#include "Expressions/MakeDerivative.h"

#include <limits>
#include <string>
#include <string_view>
#include <vector>

namespace TestExpressions
{

inline constexpr float NaN = std::numeric_limits<float>::quiet_NaN();

/// Some units, every one with every prefix of "", "milli" and "centi".
class UnitTable final : public Expressions::IUnitTable
{
public:
    TQL::IResult Find(std::uint16_t i_Id, TQL::SubTypeRecord& o_rRecord) const override;
    bool FindByName(std::string_view i_Prefix, std::string_view i_Base, std::uint16_t& o_rId) const override;
};

/// "Pose rad*3 mm*3", "Position mm/s^2*3", " N" and the like: format, then units and how many components have them; a
/// format that ends in "!" has its unit scaling off; the unit "1" is none.
TQL::ComponentDescription Description(const std::string& i_rText);
std::string TextOf(const TQL::ComponentDescription& i_rDescription);

/// An input: what it is, and its rows one after another.
struct Channel
{
    TQL::ComponentDescription Description;
    std::vector<float> Rows;
};

/// The rows of an operation, or of an expression, over the inputs; an expression that cannot be made fails the test.
std::vector<float> Evaluate(const Expressions::IRowOperation& i_rOperation, const std::vector<Channel>& i_rInputs);
std::vector<float> Evaluate(std::string_view i_Expression, const std::vector<Channel>& i_rInputs);

/// As above, of a derivative. i_Seconds 0 is by frame.
std::vector<float> Differentiate(int i_Order, double i_Seconds, const Channel& i_rInput);

/// What an expression makes of inputs like these: its description, or its error.
std::string Outcome(std::string_view i_Expression, const std::vector<std::string>& i_rInputs);

/// Every value within the tolerance, or both missing.
void ExpectNear(const std::vector<float>& i_rValues, const std::vector<float>& i_rExpected, double i_Tolerance,
                const std::string& i_rWhat);

} // namespace TestExpressions

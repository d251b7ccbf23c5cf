#include "Expressions/MakeDerivative.h"

#include "Expressions/Units.h"
#include "Expressions/VDerivative.h"

#include <algorithm>
#include <cmath>
#include <numbers>
#include <optional>
#include <span>
#include <utility>

namespace Expressions
{

namespace
{

OperationOrError Refuse(std::string i_Sentence)
{
    return {nullptr, std::move(i_Sentence)};
}

/// A full turn in the unit of angles that stand each by itself and jump by it; 0 for other numbers.
double TurnOf(const TQL::ComponentDescription& i_rInput, const IUnitTable& i_rUnits)
{
    if (i_rInput.FormatName != s_pEulerOfNoOrder || i_rInput.Groups.empty())
        return 0.0;
    const TQL::ComponentGroup& rFirst = i_rInput.Groups.front();
    const bool bAlike = std::ranges::all_of(i_rInput.Groups, [&](const TQL::ComponentGroup& i_rGroup)
                                            { return i_rGroup.Factors == rFirst.Factors; });
    const std::optional<double> radians = FindRadians(rFirst.Factors, i_rUnits);
    return bAlike && radians ? 2.0 * std::numbers::pi / *radians : 0.0;
}

/// The components that are differentiated: a rotation becomes the three of a turn.
TQL::ComponentDescription DescribeSteps(const TQL::ComponentDescription& i_rInput, const Shape& i_rShape,
                                        std::uint16_t i_Radian)
{
    TQL::ComponentDescription steps{{}, i_rInput.bUnitScalingOff, ""};
    if (i_rShape.Kind != EShape::Numbers)
        steps.Groups = GroupsOfRotation(ERotation::AngleAxis, i_Radian);
    const auto rest = std::span(i_rInput.Groups).subspan(i_rShape.RotationWidth());
    steps.Groups.insert(steps.Groups.end(), rest.begin(), rest.end());
    if (i_rShape.Kind == EShape::Rotation || (i_rInput.FormatName == s_pPosition && steps.Groups.size() == 3))
        steps.FormatName = s_pPosition;
    return steps;
}

/// What rows are apart, and one over it.
struct StepUnits
{
    std::optional<std::uint16_t> Step;
    std::optional<std::uint16_t> PerStep;
};

/// What is left of it as a power of the step alone is told in hertz, or per frame, if there is such a unit: a text of
/// units needs one to stand above the line.
bool DivideByStep(Unit& io_rUnit, int i_Order, const StepUnits& i_rUnits)
{
    if (!MultiplyUnit(io_rUnit, *i_rUnits.Step, -i_Order))
        return false;
    if (i_rUnits.PerStep && io_rUnit.size() == 1 && io_rUnit[0].SubTypeId == *i_rUnits.Step && io_rUnit[0].Exponent < 0)
        io_rUnit[0] = {*i_rUnits.PerStep, -io_rUnit[0].Exponent};
    return true;
}

} // namespace

OperationOrError MakeDerivative(int i_Order, bool i_bPerFrame, double i_SecondsPerRow,
                                const TQL::ComponentDescription& i_rInput, const IUnitTable& i_rUnits)
{
    if (i_Order != 1 && i_Order != 2)
        return Refuse("There are derivatives of order 1 and 2, not of order " + std::to_string(i_Order) + ".");
    if (i_rInput.Groups.empty())
        return Refuse("A channel without components has no derivative.");
    if (!i_bPerFrame && !(std::isfinite(i_SecondsPerRow) && i_SecondsPerRow > 0.0))
        return Refuse("A channel without a rate has no derivative by time.");
    const std::optional<std::uint16_t> radian = FindUnit("radian", i_rUnits);
    const StepUnits step = i_bPerFrame ? StepUnits{FindUnit("frame", i_rUnits), FindUnit("per frame", i_rUnits)}
                                       : StepUnits{FindUnit("second", i_rUnits), FindUnit("hertz", i_rUnits)};
    if (!radian || !step.Step)
        return Refuse("There are no units \"radian\" and \"second\" or \"frame\" to give derivatives in.");
    DerivativePlan plan;
    plan.Is = FindShape(i_rInput, i_rUnits);
    plan.Order = i_Order;
    plan.InputWidth = i_rInput.Groups.size();
    plan.RowsPerUnit = i_bPerFrame ? 1.0 : 1.0 / i_SecondsPerRow;
    plan.Turn = TurnOf(i_rInput, i_rUnits);
    plan.Description = DescribeSteps(i_rInput, plan.Is, *radian);
    if (plan.Is.Kind != EShape::Numbers)
        plan.Radians =
            *FindRadians(plan.Is.Form.Form, std::span(i_rInput.Groups).first(plan.Is.RotationWidth()), i_rUnits);
    for (TQL::ComponentGroup& rGroup : plan.Description.Groups)
        if (!DivideByStep(rGroup.Factors, i_Order, step))
            return Refuse("The unit of the derivative has too high a power of time.");
    return {std::make_shared<const VDerivative>(std::move(plan)), {}};
}

} // namespace Expressions

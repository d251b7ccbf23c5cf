#include "Bench.h"

#include "Expressions/CompileExpression.h"

#include <Eigen/Geometry>

#include <cmath>
#include <cstddef>
#include <cstdio>
#include <cstdlib>
#include <span>
#include <string>
#include <string_view>
#include <vector>

namespace Bench
{

namespace
{

constexpr std::size_t RowCount = 1000000;

/// Radian and millimetre.
class Units final : public Expressions::IUnitTable
{
public:
    TQL::IResult Find(std::uint16_t i_Id, TQL::SubTypeRecord& o_rRecord) const override
    {
        o_rRecord = {0, i_Id, i_Id == 0 ? 1e-3 : 1.0, {}, {}};
        return TQL::Result::Ok;
    }

    bool FindByName(std::string_view i_Prefix, std::string_view i_Base, std::uint16_t& o_rId) const override
    {
        o_rId = TQL::SubTypeRecord::DimensionAngle;
        return i_Prefix.empty() && i_Base == "radian";
    }
};

TQL::ComponentDescription Describe(const char* i_pFormat, std::size_t i_Angles, std::size_t i_Lengths)
{
    TQL::ComponentDescription description{{}, false, i_pFormat};
    for (std::size_t i = 0; i < i_Angles + i_Lengths; ++i)
        description.Groups.push_back(
            {true, {{i < i_Angles ? TQL::SubTypeRecord::DimensionAngle : TQL::SubTypeRecord::DimensionLength, 1}}});
    return description;
}

std::vector<float> MakeRows(std::size_t i_Width, double i_Phase)
{
    std::vector<float> rows(RowCount * i_Width);
    for (std::size_t i = 0; i < rows.size(); ++i)
        rows[i] = static_cast<float>(2.0 * std::sin(static_cast<double>(i % 100003) * 0.37 + i_Phase));
    return rows;
}

/// What a hand writes that knows the two inputs.
void DistanceByHand(const std::vector<float>& i_rA, const std::vector<float>& i_rB, std::vector<float>& o_rOutput)
{
    for (std::size_t row = 0; row < RowCount; ++row)
    {
        const float x = i_rA[3 * row] - i_rB[3 * row];
        const float y = i_rA[3 * row + 1] - i_rB[3 * row + 1];
        const float z = i_rA[3 * row + 2] - i_rB[3 * row + 2];
        o_rOutput[row] = std::sqrt(x * x + y * y + z * z);
    }
}

template <typename TScalar>
Eigen::Quaternion<TScalar> RotationByHand(const float* i_pRow)
{
    const Eigen::Matrix<TScalar, 3, 1> vector = Eigen::Map<const Eigen::Vector3f>(i_pRow).cast<TScalar>();
    const TScalar angle = vector.norm();
    return Eigen::Quaternion<TScalar>(Eigen::AngleAxis<TScalar>(angle, vector / angle));
}

template <typename TScalar>
void AnglesByHand(const std::vector<float>& i_rA, const std::vector<float>& i_rB, std::vector<float>& o_rOutput)
{
    for (std::size_t row = 0; row < RowCount; ++row)
    {
        const auto quotient =
            RotationByHand<TScalar>(&i_rB[6 * row]).conjugate() * RotationByHand<TScalar>(&i_rA[6 * row]);
        const Eigen::Matrix<TScalar, 3, 3> matrix = quotient.toRotationMatrix();
        o_rOutput[3 * row] = static_cast<float>(std::atan2(-matrix(1, 2), matrix(2, 2)));
        o_rOutput[3 * row + 1] = static_cast<float>(
            std::atan2(matrix(0, 2), std::sqrt(matrix(0, 0) * matrix(0, 0) + matrix(0, 1) * matrix(0, 1))));
        o_rOutput[3 * row + 2] = static_cast<float>(std::atan2(-matrix(0, 1), matrix(0, 0)));
    }
}

template <typename THand>
void AddFigure(Table& o_rTable, std::string_view i_Expression, const TQL::ComponentDescription& i_rInput,
               const std::string& i_rYardstick, EGoal i_Goal, double i_Target, const THand& i_rHand)
{
    const std::vector<TQL::ComponentDescription> inputs(2, i_rInput);
    const auto made = Expressions::CompileExpression(i_Expression, inputs, Units());
    if (!made.pOperation)
    {
        std::fprintf(stderr, "%s\n", made.Error.c_str());
        std::abort();
    }
    const std::vector<float> a = MakeRows(i_rInput.Groups.size(), 0.0);
    const std::vector<float> b = MakeRows(i_rInput.Groups.size(), 1.0);
    const std::vector<std::span<const float>> rows{a, b};
    std::vector<float> ours(RowCount * made.pOperation->GetDescription().Groups.size());
    std::vector<float> theirs(ours.size());
    const auto pWorkspace = made.pOperation->MakeWorkspace();
    const auto [mine, hand] = BestSecondsPaired(
        15,
        [&]
        {
            made.pOperation->Run(rows, RowCount, ours, *pWorkspace);
            Keep(ours.front());
        },
        [&]
        {
            i_rHand(a, b, theirs);
            Keep(theirs.front());
        });
    for (std::size_t i = 0; i < ours.size(); i += 1009)
        if (!(std::abs(ours[i] - theirs[i]) < 1e-2f || std::abs(ours[i] - theirs[i]) > 6.27f))
            std::fprintf(stderr, "%.*s: %g instead of %g\n", static_cast<int>(i_Expression.size()), i_Expression.data(),
                         static_cast<double>(ours[i]), static_cast<double>(theirs[i]));
    const double scale = 1e9 / static_cast<double>(RowCount);
    o_rTable.push_back({std::string(i_Expression) + " over 10^6 rows (ratio: time of the yardstick)", mine * scale,
                        "ns a row", i_rYardstick, hand * scale, mine / hand, i_Goal, i_Target});
}

} // namespace

void RunExpression(Table& o_rTable)
{
    AddFigure(o_rTable, "mag(Position(#0)-Position(#1))", Describe("Position", 0, 3),
              "the same loop by hand over contiguous floats", EGoal::AtMost, 2.0, DistanceByHand);
    const std::string_view angles = "EulerXYZ(leftQuotient(#1,#0))";
    const auto swapped = [](auto i_pHand)
    {
        return [i_pHand](const std::vector<float>& i_rA, const std::vector<float>& i_rB, std::vector<float>& o_rOutput)
        {
            i_pHand(i_rB, i_rA, o_rOutput);
        };
    };
    AddFigure(o_rTable, angles, Describe("Pose", 3, 3), "the same by hand with Eigen, in double as here", EGoal::AtMost,
              1.5, swapped(AnglesByHand<double>));
    AddFigure(o_rTable, angles, Describe("Pose", 3, 3), "the same by hand with Eigen, in float", EGoal::Report, 0.0,
              swapped(AnglesByHand<float>));
}

} // namespace Bench

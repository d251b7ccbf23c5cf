#include "Evaluation.h"

#include <Eigen/Core>
#include <gtest/gtest.h>

#include <cmath>
#include <numbers>
#include <random>
#include <string>
#include <thread>
#include <vector>

namespace TestExpressions
{

namespace
{

constexpr double Pi = std::numbers::pi;

} // namespace

TEST(Values, AreThoseOfTheirUnits)
{
    struct Case
    {
        std::string Expression;
        std::string Input;
        std::vector<float> Row;
        std::vector<float> Expected;
    };
    const float radian = static_cast<float>(Pi / 180.0);
    const std::vector<Case> cases{
        {"millimeter(#0)", " m", {1.5f}, {1500}},
        {"centimeter(#0)", " in", {2}, {5.08f}},
        {"meter(#0)", " mm/s^2", {9810}, {9.81f}},
        {"millimeter(#0)", " m^2", {2}, {2e6f}},
        {"meter(#0)", " s/mm", {3}, {3000}},
        {"degree(#0)", " rad/s^2", {1}, {1.0f / radian}},
        {"radian(#0)", " deg", {90}, {90 * radian}},
        {"second(#0)", " m/min", {120}, {2}},
        {"degree(millimeter(#0))", "Pose rad*3 m*3", {radian, 0, 0, 1, 2, 3}, {1, 0, 0, 1000, 2000, 3000}},
        {"degree(AxisAndAngle(#0))", "AngleAxis rad*3", {0, 0.5f * radian, 0}, {0, 1, 0, 0.5f}},
        {"#0 - millimeter(#0)", " m", {1}, {0}},
        {"mag(#0)", " m mm mm", {0.003f, 4, 0}, {0.005f}},
        {"mag(#0)", " N*3", {1e-30f, 0, 0}, {1e-30f}},
        {"mag(#0)", " N*3", {3e30f, 4e30f, 0}, {5e30f}},
        {"mag(#0)", " N*2", {-3, 4}, {5}},
        {"mag(#0)", " N", {-3}, {3}},
        {"dot(#0, meter(#0))", "Position mm*3", {1, 2, 3}, {14}},
        {"#0[2]", " N*3", {1, 2, 3}, {3}},
        {"#0[0]", " N*3", {1, NaN, 3}, {1}},
        {"millimeter(#0)", " m*3", {1, NaN, 3}, {NaN, NaN, NaN}},
        {"#0", " m*3", {1, NaN, 3}, {NaN, NaN, NaN}},
        {"mag(#0)", " m*3", {1, NaN, 3}, {NaN}},
        {"join(#0[1], #0[0])", " m*3", {1, 2, NaN}, {2, 1}},
        {"#0 - (#0 - #0)", " m*2", {1, 2}, {1, 2}},
        {"#0 - #0 - #0", " m*2", {1, 2}, {-1, -2}},
    };
    for (const Case& rCase : cases)
    {
        const double size = std::abs(double{rCase.Expected[0]});
        ExpectNear(Evaluate(rCase.Expression, {{Description(rCase.Input), rCase.Row}}), rCase.Expected,
                   2e-7 * (std::isnan(size) ? 1.0 : size), rCase.Expression + " of" + rCase.Input);
    }
}

TEST(Values, AreMeasuredBetweenMarkers)
{
    std::mt19937 random(11);
    std::uniform_real_distribution<float> any(-1000.0f, 1000.0f);
    std::vector<Channel> markers(3, {Description("Position mm*3"), {}});
    std::vector<float> distances;
    std::vector<float> differences;
    std::vector<float> angles;
    for (int row = 0; row < 700; ++row) // more than two blocks
    {
        Eigen::Vector3d at[3];
        for (std::size_t marker = 0; marker < 3; ++marker)
            for (Eigen::Index i = 0; i < 3; ++i)
            {
                markers[marker].Rows.push_back(row == 300 && marker == 1 && i == 2 ? NaN : std::round(any(random)));
                at[marker][i] = markers[marker].Rows.back();
            }
        const Eigen::Vector3d apart = at[1] - at[0];
        const Eigen::Vector3d next = at[2] - at[1];
        distances.push_back(static_cast<float>(apart.norm()));
        for (const double value : apart)
            differences.push_back(std::isnan(distances.back()) ? NaN : static_cast<float>(value));
        angles.push_back(static_cast<float>(std::acos(apart.dot(next) / apart.norm() / next.norm())));
    }
    ExpectNear(Evaluate("mag( Position(#0)- Position(#1) )", markers), distances, 3e-4, "distance");
    ExpectNear(Evaluate("Position(#1)-Position(#0)", markers), differences, 0.0, "difference");
    ExpectNear(Evaluate("angleBetween(Position(#1)-Position(#0),Position(#2)-Position(#1))[Angle]", markers), angles,
               1e-5, "angle");
}

TEST(Values, OfAnAngleAreExactAtItsEnds)
{
    const auto angle = [](std::vector<float> i_A, std::vector<float> i_B)
    {
        return Evaluate("angleBetween(#0, #1)", {{Description(" mm*3"), i_A}, {Description(" m*3"), i_B}})[0];
    };
    EXPECT_FLOAT_EQ(angle({1, 0, 0}, {1e3f, 1e-4f, 0}), 1e-7f);
    EXPECT_FLOAT_EQ(angle({1, 0, 0}, {-1, 1e-4f, 0}), static_cast<float>(Pi - 1e-4));
    EXPECT_FLOAT_EQ(angle({1, 1, 0}, {0, 0, -1e-30f}), static_cast<float>(Pi / 2));
    EXPECT_TRUE(std::isnan(angle({1, 0, 0}, {0, 0, 0})));
}

TEST(Values, AreTheSameFromManyThreads)
{
    const std::vector<TQL::ComponentDescription> inputs(2, Description("Pose rad*3 mm*3"));
    const auto pOperation =
        Expressions::CompileExpression("EulerXYZ(leftQuotient(#1, #0))", inputs, UnitTable()).pOperation;
    ASSERT_TRUE(pOperation);
    std::vector<Channel> channels(2, {inputs[0], {}});
    for (int i = 0; i < 6 * 2000; ++i)
        for (Channel& rChannel : channels)
            rChannel.Rows.push_back(static_cast<float>(std::sin(i * 0.1) + (&rChannel - channels.data())));
    const std::vector<float> expected = Evaluate(*pOperation, channels);
    std::vector<std::vector<float>> found(4);
    std::vector<std::thread> threads;
    for (std::vector<float>& rFound : found)
        threads.emplace_back([&] { rFound = Evaluate(*pOperation, channels); });
    for (std::thread& rThread : threads)
        rThread.join();
    for (const std::vector<float>& rFound : found)
        EXPECT_EQ(rFound, expected);
}

} // namespace TestExpressions

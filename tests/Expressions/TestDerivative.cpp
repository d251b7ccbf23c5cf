#include "Evaluation.h"

#include "Recordings/OpenRecording.h"

#include <Eigen/Geometry>
#include <gtest/gtest.h>

#include <algorithm>
#include <cmath>
#include <cstdlib>
#include <filesystem>
#include <functional>
#include <numbers>
#include <string>
#include <vector>

namespace TestExpressions
{

namespace
{

using Eigen::Vector3d;

constexpr double Pi = std::numbers::pi;

std::vector<float> Sample(int i_Rows, double i_Seconds, const std::function<std::vector<double>(double)>& i_rFunction)
{
    std::vector<float> rows;
    for (int row = 0; row < i_Rows; ++row)
        for (const double value : i_rFunction(row * i_Seconds))
            rows.push_back(static_cast<float>(value));
    return rows;
}

} // namespace

TEST(Derivative, GivesFormatsAndUnits)
{
    struct Case
    {
        std::string Input;
        int Order;
        double Seconds;
        std::string Expected;
    };
    const std::vector<Case> cases{
        {"Position mm*3", 1, 0.01, "Position mm/s*3"},
        {"Position mm/s*3", 2, 0.01, "Position mm/s^3*3"},
        {"Position mm*3", 2, 0.0, "Position mm/frame^2*3"},
        {"Pose deg*3 m*3", 2, 0.01, " rad/s^2*3 m/s^2*3"},
        {"Pose 1*9 mm*3", 1, 0.01, " rad/s*3 mm/s*3"},
        {"Quaternion 1*4", 1, 0.01, "Position rad/s*3"},
        {"EulerZXY deg*3", 1, 0.0, "Position rad/frame*3"},
        {" N 1", 2, 0.0, " N/frame^2 1:frame^2"},
        {"Euler deg*3", 1, 0.01, " deg/s*3"},
        {"Angle rad", 1, 0.01, " rad/s"},
        {" N 1", 2, 0.01, " N/s^2 Hz^2"},
        {" s", 1, 0.01, " 1"},
        {" s", 2, 0.01, " Hz"},
        {"Position! mm*3", 1, 0.01, "Position! mm/s*3"},
        {" N", 0, 0.01, "There are derivatives of order 1 and 2, not of order 0."},
        {" N", 3, 0.01, "There are derivatives of order 1 and 2, not of order 3."},
        {" N", 1, -0.01, "A channel without a rate has no derivative by time."},
        {"Position", 1, 0.01, "A channel without components has no derivative."},
        {" N/s^127", 1, 0.01, "The unit of the derivative has too high a power of time."},
    };
    for (const Case& rCase : cases)
    {
        const auto made = Expressions::MakeDerivative(rCase.Order, rCase.Seconds == 0.0, rCase.Seconds,
                                                      Description(rCase.Input), UnitTable());
        EXPECT_EQ(made.pOperation ? TextOf(made.pOperation->GetDescription()) : made.Error, rCase.Expected)
            << rCase.Input;
    }
}

/// The derivatives of a parabola are exact inside, and at its ends those of the line through the last two.
TEST(Derivative, OfPolynomialsIsThatOfTheTextbook)
{
    const double h = 0.125;
    const auto rows = Sample(300, h, [](double i_T) { return std::vector{3 * i_T * i_T - 2 * i_T + 5, 4 - i_T, 7.0}; });
    const Channel input{Description("Position mm*3"), rows};
    auto first = Sample(300, h, [](double i_T) { return std::vector{6 * i_T - 2, -1.0, 0.0}; });
    first[0] += static_cast<float>(3 * h);
    first[3 * 299] -= static_cast<float>(3 * h);
    ExpectNear(Differentiate(1, h, input), first, 1e-6, "first");
    auto second = Sample(300, h, [](double) { return std::vector{6.0, 0.0, 0.0}; });
    std::fill_n(second.begin(), 3, NaN);
    std::fill_n(second.end() - 3, 3, NaN);
    ExpectNear(Differentiate(2, h, input), second, 1e-6, "second");
    for (float& rValue : first)
        rValue *= static_cast<float>(h);
    ExpectNear(Differentiate(1, 0.0, input), first, 1e-6, "by frame");
}

TEST(Derivative, StopsAtGaps)
{
    struct Case
    {
        std::string Input;
        std::vector<float> Rows;
        std::vector<float> First;
        std::vector<float> Second;
    };
    const std::vector<Case> cases{
        {" N",
         {1, 2, 4, NaN, 8, NaN, 9, 7},
         {1, 1.5f, 2, NaN, NaN, NaN, -2, -2},
         {NaN, 1, NaN, NaN, NaN, NaN, NaN, NaN}},
        {" N*2", {1, 1, 2, NaN, 3, 3, 4, 5}, {NaN, NaN, NaN, NaN, 1, 2, 1, 2}, std::vector<float>(8, NaN)},
        {" N", {5}, {NaN}, {NaN}},
        {"Euler deg*3",
         {0, 170, 0, 0, -170, 1, 0, -150, 3},
         {0, 20, 1, 0, 20, 1.5f, 0, 20, 2},
         {NaN, NaN, NaN, 0, 0, 1, NaN, NaN, NaN}},
        {"AngleAxis rad*3",
         {0, 0, 0, 0, NaN, 0, 0, 1, 0, 0, 1.5f, 0},
         {NaN, NaN, NaN, NaN, NaN, NaN, 0, 0.5f, 0, 0, 0.5f, 0},
         std::vector<float>(12, NaN)},
    };
    for (const Case& rCase : cases)
    {
        const Channel input{Description(rCase.Input), rCase.Rows};
        ExpectNear(Differentiate(1, 0.0, input), rCase.First, 1e-5, rCase.Input + ", first");
        ExpectNear(Differentiate(2, 0.0, input), rCase.Second, 1e-5, rCase.Input + ", second");
    }
}

/// A body that is turned away at first and then spins faster and faster about an axis of the world: the same angular
/// velocity in every form, through many turns.
TEST(Derivative, OfASpinIsItsRateInEveryForm)
{
    const double h = 0.01;
    const Vector3d axis = Vector3d(1, -2, 2) / 3.0;
    const auto angle = [](double i_T)
    {
        return 2.0 * i_T + 1.5 * i_T * i_T;
    };
    const auto pose = [&](double i_T)
    {
        const Eigen::Quaterniond turn = Eigen::AngleAxisd(angle(i_T), axis) * Eigen::Quaterniond(0.5, 0.5, -0.5, 0.5);
        return std::vector{turn.x(), turn.y(), turn.z(), turn.w(), i_T, 0.0, 0.1 * i_T * i_T};
    };
    const Channel poses{Description("Pose 1*4 mm*3"), Sample(600, h, pose)};
    const auto expected = [&](int i_Order)
    {
        return Sample(600, h,
                      [&](double i_T)
                      {
                          const Vector3d spin = axis * (i_Order == 1 ? 2.0 + 3.0 * i_T : 3.0);
                          return i_Order == 1 ? std::vector{spin[0], spin[1], spin[2], 1.0, 0.0, 0.2 * i_T}
                                              : std::vector{spin[0], spin[1], spin[2], 0.0, 0.0, 0.2};
                      });
    };
    const auto inner = [](const std::vector<float>& i_rRows, std::size_t i_Width, std::size_t i_Kept)
    {
        std::vector<float> kept;
        for (std::size_t row = 1; row + 1 < i_rRows.size() / i_Width; ++row)
            kept.insert(kept.end(), i_rRows.begin() + static_cast<std::ptrdiff_t>(row * i_Width),
                        i_rRows.begin() + static_cast<std::ptrdiff_t>(row * i_Width + i_Kept));
        return kept;
    };
    for (const int order : {1, 2})
    {
        // What the floats round away, times the rate: over the step, and over its square.
        const double tolerance = order == 1 ? 1e-4 : 2e-2;
        ExpectNear(inner(Differentiate(order, h, poses), 6, 6), inner(expected(order), 6, 6), tolerance, "pose");
        for (const std::string form :
             {"AngleAxis", "AxisAndAngle", "Quaternion", "SOMatrix", "EulerXYZ", "EulerZXY", "EulerXYX"})
        {
            const auto made =
                Expressions::CompileExpression(form + "(#0)", std::vector{poses.Description}, UnitTable());
            ASSERT_TRUE(made.pOperation);
            const Channel rotation{made.pOperation->GetDescription(), Evaluate(form + "(#0)", {poses})};
            ExpectNear(inner(Differentiate(order, h, rotation), 3, 3), inner(expected(order), 6, 3), tolerance, form);
        }
    }
}

/// The speed of a real marker, computed here from the file's samples, gaps and all.
TEST(Derivative, OfARecordedMarkerIsItsSpeed)
{
    const char* pFolder = std::getenv("GRAPHPLOTS_TEST_DATA");
    const std::filesystem::path folder = pFolder ? pFolder : "";
    if (!std::filesystem::exists(folder / "known_values.csv"))
        GTEST_SKIP() << "the folder with real recordings is absent (GRAPHPLOTS_TEST_DATA)";
    Recordings::VRecording recording;
    std::string error;
    ASSERT_TRUE(Recordings::OpenRecording(folder / "sprintbasket.c3d", recording, error).IsSuccess()) << error;
    const std::vector<float>& rSamples = recording.Channels[0].Samples;
    const std::size_t rows = rSamples.size() / 3;
    const auto at = [&](std::size_t i_Row)
    {
        return Vector3d(rSamples[3 * i_Row], rSamples[3 * i_Row + 1], rSamples[3 * i_Row + 2]);
    };
    const auto isThere = [&](std::size_t i_Row)
    {
        return i_Row < rows && !at(i_Row).hasNaN();
    };
    std::vector<float> expected;
    for (std::size_t row = 0; row < rows; ++row)
    {
        const std::size_t before = isThere(row - 1) ? row - 1 : row;
        const std::size_t after = isThere(row + 1) ? row + 1 : row;
        const bool bNone = !isThere(row) || before == after;
        expected.push_back(
            bNone ? NaN
                  : static_cast<float>((at(after) - at(before)).norm() * 120.0 / static_cast<double>(after - before)));
    }
    EXPECT_GT(std::ranges::count_if(expected, [](float i_Value) { return std::isnan(i_Value); }), 500);
    const Channel velocity{Description("Position m/s*3"),
                           Differentiate(1, 1.0 / 120.0, {Description("Position m*3"), rSamples})};
    ExpectNear(Evaluate("mag(#0)", {velocity}), expected, 1e-5, "speed");
}

} // namespace TestExpressions

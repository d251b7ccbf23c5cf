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
#include <random>
#include <string>
#include <vector>

namespace TestExpressions
{

namespace
{

using Eigen::AngleAxisd;
using Eigen::Matrix3d;
using Eigen::Vector3d;

constexpr double Pi = std::numbers::pi;

const std::vector<std::string> Orders{"XYZ", "XZY", "YZX", "YXZ", "ZXY", "ZYX",
                                      "XYX", "XZX", "YXY", "YZY", "ZXZ", "ZYZ"};

Matrix3d MatrixOfVector(const Vector3d& i_rVector)
{
    const double angle = i_rVector.norm();
    return angle == 0.0 ? Matrix3d(Matrix3d::Identity()) : AngleAxisd(angle, i_rVector / angle).toRotationMatrix();
}

Matrix3d MatrixOfEuler(const std::string& i_rOrder, const Vector3d& i_rAngles)
{
    Matrix3d matrix = Matrix3d::Identity();
    for (Eigen::Index i = 0; i < 3; ++i)
        matrix =
            matrix *
            AngleAxisd(i_rAngles[i], Vector3d::Unit(i_rOrder[static_cast<std::size_t>(i)] - 'X')).toRotationMatrix();
    return matrix;
}

/// What a row of a format means, read as plainly as can be; angles in radian.
Matrix3d MatrixOf(const std::string& i_rFormat, const float* i_pRow)
{
    const Vector3d vector(i_pRow[0], i_pRow[1], i_pRow[2]);
    if (i_rFormat == "AngleAxis")
        return MatrixOfVector(vector);
    if (i_rFormat == "AxisAndAngle")
        return AngleAxisd(i_pRow[3], vector).toRotationMatrix();
    if (i_rFormat == "Quaternion")
        return Eigen::Quaterniond(i_pRow[3], vector[0], vector[1], vector[2]).toRotationMatrix();
    if (i_rFormat == "SOMatrix")
        return Eigen::Map<const Eigen::Matrix<float, 3, 3, Eigen::RowMajor>>(i_pRow).cast<double>();
    return MatrixOfEuler(i_rFormat.substr(5), vector);
}

std::vector<std::string> Formats()
{
    std::vector<std::string> formats{"AngleAxis", "AxisAndAngle", "Quaternion", "SOMatrix"};
    for (const std::string& rOrder : Orders)
        formats.push_back("Euler" + rOrder);
    return formats;
}

std::string DescriptionOf(const std::string& i_rFormat)
{
    if (i_rFormat == "AxisAndAngle")
        return i_rFormat + " 1*3 rad";
    return i_rFormat + (i_rFormat == "SOMatrix" ? " 1*9" : i_rFormat == "Quaternion" ? " 1*4" : " rad*3");
}

/// Nothing, quarter and half turns about every axis and between them, angles a little beside those, and any rotation;
/// the last row is missing.
Channel Rotations()
{
    std::vector<float> rows(3, 0.0f);
    const std::vector<Vector3d> axes{{1, 0, 0},
                                     {0, 1, 0},
                                     {0, 0, 1},
                                     {-1, 0, 0},
                                     {0, -0.6, -0.8},
                                     {0.6, 0.8, 0.0},
                                     {1 / std::sqrt(3.0), 1 / std::sqrt(3.0), 1 / std::sqrt(3.0)}};
    const auto add = [&](const Vector3d& i_rVector)
    {
        for (const double value : i_rVector)
            rows.push_back(static_cast<float>(value));
    };
    for (const Vector3d& rAxis : axes)
        for (const double angle :
             {1e-20, 1e-8, 1e-4, Pi / 2 - 1e-6, Pi / 2, Pi / 2 + 1e-3, Pi - 1e-6, Pi, Pi + 0.5, 2 * Pi})
            add(rAxis * angle);
    std::mt19937 random(3);
    std::uniform_real_distribution<double> any(-3.0, 3.0);
    for (int i = 0; i < 100; ++i)
        add({any(random), any(random), any(random)});
    rows.insert(rows.end(), {1.0f, NaN, 0.0f});
    return {Description("AngleAxis rad*3"), rows};
}

std::size_t WidthOf(const std::string& i_rFormat)
{
    return Description(DescriptionOf(i_rFormat)).Groups.size();
}

} // namespace

/// Every form into every form: the matrix of a row stays, whatever road it took.
TEST(Rotations, KeepTheirMatrixInEveryForm)
{
    const Channel input = Rotations();
    const std::size_t rows = input.Rows.size() / 3;
    for (const std::string& rFirst : Formats())
    {
        const Channel first{Description(DescriptionOf(rFirst)), Evaluate(rFirst + "(#0)", {input})};
        for (const std::string& rSecond : Formats())
        {
            const std::vector<float> second = Evaluate(rSecond + "(#0)", {first});
            const std::size_t width = WidthOf(rSecond);
            for (std::size_t row = 0; row + 1 < rows; ++row)
            {
                const Matrix3d expected = MatrixOf("AngleAxis", &input.Rows[3 * row]);
                const Matrix3d found = MatrixOf(rSecond, &second[width * row]);
                ASSERT_LT((found - expected).norm(), 4e-6) << rFirst << " to " << rSecond << ", row " << row;
            }
            EXPECT_TRUE(std::all_of(second.end() - static_cast<std::ptrdiff_t>(width), second.end(),
                                    [](float i_Value) { return std::isnan(i_Value); }))
                << rFirst << " to " << rSecond;
        }
    }
}

TEST(Rotations, StayWithinTheirRanges)
{
    const Channel input = Rotations();
    const auto rows = [&](const std::string& i_rExpression)
    {
        return Evaluate(i_rExpression, {{Description("SOMatrix 1*9"), Evaluate("SOMatrix(#0)", {input})}});
    };
    const auto check = [&](const std::string& i_rExpression, const std::function<bool(float)>& i_rHolds)
    {
        for (const float value : rows(i_rExpression))
            EXPECT_TRUE(std::isnan(value) || i_rHolds(value)) << i_rExpression << ": " << value;
    };
    const float pi = std::nextafter(static_cast<float>(Pi), 4.0f);
    const float halfPi = std::nextafter(static_cast<float>(Pi / 2), 4.0f);
    check("Quaternion(#0)[W]", [](float i_Value) { return i_Value >= 0.0f; });
    check("mag(AngleAxis(#0))", [&](float i_Value) { return i_Value <= pi; });
    check("AxisAndAngle(#0)[A]", [&](float i_Value) { return i_Value >= 0.0f && i_Value <= pi; });
    for (const std::string& rOrder : Orders)
    {
        const bool bTwice = rOrder[0] == rOrder[2];
        check("Euler" + rOrder + "(#0)", [&](float i_Value) { return std::abs(i_Value) <= pi; });
        check("Euler" + rOrder + "(#0)[1]",
              [&](float i_Value) { return bTwice ? i_Value >= 0.0f : std::abs(i_Value) <= halfPi; });
    }
}

TEST(Rotations, AreWellDefinedWhereTheyAreNotUnique)
{
    const float pi = static_cast<float>(Pi);
    const float halfPi = static_cast<float>(Pi / 2);
    struct Case
    {
        std::string Expression;
        std::string Input;
        std::vector<float> Row;
        std::vector<float> Expected;
    };
    const std::vector<Case> cases{
        {"AxisAndAngle(#0)", "AngleAxis rad*3", {0, 0, 0}, {1, 0, 0, 0}},
        {"AngleAxis(#0)", "Quaternion 1*4", {0, 0, 0, -1}, {0, 0, 0}},
        {"AngleAxis(#0)", "Quaternion 1*4", {0, 0, -2, 0}, {0, 0, pi}},
        {"Quaternion(#0)", "SOMatrix 1*9", {-1, 0, 0, 0, -1, 0, 0, 0, 1}, {0, 0, 1, 0}},
        {"EulerXYZ(#0)", "EulerXYZ deg*3", {30, 90, 40}, {30, 90, 40}},
        {"EulerXYZ(Quaternion(#0))", "EulerXYZ deg*3", {30, 90, 40}, {70 * pi / 180, halfPi, 0}},
        {"EulerXYZ(Quaternion(#0))", "EulerXYZ deg*3", {30, -90, 40}, {-10 * pi / 180, -halfPi, 0}},
        {"EulerZYZ(Quaternion(#0))", "EulerZYZ deg*3", {30, 0, 40}, {70 * pi / 180, 0, 0}},
        {"EulerZYZ(Quaternion(#0))", "EulerZYZ deg*3", {30, 180, 40}, {-10 * pi / 180, pi, 0}},
        {"Angle(#0)", "AngleAxis deg*3", {0, 270, 0}, {halfPi}},
        {"Angle(#0)", "AngleAxis rad*2 deg", {0, 0, -90}, {halfPi}},
        {"AngleAxis(#0)", "Quaternion 1*4", {0, 0, 0, 0}, {NaN, NaN, NaN}},
        {"AngleAxis(#0)", "SOMatrix 1*9", {0, 0, 0, 0, 0, 0, 0, 0, 0}, {NaN, NaN, NaN}},
        {"AngleAxis(#0)", "SOMatrix 1*9", {1, 0, 0, 0, 1, 0, 0, 0, -1}, {NaN, NaN, NaN}},
        {"AngleAxis(#0)", "AxisAndAngle 1*3 deg", {0, 0, 0, 0}, {0, 0, 0}},
        {"AngleAxis(#0)", "AxisAndAngle 1*3 deg", {0, 0, 0, 10}, {NaN, NaN, NaN}},
        {"AngleAxis(#0)", "AxisAndAngle 1*3 deg", {0, 5, 0, -90}, {0, -halfPi, 0}},
    };
    for (const Case& rCase : cases)
        ExpectNear(Evaluate(rCase.Expression, {{Description(rCase.Input), rCase.Row}}), rCase.Expected, 1e-6,
                   rCase.Expression + " of " + rCase.Input);
}

TEST(Rotations, ArePartsOfPoses)
{
    const Channel pose{Description("Pose rad*3 mm*3"), {0.3f, -0.2f, 0.5f, 1, 2, 3, 0, 0, 0, 4, 5, 6}};
    for (const std::string form : {"AngleAxis", "AxisAndAngle", "Quaternion", "SOMatrix"})
    {
        const std::string expression = "join( " + form + "(#0), Position(#0) )";
        const auto made = Expressions::CompileExpression(expression, std::vector{pose.Description}, UnitTable());
        ASSERT_TRUE(made.pOperation);
        const Channel joined{made.pOperation->GetDescription(), Evaluate(expression, {pose})};
        ExpectNear(Evaluate("join(AngleAxis(#0), Position(#0))", {joined}), pose.Rows, 1e-6, form);
        ExpectNear(Evaluate("leftQuotient(#0, #1)", {joined, pose}), std::vector<float>(12, 0.0f), 1e-6, form);
    }
}

TEST(Rotations, GiveWhatOneSeesFromAnother)
{
    std::mt19937 random(5);
    std::uniform_real_distribution<float> any(-2.0f, 2.0f);
    Channel a{Description("Pose rad*3 mm*3"), {}};
    Channel b{Description("Pose deg*3 m*3"), {}};
    std::vector<float> expected;
    for (int row = 0; row < 600; ++row) // more than a block
    {
        const Vector3d turnA(any(random), any(random), any(random));
        const Vector3d turnB(any(random), any(random), any(random));
        const Vector3d at(any(random), any(random), any(random));
        const Vector3d from(any(random), any(random), any(random));
        for (Eigen::Index i = 0; i < 6; ++i)
        {
            a.Rows.push_back(static_cast<float>(i < 3 ? turnA[i] : 1000.0 * at[i - 3]));
            b.Rows.push_back(static_cast<float>(i < 3 ? turnB[i] * 180.0 / Pi : from[i - 3]));
        }
        const AngleAxisd turn(Matrix3d(MatrixOfVector(turnB).transpose() * MatrixOfVector(turnA)));
        const Vector3d seen = 1000.0 * (MatrixOfVector(turnB).transpose() * (at - from));
        for (Eigen::Index i = 0; i < 6; ++i)
            expected.push_back(static_cast<float>(i < 3 ? turn.angle() * turn.axis()[i] : seen[i - 3]));
    }
    a.Rows[6 * 77 + 4] = NaN;
    std::fill_n(expected.begin() + 6 * 77, 6, NaN);
    const std::vector<float> quotient = Evaluate("leftQuotient( #1, #0 )", {b, a});
    ExpectNear(quotient, expected, 2e-3, "pose"); // of positions up to 4 m
    const Channel relative{Description("Pose rad*3 mm*3"), quotient};
    ExpectNear(Evaluate("Position(leftQuotient( #1, #0 ))", {b, a}), Evaluate("Position(#0)", {relative}), 0.0,
               "position");
    const Channel turns{Description("AngleAxis rad*3"), Evaluate("AngleAxis(leftQuotient(#1, #0))", {b, a})};
    expected.resize(3 * 77);
    for (std::size_t row = 0; row < 77; ++row)
        std::copy_n(quotient.begin() + static_cast<std::ptrdiff_t>(6 * row), 3,
                    expected.begin() + static_cast<std::ptrdiff_t>(3 * row));
    ExpectNear({turns.Rows.begin(), turns.Rows.begin() + 3 * 77}, expected, 0.0, "rotation");
}

/// The poses of a recording's joints, each as seen from its parent, give the angles that the file holds.
TEST(Rotations, GiveTheJointAnglesOfRecordings)
{
    struct Case
    {
        std::string File;
        std::string Parent;
        std::string Joint;
    };
    const char* pFolder = std::getenv("GRAPHPLOTS_TEST_DATA");
    const std::filesystem::path folder = pFolder ? pFolder : "";
    if (!std::filesystem::exists(folder / "known_values.csv"))
        GTEST_SKIP() << "the folder with real recordings is absent (GRAPHPLOTS_TEST_DATA)";
    for (const Case& rCase : {Case{"cmu_12_01_walk.bvh", "LeftUpLeg", "LeftLeg"},
                              Case{"dab.bvh", "RightHand", "RightHandThumb1"}, Case{"dab.bvh", "Spine1", "Spine2"}})
    {
        Recordings::VRecording recording;
        std::string error;
        ASSERT_TRUE(Recordings::OpenRecording(folder / rCase.File, recording, error).IsSuccess()) << error;
        const auto find = [&](Recordings::EChannelKind i_Kind, const std::string& i_rName)
        {
            const auto channel =
                std::ranges::find_if(recording.Channels, [&](const Recordings::RecordedChannel& i_rChannel)
                                     { return i_rChannel.Kind == i_Kind && i_rChannel.Name == i_rName; });
            EXPECT_NE(channel, recording.Channels.end()) << i_rName;
            return *channel;
        };
        const auto joint = find(Recordings::EChannelKind::JointAngles, rCase.Joint);
        std::string order;
        for (const std::string& rName : joint.ComponentNames)
            order += rName[0];
        const auto pose = Description("Pose rad*3 mm*3");
        const std::vector<float> angles =
            Evaluate("degree(Euler" + order + "(leftQuotient(#1, #0)))",
                     {{pose, find(Recordings::EChannelKind::SegmentPose, rCase.Parent).Samples},
                      {pose, find(Recordings::EChannelKind::SegmentPose, rCase.Joint).Samples}});
        ExpectNear(angles, joint.Samples, 2e-4, rCase.File + " " + rCase.Joint);
        ExpectNear(Evaluate("degree(Euler" + order + "(SOMatrix(#0)))",
                            {{Description("Euler" + order + " deg*3"), joint.Samples}}),
                   joint.Samples, 2e-4, rCase.Joint + " and back");
    }
}

} // namespace TestExpressions

#include "Channels/Blocks/VRotationUnwrapper.h"
#include "Channels/Common/VSubTypeTable.h"
#include "Reference.h"

#include <array>
#include <cstdio>
#include <functional>
#include <numbers>
#include <sstream>

namespace ChannelsTest
{

namespace
{

using Channels::ERotationForm;
using Channels::VRotationUnwrapper;

constexpr double Pi = std::numbers::pi;
using Vector = std::array<double, 3>;

/// As a solver gives it: the angle between 0 and pi.
Vector Wrapped(const Vector& i_rAxis, double i_Angle)
{
    const double angle = i_Angle - 2.0 * Pi * std::round(i_Angle / (2.0 * Pi));
    return {i_rAxis[0] * angle, i_rAxis[1] * angle, i_rAxis[2] * angle};
}

void Push(std::vector<float>& o_rRows, const Vector& i_rVector)
{
    for (const double component : i_rVector)
        o_rRows.push_back(static_cast<float>(component));
}

/// Four turns about an axis and back, with gaps.
struct Spin
{
    std::vector<float> Wrapped;
    std::vector<Vector> Expected;
};

Spin MakeSpin(const Vector& i_rAxis)
{
    Spin spin;
    for (int i = 0; i < 400; ++i)
    {
        const double angle = 0.3 + 8.0 * Pi * std::sin(i * Pi / 400.0);
        spin.Expected.push_back({i_rAxis[0] * angle, i_rAxis[1] * angle, i_rAxis[2] * angle});
        if (i % 50 >= 5 && i % 50 < 9)
            spin.Wrapped.insert(spin.Wrapped.end(), {i % 2 == 0 ? NaN : 1.0f, NaN, NaN});
        else
            Push(spin.Wrapped, Wrapped(i_rAxis, angle));
    }
    return spin;
}

void ExpectNear(std::span<const float> i_Rows, std::span<const Vector> i_Expected)
{
    for (std::size_t i = 0; i < i_Expected.size(); ++i)
    {
        if (std::isnan(i_Rows[3 * i + 1]))
            continue;
        for (std::size_t c = 0; c < 3; ++c)
            ASSERT_NEAR(i_Rows[3 * i + c], i_Expected[i][c], 1e-4) << "row " << i << ", " << c;
    }
}

} // namespace

TEST(RotationUnwrapper, AngleAxisFollowsTurnsAcrossGapsBothWays)
{
    const double third = 1.0 / std::sqrt(3.0);
    for (const Vector& rAxis : {Vector{1, 0, 0}, Vector{0, -1, 0}, Vector{third, -third, third}})
    {
        const Spin spin = MakeSpin(rAxis);
        std::vector<float> rows = spin.Wrapped;
        VRotationUnwrapper forwards({ERotationForm::AngleAxis, 2.0 * Pi});
        forwards.Forwards(rows, 3);
        ExpectNear(rows, spin.Expected);
        EXPECT_TRUE(std::isnan(rows[3 * 6 + 1])) << "a gap stays a gap";

        rows = spin.Wrapped;
        VRotationUnwrapper backwards({ERotationForm::AngleAxis, 2.0 * Pi});
        backwards.Backwards(rows, 3);
        ExpectNear(rows, spin.Expected);
    }
}

TEST(RotationUnwrapper, SlicesGoOnWhereTheLastOneEnded)
{
    const Spin spin = MakeSpin({0, 0, 1});
    std::vector<float> rows = spin.Wrapped;
    VRotationUnwrapper unwrapper({ERotationForm::AngleAxis, 2.0 * Pi});
    for (std::size_t row = 0; row < rows.size() / 3; row += 7)
        unwrapper.Forwards(std::span(rows).subspan(3 * row, std::min<std::size_t>(21, rows.size() - 3 * row)), 3);
    ExpectNear(rows, spin.Expected);
}

TEST(RotationUnwrapper, NoRotationTakesTheAxisBefore)
{
    VRotationUnwrapper unwrapper({ERotationForm::AngleAxis, 2.0 * Pi});
    std::vector<float> rows;
    Push(rows, {0, 0, 0});
    Push(rows, {0, 3.0, 0});
    Push(rows, {0, 5.0 - 2.0 * Pi, 0});
    Push(rows, {0, 0, 0}); // after nearly a whole turn about y
    unwrapper.Forwards(rows, 3);
    const std::vector<Vector> expected{{0, 0, 0}, {0, 3.0, 0}, {0, 5.0, 0}, {0, 2.0 * Pi, 0}};
    ExpectNear(rows, expected);
}

TEST(RotationUnwrapper, EulerAnglesAreEachContinuousAndOtherComponentsStay)
{
    for (const double turn : {2.0 * Pi, 360.0})
    {
        std::vector<float> rows;
        for (int i = 0; i < 100; ++i)
        {
            const double angle = turn * 0.03 * i;
            const double wrapped = angle - turn * std::round(angle / turn);
            rows.insert(rows.end(), {static_cast<float>(wrapped), static_cast<float>(-wrapped), 0.25f,
                                     static_cast<float>(1000 - 20 * i)});
        }
        rows[4 * 40] = NaN;
        VRotationUnwrapper unwrapper({ERotationForm::Euler, turn});
        unwrapper.Forwards(rows, 4);
        for (int i = 0; i < 100; ++i)
        {
            const float* pRow = &rows[static_cast<std::size_t>(4 * i)];
            EXPECT_FLOAT_EQ(pRow[3], static_cast<float>(1000 - 20 * i));
            if (i == 40)
                continue; // incomplete, so untouched
            ASSERT_NEAR(pRow[0], turn * 0.03 * i, 1e-5 * turn) << i;
            ASSERT_NEAR(pRow[1], -turn * 0.03 * i, 1e-5 * turn) << i;
            ASSERT_FLOAT_EQ(pRow[2], 0.25f);
        }
    }
}

TEST(RotationUnwrapper, EveryFormFollowsASpinAboutAnAxis)
{
    struct Case
    {
        ERotationForm Form;
        double Turn;
        std::function<std::vector<double>(double)> Wrapped; ///< of the angle in radians, as a computation gives it
        std::function<std::vector<double>(double)> Expected;
    };
    const auto wrap = [](double i_Angle, double i_Turn)
    {
        return i_Angle - i_Turn * std::round(i_Angle / i_Turn);
    };
    const double degrees = 180.0 / Pi;
    const std::vector<Case> cases{
        {ERotationForm::Quaternion, 0.0,
         [&](double i_A)
         {
             const double half = wrap(i_A, 2.0 * Pi) / 2.0; // so that the last is never below 0
             return std::vector<double>{0.0, std::sin(half), 0.0, std::cos(half)};
         },
         [](double i_A)
         {
             return std::vector<double>{0.0, std::sin(i_A / 2.0), 0.0, std::cos(i_A / 2.0)};
         }},
        {ERotationForm::AxisAndAngle, 360.0,
         [&](double i_A)
         {
             const double angle = wrap(i_A, 2.0 * Pi);
             if (std::abs(angle) < 1e-5)
                 return std::vector<double>{1.0, 0.0, 0.0, 0.0};
             return std::vector<double>{0.0, 0.0, angle < 0.0 ? -1.0 : 1.0, std::abs(angle) * degrees};
         },
         [&](double i_A)
         {
             return std::vector<double>{0.0, 0.0, 1.0, i_A * degrees};
         }},
        {ERotationForm::Angle, 2.0 * Pi, [&](double i_A) { return std::vector<double>{wrap(i_A, 2.0 * Pi)}; },
         [](double i_A)
         {
             return std::vector<double>{i_A};
         }},
    };
    for (const Case& rCase : cases)
    {
        SCOPED_TRACE(static_cast<int>(rCase.Form));
        const std::size_t count = rCase.Expected(0.0).size();
        std::vector<float> rows;
        std::vector<double> expected;
        for (int i = 0; i < 400; ++i)
        {
            const double angle = 0.05 * Pi * i + 0.05; // meets whole turns nearly
            for (const double value : rCase.Wrapped(i == 39 ? 2.0 * Pi : angle))
                rows.push_back(i % 50 == 7 ? NaN : static_cast<float>(value));
            rows.push_back(42.0f);
            std::ranges::copy(rCase.Expected(i == 39 ? 2.0 * Pi : angle), std::back_inserter(expected));
        }
        VRotationUnwrapper unwrapper({rCase.Form, rCase.Turn});
        unwrapper.Forwards(rows, count + 1);
        for (std::size_t i = 0; i < 400; ++i)
        {
            EXPECT_EQ(rows[i * (count + 1) + count], 42.0f);
            for (std::size_t c = 0; c < count && i % 50 != 7; ++c)
                ASSERT_NEAR(rows[i * (count + 1) + c], expected[i * count + c], 2e-3) << "row " << i << ", " << c;
        }
    }
}

TEST(RotationUnwrapper, DescriptionSaysWhatIsARotation)
{
    Channels::VSubTypeTable subTypes;
    // Format and units of the components -> form and turn.
    const std::vector<std::array<std::string, 3>> cases{
        {"Pose", "rad rad rad mm mm mm", "0 of 6.283"},
        {"Pose", "deg deg deg mm mm mm", "0 of 360.000"},
        {"Pose", "- - - deg mm mm mm", "2 of 360.000"},
        {"Pose", "- - - - mm mm mm", "3 of 0.000"},
        {"Pose", "- - - - - - - - - mm mm mm", "none"},
        {"AngleAxis", "rad rad rad", "0 of 6.283"},
        {"EulerXYX", "deg deg deg", "1 of 360.000"},
        {"EulerZXY", "rad rad rad", "1 of 6.283"},
        {"EulerZXY", "rad", "none"},
        {"EulerZXY", "- - -", "none"},
        {"AxisAndAngle", "- - - rad", "2 of 6.283"},
        {"Quaternion", "- - - -", "3 of 0.000"},
        {"Quaternion", "- - -", "none"},
        {"Angle", "deg", "4 of 360.000"},
        {"Angle", "mm", "none"},
        {"SOMatrix", "- - - - - - - - -", "none"},
        {"Position", "mm mm mm", "none"},
        {"", "rad rad rad", "none"},
    };
    for (const auto& [format, units, expected] : cases)
    {
        TQL::ComponentDescription description;
        description.FormatName = format;
        std::istringstream words(units);
        for (std::string word; words >> word;)
        {
            description.Groups.emplace_back();
            if (word != "-")
                description.Groups.back().Factors.push_back({subTypes.IdOfUnit(word)});
        }
        const auto rotation = Channels::FindRotation(description);
        char text[64] = "none";
        if (rotation)
            std::snprintf(text, sizeof(text), "%d of %.3f", static_cast<int>(rotation->Form), rotation->Turn);
        EXPECT_EQ(text, expected) << format << " " << units;
    }
}

} // namespace ChannelsTest

#include "Channels/ChannelTypes.h"
#include "Channels/VRotationUnwrapper.h"
#include "Channels/VSubTypeTable.h"
#include "Reference.h"

#include <array>
#include <numbers>

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

TEST(RotationUnwrapper, DescriptionSaysWhatIsARotation)
{
    struct Case
    {
        std::string_view Type;
        std::string Units;
        std::vector<std::string> Components;
        bool bRotation;
        ERotationForm Form;
        double Turn;
    };
    const std::vector<Case> cases{
        {Channels::SegmentPoseType, "mm", {}, true, ERotationForm::AngleAxis, 2.0 * Pi},
        {Channels::LabelPositionType, "mm", {}, false, {}, 0.0},
        {Channels::DeviceOutputType, "V", {}, false, {}, 0.0},
        {Channels::JointAnglesType, "deg", {"X", "Y", "Z"}, true, ERotationForm::Euler, 360.0},
        {Channels::JointAnglesType, "rad", {"X", "Y", "Z"}, true, ERotationForm::Euler, 2.0 * Pi},
        {Channels::JointAnglesType, "deg", {"X"}, false, {}, 0.0},
        {Channels::JointAnglesType, "", {"X", "Y", "Z"}, false, {}, 0.0},
    };
    Channels::VSubTypeTable subTypes;
    for (const Case& rCase : cases)
    {
        const Channels::ChannelDefinition definition{std::string(rCase.Type), 0, 0, "", "", rCase.Units,
                                                     rCase.Components};
        const auto rotation = Channels::FindRotation(Channels::DescribeComponents(definition, subTypes));
        ASSERT_EQ(rotation.has_value(), rCase.bRotation) << rCase.Type << " " << rCase.Units;
        if (rotation)
        {
            EXPECT_EQ(rotation->Form, rCase.Form) << rCase.Type;
            EXPECT_DOUBLE_EQ(rotation->Turn, rCase.Turn) << rCase.Type;
        }
    }
}

} // namespace ChannelsTest

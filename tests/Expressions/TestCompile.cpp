#include "Evaluation.h"

#include <gtest/gtest.h>

#include <random>
#include <string>
#include <vector>

namespace TestExpressions
{

namespace
{

struct Case
{
    std::string Expression;
    std::vector<std::string> Inputs;
    std::string Outcome;
};

void Check(const std::vector<Case>& i_rCases)
{
    for (const Case& rCase : i_rCases)
        EXPECT_EQ(Outcome(rCase.Expression, rCase.Inputs), rCase.Outcome) << rCase.Expression;
}

std::string Repeat(const std::string& i_rText, int i_Times)
{
    std::string text;
    for (int i = 0; i < i_Times; ++i)
        text += i_rText;
    return text;
}

/// #0 to the power of 2^i_Times.
std::string Square(int i_Times)
{
    return i_Times == 0 ? "#0" : "dot(" + Square(i_Times - 1) + "," + Square(i_Times - 1) + ")";
}

const std::string Pose = "Pose rad*3 mm*3";
const std::string Position = "Position mm*3";
const std::string Force = " N*3";

} // namespace

TEST(Compile, GivesFormatsAndUnits)
{
    const std::string scalar = " N";
    Check({
        {"#0", {Pose}, Pose + " (as it is)"},
        {"\t#0\n", {"Euler deg*3"}, "Euler deg*3 (as it is)"},
        {"Position(#0)", {Position}, Position + " (as it is)"},
        {"Position(#0)", {Pose}, Position},
        {"AngleAxis(#0)", {Pose}, "AngleAxis rad*3"},
        {"AngleAxis(#0)", {"AngleAxis deg*3"}, "AngleAxis deg*3 (as it is)"},
        {"AxisAndAngle(#0)", {Pose}, "AxisAndAngle 1*3 rad"},
        {"Quaternion(#0)", {Pose}, "Quaternion 1*4"},
        {"SOMatrix(#0)", {Pose}, "SOMatrix 1*9"},
        {"EulerXYX(#0)", {Pose}, "EulerXYX rad*3"},
        {"EulerZXY(#0)", {"EulerZXY deg*3"}, "EulerZXY deg*3 (as it is)"},
        {"EulerXYZ(#0)", {"EulerZXY deg*3"}, "EulerXYZ rad*3"},
        {"degree(EulerXYZ(#0))", {Pose}, "EulerXYZ deg*3"},
        {"join( AngleAxis(#0), Position(#0) )", {Pose}, Pose + " (as it is)"},
        {"join( AxisAndAngle(#0), Position(#0) )", {Pose}, "Pose 1*3 rad mm*3"},
        {"join( Quaternion(#0), Position(#0) )", {Pose}, "Pose 1*4 mm*3"},
        {"join( SOMatrix(#0), Position(#0) )", {Pose}, "Pose 1*9 mm*3"},
        {"join(EulerXYZ(#0), Position(#0))", {Pose}, " rad*3 mm*3"},
        {"join(AxisAndAngle(#0), #1)", {"AxisAndAngle 1*4", Position}, "Pose 1*3 rad mm*3"},
        {"SOMatrix(#0)", {"Pose 1*3 rad mm*3"}, "SOMatrix 1*9"},
        {"Angle(#0)", {"Pose 1*9 mm*3"}, "Angle rad"},
        {"degree(Angle(#0))", {Pose}, "Angle deg"},
        {"mag( #0 )", {Position}, " mm"},
        {"mag(#0)", {" m mm*2"}, " m"},
        {"dot( #0, #0 )", {Position}, " mm^2"},
        {"dot(#0, #1)", {Position, " m*3"}, " mm^2"},
        {"dot(#0, #1)", {Position, Force}, " mm.N"},
        {"mag( Position(#0)- Position(#1) )", {Pose, Position}, " mm"},
        {"Position(#1)-Position(#0)", {Position, "Position m*3"}, "Position m*3"},
        {"#0 - #0 - #0", {Force}, " N*3"},
        {"angleBetween(Position(#1)-Position(#0),Position(#2)-Position(#1))[Angle]",
         {Position, Pose, Position},
         " rad"},
        {"Position(leftQuotient( #1, #0 ))", {Pose, "Pose 1*4 m*3"}, "Position m*3"},
        {"AngleAxis(leftQuotient( #1, #0 ))", {Pose, Pose}, "AngleAxis rad*3"},
        {"leftQuotient( #1, #0 )", {Pose, "Pose deg*3 mm*3"}, Pose},
        {"leftQuotient(#1, #0)", {"Quaternion 1*4", "EulerXYZ deg*3"}, "AngleAxis rad*3"},
        {"millimeter(#0)", {Position}, Position + " (as it is)"},
        {"millimeter(#0)", {"Position m/s^2*3"}, "Position mm/s^2*3"},
        {"degree(millimeter(#0))", {"Pose rad*3 m*3"}, "Pose deg*3 mm*3"},
        {"degree(#0)", {" rad/s*3"}, " deg/s*3"},
        {"centimeter(#0)", {" m^2 in"}, " cm^2 cm"},
        {"second(#0)", {" m/min"}, " m/s"},
        {"#0[TY]", {Position}, " mm"},
        {"#0[4]", {Pose}, " mm"},
        {"#0[TX]", {Pose}, " mm"},
        {"AxisAndAngle(#0)[Angle]", {Pose}, " rad"},
        {"(#0)[0]", {scalar}, " N (as it is)"},
        {"mag(#0)", {"Position! mm*3"}, "! mm"},
    });
    EXPECT_EQ(Outcome("#3999 - #0", std::vector<std::string>(4000, Position)), Position);
}

TEST(Compile, TellsWhatDoesNotFit)
{
    Check({
        {"AngleAxis(#0)", {Force}, "AngleAxis needs a rotation, but #0 is 3 numbers."},
        {"EulerXYZ(Position(#0))", {Pose}, "EulerXYZ needs a rotation, but Position(#0) is a position."},
        {"SOMatrix(#0)",
         {"Euler deg*3"},
         "SOMatrix needs a rotation, but #0 is angles whose order of axes is not known."},
        {"Quaternion(#0)", {"AngleAxis rad/s*3"}, "Quaternion needs a rotation, but #0 is 3 numbers."},
        {"Quaternion(#0)", {"Quaternion 1*3"}, "Quaternion needs a rotation, but #0 is 3 numbers."},
        {"AngleAxis(#0)", {"Pose rad*5"}, "AngleAxis needs a rotation, but #0 is 5 numbers."},
        {"Angle(#0)", {" N"}, "Angle needs a rotation, but #0 is a single number."},
        {"Angle(Angle(#0))", {Pose}, "Angle needs a rotation, but Angle(#0) is an angle."},
        {"Position(#0)", {"Quaternion 1*4"}, "Position needs a position or a pose, but #0 is a rotation."},
        {"mag(#0)", {Pose}, "mag needs a vector, but #0 is a pose."},
        {"mag(#0)", {" N mm"}, "mag needs components of one unit, but those of #0 have N and mm."},
        {"mag(AxisAndAngle(#0))",
         {Pose},
         "mag needs components of one unit, but those of AxisAndAngle(#0) have no unit and rad."},
        {"dot(#0, #1)", {Force, " N*2"}, "dot needs vectors of one size, but has 3 numbers and 2 numbers."},
        {Square(7), {" N"}, "The unit of " + Square(7).substr(0, 40) + "... has too high a power."},
        {"#0 - #1", {Force, Position}, "The units of #0 - #1 do not go together: N and mm."},
        {"#0 - #1", {" blob", " glob"}, "The units of #0 - #1 do not go together: blob and glob."},
        {"#0 - #1", {Force, " N"}, "#0 and #1 have no difference: 3 numbers and a single number."},
        {"#0 - #0", {Pose}, "A pose has no difference to another, and #0 is a pose."},
        {"angleBetween(#0, #0)",
         {" N"},
         "angleBetween needs two vectors of one size, but has a single number and a single number."},
        {"leftQuotient(#0, #1)",
         {Pose, Position},
         "leftQuotient needs two poses or two rotations, but #1 is a position."},
        {"leftQuotient(#0, #1)", {Pose, "Quaternion 1*4"}, "leftQuotient needs a second pose, but #1 is a rotation."},
        {"leftQuotient(#0, #1)",
         {Pose, "Pose rad*3 N*3"},
         "leftQuotient needs positions whose units go together, but #1 has N instead of mm."},
        {"#0\n-#1", {Force, Position}, "The units of #0 -#1 do not go together: N and mm."},
        {"degree(#0)", {Force}, "#0 cannot be given in degree; it has N."},
        {"millimeter(Quaternion(#0))", {Pose}, "Quaternion(#0) cannot be given in millimeter; it has no unit."},
        {"degree(#0)", {"AngleAxis! rad*3"}, "The units of #0 are not to be converted."},
        {"furlong(#0)", {Position}, "There is no function and no unit \"furlong\"."},
        {"EulerXXY(#0)", {Pose}, "There is no function and no unit \"EulerXXY\"."},
        {"dot(#0)", {Force}, "dot takes two arguments, not 1."},
        {"mag(#0, #0)", {Force}, "mag takes one argument, not 2."},
        {"#0[3]", {Force}, "#0 is 3 numbers and has no component 3."},
        {"#0[RX]", {Position}, "#0 is a position and has no component RX."},
        {"#3", {Force, Force}, "There is no input #3; the inputs are #0 to #1."},
        {"#0", {}, "There is no input #0; the inputs are none."},
        {"#0", {"Position"}, "#0 has no components."},
    });
}

TEST(Compile, TellsWhereTheTextIsWrong)
{
    const std::string expected = " was expected, at character ";
    Check({
        {"", {}, "The expression ends where '#', a function or '('" + expected + "1."},
        {"#", {}, "The expression ends where the number of an input behind '#'" + expected + "2."},
        {"# 0", {}, "The expression has a blank where the number of an input behind '#'" + expected + "2."},
        {"#99999999999", {}, "The expression has '9' where the number of an input behind '#'" + expected + "2."},
        {"mag", {}, "The expression ends where '(' behind mag" + expected + "4."},
        {"mag(#0", {Force}, "The expression ends where ',' or ')'" + expected + "7."},
        {"mag(#0))", {Force}, "The expression has ')' where an operator or the end" + expected + "8."},
        {"(#0", {Force}, "The expression ends where ')'" + expected + "4."},
        {"#0 + #1", {Force}, "The expression has '+' where an operator or the end" + expected + "4."},
        {"#0 - ", {Force}, "The expression ends where '#', a function or '('" + expected + "6."},
        {"-#0", {Force}, "The expression has '-' where '#', a function or '('" + expected + "1."},
        {"#0[]", {Force}, "The expression has ']' where the name or the number of a component" + expected + "4."},
        {"#0[1", {Force}, "The expression ends where ']'" + expected + "5."},
        {"mag()", {Force}, "The expression has ')' where '#', a function or '('" + expected + "5."},
        {"\xc3\xa4(#0)",
         {Force},
         "The expression has a character of no meaning where '#', a function or '('" + expected + "1."},
        {Repeat("(", 101) + "#0" + Repeat(")", 101),
         {Force},
         "The expression is nested deeper than 100 brackets, at character 102."},
        {Repeat("(", 100) + "#0" + Repeat(")", 100), {Force}, Force + " (as it is)"},
        {"#0" + Repeat(" ", 10000), {Force}, "The expression is longer than 10000 characters."},
        {"#0" + Repeat("-#0", 1000), {Force}, Force},
        {"#0" + Repeat("-#0", 3000), {Force}, "The expression is too large."},
    });
}

/// Words in any order and bytes in any order: an operation or a sentence, and nothing worse.
TEST(Compile, TakesAnyText)
{
    const std::vector<std::string> words{"#0",
                                         "#1",
                                         "#2",
                                         "(",
                                         ")",
                                         ",",
                                         "-",
                                         "[",
                                         "]",
                                         "mag",
                                         "dot",
                                         "join",
                                         "Angle",
                                         "Position",
                                         "Quaternion",
                                         "EulerXYX",
                                         "leftQuotient",
                                         "angleBetween",
                                         "millimeter",
                                         "degree",
                                         "TX",
                                         "7",
                                         " ",
                                         "\x80",
                                         std::string(1, '\0')};
    std::mt19937 random(7);
    for (int round = 0; round < 20000; ++round)
    {
        std::string text;
        for (std::size_t left = random() % 12 + 1; left > 0; --left)
            text += words[random() % words.size()];
        const std::string outcome = Outcome(text, {Pose, Position, "Quaternion 1*4"});
        ASSERT_FALSE(outcome.empty());
    }
}

} // namespace TestExpressions

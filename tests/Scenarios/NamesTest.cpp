#include "Scenarios/PlotScenario.h"
#include "Scenarios/SmallTake.h"

#include <initializer_list>
#include <iterator>
#include <sstream>

namespace
{

/// What is selected, separated by blanks, the type that is picked for it, the options, and the line of what is plotted.
struct NameCase
{
    const char* pSelected;
    const char* pType;
    const char* pOptions;
    const char* pPlotted;
};

class Names : public PlotScenario
{
protected:
    void Check(std::initializer_list<NameCase> i_Cases)
    {
        for (const NameCase& rCase : i_Cases)
        {
            std::istringstream stream(rCase.pSelected);
            Select({std::istream_iterator<std::string>(stream), {}});
            PickType(rCase.pType);
            Choose(rCase.pOptions);
            EXPECT_EQ(Plotted(), std::string(rCase.pPlotted) + "\n")
                << rCase.pSelected << ", " << rCase.pType << ", " << rCase.pOptions;
        }
    }
};

constexpr const char* Auto = "Auto";
constexpr const char* Femora = "Anna:Pelvis Anna:Femur";
constexpr const char* Hips = "Anna:LASI Anna:RASI";

TEST_F(Names, OfMarkersAndNumbers)
{
    AddRecording("Take", SmallTake::MakeRecording());
    Show("Take");
    constexpr const char* marker = "Anna:LASI";
    Check({
        {marker, Auto, "", "Position - Anna:LASI | TX,TY,TZ | mm[3]"},
        {marker, Auto, "cm rad f4", "Position - Anna:LASI | TX,TY,TZ | cm[3]"},
        {marker, Auto, "m", "Position - Anna:LASI | TX,TY,TZ | m[3]"},
        {marker, Auto, "mag", "Distance From Origin - Anna:LASI |  | mm"},
        {marker, Auto, "d1", "Velocity - Anna:LASI | TX,TY,TZ | mm/s[3]"},
        {marker, Auto, "d1 m", "Velocity - Anna:LASI | TX,TY,TZ | m/s[3]"},
        {marker, Auto, "d1 frame", "Velocity - Anna:LASI | TX,TY,TZ | mm/frame[3]"},
        {marker, Auto, "d1 mag", "Speed - Anna:LASI |  | mm/s"},
        {marker, Auto, "d2", "Acceleration - Anna:LASI | TX,TY,TZ | mm/s^2[3] | mm/s<sup>2</sup>"},
        {marker, Auto, "d2 frame cm", "Acceleration - Anna:LASI | TX,TY,TZ | cm/frame^2[3] | cm/frame<sup>2</sup>"},
        {marker, Auto, "d2 mag", "Acceleration (Magnitude) - Anna:LASI |  | mm/s^2 | mm/s<sup>2</sup>"},
        // Nothing that an operator chooses fits a force but its derivative; its magnitude is not on offer.
        {"Force.Fz", Auto, "f4 rad m mag", "Device Output - Force.Fz |  | N"},
        {"Force.Fz", Auto, "d1", "Device Output 1st Derivative - Force.Fz |  | N/s"},
        {"Force.Fz", Auto, "d2 mag", "Device Output 2nd Derivative - Force.Fz |  | N/s^2 | N/s<sup>2</sup>"},
        {"Torque", Auto, "", "Column - Torque |  | N·m"},
        {"Ratio", Auto, "", "Column - Ratio |  | "},
        {"Ratio", Auto, "d1", "Column 1st Derivative - Ratio |  | Hz"},
        {"Ratio", Auto, "d1 frame", "Column 1st Derivative - Ratio |  | 1/frame"},
        {"Anna:KneeAngles", Auto, "", "Angle - Anna:KneeAngles | X,Y,Z | °[3]"},
        {"Anna:KneeAngles", Auto, "d1 rad", "Angular Velocity - Anna:KneeAngles | X,Y,Z | rad/s[3]"},
        {"Anna:KneeMoment", Auto, "m", "Moment - Anna:KneeMoment | X,Y,Z | Nmm[3]"},
        // The file tells no unit of length, so that none can be chosen.
        {"Root", Auto, "cm", "Pose (Helical) - Root | RX,RY,RZ,TX,TY,TZ | °[3] units[3]"},
        {"Root", Auto, "d1 cm", "Pose 1st Derivative - Root | RX,RY,RZ,TX,TY,TZ | °/s[3] units/s[3]"},
    });
}

TEST_F(Names, OfRotationsInEveryFormat)
{
    AddRecording("Take", SmallTake::MakeRecording());
    Show("Take");
    Check({
        {"Anna:Pelvis", Auto, "", "Pose (Helical) - Anna:Pelvis | RX,RY,RZ,TX,TY,TZ | °[3] mm[3]"},
        {"Anna:Pelvis", Auto, "rad m", "Pose (Helical) - Anna:Pelvis | RX,RY,RZ,TX,TY,TZ | rad[3] m[3]"},
        {"Anna:Pelvis", Auto, "f1", "Pose (Axis and Angle) - Anna:Pelvis | X,Y,Z,A,TX,TY,TZ | [3] ° mm[3]"},
        {"Anna:Pelvis", Auto, "f2", "Pose (Quaternion) - Anna:Pelvis | X,Y,Z,W,TX,TY,TZ | [4] mm[3]"},
        {"Anna:Pelvis", Auto, "f3",
         "Pose (SO(3) Matrix) - Anna:Pelvis | xx,xy,xz,yx,yy,yz,zx,zy,zz,TX,TY,TZ | [9] mm[3]"},
        {"Anna:Pelvis", Auto, "f4", "Pose (Euler XYZ) - Anna:Pelvis | RX,RY,RZ | °[3]"},
        {"Anna:Pelvis", Auto, "f5", "Pose (Euler XZY) - Anna:Pelvis | RX,RY,RZ | °[3]"},
        {"Anna:Pelvis", Auto, "f6", "Pose (Euler YZX) - Anna:Pelvis | RX,RY,RZ | °[3]"},
        {"Anna:Pelvis", Auto, "f7", "Pose (Euler YXZ) - Anna:Pelvis | RX,RY,RZ | °[3]"},
        {"Anna:Pelvis", Auto, "f8", "Pose (Euler ZXY) - Anna:Pelvis | RX,RY,RZ | °[3]"},
        {"Anna:Pelvis", Auto, "f9 rad", "Pose (Euler XYX) - Anna:Pelvis | RX,RY,RZ | rad[3]"},
        {"Anna:Pelvis", Auto, "d1 f4", "Pose 1st Derivative - Anna:Pelvis | RX,RY,RZ,TX,TY,TZ | °/s[3] mm/s[3]"},
        {"Anna:Pelvis", Auto, "d2 frame rad",
         "Pose 2nd Derivative - Anna:Pelvis | RX,RY,RZ,TX,TY,TZ | rad/frame^2[3] mm/frame^2[3] | "
         "rad/frame<sup>2</sup> mm/frame<sup>2</sup>"},
        {"Anna:Pelvis", "SubjectSegmentPose", "", "Pose (Helical) - Anna:Pelvis | RX,RY,RZ,TX,TY,TZ | °[3] mm[3]"},
        {"Knee", Auto, "", "Joint Angles (Helical) - Knee | RX,RY,RZ | °[3]"},
        {"Knee", Auto, "f1 rad", "Joint Angles (Axis and Angle) - Knee | X,Y,Z,A | [3] rad"},
        {"Knee", Auto, "f2", "Joint Angles (Quaternion) - Knee | X,Y,Z,W | [4]"},
        {"Knee", Auto, "f3", "Joint Angles (SO(3) Matrix) - Knee | xx,xy,xz,yx,yy,yz,zx,zy,zz | [9]"},
        {"Knee", Auto, "f4", "Joint Angles (Euler XYZ) - Knee | RX,RY,RZ | °[3]"},
        {"Knee", Auto, "f8", "Joint Angles (Euler ZXY) - Knee | RX,RY,RZ | °[3]"},
        {"Knee", Auto, "d1", "Joint Angles 1st Derivative - Knee | RX,RY,RZ | °/s[3]"},
    });
}

TEST_F(Names, OfOneThingAgainstAnother)
{
    AddRecording("Take", SmallTake::MakeRecording());
    Show("Take");
    constexpr const char* corner = "Anna:LASI Anna:RASI Anna:C7";
    Check({
        {Hips, "_DistanceBetween", "", "Distance Between - Anna:LASI ➞ Anna:RASI |  | mm"},
        {Hips, "_DistanceBetween", "d1 cm", "Distance Between 1st Derivative - Anna:LASI ➞ Anna:RASI |  | cm/s"},
        {Hips, "_DifferenceBetween", "", "Difference Between - Anna:LASI (reference) ➞ Anna:RASI | TX,TY,TZ | mm[3]"},
        {Hips, "_DifferenceBetween", "mag", "Distance Between - Anna:LASI (reference) ➞ Anna:RASI |  | mm"},
        {Hips, "_DifferenceBetween", "d1", "Velocity Between - Anna:LASI (reference) ➞ Anna:RASI | TX,TY,TZ | mm/s[3]"},
        {Hips, "_DifferenceBetween", "d2",
         "Acceleration Between - Anna:LASI (reference) ➞ Anna:RASI | TX,TY,TZ | mm/s^2[3] | mm/s<sup>2</sup>"},
        {corner, "_AngleBetween", "", "Angle Between - Anna:LASI ➞ Anna:RASI ➞ Anna:C7 |  | °"},
        {corner, "_AngleBetween", "rad", "Angle Between - Anna:LASI ➞ Anna:RASI ➞ Anna:C7 |  | rad"},
        {corner, "_AngleBetween", "d1", "Angular Velocity Between - Anna:LASI ➞ Anna:RASI ➞ Anna:C7 |  | °/s"},
        {corner, "_AngleBetween", "d2",
         "Angular Acceleration Between - Anna:LASI ➞ Anna:RASI ➞ Anna:C7 |  | °/s^2 | °/s<sup>2</sup>"},
        {Femora, "_RelativePosition", "",
         "Relative Position - Anna:Pelvis (reference) ➞ Anna:Femur | TX,TY,TZ | mm[3]"},
        {Femora, "_RelativePosition", "mag",
         "Relative Distance From Origin - Anna:Pelvis (reference) ➞ Anna:Femur |  | mm"},
        {Femora, "_RelativePosition", "d1",
         "Relative Velocity - Anna:Pelvis (reference) ➞ Anna:Femur | TX,TY,TZ | mm/s[3]"},
        {Femora, "_RelativePosition", "d1 mag", "Relative Speed - Anna:Pelvis (reference) ➞ Anna:Femur |  | mm/s"},
        {Femora, "_RelativeRotation", "",
         "Relative Rotation (Helical) - Anna:Pelvis (reference) ➞ Anna:Femur | RX,RY,RZ | °[3]"},
        {Femora, "_RelativeRotation", "mag",
         "Relative Rotation (Helical) (Angle) - Anna:Pelvis (reference) ➞ Anna:Femur |  | °"},
        {Femora, "_RelativeRotation", "f8",
         "Relative Rotation (Euler ZXY) - Anna:Pelvis (reference) ➞ Anna:Femur | RX,RY,RZ | °[3]"},
        {Femora, "_RelativeRotation", "d1",
         "Relative Angular Velocity - Anna:Pelvis (reference) ➞ Anna:Femur | RX,RY,RZ | °/s[3]"},
        {Femora, "_RelativeRotation", "d2 rad",
         "Relative Angular Acceleration - Anna:Pelvis (reference) ➞ Anna:Femur | RX,RY,RZ | rad/s^2[3] | "
         "rad/s<sup>2</sup>"},
        {Femora, "_RelativeRotation", "d1 mag",
         "Relative Angular Speed - Anna:Pelvis (reference) ➞ Anna:Femur |  | °/s"},
        {Femora, "_RelativePose", "",
         "Relative Pose (Helical) - Anna:Pelvis (reference) ➞ Anna:Femur | RX,RY,RZ,TX,TY,TZ | °[3] mm[3]"},
        {Femora, "_DistanceBetween", "", "Distance Between - Anna:Pelvis ➞ Anna:Femur |  | mm"},
    });
}

TEST_F(Names, OfWhatOnlyACaptureHas)
{
    AddCapture("Live");
    Show("Live");
    Check({
        {"Camera7", Auto, "", "Position - Camera7 | TX,TY,TZ | mm[3]"},
        {"Camera7", "_CameraPosition", "mag", "Distance From Origin - Camera7 |  | mm"},
        {"Knee", Auto, "", "Angle - Knee |  | °"},
        {"Knee", Auto, "d1", "Angular Velocity - Knee |  | °/s"},
        {"Knee", Auto, "d2 rad", "Angular Acceleration - Knee |  | rad/s^2 | rad/s<sup>2</sup>"},
    });
    Select({});
    PickGlobalType("SampleCount");
    Choose("");
    EXPECT_EQ(Plotted(), "Sample Count |  | \n");
}

} // namespace

#include "Scenarios/PlotScenario.h"
#include "Scenarios/SmallTake.h"

#include <initializer_list>
#include <iterator>
#include <sstream>

namespace
{

/// The numbers of one frame beside the name that the operator reads them under.
TEST_F(PlotScenario, NumbersAreWhatTheNamesSay)
{
    struct Case
    {
        const char* pSelected;
        const char* pType;
        const char* pOptions;
        std::int64_t Frame;
        const char* pValues;
    };
    AddRecording("Take", SmallTake::MakeRecording());
    Show("Take");
    constexpr const char* marker = "Anna:LASI";
    constexpr const char* hips = "Anna:LASI Anna:RASI";
    constexpr const char* corner = "Anna:LASI Anna:RASI Anna:C7";
    constexpr const char* leg = "Anna:Pelvis Anna:Femur";
    for (const Case& rCase : std::initializer_list<Case>{
             {marker, "Auto", "", 3, "Position - Anna:LASI: 30 100 300"},
             {marker, "Auto", "", 5, "Position - Anna:LASI: - - -"},
             {marker, "Auto", "cm", 3, "Position - Anna:LASI: 3 10 30"},
             {marker, "Auto", "m mag", 0, "Distance From Origin - Anna:LASI: 0.3162"},
             {marker, "Auto", "d1", 3, "Velocity - Anna:LASI: 1200 0 0"},
             {marker, "Auto", "d1 frame", 3, "Velocity - Anna:LASI: 10 0 0"},
             {marker, "Auto", "d1 mag", 4, "Speed - Anna:LASI: 1200"}, // from one side: the next frame is lost
             {marker, "Auto", "d1 mag", 6, "Speed - Anna:LASI: -"},
             {marker, "Auto", "d2 mag", 4, "Acceleration (Magnitude) - Anna:LASI: -"},
             {"Force.Fz", "Auto", "", 3, "Device Output - Force.Fz: 30"},
             {"Force.Fz", "Auto", "d1", 3, "Device Output 1st Derivative - Force.Fz: 1200"},
             {hips, "_DistanceBetween", "", 3, "Distance Between - Anna:LASI ➞ Anna:RASI: 50"},
             {hips, "_DistanceBetween", "", 5, "Distance Between - Anna:LASI ➞ Anna:RASI: -"},
             {hips, "_DifferenceBetween", "", 3, "Difference Between - Anna:LASI (reference) ➞ Anna:RASI: 0 -40 30"},
             {hips, "_DifferenceBetween", "mag", 3, "Distance Between - Anna:LASI (reference) ➞ Anna:RASI: 50"},
             {corner, "_AngleBetween", "", 3, "Angle Between - Anna:LASI ➞ Anna:RASI ➞ Anna:C7: 90"},
             {"Anna:Pelvis", "Auto", "", 3, "Pose (Helical) - Anna:Pelvis: 0 0 17.1887 100 0 900"},
             {"Anna:Pelvis", "Auto", "f1", 3, "Pose (Axis and Angle) - Anna:Pelvis: 0 0 1 17.1887 100 0 900"},
             {"Anna:Pelvis", "Auto", "f2 m", 3, "Pose (Quaternion) - Anna:Pelvis: 0 0 0.1494 0.9888 0.1 0 0.9"},
             {"Anna:Pelvis", "Auto", "f3", 3,
              "Pose (SO(3) Matrix) - Anna:Pelvis: 0.9553 -0.2955 0 0.2955 0.9553 0 0 0 1 100 0 900"},
             {"Anna:Pelvis", "Auto", "f4 rad", 3, "Pose (Euler XYZ) - Anna:Pelvis: 0 0 0.3"},
             {"Anna:Pelvis", "Auto", "d1 f4", 3, "Pose 1st Derivative - Anna:Pelvis: 0 0 687.5494 0 0 0"},
             {"Anna:Pelvis", "Auto", "d1 rad frame", 3, "Pose 1st Derivative - Anna:Pelvis: 0 0 0.1 0 0 0"},
             {"Knee", "Auto", "f8", 3, "Joint Angles (Euler ZXY) - Knee: 13 20 -5"}, // as in the recording
             {"Knee", "Auto", "f8 rad", 3, "Joint Angles (Euler ZXY) - Knee: 0.2269 0.3491 -0.0873"},
             {"Knee", "Auto", "d1", 3, "Joint Angles 1st Derivative - Knee: 0 0 120"}, // about the Z axis of the parent
             {leg, "_RelativePosition", "", 3, "Relative Position - Anna:Pelvis (reference) ➞ Anna:Femur: 0 0 -400"},
             {leg, "_RelativePosition", "mag", 3,
              "Relative Distance From Origin - Anna:Pelvis (reference) ➞ Anna:Femur: 400"},
             {leg, "_RelativeRotation", "", 3,
              "Relative Rotation (Helical) - Anna:Pelvis (reference) ➞ Anna:Femur: 0 0 11.4592"},
             {leg, "_RelativeRotation", "mag rad", 3,
              "Relative Rotation (Helical) (Angle) - Anna:Pelvis (reference) ➞ Anna:Femur: 0.2"},
             {leg, "_RelativePose", "m", 3,
              "Relative Pose (Helical) - Anna:Pelvis (reference) ➞ Anna:Femur: 0 0 11.4592 0 0 -0.4"},
         })
    {
        std::istringstream stream(rCase.pSelected);
        Select({std::istream_iterator<std::string>(stream), {}});
        PickType(rCase.pType);
        Choose(rCase.pOptions);
        EXPECT_EQ(Values(rCase.Frame), std::string(rCase.pValues) + "\n")
            << rCase.pSelected << ", " << rCase.pType << ", " << rCase.pOptions;
    }
}

} // namespace

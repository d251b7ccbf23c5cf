#include "Simulation/BodyTables.h"

#include <array>
#include <vector>

namespace Simulation
{

namespace
{

using enum ESegment;

constexpr std::array<SegmentRow, SegmentCount> segmentTable{{
    {"Pelvis", Pelvis, {0.0, 0.0, 0.0}},
    {"Lumbar", Pelvis, {-20.0, 0.0, 100.0}},
    {"Thorax", Lumbar, {0.0, 0.0, 150.0}},
    {"Head", Thorax, {15.0, 0.0, 300.0}},
    {"LClavicle", Thorax, {10.0, 30.0, 230.0}},
    {"LUpperArm", LeftClavicle, {-10.0, 150.0, -10.0}},
    {"LForearm", LeftUpperArm, {0.0, 0.0, -290.0}},
    {"LHand", LeftForearm, {0.0, 0.0, -250.0}},
    {"RClavicle", Thorax, {10.0, -30.0, 230.0}},
    {"RUpperArm", RightClavicle, {-10.0, -150.0, -10.0}},
    {"RForearm", RightUpperArm, {0.0, 0.0, -290.0}},
    {"RHand", RightForearm, {0.0, 0.0, -250.0}},
    {"LThigh", Pelvis, {0.0, 90.0, -20.0}},
    {"LShin", LeftThigh, {0.0, 0.0, -420.0}},
    {"LFoot", LeftShin, {0.0, 0.0, -400.0}},
    {"LToes", LeftFoot, {140.0, 0.0, -60.0}},
    {"RThigh", Pelvis, {0.0, -90.0, -20.0}},
    {"RShin", RightThigh, {0.0, 0.0, -420.0}},
    {"RFoot", RightShin, {0.0, 0.0, -400.0}},
    {"RToes", RightFoot, {140.0, 0.0, -60.0}},
}};

/// A marker on the left side, or one of both sides together. The name lacks the side's letter.
struct SidedRow
{
    const char* pName;
    ESegment Left;
    ESegment Right;
    double Offset[3];
    EOcclusion Occlusion;
};

using enum EOcclusion;

constexpr MarkerRow Middle(const char* i_pName, double i_X, double i_Y, double i_Z)
{
    return {i_pName, Thorax, {i_X, i_Y, i_Z}, Rare};
}

constexpr SidedRow sidedTable[] = {
    {"FHD", Head, Head, {95.0, 65.0, 120.0}, Rare},
    {"BHD", Head, Head, {-85.0, 60.0, 110.0}, Rare},
    {"SHO", LeftClavicle, RightClavicle, {-5.0, 145.0, 45.0}, Rare},
    {"UPA", LeftUpperArm, RightUpperArm, {10.0, 55.0, -140.0}, Rare},
    {"ELB", LeftUpperArm, RightUpperArm, {0.0, 50.0, -285.0}, Rare},
    {"MEL", LeftUpperArm, RightUpperArm, {0.0, -45.0, -285.0}, Often},
    {"FRM", LeftForearm, RightForearm, {15.0, 40.0, -130.0}, Crossing},
    {"WRA", LeftForearm, RightForearm, {38.0, 5.0, -245.0}, Crossing},
    {"WRB", LeftForearm, RightForearm, {-36.0, 8.0, -245.0}, Crossing},
    {"FIN", LeftHand, RightHand, {5.0, 15.0, -95.0}, Crossing},
    {"ASI", Pelvis, Pelvis, {85.0, 120.0, 60.0}, Crossing},
    {"PSI", Pelvis, Pelvis, {-95.0, 45.0, 75.0}, Rare},
    {"ICR", Pelvis, Pelvis, {5.0, 150.0, 95.0}, Crossing},
    {"THI", LeftThigh, RightThigh, {20.0, 90.0, -190.0}, Crossing},
    {"THF", LeftThigh, RightThigh, {80.0, 15.0, -270.0}, Rare},
    {"KNE", LeftThigh, RightThigh, {0.0, 55.0, -420.0}, Rare},
    {"MKN", LeftThigh, RightThigh, {0.0, -52.0, -420.0}, Often},
    {"TIB", LeftShin, RightShin, {20.0, 55.0, -190.0}, Rare},
    {"SHN", LeftShin, RightShin, {50.0, 5.0, -270.0}, Rare},
    {"ANK", LeftShin, RightShin, {-5.0, 38.0, -398.0}, Rare},
    {"MAN", LeftShin, RightShin, {0.0, -36.0, -390.0}, Often},
    {"HEE", LeftFoot, RightFoot, {-65.0, 0.0, -50.0}, Rare},
    {"MT1", LeftFoot, RightFoot, {125.0, -35.0, -45.0}, Often},
    {"MT5", LeftFoot, RightFoot, {105.0, 50.0, -55.0}, Rare},
    {"TOE", LeftToes, RightToes, {25.0, 0.0, 12.0}, Rare},
};

std::vector<MarkerRow> BuildMarkers()
{
    std::vector<MarkerRow> markers{
        Middle("C7", -75.0, 0.0, 265.0),
        Middle("T10", -105.0, 0.0, 20.0),
        Middle("CLAV", 70.0, 0.0, 215.0),
    };
    for (const SidedRow& rRow : sidedTable)
    {
        const auto& rOffset = rRow.Offset;
        markers.push_back(
            {std::string("L") + rRow.pName, rRow.Left, {rOffset[0], rOffset[1], rOffset[2]}, rRow.Occlusion});
        markers.push_back(
            {std::string("R") + rRow.pName, rRow.Right, {rOffset[0], -rOffset[1], rOffset[2]}, rRow.Occlusion});
    }
    return markers;
}

} // namespace

std::span<const SegmentRow, SegmentCount> GetSegmentTable()
{
    return segmentTable;
}

std::span<const MarkerRow> GetMarkerTable()
{
    static const std::vector<MarkerRow> markers = BuildMarkers();
    return markers;
}

} // namespace Simulation

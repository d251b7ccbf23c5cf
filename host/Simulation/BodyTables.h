#pragma once

#include <cstddef>
#include <cstdint>
#include <span>
#include <string>

namespace Simulation
{

/// The segments of the body, parents before children, each side together.
enum class ESegment : std::uint8_t
{
    Pelvis,
    Lumbar,
    Thorax,
    Head,
    LeftClavicle,
    LeftUpperArm,
    LeftForearm,
    LeftHand,
    RightClavicle,
    RightUpperArm,
    RightForearm,
    RightHand,
    LeftThigh,
    LeftShin,
    LeftFoot,
    LeftToes,
    RightThigh,
    RightShin,
    RightFoot,
    RightToes,
    Count
};

inline constexpr std::size_t SegmentCount = static_cast<std::size_t>(ESegment::Count);

/// Body axes: x forward, y left, z up; millimetres of a person of 1750 mm.
struct SegmentRow
{
    const char* pName;
    ESegment Parent;  ///< the pelvis is its own parent
    double Offset[3]; ///< of the joint, in the parent's axes
};

/// Why a marker gets lost.
enum class EOcclusion : std::uint8_t
{
    Rare,     ///< in plain view of most cameras
    Crossing, ///< hidden when an arm passes the hip or one leg the other
    Often     ///< on an inner side or near the floor
};

struct MarkerRow
{
    std::string Name;
    ESegment Segment = ESegment::Pelvis;
    double Offset[3] = {0.0, 0.0, 0.0}; ///< in the segment's axes
    EOcclusion Occlusion = EOcclusion::Rare;
};

std::span<const SegmentRow, SegmentCount> GetSegmentTable();

/// 53 markers; those of the right side are the mirror of those of the left.
std::span<const MarkerRow> GetMarkerTable();

} // namespace Simulation

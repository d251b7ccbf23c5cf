#pragma once

#include "Recordings/Common/VRecording.h"

#include <cstddef>
#include <cstdint>
#include <string_view>
#include <vector>

namespace Recordings
{

inline constexpr std::size_t LargestC3dWord = 0xFFFF;

/// What of a recording a C3D file can hold, and the shape of that file. Points into the recording, which must outlive
/// it.
struct C3dWritePlan
{
    std::vector<const RecordedChannel*> Points; ///< markers and model outputs, in the order of the recording
    std::vector<const RecordedChannel*> Analog;
    std::size_t LeftOut = 0; ///< channels that the format has no place for
    std::size_t Frames = 0;
    std::size_t AnalogSamplesPerFrame = 0;
    std::uint64_t FirstFrame = 1; ///< its number, from 1
    double Rate = 0.0;            ///< frames a second

    /// The first point of a quantity, the empty one being that of the markers; null when there is none.
    const RecordedChannel* FirstOf(std::string_view i_Quantity) const;
    std::uint64_t LastFrame() const { return FirstFrame + Frames - 1; }
    bool IsLong() const { return LastFrame() > LargestC3dWord; } ///< more than the header can say
};

C3dWritePlan PlanC3d(const VRecording& i_rRecording);

/// One sentence: why the format cannot hold the recording. Null when it can.
const char* FindC3dObstacle(const VRecording& i_rRecording, const C3dWritePlan& i_rPlan);

} // namespace Recordings

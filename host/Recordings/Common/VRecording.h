#pragma once

#include "TQL/ITick.h"

#include <cstddef>
#include <cstdint>
#include <string>
#include <string_view>
#include <vector>

namespace Recordings
{

/// The quantity of columns that are lengths, whatever their unit.
inline constexpr std::string_view LengthQuantity = "Length";

enum class EChannelKind
{
    Marker,      ///< position of a marker; components X, Y, Z
    SegmentPose, ///< angle-axis rotation and position of a segment; components RX, RY, RZ, TX, TY, TZ; radians
    Analog,      ///< one output of an analog device; one component
    JointAngles, ///< angles of a joint
    ModelOutput, ///< what a model computed, and no position; components X, Y, Z
    Column       ///< one column of a table
};

/// One channel of a recording, its samples in memory: rows x components, interleaved, a missing sample NaN.
struct RecordedChannel
{
    EChannelKind Kind = EChannelKind::Column;
    std::string Name;    ///< as in the file; one that comes again in the file gets "#2", "#3" behind it
    std::string Subject; ///< the part of the label before the colon, or empty
    std::vector<std::string> ComponentNames; ///< {""} for a channel with one unnamed component
    std::string Units;                       ///< as in the file: "mm", "m", "V"; empty when the file has none
    double Rate = 0.0;                       ///< samples a second
    std::int64_t SamplePeriod = TQL::DefaultFramePeriod; ///< ticks, nearest to the rate
    std::int64_t FirstTick = 0; ///< of the first row; row i stands at FirstTick + i x SamplePeriod
    std::vector<float> Samples;
    std::string RotationOrder = {}; ///< of joint angles: the axes in the order of the components, "ZXY"; empty: unknown
    bool bCountsRows = false;       ///< a column that says when or which row: a time or a number of a frame
    std::string Quantity = {};      ///< of a model output: "Angle", "Force", "Moment" and so on; of a column: "Length"

    std::size_t ComponentCount() const { return ComponentNames.size(); }
    std::size_t RowCount() const { return ComponentNames.empty() ? 0 : Samples.size() / ComponentNames.size(); }
    TQL::TickRange GetTickRange() const;
    std::size_t MissingCount() const; ///< rows in which any component is NaN
};

struct RecordedEvent
{
    std::string Subject;
    std::string Label;
    double Seconds = 0.0;     ///< as in the file
    std::string Context = {}; ///< "Left", "Right", "General"; empty when the file has none
    bool bOn = true;          ///< files can switch single events off
};

/// A motion recording in memory, whatever the format of its file. No thread of its own; read-only once it is open.
struct VRecording
{
    std::string Name;                                   ///< file name without folder and ending
    std::string Format;                                 ///< "C3D"
    std::int64_t FramePeriod = TQL::DefaultFramePeriod; ///< ticks of the motion frames
    TQL::TickRange Range; ///< of the motion frames; covers all channels where there are none
    std::vector<RecordedChannel> Channels;
    std::vector<RecordedEvent> Events;
    std::vector<std::string> Warnings; ///< what the reader had to guess or leave out, one sentence each
    std::vector<std::string> Remarks;  ///< what is usual of such files and worth a line in a log, one sentence each
};

/// The tick period nearest to a rate in samples a second. 0 for a rate that is not positive and finite.
std::int64_t PeriodOfRate(double i_Rate);

} // namespace Recordings

#pragma once

#include "ChannelSystem/ComponentDescription.h"
#include "ChannelSystem/ISelectionSource.h"
#include "Recordings/Common/VRecording.h"
#include "TQL/IChannelInstanceId.h"

#include <cstdint>
#include <optional>
#include <span>
#include <string>
#include <string_view>
#include <vector>

namespace Channels
{

class VSubTypeTable;

/// Names of the channel types of this host, as they stand in channel ids.
inline constexpr std::string_view LabelledReconstructionType = "Labelled Reconstructions";
inline constexpr std::string_view SegmentPoseType = "SubjectSegmentPose";
inline constexpr std::string_view DeviceOutputType = "DeviceOutput";
inline constexpr std::string_view CameraPoseType = "CalibratedCameraPose";
inline constexpr std::string_view SampleCountType = "SampleCount";
inline constexpr std::string_view ModelOutputType = "ModelSetSamplesOutput"; ///< model outputs, joint angles, columns
inline constexpr std::string_view MonitorType = "Monitor";                   ///< from 0 to 1, and so plotted

/// What stands in place of the display name of that type for two of the things that are of it; model outputs of other
/// kinds are named by their quantity: "Angle", "Force".
inline constexpr std::string_view JointAnglesText = "Joint Angles";
inline constexpr std::string_view ColumnText = "Column";

/// The context that the ids of global channels bear: what belongs to no single capture or recording. It is none that
/// can be shown.
inline constexpr std::string_view GlobalContextName = "GlobalItems";

/// The unit of lengths whose recording tells none: no other converts into it, and rates of them are "units/s".
inline constexpr std::string_view LengthWithoutUnit = "units";

/// How the unit of a channel falls on its components.
enum class EUnitUse
{
    AllComponents,
    PositionOfPose ///< the first three components are angles in radians, the unit is that of the others
};

/// One type of source channels. First and Second of an id: subject and marker, subject and segment, device and output,
/// the camera and 0, the monitor and 0; for the types without a number of two parts the index, and the name in Text. A
/// context has at most one channel of a global type.
struct ChannelType
{
    std::string_view Name;
    std::optional<Recordings::EChannelKind> RecordedKind; ///< nothing: no recording has it
    TQL::ESelectionKind Kind;
    std::string_view DisplayName;
    std::string_view Category;
    std::string_view FormatName;
    std::string_view ComponentNames; ///< separated by commas; empty: each channel has its own
    EUnitUse UnitUse;
    bool bSupportMagnitude;
    std::uint64_t Flags; ///< what the mask of a listing leaves out
};

/// All types, in the order in which they are listed.
std::span<const ChannelType> GetChannelTypeTable();
const ChannelType* FindChannelType(std::string_view i_Name);
const ChannelType& ChannelTypeOf(Recordings::EChannelKind i_Kind);

/// What makes one source channel; its data context is that of the context that it is added to.
struct ChannelDefinition
{
    std::string TypeName;
    std::uint64_t First = 0;
    std::uint64_t Second = 0;
    std::string Text;
    std::string Name;                        ///< as shown to the operator
    std::string Units;                       ///< "mm"; empty for none
    std::vector<std::string> ComponentNames; ///< empty: those of the type
    std::string RotationOrder = {};          ///< of joint angles, as far as it is known: "ZXY"
    std::string TypeText = {};               ///< shown in place of the display name of the type, unless it is empty
    bool bCountsRows = false;                ///< says when or which row, and is the last that anybody wants to see
};

/// Component names of a definition: its own, or those of its type.
std::vector<std::string> ComponentNamesOf(const ChannelDefinition& i_rDefinition);

TQL::ComponentDescription DescribeComponents(const ChannelDefinition& i_rDefinition, VSubTypeTable& i_rSubTypes);

/// What the operator selects to see a channel; nothing for an id of a type that is not in the table or global.
std::optional<TQL::SelectionItem> SelectionOfChannel(const TQL::IChannelInstanceId& i_rId);

/// The channel of a type that belongs to a selected thing; nothing when the type is not about things of that kind. That
/// of a monitor is global, whatever the context.
std::optional<TQL::IChannelInstanceId> ChannelOfSelection(const TQL::SelectionItem& i_rItem, std::string_view i_Context,
                                                          std::string_view i_Type);

} // namespace Channels

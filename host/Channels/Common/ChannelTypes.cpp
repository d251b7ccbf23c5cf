#include "Channels/Common/ChannelTypes.h"

#include "Channels/Common/VSubTypeTable.h"

#include <algorithm>
#include <array>

namespace Channels
{

namespace
{

using Recordings::EChannelKind;
using TQL::ESelectionKind;

// One type for each kind of thing that is selected: with two, what is selected would not tell which of them to plot.
constexpr std::array<ChannelType, 7> Types{{
    {LabelledReconstructionType, EChannelKind::Marker, ESelectionKind::Label, "Position", "Markers", "Position",
     "TX,TY,TZ", EUnitUse::AllComponents, true, 0},
    {SegmentPoseType, EChannelKind::SegmentPose, ESelectionKind::Segment, "Pose", "Segments", "Pose",
     "RX,RY,RZ,TX,TY,TZ", EUnitUse::PositionOfPose, false, 0},
    {DeviceOutputType, EChannelKind::Analog, ESelectionKind::AnalogueDeviceOutput, "Device Output", "Device Outputs",
     "", "", EUnitUse::AllComponents, false, 0},
    {ModelOutputType, EChannelKind::Column, ESelectionKind::ModelOutput, "Model Output", "Model Outputs", "", "",
     EUnitUse::AllComponents, false, 0},
    {CameraPoseType, std::nullopt, ESelectionKind::Camera, "Camera Pose", "Cameras", "Pose", "RX,RY,RZ,TX,TY,TZ",
     EUnitUse::PositionOfPose, false, 0},
    {MonitorType, std::nullopt, ESelectionKind::Monitor, "Monitor", "Monitors", "", "", EUnitUse::AllComponents, false,
     0},
    {SampleCountType, std::nullopt, ESelectionKind::Global, "Sample Count", "Capture", "", "", EUnitUse::AllComponents,
     false, 0},
}};

std::vector<std::string> SplitNames(std::string_view i_Names)
{
    std::vector<std::string> names;
    while (!i_Names.empty())
    {
        const std::size_t comma = std::min(i_Names.find(','), i_Names.size());
        names.emplace_back(i_Names.substr(0, comma));
        i_Names.remove_prefix(std::min(comma + 1, i_Names.size()));
    }
    return names;
}

bool IsAngle(const TQL::ComponentGroup& i_rGroup)
{
    return std::ranges::any_of(
        i_rGroup.Factors, [](const TQL::UnitFactor& i_rFactor)
        { return i_rFactor.SubTypeId == VSubTypeTable::Radian || i_rFactor.SubTypeId == VSubTypeTable::Degree; });
}

} // namespace

std::span<const ChannelType> GetChannelTypeTable()
{
    return Types;
}

const ChannelType* FindChannelType(std::string_view i_Name)
{
    const auto type = std::ranges::find(Types, i_Name, &ChannelType::Name);
    return type == Types.end() ? nullptr : &*type;
}

const ChannelType& ChannelTypeOf(Recordings::EChannelKind i_Kind)
{
    const bool bModel = i_Kind == EChannelKind::JointAngles || i_Kind == EChannelKind::ModelOutput;
    const EChannelKind kind = bModel ? EChannelKind::Column : i_Kind;
    const auto type = std::ranges::find(Types, kind, &ChannelType::RecordedKind);
    return type == Types.end() ? Types.front() : *type; // every kind has one
}

std::vector<std::string> ComponentNamesOf(const ChannelDefinition& i_rDefinition)
{
    const ChannelType* pType = FindChannelType(i_rDefinition.TypeName);
    std::vector<std::string> names = SplitNames(pType ? pType->ComponentNames : std::string_view());
    const std::size_t own = i_rDefinition.ComponentNames.size();
    if (own != 0 && own != names.size())
        return i_rDefinition.ComponentNames;
    return names.empty() ? std::vector<std::string>{""} : names;
}

TQL::ComponentDescription DescribeComponents(const ChannelDefinition& i_rDefinition, VSubTypeTable& i_rSubTypes)
{
    TQL::ComponentDescription description;
    const std::size_t count = ComponentNamesOf(i_rDefinition).size();
    const ChannelType* pType = FindChannelType(i_rDefinition.TypeName);
    const bool bPose = pType && pType->UnitUse == EUnitUse::PositionOfPose && count == 6;
    TQL::ComponentGroup group;
    const bool bLength = pType && !pType->FormatName.empty();
    const std::string_view units = i_rDefinition.Units.empty() && bLength ? LengthWithoutUnit : i_rDefinition.Units;
    if (!units.empty())
        group.Factors.push_back({i_rSubTypes.IdOfUnit(units), boost::rational<std::int8_t>(1)});
    description.Groups.assign(count, group);
    for (std::size_t i = 0; bPose && i < 3; ++i)
        description.Groups[i].Factors = {{VSubTypeTable::Radian, boost::rational<std::int8_t>(1)}};
    if (!pType || (pType->FormatName == "Pose" && !bPose) || (pType->FormatName == "Position" && count != 3))
        return description;
    description.FormatName = pType->FormatName;
    if (i_rDefinition.RotationOrder.size() == 3 && count == 3 && IsAngle(group))
        description.FormatName = "Euler" + i_rDefinition.RotationOrder;
    return description;
}

std::optional<TQL::SelectionItem> SelectionOfChannel(const TQL::IChannelInstanceId& i_rId)
{
    const ChannelType* pType = FindChannelType(i_rId.TypeName);
    if (!pType || pType->Kind == ESelectionKind::Global)
        return std::nullopt;
    return TQL::SelectionItem{pType->Kind, i_rId.First, i_rId.Second, i_rId.Text};
}

std::optional<TQL::IChannelInstanceId> ChannelOfSelection(const TQL::SelectionItem& i_rItem, std::string_view i_Context,
                                                          std::string_view i_Type)
{
    const ChannelType* pType = FindChannelType(i_Type);
    if (!pType || pType->Kind != i_rItem.Kind || pType->Kind == ESelectionKind::Global)
        return std::nullopt;
    const std::string_view context = pType->Kind == ESelectionKind::Monitor ? GlobalContextName : i_Context;
    return TQL::IChannelInstanceId{std::string(context), std::string(i_Type), i_rItem.First, i_rItem.Second,
                                   i_rItem.Text};
}

} // namespace Channels

#include "Services/Selection/CreatableChannelTypes.h"

#include "ChannelSystemUtils/ChannelParameterNames.h"
#include "ChannelSystemUtils/DerivedRecords.h"
#include "ChannelSystemUtils/RelativeMeasurements.h"
#include "Channels/Common/ChannelTypes.h"

#include <algorithm>
#include <array>
#include <utility>

namespace Services
{

namespace
{

using ChannelSystem::VDerivedChannelParameters;
using ChannelSystemUtils::RelativeMeasurement;

const std::set<std::string> PoseTypes{std::string(Channels::SegmentPoseType), "SubjectSegmentPoseSolve",
                                      "SubjectSegmentPoseRetarget"};

/// What is known of a measurement beside its record.
struct MeasurementTraits
{
    std::string_view Name;
    bool bOfPositions;      ///< markers will do
    bool bSupportMagnitude; ///< a vector, or a rotation, with nothing beside it
    bool bReference;        ///< the first input is what the second is measured against
};

constexpr std::array<MeasurementTraits, 6> Traits{{
    {"_DistanceBetween", true, false, false},
    {"_DifferenceBetween", true, true, true},
    {"_AngleBetween", true, false, false},
    {"_RelativePosition", false, true, true},
    {"_RelativeRotation", false, true, true},
    {"_RelativePose", false, false, true},
}};

/// The first input of a measurement is often a pose, of which there is no magnitude; the measurement has its own say.
void SetMagnitude(VDerivedChannelParameters& io_rRecord, bool i_bSupported)
{
    io_rRecord.TypeParameters.emplace_back(ChannelSystemUtils::ParameterName::SupportMagnitude, i_bSupported);
}

/// "Pelvis (reference) ➞ Head": the names say which of the two is which.
void NameReference(VDerivedChannelParameters& io_rRecord)
{
    namespace Names = ChannelSystemUtils::ParameterName;
    for (auto& [rName, rValue] : io_rRecord.InstanceParameters)
        if (rName == Names::InstanceDisplayName)
            rValue = std::string("%1% (reference) \u279E %2%");
    io_rRecord.Hash =
        ChannelSystemUtils::HashDerivation(io_rRecord, ChannelSystemUtils::ParameterGroup::AlgebraicOperation);
}

CreatableChannelType MakePositionAndRotation()
{
    CreatableChannelType type;
    type.Name = ChannelSystemUtils::PositionAndRotationType;
    type.DisplayName = "Position and Rotation";
    type.ComponentNames = "RX,RY,RZ,TX,TY,TZ";
    type.Category = "Segments";
    type.InputTypes = PoseTypes;
    return type;
}

CreatableChannelType MakeCameraPosition()
{
    CreatableChannelType type;
    type.Name = ChannelSystemUtils::CameraPositionType;
    type.DisplayName = "Camera Position";
    type.ComponentNames = "TX,TY,TZ";
    type.Category = "Cameras";
    type.InputTypes = {std::string(Channels::CameraPoseType)};
    type.bSupportMagnitude = true;
    type.Selection = TQL::ESelectionKind::Camera;
    type.Record = ChannelSystemUtils::GetPositionRecord();
    SetMagnitude(*type.Record, true);
    return type;
}

CreatableChannelType MakeMeasurement(const RelativeMeasurement& i_rMeasurement)
{
    CreatableChannelType type;
    type.Name = i_rMeasurement.InternalName;
    type.DisplayName = i_rMeasurement.TypeDisplayName;
    type.ComponentNames = i_rMeasurement.ComponentNames;
    type.Category = i_rMeasurement.Category;
    type.InputCount = i_rMeasurement.InputCount;
    type.InputTypes = PoseTypes;
    const auto traits = std::ranges::find(Traits, i_rMeasurement.InternalName, &MeasurementTraits::Name);
    if (traits != Traits.end() && traits->bOfPositions)
        type.InputTypes.emplace(Channels::LabelledReconstructionType);
    type.bSupportMagnitude = traits != Traits.end() && traits->bSupportMagnitude;
    type.Record = ChannelSystemUtils::MakeDerivedRecord(i_rMeasurement);
    SetMagnitude(*type.Record, type.bSupportMagnitude);
    if (traits != Traits.end() && traits->bReference)
        NameReference(*type.Record);
    return type;
}

} // namespace

std::vector<CreatableChannelType> MakeCreatableChannelTypes()
{
    std::vector<CreatableChannelType> types{MakePositionAndRotation(), MakeCameraPosition()};
    for (const RelativeMeasurement& rMeasurement : ChannelSystemUtils::GetRelativeMeasurements())
        types.push_back(MakeMeasurement(rMeasurement));
    return types;
}

} // namespace Services

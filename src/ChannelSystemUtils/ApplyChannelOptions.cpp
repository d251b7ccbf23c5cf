#include "ChannelSystemUtils/ApplyChannelOptions.h"

#include "ChannelSystem/IChannel.h"
#include "ChannelSystem/IChannelService.h"
#include "ChannelSystemUtils/ChannelParameterAccess.h"
#include "ChannelSystemUtils/ChannelParameterNames.h"
#include "ChannelSystemUtils/DerivedRecords.h"

#include <utility>

namespace ChannelSystemUtils
{
namespace
{

using OutputPointer = std::shared_ptr<TQL::IChannelOutput>;

constexpr std::string_view s_PositionFormat = "Position";
constexpr std::string_view s_PoseFormat = "Pose";

/// Replaces the output by that of a channel derived from i_rpSource; false, and leaves it, when the host makes none.
bool Derive(ChannelSystem::IChannelService& i_rService, std::string_view i_Operation,
            const ChannelSystem::VDerivedChannelParameters& i_rRecord, const OutputPointer& i_rpSource,
            OutputPointer& io_rpOutput)
{
    auto pInput = i_rpSource->GetChannel();
    if (!pInput)
        return false;
    const auto pChannel = i_rService.CreateDerivedChannel(i_Operation, i_rRecord, {std::move(pInput)});
    auto pOutput = pChannel ? pChannel->GetOutput() : nullptr;
    if (!pOutput)
        return false;
    io_rpOutput = std::move(pOutput);
    return true;
}

void ApplyRotationFormat(ChannelSystem::IChannelService& i_rService, const OutputPointer& i_rpSource,
                         std::int32_t i_RotationFormat, OutputPointer& io_rpOutput)
{
    const std::string format = i_rpSource->GetDescription().FormatName;
    if (format == s_PositionFormat)
        return;
    const auto& rRecord =
        format == s_PoseFormat ? GetPoseRecord(i_RotationFormat) : GetRotationRecord(i_RotationFormat);
    (void)Derive(i_rService, OperationName::AlgebraicExpression, rRecord, i_rpSource, io_rpOutput);
}

/// False when there is something to convert and the host cannot.
bool Convert(ChannelSystem::IChannelService& i_rService, const Conversion& i_rConversion, OutputPointer& io_rpOutput)
{
    const auto record = ComposeConversionRecord(i_rConversion);
    const OutputPointer pUnconverted = io_rpOutput;
    return record.Hash == 0 ||
           Derive(i_rService, OperationName::AlgebraicExpression, record, pUnconverted, io_rpOutput);
}

/// Looks for an angle and for a length among the used components; a channel whose units are not scaled has neither.
void FindDimensions(const ChannelSystem::IChannelService& i_rService, const TQL::ComponentDescription& i_rDescription,
                    Conversion& io_rConversion)
{
    for (const TQL::ComponentGroup& rGroup : i_rDescription.Groups)
    {
        for (const TQL::UnitFactor& rFactor : rGroup.Factors)
        {
            if (i_rDescription.bUnitScalingOff || (io_rConversion.bAngleSeen && io_rConversion.bLengthSeen))
                return;
            TQL::SubTypeRecord record;
            if (!rGroup.bUsed || i_rService.GetSubTypeTable(rFactor.SubTypeId, record).IsError())
                continue;
            io_rConversion.bAngleSeen |= record.Dimension == TQL::SubTypeRecord::DimensionAngle;
            io_rConversion.bLengthSeen |= record.Dimension == TQL::SubTypeRecord::DimensionLength;
        }
    }
}

bool SupportsMagnitude(const TQL::IChannelOutput& i_rOutput)
{
    const auto pChannel = i_rOutput.GetChannel();
    const auto pParameters = pChannel ? pChannel->GetParameters() : nullptr;
    return !pParameters || ReadBoolParameter(*pParameters, ParameterName::SupportMagnitude).value_or(true);
}

} // namespace

TQL::IResult ApplyChannelOptions(ChannelSystem::IChannelService& i_rService, const OutputPointer& i_rpSource,
                                 const VActiveChannelOptions& i_rOptions, OutputPointer& o_rpOutput)
{
    if (!i_rpSource)
        return TQL::Result::InvalidArgument;
    OutputPointer pOutput = i_rpSource;
    if (i_rOptions.DerivativeOrder == 0)
        ApplyRotationFormat(i_rService, i_rpSource, i_rOptions.RotationFormat, pOutput);
    else if (i_rOptions.DerivativeOrder > 0)
        (void)Derive(i_rService, OperationName::Derivative,
                     GetDerivativeRecord(i_rOptions.DerivativeOrder, i_rOptions.DifferentiateByFrame), i_rpSource,
                     pOutput);

    const TQL::ComponentDescription description = pOutput->GetDescription();
    Conversion conversion;
    conversion.bRotationLike = description.FormatName != s_PoseFormat && description.FormatName != s_PositionFormat;
    FindDimensions(i_rService, description, conversion);
    const bool bAngleFound = std::exchange(conversion.bAngleSeen, conversion.bAngleSeen || conversion.bRotationLike);
    conversion.bMagnitude = i_rOptions.bPlotMagnitude && SupportsMagnitude(*pOutput);
    conversion.RotationUnitName = i_rOptions.RotationUnitName;
    conversion.LengthUnitName = i_rOptions.LengthUnitName;
    conversion.LengthPrefix = i_rOptions.LengthPrefix;
    if (!Convert(i_rService, conversion, pOutput) && conversion.bAngleSeen && !bAngleFound)
    {
        // A distance looks like a rotation until it is found to hold no angle; its length is converted all the same.
        conversion.bAngleSeen = false;
        (void)Convert(i_rService, conversion, pOutput);
    }
    o_rpOutput = std::move(pOutput);
    return TQL::Result::Ok;
}

} // namespace ChannelSystemUtils

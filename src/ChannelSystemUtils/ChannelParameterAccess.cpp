#include "ChannelSystemUtils/ChannelParameterAccess.h"

#include "ChannelSystem/IChannel.h"
#include "ChannelSystemUtils/ChannelParameterNames.h"
#include "TQL/Log.h"

#include <algorithm>
#include <iterator>

namespace ChannelSystemUtils
{
namespace
{

template <typename T>
std::optional<T> ReadParameter(const TQL::IChannelParameters& i_rParameters, std::string_view i_Name)
{
    TQL::ParameterValue value;
    if (i_rParameters.Read("", i_Name, value).IsError() || !std::holds_alternative<T>(value))
        return std::nullopt;
    return std::get<T>(std::move(value));
}

/// By the numbers of TQL::ESelectionKind.
constexpr std::string_view s_SelectionNames[] = {"None",
                                                 "Global",
                                                 "Camera",
                                                 "Net",
                                                 "AnalogueDeviceOutput",
                                                 "Device",
                                                 "Subject",
                                                 "Label",
                                                 "ReconstructionTrack",
                                                 "CentroidTrack",
                                                 "Segment",
                                                 "SegmentSolve",
                                                 "SegmentRetarget",
                                                 "Joint",
                                                 "Monitor",
                                                 "ModelOutput"};

/// The number of a kind, or one outside the table.
std::int64_t NumberOfSelection(const TQL::ParameterValue& i_rValue)
{
    if (const auto* pNumber = std::get_if<std::int32_t>(&i_rValue))
        return *pNumber;
    if (const auto* pNumber = std::get_if<std::int64_t>(&i_rValue))
        return *pNumber;
    const auto* pName = std::get_if<std::string>(&i_rValue);
    return pName ? std::ranges::find(s_SelectionNames, *pName) - std::begin(s_SelectionNames) : -1;
}

} // namespace

std::optional<std::string> ReadTextParameter(const TQL::IChannelParameters& i_rParameters, std::string_view i_Name)
{
    return ReadParameter<std::string>(i_rParameters, i_Name);
}

std::optional<bool> ReadBoolParameter(const TQL::IChannelParameters& i_rParameters, std::string_view i_Name)
{
    return ReadParameter<bool>(i_rParameters, i_Name);
}

TQL::IResult ReadSelectionParameter(const TQL::IChannelParameters& i_rParameters, TQL::ESelectionKind& o_rKind)
{
    o_rKind = TQL::ESelectionKind::None;
    TQL::ParameterValue value;
    if (const TQL::IResult result = i_rParameters.Read("", ParameterName::Selection, value); result.IsError())
        return result;
    const std::int64_t number = NumberOfSelection(value);
    if (number < 0 || number >= std::ssize(s_SelectionNames))
    {
        TQL::Log::Format(TQL::Log::GetCategory("GraphPlot"), TQL::ELogSeverity::Error,
                         "Failed to interpret default value as expected type.");
        return TQL::Result::InvalidType;
    }
    o_rKind = static_cast<TQL::ESelectionKind>(number);
    return TQL::Result::Ok;
}

} // namespace ChannelSystemUtils

#pragma once

#include <span>
#include <string_view>

/// The vocabulary of channel parameters: the groups, the names in them, and how each is described where it is stored.
namespace ChannelSystemUtils
{

namespace ParameterGroup
{
inline constexpr std::string_view Type = "ChannelTypeParameters";
inline constexpr std::string_view Instance = "ChannelInstanceParameters";
inline constexpr std::string_view AlgebraicOperation = "AlgebraicOperationParams";
inline constexpr std::string_view Derivative = "ChannelDerivativeParams";
} // namespace ParameterGroup

namespace ParameterName
{
inline constexpr std::string_view TypeDisplayName = "TypeDisplayName";
inline constexpr std::string_view ComponentDisplayNames = "ComponentDisplayNames";
inline constexpr std::string_view CategoryDisplayName = "CategoryDisplayName";
inline constexpr std::string_view SupportMagnitude = "SupportMagnitude";
inline constexpr std::string_view Selection = "Selection";
inline constexpr std::string_view InstanceDisplayName = "InstanceDisplayName";
inline constexpr std::string_view ErrorData = "ErrorData";
inline constexpr std::string_view Expression = "Expression";
inline constexpr std::string_view EvaluationFormat = "EvaluationFormat";
inline constexpr std::string_view EvaluationStorage = "EvaluationStorage";
inline constexpr std::string_view Mode = "Mode";
inline constexpr std::string_view Order = "Order";
inline constexpr std::string_view WithRespectTo = "WithRespectTo";
} // namespace ParameterName

namespace OperationName
{
inline constexpr std::string_view AlgebraicExpression = "AlgebraicExpression";
inline constexpr std::string_view Derivative = "Derivative";
} // namespace OperationName

enum class EParameterType
{
    String, ///< std::string
    Bool,
    Int32,
    Selection ///< TQL::ESelectionKind, held as std::int32_t
};

/// One parameter of the vocabulary. The texts of the last three are those that a store keeps; empty for none.
struct ChannelParameterInfo
{
    std::string_view Group;
    std::string_view Name;
    EParameterType Type;
    std::string_view StoreGroupLabel;
    std::string_view Label;
    std::string_view Description;
};

/// All parameters, group after group.
std::span<const ChannelParameterInfo> GetChannelParameterTable();

} // namespace ChannelSystemUtils

#include "ChannelSystemUtils/ChannelParameterNames.h"

namespace ChannelSystemUtils
{
namespace
{

constexpr ChannelParameterInfo s_Parameters[] = {
    {ParameterGroup::Type, ParameterName::TypeDisplayName, EParameterType::String, "General", "Type Name", ""},
    {ParameterGroup::Type, ParameterName::ComponentDisplayNames, EParameterType::String, "General", "Component Names",
     ""},
    {ParameterGroup::Type, ParameterName::CategoryDisplayName, EParameterType::String, "General", "Category Name", ""},
    {ParameterGroup::Type, ParameterName::SupportMagnitude, EParameterType::Bool, "General", "Support Magnitude", ""},
    {ParameterGroup::Type, ParameterName::Selection, EParameterType::Selection, "General", "Selection Type",
     "What kind of selection (if any) is supported by this channel type Overriding this via an initializer on a "
     "creatable channel has NO effect it's only checked when first adding the channel type via a channel specifier"},
    {ParameterGroup::Instance, ParameterName::InstanceDisplayName, EParameterType::String, "General", "Instance Name",
     ""},
    {ParameterGroup::Instance, ParameterName::ErrorData, EParameterType::String, "General", "Data Error", ""},
    {ParameterGroup::AlgebraicOperation, ParameterName::Expression, EParameterType::String, "", "", ""},
    {ParameterGroup::AlgebraicOperation, ParameterName::EvaluationFormat, EParameterType::String, "", "", ""},
    {ParameterGroup::AlgebraicOperation, ParameterName::EvaluationStorage, EParameterType::String, "", "", ""},
    {ParameterGroup::Derivative, ParameterName::Mode, EParameterType::Int32, "", "", ""},
    {ParameterGroup::Derivative, ParameterName::Order, EParameterType::Int32, "", "", ""},
    {ParameterGroup::Derivative, ParameterName::WithRespectTo, EParameterType::Int32, "", "", ""},
};

} // namespace

std::span<const ChannelParameterInfo> GetChannelParameterTable()
{
    return s_Parameters;
}

} // namespace ChannelSystemUtils

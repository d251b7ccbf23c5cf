#include "ChannelSystemUtils/ChannelNames.h"

#include "ChannelSystem/IChannel.h"
#include "ChannelSystemUtils/ChannelParameterAccess.h"
#include "ChannelSystemUtils/ChannelParameterNames.h"

#include <boost/regex.hpp>

namespace ChannelSystemUtils
{
namespace
{

struct Renaming
{
    boost::regex Expression;
    const char* pReplacement;
};

/// In the order in which they are applied, which matters: a later row sees what an earlier one wrote. None is anchored,
/// so "Velocity (Magnitude)" within "Angular Velocity (Magnitude)" is renamed too.
const std::vector<Renaming>& GetRenamings()
{
    static const std::vector<Renaming> s_Renamings = {
        {boost::regex("Position 1st Derivative"), "Velocity"},
        {boost::regex("Position 2nd Derivative"), "Acceleration"},
        {boost::regex("Difference Between 1st Derivative"), "Velocity Between"},
        {boost::regex("Difference Between 2nd Derivative"), "Acceleration Between"},
        {boost::regex("Rotation 1st Derivative"), "Angular Velocity"},
        {boost::regex("Rotation 2nd Derivative"), "Angular Acceleration"},
        {boost::regex("Angle 1st Derivative"), "Angular Velocity"},
        {boost::regex("Angle 2nd Derivative"), "Angular Acceleration"},
        {boost::regex("Angle Between 1st Derivative"), "Angular Velocity Between"},
        {boost::regex("Angle Between 2nd Derivative"), "Angular Acceleration Between"},
        {boost::regex("Position \\(Magnitude\\)"), "Distance From Origin"},
        {boost::regex("Relative Position \\(Magnitude\\)"), "Relative Distance"},
        {boost::regex("Relative Rotation \\(Magnitude\\)"), "Relative Angle"},
        {boost::regex("Velocity \\(Magnitude\\)"), "Speed"},
        {boost::regex("Angular Velocity \\(Magnitude\\)"), "Angular Speed"},
        {boost::regex("Difference Between \\(Magnitude\\)"), "Distance Between"},
    };
    return s_Renamings;
}

} // namespace

std::string RenameType(std::string_view i_TypeName)
{
    std::string name(i_TypeName);
    for (const Renaming& rRenaming : GetRenamings())
        name = boost::regex_replace(name, rRenaming.Expression, rRenaming.pReplacement);
    return name;
}

std::string JoinTypeAndInstance(std::string_view i_TypeName, std::string_view i_InstanceName)
{
    std::string name(i_TypeName);
    if (!i_InstanceName.empty() && !i_InstanceName.starts_with(' '))
        name += " - ";
    return name.append(i_InstanceName);
}

ChannelNames ComposeChannelNames(const TQL::IChannel& i_rChannel)
{
    const auto pParameters = i_rChannel.GetParameters();
    const auto type = ReadTextParameter(*pParameters, ParameterName::TypeDisplayName);
    const auto instance = ReadTextParameter(*pParameters, ParameterName::InstanceDisplayName);
    ChannelNames names;
    names.TypeName = RenameType(type && !type->empty() ? *type : i_rChannel.GetInstanceId().TypeName);
    names.DisplayName = JoinTypeAndInstance(names.TypeName, instance.value_or(std::string()));
    return names;
}

std::vector<std::string> SplitComponentNames(std::string_view i_Names)
{
    std::vector<std::string> names;
    if (i_Names.empty())
        return names;
    for (std::size_t begin = 0;;)
    {
        const std::size_t comma = i_Names.find(',', begin);
        names.emplace_back(i_Names.substr(begin, comma - begin));
        if (comma == std::string_view::npos)
            return names;
        begin = comma + 1;
    }
}

TQL::IResult GetComponentName(std::string_view i_Names, std::size_t i_Index, std::string& o_rName)
{
    std::vector<std::string> names = SplitComponentNames(i_Names);
    const bool bFound = i_Index < names.size();
    o_rName = bFound ? std::move(names[i_Index]) : std::string();
    return bFound ? TQL::Result::Ok : TQL::Result::InvalidIndex;
}

} // namespace ChannelSystemUtils

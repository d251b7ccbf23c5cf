#include "GraphPlotSystem/ContextSwitchRules.h"

#include "ChannelSystem/IChannel.h"

#include <unordered_set>
#include <vector>

namespace GraphPlotUI
{
namespace
{

constexpr std::string_view s_GlobalItems = "GlobalItems";

} // namespace

std::string FindDataContext(const std::shared_ptr<TQL::IChannel>& i_rpChannel)
{
    std::vector<std::shared_ptr<TQL::IChannel>> open{i_rpChannel};
    std::unordered_set<const TQL::IChannel*> seen; // channels may share what they are made from
    while (!open.empty())
    {
        const std::shared_ptr<TQL::IChannel> pChannel = std::move(open.back());
        open.pop_back();
        if (!pChannel || !seen.insert(pChannel.get()).second)
            continue;
        if (!pChannel->GetInstanceId().DataContextName.empty())
            return pChannel->GetInstanceId().DataContextName;
        std::vector<std::shared_ptr<TQL::IChannel>> dependents;
        pChannel->GetDependentChannels(dependents);
        open.insert(open.end(), dependents.rbegin(), dependents.rend());
    }
    return {};
}

bool IsSpecialContext(std::string_view i_Name)
{
    return i_Name.starts_with('#') || i_Name.starts_with('*');
}

EContextSwitchFate DecideContextSwitch(const std::string& i_rContext, const std::string& i_rNewContext,
                                       const std::set<std::string>& i_rPresentContexts)
{
    const bool bPresent = i_rPresentContexts.contains(i_rContext);
    if (i_rContext == s_GlobalItems || (IsSpecialContext(i_rContext) && IsSpecialContext(i_rNewContext) && !bPresent))
        return EContextSwitchFate::Migrate;
    return i_rContext == i_rNewContext || bPresent ? EContextSwitchFate::Stay : EContextSwitchFate::Leave;
}

} // namespace GraphPlotUI

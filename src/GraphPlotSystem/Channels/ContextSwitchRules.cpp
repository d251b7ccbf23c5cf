#include "GraphPlotSystem/Channels/ContextSwitchRules.h"

#include "ChannelSystemUtils/WalkChannels.h"

namespace GraphPlotUI
{
namespace
{

constexpr std::string_view s_GlobalItems = "GlobalItems";

} // namespace

std::string FindDataContext(const std::shared_ptr<TQL::IChannel>& i_rpChannel)
{
    std::string context;
    ChannelSystemUtils::VisitChannels(i_rpChannel,
                                      [&context](const TQL::IChannel& i_rChannel)
                                      {
                                          context = i_rChannel.GetInstanceId().DataContextName;
                                          return !context.empty();
                                      });
    return context;
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

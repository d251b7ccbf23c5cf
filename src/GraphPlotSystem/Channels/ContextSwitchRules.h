#pragma once

#include <memory>
#include <set>
#include <string>
#include <string_view>

namespace TQL
{
class IChannel;
}

namespace GraphPlotUI
{

/// What becomes of a plotted channel when the plot goes to another data context.
enum class EContextSwitchFate
{
    Stay,
    Migrate, ///< what stands for the channel in the new context takes its place
    Leave
};

/// The context of a channel: its own, or the first that one of the channels it is made from belongs to, depth first;
/// empty when none does.
std::string FindDataContext(const std::shared_ptr<TQL::IChannel>& i_rpChannel);

/// Whether it is a context whose things have counterparts in the other ones of its sort.
bool IsSpecialContext(std::string_view i_Name);

/// i_rPresentContexts: the contexts that exist now.
EContextSwitchFate DecideContextSwitch(const std::string& i_rContext, const std::string& i_rNewContext,
                                       const std::set<std::string>& i_rPresentContexts);

} // namespace GraphPlotUI

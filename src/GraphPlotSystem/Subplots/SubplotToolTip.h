#pragma once

#include <QtCore/QString>

#include <span>

namespace TQL
{
class IChannelTextProvider;
class ITraceId;
} // namespace TQL

namespace GraphPlotUI
{

/// What the tool tip of a subplot tells, as rich text: channels with their components, units, and with
/// i_bShowDataContexts the data contexts. Each list is sorted by character code.
QString SubplotToolTip(std::span<const TQL::ITraceId> i_Traces, const TQL::IChannelTextProvider& i_rTexts,
                       bool i_bShowDataContexts);

} // namespace GraphPlotUI

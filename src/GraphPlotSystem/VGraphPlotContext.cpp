#include "GraphPlotSystem/VGraphPlotContext.h"

#include "GraphPlotSystem/Traces/ITraceDataProvider.h"

#include <utility>

namespace GraphPlotUI
{

VGraphPlotContext::VGraphPlotContext(std::shared_ptr<CoreGraphics::Resources> i_pResources,
                                     std::shared_ptr<TQL::ITraceDataProvider> i_pTraceDataProvider, QObject* i_pParent)
    : QObject(i_pParent), m_pResources(std::move(i_pResources)), m_pTraceDataProvider(std::move(i_pTraceDataProvider))
{
}

VGraphPlotContext::~VGraphPlotContext() = default;

} // namespace GraphPlotUI

#include "GraphPlotSystem/VGraphPlotSystem.h"

#include <utility>

namespace GraphPlotUI
{

VGraphPlotSystem::VGraphPlotSystem(std::shared_ptr<VGraphPlotContext> i_pContext,
                                   std::shared_ptr<VTraceManager> i_pTraceManager,
                                   std::shared_ptr<VBaseGraphPlotTime> i_pPlotTime)
    : m_pContext(std::move(i_pContext))
    , m_pTraceManager(std::move(i_pTraceManager))
    , m_pPlotTime(std::move(i_pPlotTime))
{
}

VGraphPlotSystem::~VGraphPlotSystem() = default;

void VGraphPlotSystem::BuildState(GraphPlotState& o_rState)
{
    o_rState = GraphPlotState();
    m_pTraceManager->BuildState(o_rState.Trace);
}

void VGraphPlotSystem::ApplyState(TQL::IResult& o_rResult, const GraphPlotState& i_rState)
{
    m_pTraceManager->ApplyState(o_rResult, i_rState.Trace);
}

void VGraphPlotSystem::SetContext(const std::string& i_rName)
{
    m_pTraceManager->SetContext(i_rName);
    m_pPlotTime->SetActive(!i_rName.empty());
}

void VGraphPlotSystem::Reset()
{
    m_pTraceManager->Reset();
}

} // namespace GraphPlotUI

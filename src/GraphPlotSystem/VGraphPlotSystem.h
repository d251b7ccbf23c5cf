#pragma once

#include "GraphPlotSystem/GraphPlotState.h"
#include "GraphPlotSystem/Time/VBaseGraphPlotTime.h"
#include "GraphPlotSystem/Traces/VTraceManager.h"
#include "GraphPlotSystem/VGraphPlotContext.h"
#include "TQL/IResult.h"

#include <memory>
#include <string>

namespace GraphPlotUI
{

/// The trace side of one graph window: holds its context, trace manager and plot time, and is the door through which
/// its state is saved and restored. Owned by the window's content. UI thread.
class VGraphPlotSystem
{
public:
    VGraphPlotSystem(std::shared_ptr<VGraphPlotContext> i_pContext, std::shared_ptr<VTraceManager> i_pTraceManager,
                     std::shared_ptr<VBaseGraphPlotTime> i_pPlotTime);
    virtual ~VGraphPlotSystem();
    VGraphPlotSystem(const VGraphPlotSystem&) = delete;
    VGraphPlotSystem& operator=(const VGraphPlotSystem&) = delete;

    std::shared_ptr<VGraphPlotContext> GetContext() const { return m_pContext; }
    std::shared_ptr<VTraceManager> GetTraceManager() const { return m_pTraceManager; }
    std::shared_ptr<VBaseGraphPlotTime> GetPlotTime() const { return m_pPlotTime; }

    /// Starts from a default state, whatever o_rState held.
    virtual void BuildState(GraphPlotState& o_rState);
    virtual void ApplyState(TQL::IResult& o_rResult, const GraphPlotState& i_rState);

    /// The data context to plot; a name that no context bears yet is waited for, the empty name stops.
    virtual void SetContext(const std::string& i_rName);
    virtual void Reset();

private:
    std::shared_ptr<VGraphPlotContext> m_pContext;
    std::shared_ptr<VTraceManager> m_pTraceManager;
    std::shared_ptr<VBaseGraphPlotTime> m_pPlotTime;
};

} // namespace GraphPlotUI

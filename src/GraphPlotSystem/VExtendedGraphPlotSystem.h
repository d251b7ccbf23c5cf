#pragma once

#include "GraphPlotSystem/VGraphPlotSystem.h"
#include "TQL/VShared.h"

#include <QtCore/QPointer>

namespace TQL
{
class IChannelComponentControls;
class IPostalService;
} // namespace TQL

namespace GraphPlotUI
{

class VActiveChannelManager;
class VActiveChannelModel;
class VChannelComponentModel;
class VKeyModel;
class VSubplotManager;

/// What belongs to the channels and subplots of one window.
struct GraphPlotModels
{
    std::shared_ptr<VActiveChannelManager> pActiveChannelManager;
    std::shared_ptr<VSubplotManager> pSubplotManager;
    std::shared_ptr<TQL::IChannelComponentControls> pComponentControls;
    // Children of the graph plot context, with which they die.
    QPointer<VActiveChannelModel> pActiveChannelModel;
    QPointer<VChannelComponentModel> pComponentModel;
    QPointer<VKeyModel> pKeyModel;
};

/// The whole of one graph window: what VGraphPlotSystem holds, and all managers and models of channels and subplots.
/// Every change of the channels goes to the trace manager and the list of components from here. Made by
/// TQL::MakeShared, owned by the window's content. UI thread.
class VExtendedGraphPlotSystem : public VGraphPlotSystem, public TQL::VShared
{
public:
    VExtendedGraphPlotSystem(std::shared_ptr<VGraphPlotContext> i_pContext,
                             std::shared_ptr<VTraceManager> i_pTraceManager,
                             std::shared_ptr<VBaseGraphPlotTime> i_pPlotTime, GraphPlotModels i_Models,
                             std::shared_ptr<TQL::IPostalService> i_pUiPostalService);
    ~VExtendedGraphPlotSystem() override;

    std::shared_ptr<VActiveChannelManager> GetActiveChannelManager() const { return m_Models.pActiveChannelManager; }
    std::shared_ptr<VSubplotManager> GetSubplotManager() const { return m_Models.pSubplotManager; }
    VActiveChannelModel* GetActiveChannelModel() const;
    VChannelComponentModel* GetChannelComponentModel() const;
    VKeyModel* GetKeyModel() const;

    void BuildState(GraphPlotState& o_rState) override;
    /// All parts are applied, whatever the others give: see CombineStateResults.
    void ApplyState(TQL::IResult& o_rResult, const GraphPlotState& i_rState) override;

    void SetContext(const std::string& i_rName) override;
    void Reset() override;

protected:
    void OnPostCreation() override;

private:
    void OnChannelsChanged();

    const GraphPlotModels m_Models;
    const std::shared_ptr<TQL::IPostalService> m_pUiPostalService;
};

} // namespace GraphPlotUI

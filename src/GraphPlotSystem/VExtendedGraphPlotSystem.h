#pragma once

#include "GraphPlotSystem/VGraphPlotSystem.h"
#include "GraphPlotSystem/VPlainSubplotModel.h"
#include "GraphPlotSystem/VSelectedChannels.h"
#include "TQL/VShared.h"

#include <QtCore/QPointer>

namespace GraphPlotUI
{

/// The whole of one graph window: what VGraphPlotSystem holds, the channels to plot and the subplots that show them.
/// Every change of the channels goes to the trace manager from here. Made by TQL::MakeShared, owned by the window's
/// content. The models are children of the context and die with it. UI thread.
class VExtendedGraphPlotSystem : public VGraphPlotSystem, public TQL::VShared
{
public:
    VExtendedGraphPlotSystem(std::shared_ptr<VGraphPlotContext> i_pContext,
                             std::shared_ptr<VTraceManager> i_pTraceManager,
                             std::shared_ptr<VBaseGraphPlotTime> i_pPlotTime, VSelectedChannels* i_pSelectedChannels,
                             VPlainSubplotModel* i_pSubplotModel,
                             std::shared_ptr<TQL::IPostalService> i_pUiPostalService);

    VSelectedChannels* GetSelectedChannels() const { return m_pSelectedChannels; }
    VPlainSubplotModel* GetSubplotModel() const { return m_pSubplotModel; }

    void SetContext(const std::string& i_rName) override;
    void Reset() override;

protected:
    void OnPostCreation() override;

private:
    void OnChannelsChanged();

    const QPointer<VSelectedChannels> m_pSelectedChannels;
    const QPointer<VPlainSubplotModel> m_pSubplotModel;
    const std::shared_ptr<TQL::IPostalService> m_pUiPostalService;
};

} // namespace GraphPlotUI

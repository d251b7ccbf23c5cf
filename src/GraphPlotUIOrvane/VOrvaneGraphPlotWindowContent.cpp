#include "GraphPlotUIOrvane/VOrvaneGraphPlotWindowContent.h"

#include "GraphPlotSystem/VExtendedGraphPlotSystem.h"
#include "GraphPlotSystem/VViewFollower.h"
#include "GraphPlotUI/VGraphPlotWidget.h"
#include "GraphPlotUIOrvane/VOrvaneGraphPlotWindowContentFactory.h"
#include "OrvanePluginInterface/IHostUiServices.h"

#include <QtWidgets/QVBoxLayout>

namespace GraphPlotUI
{

VOrvaneGraphPlotWindowContent::VOrvaneGraphPlotWindowContent(
    QWidget* i_pFrame, const GraphPlotServices& i_rServices,
    std::shared_ptr<OrvanePluginInterface::ITimeController> i_pWindowContext,
    std::shared_ptr<VExtendedGraphPlotSystem> i_pSystem, const QString& i_rName)
    : VWindowFrameContent(i_pFrame, nullptr)
    , m_pSystem(std::move(i_pSystem))
    , m_pViewFollower(TQL::MakeShared<VViewFollower>(i_rServices.pUiPostalService, i_rServices.pChannelService,
                                                     std::move(i_pWindowContext), m_pSystem))
    , m_pWidget(new VGraphPlotWidget(m_pSystem, i_rServices.pEngineHost->GetEngine(), i_rServices.bChannelBrowser))
{
    setWindowTitle(i_rName);
    auto* pLayout = new QVBoxLayout(this);
    pLayout->setContentsMargins(0, 0, 0, 0);
    pLayout->setSpacing(0);
    pLayout->addWidget(m_pWidget);
}

VOrvaneGraphPlotWindowContent::~VOrvaneGraphPlotWindowContent()
{
    delete m_pWidget; // the scene first, then what it shows
}

} // namespace GraphPlotUI

#include "GraphPlotUI/VGraphPlotWidget.h"

#include "GraphPlotSystem/Channels/VActiveChannelManager.h"
#include "GraphPlotSystem/Channels/VActiveChannelModel.h"
#include "GraphPlotSystem/Subplots/VKeyModel.h"
#include "GraphPlotSystem/Subplots/VSubplotManager.h"
#include "GraphPlotSystem/Texts/VChannelComponentModel.h"
#include "GraphPlotSystem/VExtendedGraphPlotSystem.h"

namespace GraphPlotUI
{

VGraphPlotWidget::VGraphPlotWidget(std::shared_ptr<VExtendedGraphPlotSystem> i_pSystem, QQmlEngine* i_pEngine,
                                   bool i_bDeveloper, QWidget* i_pParent)
    : VQuickWidget(i_pEngine, i_pParent), m_pSystem(std::move(i_pSystem))
{
    SetContextProperties(i_bDeveloper);
    setResizeMode(QQuickWidget::SizeRootObjectToView);
    SetSource(QStringLiteral("Zarvo/GraphPlot/GraphPlotWidget.qml"), {});
}

VGraphPlotWidget::~VGraphPlotWidget()
{
    ClearSource(); // the scene dies while every context object is still alive
}

void VGraphPlotWidget::SetContextProperties(bool i_bDeveloper)
{
    const std::pair<const char*, QObject*> objects[] = {
        {"contextWidget", this},
        {"contextGraphPlot", m_pSystem->GetContext().get()},
        {"contextActiveChannelModel", m_pSystem->GetActiveChannelModel()},
        {"contextKeyModel", m_pSystem->GetKeyModel()},
        {"contextChannelComponentModel", m_pSystem->GetChannelComponentModel()},
        {"contextActiveChannelManager", m_pSystem->GetActiveChannelManager().get()},
        {"contextTraceManager", m_pSystem->GetTraceManager().get()},
        {"contextSubplotManager", m_pSystem->GetSubplotManager().get()},
        {"contextGraphPlotTime", m_pSystem->GetPlotTime().get()},
    };
    for (const auto& [pName, pObject] : objects)
        SetContextProperty(QString::fromLatin1(pName), pObject);
    for (const char* pName : {"contextChannelBrowserComponent", "contextChannelBrowser"})
        SetContextProperty(QString::fromLatin1(pName), QVariant());
    SetContextProperty(QStringLiteral("zarvoDeveloperMode"), QVariant(i_bDeveloper));
}

} // namespace GraphPlotUI

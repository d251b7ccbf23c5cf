#pragma once

#include "ZarvoQtQuick/VQuickWidget.h"

#include <memory>

namespace GraphPlotUI
{

class VExtendedGraphPlotSystem;

/// The Quick widget of one graph window: gives the window's models to its scene as context properties and loads it.
/// Child of the window's content; holds the system, so that the scene always dies before what it shows. UI thread.
class VGraphPlotWidget : public ZarvoQtQuick::VQuickWidget
{
    Q_OBJECT

public:
    /// i_bDeveloper is given to the scene as "zarvoDeveloperMode".
    VGraphPlotWidget(std::shared_ptr<VExtendedGraphPlotSystem> i_pSystem, QQmlEngine* i_pEngine, bool i_bDeveloper,
                     QWidget* i_pParent = nullptr);
    ~VGraphPlotWidget() override;

private:
    void SetContextProperties(bool i_bDeveloper);

    std::shared_ptr<VExtendedGraphPlotSystem> m_pSystem;
};

} // namespace GraphPlotUI

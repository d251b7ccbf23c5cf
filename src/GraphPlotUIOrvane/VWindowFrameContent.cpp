#include "GraphPlotUIOrvane/VWindowFrameContent.h"

#include "OrvanePluginInterface/IHostCoreServices.h"

namespace GraphPlotUI
{

VWindowFrameContent::VWindowFrameContent(QWidget* i_pFrame,
                                         std::shared_ptr<OrvanePluginInterface::IOpaqueService> i_pHostObject)
    : QWidget(i_pFrame), m_pHostObject(std::move(i_pHostObject))
{
    setSizePolicy(QSizePolicy::Expanding, QSizePolicy::Expanding);
}

VWindowFrameContent::~VWindowFrameContent() = default;

} // namespace GraphPlotUI

#pragma once

#include <QtWidgets/QWidget>

#include <memory>

namespace OrvanePluginInterface
{
class IOpaqueService;
}

namespace GraphPlotUI
{

/// A widget that fills the frame that the host gives it. Owned by the frame. UI thread.
class VWindowFrameContent : public QWidget
{
public:
    VWindowFrameContent(QWidget* i_pFrame, std::shared_ptr<OrvanePluginInterface::IOpaqueService> i_pHostObject);
    ~VWindowFrameContent() override;

private:
    std::shared_ptr<OrvanePluginInterface::IOpaqueService> m_pHostObject; ///< may be null
};

} // namespace GraphPlotUI

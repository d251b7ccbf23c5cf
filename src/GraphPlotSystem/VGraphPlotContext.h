#pragma once

#include <QtCore/QObject>

#include <memory>

namespace CoreGraphics
{
class Resources;
}

namespace TQL
{
class ITraceDataProvider;
}

namespace GraphPlotUI
{

/// Carries the two services that drawing needs to the items of a window's scene, which get it as "contextGraphPlot".
/// Made with the window and held by its graph plot system. UI thread.
class VGraphPlotContext : public QObject
{
    Q_OBJECT

public:
    VGraphPlotContext(std::shared_ptr<CoreGraphics::Resources> i_pResources,
                      std::shared_ptr<TQL::ITraceDataProvider> i_pTraceDataProvider, QObject* i_pParent = nullptr);
    ~VGraphPlotContext() override;

    std::shared_ptr<CoreGraphics::Resources> GetResources() const { return m_pResources; }
    std::shared_ptr<TQL::ITraceDataProvider> GetTraceDataProvider() const { return m_pTraceDataProvider; }

private:
    const std::shared_ptr<CoreGraphics::Resources> m_pResources;
    const std::shared_ptr<TQL::ITraceDataProvider> m_pTraceDataProvider;
};

} // namespace GraphPlotUI

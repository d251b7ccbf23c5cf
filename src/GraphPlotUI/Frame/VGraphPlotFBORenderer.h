#pragma once

#include <QtCore/QPointer>
#include <QtCore/QSize>
#include <QtQuick/QQuickFramebufferObject>

#include <cstdint>
#include <memory>
#include <vector>

namespace CoreGraphics
{
class RenderContext;
class Resources;
} // namespace CoreGraphics

namespace TQL
{
class ITraceDataProvider;
}

namespace GraphPlotUI
{

class IGraphRenderType;
class VGraphPlotContext;

/// Draws one frame of a graph window into the framebuffer of its VGraphPlotFBO: clears, lets the provider upload its
/// textures, then lets each render type draw in order of registration. Made by the item, owned by Qt Quick; render
/// thread, with the window's OpenGL context current. The render types it knows are those of the last synchronisation,
/// which precedes every frame.
class VGraphPlotFBORenderer : public QQuickFramebufferObject::Renderer
{
public:
    VGraphPlotFBORenderer(bool i_bMultisample, std::unique_ptr<CoreGraphics::RenderContext> i_pRenderContext);
    /// Releases the provider's textures.
    ~VGraphPlotFBORenderer() override;

protected:
    void render() override;
    QOpenGLFramebufferObject* createFramebufferObject(const QSize& i_rSize) override;
    void synchronize(QQuickFramebufferObject* i_pItem) override;

private:
    void TakeServices(VGraphPlotContext& i_rContext);

    QPointer<VGraphPlotContext> m_pContext;
    std::shared_ptr<CoreGraphics::Resources> m_pResources;
    std::shared_ptr<TQL::ITraceDataProvider> m_pTraceDataProvider;
    std::shared_ptr<TQL::ITraceDataProvider> m_pFormerProvider; // its textures are released with the next frame
    bool m_bMultisample;
    QSize m_FramebufferSize{-1, -1};
    std::unique_ptr<CoreGraphics::RenderContext> m_pRenderContext;
    std::vector<IGraphRenderType*> m_RenderTypes;
    std::uint64_t m_Generation = 0;
};

} // namespace GraphPlotUI

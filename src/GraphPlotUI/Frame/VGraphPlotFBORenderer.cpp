#include "GraphPlotUI/Frame/VGraphPlotFBORenderer.h"

#include "CoreGraphics/RenderContext.h"
#include "CoreGraphics/Resources.h"
#include "GraphPlotSystem/Traces/ITraceDataProvider.h"
#include "GraphPlotSystem/VGraphPlotContext.h"
#include "GraphPlotUI/Frame/IGraphRenderType.h"
#include "GraphPlotUI/Frame/VGraphPlotFBO.h"

#include <QtGui/QColor>
#include <QtGui/QOpenGLContext>
#include <QtOpenGL/QOpenGLFramebufferObject>

#include <utility>

namespace GraphPlotUI
{

VGraphPlotFBORenderer::VGraphPlotFBORenderer(bool i_bMultisample,
                                             std::unique_ptr<CoreGraphics::RenderContext> i_pRenderContext)
    : m_bMultisample(i_bMultisample), m_pRenderContext(std::move(i_pRenderContext))
{
}

VGraphPlotFBORenderer::~VGraphPlotFBORenderer()
{
    if (m_pFormerProvider)
        m_pFormerProvider->ReleaseTextures();
    if (m_pTraceDataProvider)
        m_pTraceDataProvider->ReleaseTextures();
}

QOpenGLFramebufferObject* VGraphPlotFBORenderer::createFramebufferObject(const QSize& i_rSize)
{
    m_FramebufferSize = i_rSize;
    QOpenGLFramebufferObjectFormat format;
    format.setAttachment(QOpenGLFramebufferObject::NoAttachment);
    format.setSamples(m_bMultisample ? 4 : 0);
    return new QOpenGLFramebufferObject(i_rSize, format);
}

void VGraphPlotFBORenderer::synchronize(QQuickFramebufferObject* i_pItem)
{
    auto* pItem = static_cast<VGraphPlotFBO*>(i_pItem);
    if (pItem == nullptr)
        return;
    pItem->NoteFrame();
    if (m_Generation != pItem->GetGeneration())
    {
        m_RenderTypes = pItem->GetRenderTypes();
        m_Generation = pItem->GetGeneration();
    }
    if (m_pContext == pItem->GetGraphPlotContext())
        return;
    m_pContext = pItem->GetGraphPlotContext();
    if (m_pContext)
        TakeServices(*m_pContext);
}

void VGraphPlotFBORenderer::TakeServices(VGraphPlotContext& i_rContext)
{
    m_pResources = i_rContext.GetResources();
    if (m_pTraceDataProvider == i_rContext.GetTraceDataProvider())
        return;
    if (!m_pFormerProvider) // one that came and went without a frame has no textures
        m_pFormerProvider = m_pTraceDataProvider;
    m_pTraceDataProvider = i_rContext.GetTraceDataProvider();
}

void VGraphPlotFBORenderer::render()
{
    if (m_pFormerProvider)
        m_pFormerProvider->ReleaseTextures();
    m_pFormerProvider.reset();
    if (!m_pResources || !m_pTraceDataProvider)
        return;
    m_pResources->Initialise();
    if (!m_pRenderContext->IsInitialised())
        m_pRenderContext->Initialise();
    m_pRenderContext->ResetState();
    m_pRenderContext->SetFrameSize(m_FramebufferSize);
    m_pRenderContext->SetClearColour(QColor(32, 32, 32, 255));
    m_pRenderContext->Clear(true, true);
    m_pTraceDataProvider->UpdateTextures(*m_pRenderContext);
    for (IGraphRenderType* pRenderType : m_RenderTypes)
    {
        if (!pRenderType->IsInitialised())
            pRenderType->Initialise(m_pResources);
        pRenderType->Render(*m_pRenderContext);
    }
    m_pRenderContext->ResetState();
}

} // namespace GraphPlotUI

#include "GraphPlotUI/Frame/VGraphPlotFBO.h"

#include "CoreGraphics/RenderContext.h"
#include "GraphPlotSystem/Traces/ITraceDataProvider.h"
#include "GraphPlotSystem/VGraphPlotContext.h"
#include "GraphPlotUI/Frame/VBaseGraphRenderType.h"
#include "GraphPlotUI/Frame/VGraphPlotFBORenderer.h"

#include <QtQuick/QQuickRenderControl>
#include <QtQuick/QQuickWindow>

#include <algorithm>
#include <memory>

namespace GraphPlotUI
{

VGraphPlotFBO::VGraphPlotFBO(QQuickItem* i_pParent)
    : QQuickFramebufferObject(i_pParent)
    , m_RemovalFunction([this](IGraphRenderType* i_pRenderType) { RemoveRenderType(i_pRenderType); })
{
}

VGraphPlotFBO::~VGraphPlotFBO()
{
    for (IGraphRenderType* pRenderType : m_RenderTypes)
        pRenderType->SetDestroyedCallback({});
}

QQuickFramebufferObject::Renderer* VGraphPlotFBO::createRenderer() const
{
    return new VGraphPlotFBORenderer(m_bMultisample, std::make_unique<CoreGraphics::RenderContext>());
}

QObject* VGraphPlotFBO::GetGraphPlotContextObject() const
{
    return m_pContext;
}

VGraphPlotContext* VGraphPlotFBO::GetGraphPlotContext() const
{
    return m_pContext;
}

void VGraphPlotFBO::SetGraphPlotContext(QObject* i_pContext)
{
    if (i_pContext == nullptr || i_pContext == m_pContext.data())
        return;
    m_pContext = dynamic_cast<VGraphPlotContext*>(i_pContext);
    if (m_pContext)
        for (IGraphRenderType* pRenderType : m_RenderTypes)
            static_cast<VBaseGraphRenderType*>(pRenderType)->SetTraceDataProvider(m_pContext->GetTraceDataProvider());
    Q_EMIT graphPlotContextChanged();
}

void VGraphPlotFBO::registerRenderType(QObject* i_pRenderType)
{
    auto* pRenderType = qobject_cast<VBaseGraphRenderType*>(i_pRenderType);
    if (pRenderType == nullptr || std::ranges::count(m_RenderTypes, pRenderType) != 0)
        return;
    pRenderType->SetDestroyedCallback(m_RemovalFunction);
    if (m_pContext)
        pRenderType->SetTraceDataProvider(m_pContext->GetTraceDataProvider());
    m_RenderTypes.push_back(pRenderType);
    ++m_Generation;
}

void VGraphPlotFBO::RemoveRenderType(IGraphRenderType* i_pRenderType)
{
    const auto found = std::ranges::find(m_RenderTypes, i_pRenderType);
    if (found == m_RenderTypes.end())
        return;
    m_RenderTypes.erase(found);
    ++m_Generation;
}

void VGraphPlotFBO::updateIfChanged()
{
    if (IsSeen() && FindContents() != m_Shown)
        update();
}

VGraphPlotFBO::Contents VGraphPlotFBO::FindContents() const
{
    Contents contents{m_pContext, m_Generation};
    for (const IGraphRenderType* pRenderType : m_RenderTypes)
        contents.RenderTypes += pRenderType->GetRevision();
    if (const auto pProvider = m_pContext ? m_pContext->GetTraceDataProvider() : nullptr)
        contents.Data = pProvider->GetRevision();
    return contents;
}

bool VGraphPlotFBO::IsSeen() const
{
    if (!isVisible() || window() == nullptr)
        return false;
    // The scene of a widget has a window of its own that is never on the screen, and does not always know whether the
    // widget is shown. The widget's window is on the screen; a widget that is hidden in it draws nothing by itself.
    const QWindow* pOuter = QQuickRenderControl::renderWindowFor(window());
    const QWindow* pWindow = pOuter != nullptr ? pOuter : window();
    return pWindow->isVisible() && pWindow->isExposed() && !pWindow->windowStates().testFlag(Qt::WindowMinimized);
}

QSGNode* VGraphPlotFBO::updatePaintNode(QSGNode* i_pNode, UpdatePaintNodeData* i_pData)
{
    return QQuickFramebufferObject::updatePaintNode(i_pNode, i_pData);
}

} // namespace GraphPlotUI

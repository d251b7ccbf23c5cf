#include "GraphPlotUI/Geometry/TraceGeometry.h"

#include "CoreGraphics/RenderContext.h"

#include <utility>

namespace GraphPlotUI
{

static_assert(sizeof(QVector2D) == 2 * sizeof(float));

void TraceGeometry::Set(VertexList i_Vertices)
{
    m_Vertices = std::move(i_Vertices);
    m_bDirty = true;
}

void TraceGeometry::Draw(CoreGraphics::RenderContext& i_rContext, GLenum i_Mode)
{
    if (m_Vertices.empty())
        return;
    if (m_bDirty)
        Upload();
    if (!m_pBuffer || m_pBuffer->VertexCount() != m_Vertices.size())
        return;
    i_rContext.BindVertexBuffer(*m_pBuffer);
    i_rContext.DrawVertexBuffer(i_Mode, *m_pBuffer);
}

void TraceGeometry::Upload()
{
    if (!m_pBuffer)
        m_pBuffer = std::make_unique<CoreGraphics::VertexBuffer>();
    if (m_pBuffer->VertexCount() != m_Vertices.size() &&
        !m_pBuffer->Resize(m_Vertices.size(), CoreGraphics::VertexLayout::TwoFloats()))
        return;
    m_pBuffer->Write(m_Vertices.data(), 0, m_Vertices.size() * sizeof(QVector2D));
    m_bDirty = false;
}

} // namespace GraphPlotUI

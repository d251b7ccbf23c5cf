#pragma once

#include "CoreGraphics/VertexBuffer.h"

#include <QtGui/QVector2D>
#include <QtGui/qopengl.h>

#include <memory>
#include <vector>

namespace CoreGraphics
{
class RenderContext;
}

namespace GraphPlotUI
{

using VertexList = std::vector<QVector2D>;

/// A list of two-float vertices and the OpenGL buffer that it is drawn from. Owned by a render type: filled with Set on
/// the GUI thread between frames, drawn on the render thread, where the buffer is made or grown and filled when needed.
class TraceGeometry
{
public:
    void Set(VertexList i_Vertices);
    const VertexList& Vertices() const { return m_Vertices; }

    /// With the active program; nothing without vertices.
    void Draw(CoreGraphics::RenderContext& i_rContext, GLenum i_Mode);

private:
    void Upload();

    bool m_bDirty = false;
    std::unique_ptr<CoreGraphics::VertexBuffer> m_pBuffer;
    VertexList m_Vertices;
};

} // namespace GraphPlotUI

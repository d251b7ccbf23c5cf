#pragma once

#include "CoreGraphics/VertexLayout.h"

#include <QtOpenGL/QOpenGLBuffer>

#include <cstdint>

namespace CoreGraphics
{

/// Vertices in an OpenGL buffer, with the layout that says how to read them. Owned by what draws it; it may be
/// constructed on any thread, the OpenGL buffer is made at the first SetData or Resize. Those, Write and the use in a
/// RenderContext: render thread, with a context of one sharing group current. It may be destroyed anywhere: the OpenGL
/// buffer is then freed when its group next can.
class VertexBuffer
{
public:
    VertexBuffer();
    ~VertexBuffer();
    VertexBuffer(const VertexBuffer&) = delete;
    VertexBuffer& operator=(const VertexBuffer&) = delete;

    /// New contents that will not change. The number of vertices is i_ByteCount / stride. False when OpenGL has no
    /// buffer to give.
    bool SetData(const void* i_pData, std::uint64_t i_ByteCount, const VertexLayout& i_rLayout);

    /// Room for that many vertices, contents undefined, to be filled by Write.
    bool Resize(std::uint64_t i_VertexCount, const VertexLayout& i_rLayout);

    /// Ignored when the range goes beyond stride x vertex count.
    void Write(const void* i_pData, std::uint64_t i_ByteOffset, std::uint64_t i_ByteCount);

    const VertexLayout& Layout() const { return m_Layout; }
    std::uint64_t VertexCount() const { return m_VertexCount; }
    bool IsCreated() const { return m_bCreated; }
    /// Binds to GL_ARRAY_BUFFER. False when nothing was created.
    bool Bind();

private:
    bool Allocate(const void* i_pData, std::uint64_t i_ByteCount, const VertexLayout& i_rLayout,
                  QOpenGLBuffer::UsagePattern i_Usage);

    QOpenGLBuffer m_Buffer{QOpenGLBuffer::VertexBuffer};
    VertexLayout m_Layout;
    std::uint64_t m_VertexCount = 0;
    bool m_bCreated = false;
};

} // namespace CoreGraphics

#include "CoreGraphics/VertexBuffer.h"

#include <limits>

namespace CoreGraphics
{

VertexBuffer::VertexBuffer() = default;
VertexBuffer::~VertexBuffer() = default;

bool VertexBuffer::SetData(const void* i_pData, std::uint64_t i_ByteCount, const VertexLayout& i_rLayout)
{
    return Allocate(i_pData, i_ByteCount, i_rLayout, QOpenGLBuffer::StaticDraw);
}

bool VertexBuffer::Resize(std::uint64_t i_VertexCount, const VertexLayout& i_rLayout)
{
    return Allocate(nullptr, i_VertexCount * i_rLayout.Stride(), i_rLayout, QOpenGLBuffer::DynamicDraw);
}

bool VertexBuffer::Allocate(const void* i_pData, std::uint64_t i_ByteCount, const VertexLayout& i_rLayout,
                            QOpenGLBuffer::UsagePattern i_Usage)
{
    m_VertexCount = 0;
    m_Layout = i_rLayout;
    m_bCreated = m_Buffer.isCreated() || m_Buffer.create();
    if (!m_bCreated || i_ByteCount > static_cast<std::uint64_t>(std::numeric_limits<int>::max()) || !m_Buffer.bind())
        return false;
    m_Buffer.setUsagePattern(i_Usage);
    m_Buffer.allocate(i_pData, static_cast<int>(i_ByteCount));
    m_Buffer.release();
    m_VertexCount = i_rLayout.Stride() == 0 ? 0 : i_ByteCount / i_rLayout.Stride();
    return true;
}

void VertexBuffer::Write(const void* i_pData, std::uint64_t i_ByteOffset, std::uint64_t i_ByteCount)
{
    const std::uint64_t capacity = m_Layout.Stride() * m_VertexCount;
    if (i_ByteCount == 0 || i_ByteCount > capacity || i_ByteOffset > capacity - i_ByteCount || !m_Buffer.bind())
        return;
    m_Buffer.write(static_cast<int>(i_ByteOffset), i_pData, static_cast<int>(i_ByteCount));
    m_Buffer.release();
}

bool VertexBuffer::Bind()
{
    return m_bCreated && m_Buffer.bind();
}

} // namespace CoreGraphics

#include "CoreGraphics/Texture2D.h"

#include "CoreGraphics/RenderContext.h"

#include <QtGui/QOpenGLFunctions>

#include <utility>

namespace CoreGraphics
{

Texture2D::Texture2D(Texture2D&& i_rOther) noexcept
    : m_pGroup(i_rOther.m_pGroup)
    , m_Name(std::exchange(i_rOther.m_Name, 0))
    , m_InternalFormat(std::exchange(i_rOther.m_InternalFormat, 0))
    , m_Width(std::exchange(i_rOther.m_Width, 0))
    , m_Height(std::exchange(i_rOther.m_Height, 0))
{
    i_rOther.m_pGroup.clear();
}

Texture2D& Texture2D::operator=(Texture2D&& i_rOther) noexcept
{
    if (this != &i_rOther)
    {
        Destroy();
        m_pGroup.swap(i_rOther.m_pGroup);
        m_Name = std::exchange(i_rOther.m_Name, 0);
        m_InternalFormat = std::exchange(i_rOther.m_InternalFormat, 0);
        m_Width = std::exchange(i_rOther.m_Width, 0);
        m_Height = std::exchange(i_rOther.m_Height, 0);
    }
    return *this;
}

bool Texture2D::Create(RenderContext& i_rContext, GLenum i_InternalFormat, int i_Width, int i_Height)
{
    Destroy();
    m_Name = i_rContext.CreateTexture(i_InternalFormat, i_Width, i_Height);
    if (m_Name == 0)
        return false;
    m_pGroup = QOpenGLContextGroup::currentContextGroup();
    m_InternalFormat = i_InternalFormat;
    m_Width = i_Width;
    m_Height = i_Height;
    return true;
}

bool Texture2D::Bind(RenderContext& i_rContext, unsigned i_Unit) const
{
    if (!IsCreated() || m_pGroup != QOpenGLContextGroup::currentContextGroup())
        return false;
    i_rContext.BindTexture(i_Unit, m_Name);
    return true;
}

void Texture2D::UploadRows(RenderContext& i_rContext, int i_FirstRow, int i_EndRow, const void* i_pTexels) const
{
    if (i_FirstRow < 0 || i_FirstRow >= i_EndRow || i_EndRow > m_Height || !Bind(i_rContext, 0))
        return;
    i_rContext.UploadSubImage(m_InternalFormat, QRect(0, i_FirstRow, m_Width, i_EndRow - i_FirstRow), i_pTexels);
}

void Texture2D::Destroy()
{
    if (IsCreated() && m_pGroup == QOpenGLContextGroup::currentContextGroup())
        QOpenGLContext::currentContext()->functions()->glDeleteTextures(1, &m_Name);
    m_pGroup.clear();
    m_Name = 0;
    m_InternalFormat = 0;
    m_Width = 0;
    m_Height = 0;
}

} // namespace CoreGraphics

#pragma once

#include <QtCore/QPointer>
#include <QtGui/QOpenGLContext>
#include <QtGui/qopengl.h>

namespace CoreGraphics
{

class RenderContext;

/// Owns one two-dimensional texture without mipmaps, sampled nearest and clamped until a sampler state says otherwise.
/// Owned by what fills it, for example the record of one channel (components wide, 4096 rows high, GL_RGBA32F). Render
/// thread, with a context of one sharing group current, also for destruction: a texture that dies without its context
/// stays allocated until its group goes. A moved-from object is empty.
class Texture2D
{
public:
    Texture2D() = default;
    ~Texture2D() { Destroy(); }
    Texture2D(Texture2D&& i_rOther) noexcept;
    Texture2D& operator=(Texture2D&& i_rOther) noexcept;
    Texture2D(const Texture2D&) = delete;
    Texture2D& operator=(const Texture2D&) = delete;

    /// Replaces whatever was there by a texture with undefined texels, bound at unit 0. Sizes are texels. False, and an
    /// empty object, for a format that is not in PixelFormat.h or a size that OpenGL refuses.
    bool Create(RenderContext& i_rContext, GLenum i_InternalFormat, int i_Width, int i_Height);

    /// Binds at that unit, which becomes the active one. False, and unchanged bindings, without a texture.
    bool Bind(RenderContext& i_rContext, unsigned i_Unit) const;

    /// Binds at unit 0 and uploads rows [first, end), all texels of each, in one call. i_pTexels is the first row's
    /// first texel, rows follow each other without padding. Ignored when empty or out of range.
    void UploadRows(RenderContext& i_rContext, int i_FirstRow, int i_EndRow, const void* i_pTexels) const;

    void Destroy();

    /// True while there is a texture and its group is alive.
    bool IsCreated() const { return m_Name != 0 && !m_pGroup.isNull(); }
    bool Matches(GLenum i_InternalFormat, int i_Width, int i_Height) const
    {
        return IsCreated() && m_InternalFormat == i_InternalFormat && m_Width == i_Width && m_Height == i_Height;
    }
    GLenum InternalFormat() const { return m_InternalFormat; }
    int Width() const { return m_Width; }
    int Height() const { return m_Height; }

private:
    QPointer<QOpenGLContextGroup> m_pGroup;
    GLuint m_Name = 0;
    GLenum m_InternalFormat = 0;
    int m_Width = 0;
    int m_Height = 0;
};

} // namespace CoreGraphics

// The texture and pixel operations of RenderContext.
#include "CoreGraphics/PixelFormat.h"
#include "CoreGraphics/RenderContext.h"

#include <QtOpenGL/QOpenGLFramebufferObject>

namespace CoreGraphics
{
namespace
{

constexpr GLenum c_TextureMaximumLevel = 0x813D; // GL_TEXTURE_MAX_LEVEL
constexpr GLint c_DefaultAlignment = 4;

} // namespace

GLuint RenderContext::CreateTexture(GLenum i_InternalFormat, int i_Width, int i_Height)
{
    const std::optional<PixelFormat> pixels = FindPixelFormat(i_InternalFormat);
    GLint maximumSize = 0;
    m_Functions.glGetIntegerv(GL_MAX_TEXTURE_SIZE, &maximumSize);
    if (!pixels || i_Width <= 0 || i_Height <= 0 || i_Width > maximumSize || i_Height > maximumSize)
        return 0;
    GLuint texture = 0;
    m_Functions.glGenTextures(1, &texture);
    BindTexture(0, texture);
    ApplySamplerState(SamplerState{});
    m_Functions.glTexParameteri(GL_TEXTURE_2D, c_TextureMaximumLevel, 0);
    m_Functions.glTexImage2D(GL_TEXTURE_2D, 0, static_cast<GLint>(i_InternalFormat), i_Width, i_Height, 0,
                             pixels->Format, pixels->Type, nullptr);
    DrainDebugLog();
    return texture;
}

void RenderContext::BindTexture(unsigned i_Unit, GLuint i_Texture)
{
    m_Functions.glActiveTexture(GL_TEXTURE0 + i_Unit);
    m_Functions.glBindTexture(GL_TEXTURE_2D, i_Texture);
    m_UsedTextureUnits |= 1u << i_Unit;
    DrainDebugLog();
}

void RenderContext::BindFramebufferTexture(unsigned i_Unit, const QOpenGLFramebufferObject& i_rFramebuffer)
{
    BindTexture(i_Unit, i_rFramebuffer.texture());
}

void RenderContext::UploadSubImage(GLenum i_InternalFormat, const QRect& i_rTexels, const void* i_pTexels)
{
    const std::optional<PixelFormat> pixels = FindPixelFormat(i_InternalFormat);
    if (!pixels || i_rTexels.isEmpty())
        return;
    m_Functions.glPixelStorei(GL_UNPACK_ALIGNMENT, 1);
    m_Functions.glTexSubImage2D(GL_TEXTURE_2D, 0, i_rTexels.left(), i_rTexels.top(), i_rTexels.width(),
                                i_rTexels.height(), pixels->Format, pixels->Type, i_pTexels);
    m_Functions.glPixelStorei(GL_UNPACK_ALIGNMENT, c_DefaultAlignment);
    DrainDebugLog();
}

void RenderContext::ReadPixels(GLenum i_InternalFormat, const QRect& i_rPixels, void* o_pPixels)
{
    const std::optional<PixelFormat> pixels = FindPixelFormat(i_InternalFormat);
    if (!pixels || i_rPixels.isEmpty())
        return;
    m_Functions.glPixelStorei(GL_PACK_ALIGNMENT, 1);
    m_Functions.glReadPixels(i_rPixels.left(), i_rPixels.top(), i_rPixels.width(), i_rPixels.height(), pixels->Format,
                             pixels->Type, o_pPixels);
    m_Functions.glPixelStorei(GL_PACK_ALIGNMENT, c_DefaultAlignment);
    DrainDebugLog();
}

} // namespace CoreGraphics

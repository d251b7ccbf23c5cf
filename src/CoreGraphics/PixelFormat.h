#pragma once

#include <QtGui/qopengl.h>

#include <optional>

namespace CoreGraphics
{

/// How the processor's side of a texture is laid out in memory.
struct PixelFormat
{
    GLenum Format = 0; ///< GL_RGBA, GL_RED...
    GLenum Type = 0;   ///< GL_FLOAT, GL_UNSIGNED_BYTE...
    int BytesPerPixel = 0;
};

/// For the internal formats GL_RGBA32F, GL_RGB32F, GL_RGB565, GL_RG8, GL_RGB8, GL_RGBA8, GL_R8 and GL_R32F; nothing for
/// any other.
std::optional<PixelFormat> FindPixelFormat(GLenum i_InternalFormat);

} // namespace CoreGraphics

#pragma once

#include "CoreGraphics/RenderState.h"
#include "CoreGraphics/VShaderProgram.h"
#include "CoreGraphics/VertexBuffer.h"

#include <QtCore/QRect>
#include <QtCore/QSize>
#include <QtGui/QMatrix4x4>
#include <QtGui/QOpenGLExtraFunctions>
#include <QtGui/QVector3D>
#include <QtGui/QVector4D>
#include <QtOpenGL/QOpenGLVertexArrayObject>

#include <cstdint>
#include <memory>
#include <optional>

class QColor;
class QOpenGLBuffer;
class QOpenGLContext;
class QOpenGLDebugLogger;
class QOpenGLFramebufferObject;

namespace CoreGraphics
{

/// The only caller of OpenGL while graphs are drawn: keeps the matrices, viewport and active program of a frame, and
/// which attribute arrays are on. Owned by a renderer and used with that renderer's OpenGL context current, on the
/// render thread. A frame starts and ends with ResetState; after the closing one nothing of the frame is left bound.
/// On a core profile a vertex array object of its own is bound between the two, from the first BindVertexBuffer on.
class RenderContext
{
public:
    RenderContext();
    ~RenderContext();
    RenderContext(const RenderContext&) = delete;
    RenderContext& operator=(const RenderContext&) = delete;

    /// Takes the current OpenGL context. Call once.
    void Initialise();
    bool IsInitialised() const { return m_pContext != nullptr; }

    void ResetState();

    /// Framebuffer pixels; left and top as given to OpenGL.
    void SetViewport(const QRect& i_rViewport);
    const QRect& Viewport() const { return m_Viewport; }

    /// Matrices and the values below reach a program at the next UseProgram, also of the same program.
    void SetProjection(const QMatrix4x4& i_rProjection) { m_Projection = i_rProjection; }
    void SetView(const QMatrix4x4& i_rView) { m_View = i_rView; }
    void SetView2D(const QVector4D& i_rView2D) { m_View2D = i_rView2D; }
    void SetLightVector(const QVector3D& i_rLight) { m_LightVector = i_rLight; }
    void SetUp(const QVector3D& i_rUp) { m_Up = i_rUp; }
    void SetFrameSize(const QSize& i_rSize) { m_FrameSize = i_rSize; }
    void SetGlobalTime(float i_Seconds) { m_GlobalTime = i_Seconds; }

    /// False, and nothing changes, for an empty pointer or a program that is not linked.
    bool UseProgram(const std::shared_ptr<VShaderProgram>& i_rpProgram);

    void ApplyRenderState(const RenderState& i_rState);
    /// For the texture bound to GL_TEXTURE_2D at the active unit.
    void ApplySamplerState(const SamplerState& i_rState);

    /// Points the active program's attributes at the buffer. Attributes that the program does not have are left out.
    void BindVertexBuffer(VertexBuffer& i_rBuffer);
    /// All vertices of the buffer that was bound last.
    void DrawVertexBuffer(GLenum i_Mode, const VertexBuffer& i_rBuffer);
    /// gl_InstanceID runs from 0; counts of 0 or below draw nothing.
    void DrawInstanced(GLenum i_Mode, int i_VertexCount, int i_InstanceCount);
    /// i_Type is GL_UNSIGNED_BYTE, GL_UNSIGNED_SHORT or GL_UNSIGNED_INT.
    void DrawIndexed(GLenum i_Mode, QOpenGLBuffer& i_rIndices, int i_IndexCount, GLenum i_Type);

    void SetClearColour(const QColor& i_rColour);
    /// Switches the depth mask and all colour masks on first.
    void Clear(bool i_bColour, bool i_bDepth);
    /// Framebuffer pixels from the lower left corner; no rectangle switches the scissor test off.
    void SetScissor(const std::optional<QRect>& i_rScissor);

    /// A texture with undefined texels, nearest filtering, clamped, without mipmaps, bound at unit 0. 0 when OpenGL
    /// refuses the format or the size. See Texture2D for an owner.
    GLuint CreateTexture(GLenum i_InternalFormat, int i_Width, int i_Height);
    /// The unit becomes the active one. 0 unbinds.
    void BindTexture(unsigned i_Unit, GLuint i_Texture);
    void BindFramebufferTexture(unsigned i_Unit, const QOpenGLFramebufferObject& i_rFramebuffer);
    /// Into the texture bound to GL_TEXTURE_2D at the active unit, texels without padding between rows. The internal
    /// format selects their format and type; one that PixelFormat.h does not list is ignored.
    void UploadSubImage(GLenum i_InternalFormat, const QRect& i_rTexels, const void* i_pTexels);
    /// Reads from the bound framebuffer, rows upwards from the lower left corner, without padding; formats as above.
    void ReadPixels(GLenum i_InternalFormat, const QRect& i_rPixels, void* o_pPixels);

private:
    void StartDebugLogger();
    void DrainDebugLog();
    void WriteStandardUniforms(VShaderProgram& i_rProgram) const;
    void EnableAttributes(std::uint32_t i_Attributes);
    void ResetDesktopState();
    void BindVertexArray();
    void UnbindTextures();

    QOpenGLContext* m_pContext = nullptr;
    std::unique_ptr<QOpenGLDebugLogger> m_pDebugLogger;
    QOpenGLExtraFunctions m_Functions;
    QOpenGLVertexArrayObject m_VertexArray; // used on a core profile only
    std::uint32_t m_EnabledAttributes = 0;  // bit set, eight bits
    std::uint32_t m_UsedTextureUnits = 0;   // bit set of the units bound since the last reset
    bool m_bCoreProfile = false;
    QMatrix4x4 m_Projection;
    QMatrix4x4 m_View;
    QVector4D m_View2D;
    QRect m_Viewport;
    QVector3D m_LightVector;
    QVector3D m_Up;
    QSize m_FrameSize;
    float m_GlobalTime = 0.0f;
    std::shared_ptr<VShaderProgram> m_pActiveProgram;
};

} // namespace CoreGraphics

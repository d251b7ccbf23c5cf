// The state operations of RenderContext: reset, blending and masks, samplers, viewport, clearing.
#include "CoreGraphics/RenderContext.h"

#include <QtGui/QColor>
#include <QtGui/QOpenGLContext>

#include <array>

namespace CoreGraphics
{
namespace
{

// Desktop OpenGL's, absent from the headers of OpenGL ES.
constexpr GLenum c_ProgramPointSize = 0x8642; // GL_VERTEX_PROGRAM_POINT_SIZE
constexpr GLenum c_PointSprite = 0x8861;      // GL_POINT_SPRITE
constexpr GLenum c_LineSmooth = 0x0B20;       // GL_LINE_SMOOTH
constexpr GLenum c_PixelUnpackBuffer = 0x88EC;
constexpr GLuint c_AttributeCount = 8;

struct Factors
{
    GLenum Source;
    GLenum Destination;
};

constexpr std::array<Factors, 5> c_ColourFactors{{
    {GL_ONE, GL_ZERO}, // no blending of the colour
    {GL_SRC_ALPHA, GL_ONE_MINUS_SRC_ALPHA},
    {GL_SRC_ALPHA, GL_ONE},
    {GL_CONSTANT_COLOR, GL_ONE},
    {GL_ONE, GL_ONE_MINUS_SRC_ALPHA},
}};

constexpr std::array<GLenum, 6> c_DepthFunctions{GL_NEVER, GL_LEQUAL, GL_GREATER, GL_GEQUAL, GL_NOTEQUAL, GL_EQUAL};

constexpr std::array<GLint, 4> c_MinifyingFilters{GL_NEAREST_MIPMAP_NEAREST, GL_LINEAR_MIPMAP_NEAREST,
                                                  GL_LINEAR_MIPMAP_LINEAR, GL_NEAREST};

} // namespace

void RenderContext::ResetState()
{
    BindVertexArray(); // a core profile has no attribute arrays without one
    for (GLuint i = 0; i < c_AttributeCount; ++i)
        m_Functions.glDisableVertexAttribArray(i);
    m_EnabledAttributes = 0;
    m_Functions.glBindBuffer(GL_ARRAY_BUFFER, 0);
    m_Functions.glBindBuffer(GL_ELEMENT_ARRAY_BUFFER, 0);
    m_Functions.glBindBuffer(c_PixelUnpackBuffer, 0);
    if (m_VertexArray.isCreated())
        m_VertexArray.release();
    m_Functions.glUseProgram(0);
    m_Functions.glDisable(GL_CULL_FACE);
    m_Functions.glDisable(GL_BLEND);
    m_Functions.glDisable(GL_DEPTH_TEST);
    m_Functions.glDisable(GL_SCISSOR_TEST);
    m_Functions.glDisable(GL_STENCIL_TEST);
    m_Functions.glColorMask(GL_TRUE, GL_TRUE, GL_TRUE, GL_TRUE);
    m_Functions.glDepthMask(GL_TRUE);
    m_Functions.glCullFace(GL_BACK);
    m_Functions.glBlendFunc(GL_ONE, GL_ZERO);
    m_Functions.glDepthFunc(GL_LESS);
    if (!m_pContext->isOpenGLES())
        ResetDesktopState();
    UnbindTextures();
    m_pActiveProgram.reset();
    DrainDebugLog();
}

void RenderContext::ResetDesktopState()
{
    m_Functions.glEnable(c_ProgramPointSize);
    if (!m_bCoreProfile)
        m_Functions.glEnable(c_PointSprite);
    if (m_pContext->format().majorVersion() < 3)
        m_Functions.glDisable(c_LineSmooth);
}

void RenderContext::UnbindTextures()
{
    for (unsigned unit = 1; unit < 32; ++unit)
        if ((m_UsedTextureUnits & (1u << unit)) != 0)
            BindTexture(unit, 0);
    BindTexture(0, 0);
    m_UsedTextureUnits = 0;
}

void RenderContext::BindVertexArray()
{
    if (m_bCoreProfile && (m_VertexArray.isCreated() || m_VertexArray.create()))
        m_VertexArray.bind();
}

void RenderContext::SetViewport(const QRect& i_rViewport)
{
    m_Viewport = i_rViewport;
    m_Functions.glViewport(m_Viewport.left(), m_Viewport.top(), m_Viewport.width(), m_Viewport.height());
    DrainDebugLog();
}

void RenderContext::ApplyRenderState(const RenderState& i_rState)
{
    if (i_rState.BlendMode == RenderState::BlendNone && i_rState.AlphaBlendMode == 0)
    {
        m_Functions.glDisable(GL_BLEND);
    }
    else
    {
        const Factors colour = c_ColourFactors[i_rState.BlendMode < c_ColourFactors.size() ? i_rState.BlendMode : 0];
        m_Functions.glEnable(GL_BLEND);
        m_Functions.glBlendFuncSeparate(colour.Source, colour.Destination,
                                        i_rState.AlphaBlendMode != 0 ? GL_ONE : GL_ZERO,
                                        i_rState.AlphaBlendMode <= 1 ? GL_ONE : GL_ZERO);
        const float constant = i_rState.BlendConstantValue;
        if (i_rState.BlendMode == RenderState::BlendConstant)
            m_Functions.glBlendColor(constant, constant, constant, constant);
    }

    if (i_rState.CullMode == 0)
    {
        m_Functions.glDisable(GL_CULL_FACE);
    }
    else
    {
        m_Functions.glEnable(GL_CULL_FACE);
        m_Functions.glCullFace(i_rState.CullMode == 1 ? GL_FRONT : GL_BACK);
    }

    if (i_rState.bDepthTest)
        m_Functions.glEnable(GL_DEPTH_TEST);
    else
        m_Functions.glDisable(GL_DEPTH_TEST);
    if (i_rState.DepthFunction < c_DepthFunctions.size())
        m_Functions.glDepthFunc(c_DepthFunctions[i_rState.DepthFunction]);
    m_Functions.glDepthMask(i_rState.bDepthWrite ? GL_TRUE : GL_FALSE);
    const GLboolean colourMask = i_rState.bColourWrite ? GL_TRUE : GL_FALSE;
    m_Functions.glColorMask(colourMask, colourMask, colourMask, i_rState.bAlphaWrite ? GL_TRUE : GL_FALSE);
    DrainDebugLog();
}

void RenderContext::ApplySamplerState(const SamplerState& i_rState)
{
    const auto set = [this](GLenum i_Name, GLint i_Value)
    {
        m_Functions.glTexParameteri(GL_TEXTURE_2D, i_Name, i_Value);
    };
    if (i_rState.MinifyingFilter < c_MinifyingFilters.size())
        set(GL_TEXTURE_MIN_FILTER, c_MinifyingFilters[i_rState.MinifyingFilter]);
    set(GL_TEXTURE_MAG_FILTER, i_rState.bLinearMagnification ? GL_LINEAR : GL_NEAREST);
    set(GL_TEXTURE_WRAP_S, i_rState.bClampS ? GL_CLAMP_TO_EDGE : GL_REPEAT);
    set(GL_TEXTURE_WRAP_T, i_rState.bClampT ? GL_CLAMP_TO_EDGE : GL_REPEAT);
    DrainDebugLog();
}

void RenderContext::SetClearColour(const QColor& i_rColour)
{
    m_Functions.glClearColor(i_rColour.redF(), i_rColour.greenF(), i_rColour.blueF(), i_rColour.alphaF());
}

void RenderContext::Clear(bool i_bColour, bool i_bDepth)
{
    m_Functions.glDepthMask(GL_TRUE);
    m_Functions.glColorMask(GL_TRUE, GL_TRUE, GL_TRUE, GL_TRUE);
    GLbitfield buffers = 0;
    if (i_bColour)
        buffers |= GL_COLOR_BUFFER_BIT;
    if (i_bDepth)
        buffers |= GL_DEPTH_BUFFER_BIT;
    m_Functions.glClear(buffers);
    DrainDebugLog();
}

void RenderContext::SetScissor(const std::optional<QRect>& i_rScissor)
{
    if (!i_rScissor)
    {
        m_Functions.glDisable(GL_SCISSOR_TEST);
        return;
    }
    m_Functions.glEnable(GL_SCISSOR_TEST);
    m_Functions.glScissor(i_rScissor->left(), i_rScissor->top(), i_rScissor->width(), i_rScissor->height());
    DrainDebugLog();
}

} // namespace CoreGraphics

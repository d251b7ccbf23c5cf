#include "CoreGraphics/RenderContext.h"

#include "CoreGraphics/GraphicsLog.h"
#include "CoreGraphics/PixelFormat.h"

#include <QtGui/QColor>
#include <QtGui/QOpenGLContext>
#include <QtGui/QSurfaceFormat>
#include <QtOpenGL/QOpenGLDebugLogger>
#include <QtOpenGL/QOpenGLFramebufferObject>

#include <array>
#include <cstddef>

namespace CoreGraphics
{
namespace
{

constexpr GLenum c_DebugOutput = 0x92E0; // GL_DEBUG_OUTPUT, absent from some headers
constexpr std::size_t c_AttributeBits = 8;

constexpr std::array<GLenum, 7> c_VertexTypes{GL_FLOAT,          GL_BYTE, GL_UNSIGNED_BYTE, GL_SHORT,
                                              GL_UNSIGNED_SHORT, GL_INT,  GL_UNSIGNED_INT};

TQL::ELogSeverity SeverityOf(const QOpenGLDebugMessage& i_rMessage)
{
    switch (i_rMessage.severity())
    {
    case QOpenGLDebugMessage::HighSeverity:
        return TQL::ELogSeverity::Error;
    case QOpenGLDebugMessage::MediumSeverity:
        return TQL::ELogSeverity::Warning;
    case QOpenGLDebugMessage::LowSeverity:
        return TQL::ELogSeverity::Information;
    default:
        return TQL::ELogSeverity::Detail;
    }
}

void LogInformation(const char* i_pText, const TQL::LogPlace& i_rPlace = std::source_location::current())
{
    TQL::Log::Write(GraphicsLog(), TQL::ELogSeverity::Information, i_pText, i_rPlace);
}

} // namespace

RenderContext::RenderContext() = default;
RenderContext::~RenderContext() = default;

void RenderContext::Initialise()
{
    m_pContext = QOpenGLContext::currentContext();
    if (m_pContext == nullptr)
        return;
    m_Functions.initializeOpenGLFunctions();
    m_bCoreProfile = !m_pContext->isOpenGLES() && m_pContext->format().profile() == QSurfaceFormat::CoreProfile;
    if (QSurfaceFormat::defaultFormat().testOption(QSurfaceFormat::DebugContext))
        StartDebugLogger();
}

void RenderContext::StartDebugLogger()
{
    LogInformation("Debug OpenGL context requested");
    if (!m_pContext->hasExtension("GL_KHR_debug"))
    {
        LogInformation("GL_KHR_debug not available");
        return;
    }
    LogInformation("Initialising debug logger");
    m_pDebugLogger = std::make_unique<QOpenGLDebugLogger>();
    if (m_pDebugLogger->initialize())
        m_Functions.glEnable(c_DebugOutput);
    else
        m_pDebugLogger.reset();
}

void RenderContext::DrainDebugLog()
{
    if (!m_pDebugLogger)
        return;
    const QList<QOpenGLDebugMessage> messages = m_pDebugLogger->loggedMessages();
    for (const QOpenGLDebugMessage& rMessage : messages)
        TQL::Log::Format(GraphicsLog(), SeverityOf(rMessage), "%1%", rMessage.message().toStdString());
}

bool RenderContext::UseProgram(const std::shared_ptr<VShaderProgram>& i_rpProgram)
{
    if (!i_rpProgram || !i_rpProgram->IsLinked())
        return false;
    if (m_pActiveProgram)
        m_pActiveProgram->Release();
    m_pActiveProgram = i_rpProgram;
    i_rpProgram->Bind();
    WriteStandardUniforms(*i_rpProgram);
    DrainDebugLog();
    return true;
}

void RenderContext::WriteStandardUniforms(VShaderProgram& i_rProgram) const
{
    const auto write = [&i_rProgram](EStandardUniform i_Uniform, const auto& i_rValue)
    {
        i_rProgram.SetUniform(i_rProgram.UniformLocation(i_Uniform), i_rValue);
    };
    write(EStandardUniform::ViewProjection, m_Projection * m_View);
    write(EStandardUniform::View, m_View);
    write(EStandardUniform::Projection, m_Projection);
    write(EStandardUniform::View2D, m_View2D);
    write(EStandardUniform::ViewportSize, m_Viewport.size());
    write(EStandardUniform::ViewportOffset, m_Viewport.topLeft());
    write(EStandardUniform::FrameSize, m_FrameSize);
    write(EStandardUniform::LightVector, m_LightVector);
    write(EStandardUniform::Up, m_Up);
    write(EStandardUniform::GlobalTime, m_GlobalTime);
    if (i_rProgram.UniformLocation(EStandardUniform::CameraPosition) != -1)
        write(EStandardUniform::CameraPosition, m_View.inverted().map(QVector3D()));
}

void RenderContext::BindVertexBuffer(VertexBuffer& i_rBuffer)
{
    if (!m_pActiveProgram || !i_rBuffer.IsCreated())
        return;
    BindVertexArray();
    i_rBuffer.Bind();
    std::uint32_t attributes = 0;
    for (const VertexAttribute& rEntry : i_rBuffer.Layout().Attributes())
    {
        const int location = m_pActiveProgram->AttributeLocation(rEntry.Attribute);
        if (location < 0 || location >= static_cast<int>(c_AttributeBits))
            continue;
        const std::byte* pStart = nullptr;
        m_Functions.glVertexAttribPointer(static_cast<GLuint>(location), rEntry.ComponentCount,
                                          c_VertexTypes[static_cast<std::size_t>(rEntry.Type)],
                                          rEntry.bNormalised ? GL_TRUE : GL_FALSE,
                                          static_cast<GLsizei>(i_rBuffer.Layout().Stride()), pStart + rEntry.Offset);
        attributes |= 1u << location;
    }
    EnableAttributes(attributes);
    DrainDebugLog();
}

void RenderContext::EnableAttributes(std::uint32_t i_Attributes)
{
    const std::uint32_t changed = i_Attributes ^ m_EnabledAttributes;
    for (GLuint i = 0; i < c_AttributeBits; ++i)
    {
        if ((changed & (1u << i)) == 0)
            continue;
        if ((i_Attributes & (1u << i)) != 0)
            m_Functions.glEnableVertexAttribArray(i);
        else
            m_Functions.glDisableVertexAttribArray(i);
    }
    m_EnabledAttributes = i_Attributes;
}

void RenderContext::DrawVertexBuffer(GLenum i_Mode, const VertexBuffer& i_rBuffer)
{
    if (i_rBuffer.VertexCount() != 0)
        m_Functions.glDrawArrays(i_Mode, 0, static_cast<GLsizei>(i_rBuffer.VertexCount()));
    DrainDebugLog();
}

void RenderContext::DrawInstanced(GLenum i_Mode, int i_VertexCount, int i_InstanceCount)
{
    if (i_VertexCount > 0 && i_InstanceCount > 0)
        m_Functions.glDrawArraysInstanced(i_Mode, 0, i_VertexCount, i_InstanceCount);
    DrainDebugLog();
}

void RenderContext::DrawIndexed(GLenum i_Mode, QOpenGLBuffer& i_rIndices, int i_IndexCount, GLenum i_Type)
{
    if (i_IndexCount <= 0 || !i_rIndices.bind())
        return;
    m_Functions.glDrawElements(i_Mode, i_IndexCount, i_Type, nullptr);
    i_rIndices.release();
    DrainDebugLog();
}

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

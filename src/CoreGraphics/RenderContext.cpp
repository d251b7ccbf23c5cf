#include "CoreGraphics/RenderContext.h"

#include "CoreGraphics/GraphicsLog.h"

#include <QtGui/QOpenGLContext>
#include <QtGui/QSurfaceFormat>
#include <QtOpenGL/QOpenGLDebugLogger>

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

} // namespace CoreGraphics

#include "CoreGraphics/VShader.h"

#include "CoreGraphics/GraphicsLog.h"

#include <QtCore/QFile>
#include <QtOpenGL/QOpenGLShader>

#include <utility>

namespace CoreGraphics
{
namespace
{

QByteArray VertexPreamble()
{
    return "#version 300 es\n"
           "#undef highp\nprecision highp sampler2D;\n"
           "#define attribute in\n#define varying out\n#define texture2D texture\n"
           "#line 1\n";
}

QByteArray FragmentPreamble()
{
    return "#version 300 es\n"
           "#undef highp\nprecision highp float;\n"
           "#define varying in\nout vec4 FragColor;\n#define gl_FragColor FragColor\n#define texture2D texture\n"
           "#line 1\n";
}

} // namespace

VShader::VShader(EShaderKind i_Kind, const std::string& i_rPath) : m_Kind(i_Kind), m_Path(i_rPath)
{
    TQL::Log::Format(GraphicsLog(), TQL::ELogSeverity::Detail, "Loading shader file %1%", m_Path);
    QFile file(QString::fromStdString(m_Path));
    if (!file.open(QIODevice::ReadOnly))
    {
        TQL::Log::Format(GraphicsLog(), TQL::ELogSeverity::Error, "Failed to open %1%", m_Path);
        return;
    }
    Compile(file.readAll());
}

VShader::~VShader() = default;

void VShader::Compile(const QByteArray& i_rSource)
{
    const bool bVertex = m_Kind == EShaderKind::Vertex;
    auto pShader = std::make_unique<QOpenGLShader>(bVertex ? QOpenGLShader::Vertex : QOpenGLShader::Fragment);
    if (pShader->compileSourceCode((bVertex ? VertexPreamble() : FragmentPreamble()) + i_rSource))
    {
        m_pShader = std::move(pShader);
        return;
    }
    TQL::Log::Format(GraphicsLog(), TQL::ELogSeverity::Error, "Shader Failed To Compile<%1%> Log=<%2%>", m_Path,
                     pShader->log().toStdString());
}

} // namespace CoreGraphics

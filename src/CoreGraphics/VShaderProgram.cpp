#include "CoreGraphics/VShaderProgram.h"

#include "CoreGraphics/GraphicsLog.h"
#include "CoreGraphics/VShader.h"

#include <QtCore/QPoint>
#include <QtCore/QSize>
#include <QtGui/QMatrix4x4>
#include <QtGui/QOpenGLContext>
#include <QtGui/QOpenGLFunctions>
#include <QtGui/QVector2D>
#include <QtGui/QVector3D>
#include <QtGui/QVector4D>
#include <QtOpenGL/QOpenGLShaderProgram>

#include <algorithm>
#include <string_view>

namespace CoreGraphics
{
namespace
{

// In the order of EStandardUniform and EStandardAttribute.
constexpr std::array c_UniformNames{"u_ViewProjection", "u_View",      "u_Projection",  "u_View2D", "u_ViewportSize",
                                    "u_ViewportOffset", "u_FrameSize", "u_LightVector", "u_Up",     "u_GlobalTime",
                                    "u_CameraPosition"};
constexpr std::array c_AttributeNames{"a_position", "a_normal", "a_colour", "a_uv", "a_BoneIndices", "a_BoneWeights"};
static_assert(c_UniformNames.size() == static_cast<std::size_t>(EStandardUniform::Count));
static_assert(c_AttributeNames.size() == static_cast<std::size_t>(EStandardAttribute::Count));

} // namespace

VShaderProgram::VShaderProgram(std::shared_ptr<VShader> i_pVertexShader, std::shared_ptr<VShader> i_pFragmentShader)
    : m_pVertexShader(std::move(i_pVertexShader)), m_pFragmentShader(std::move(i_pFragmentShader))
{
    m_Uniforms.fill(-1);
    m_Attributes.fill(-1);
    if (m_pVertexShader->Compiled() != nullptr && m_pFragmentShader->Compiled() != nullptr)
        Link();
}

VShaderProgram::~VShaderProgram() = default;

void VShaderProgram::Link()
{
    auto pProgram = std::make_unique<QOpenGLShaderProgram>();
    if (!pProgram->addShader(m_pVertexShader->Compiled()) || !pProgram->addShader(m_pFragmentShader->Compiled()) ||
        !pProgram->link())
    {
        TQL::Log::Format(GraphicsLog(), TQL::ELogSeverity::Error, "Shader program failed to link<%1%, %2%> Log=<%3%>",
                         m_pVertexShader->Path(), m_pFragmentShader->Path(), pProgram->log().toStdString());
        return;
    }
    m_pProgram = std::move(pProgram);
    for (std::size_t i = 0; i < c_UniformNames.size(); ++i)
        m_Uniforms[i] = m_pProgram->uniformLocation(c_UniformNames[i]);
    for (std::size_t i = 0; i < c_AttributeNames.size(); ++i)
        m_Attributes[i] = m_pProgram->attributeLocation(c_AttributeNames[i]);
    ListUniforms();
}

void VShaderProgram::ListUniforms()
{
    QOpenGLFunctions* pFunctions = QOpenGLContext::currentContext()->functions();
    const GLuint program = m_pProgram->programId();
    GLint count = 0;
    GLint maximumLength = 0;
    pFunctions->glGetProgramiv(program, GL_ACTIVE_UNIFORMS, &count);
    pFunctions->glGetProgramiv(program, GL_ACTIVE_UNIFORM_MAX_LENGTH, &maximumLength);
    std::vector<char> name(static_cast<std::size_t>(std::max(maximumLength, 1)));
    for (GLint i = 0; i < count; ++i)
    {
        GLsizei length = 0;
        GLint size = 0;
        GLenum type = 0;
        pFunctions->glGetActiveUniform(program, static_cast<GLuint>(i), static_cast<GLsizei>(name.size()), &length,
                                       &size, &type, name.data());
        const NameHash hash = HashName(std::string_view(name.data(), static_cast<std::size_t>(length)));
        const std::int32_t location = pFunctions->glGetUniformLocation(program, name.data());
        const auto place =
            std::ranges::lower_bound(m_UniformTable, hash, {}, &std::pair<NameHash, std::int32_t>::first);
        if (place != m_UniformTable.end() && place->first == hash)
            place->second = location;
        else
            m_UniformTable.insert(place, {hash, location});
    }
}

bool VShaderProgram::Bind()
{
    return m_pProgram && m_pProgram->bind();
}

void VShaderProgram::Release()
{
    if (m_pProgram)
        m_pProgram->release();
}

int VShaderProgram::UniformLocation(const char* i_pName) const
{
    return m_pProgram ? m_pProgram->uniformLocation(i_pName) : -1;
}

int VShaderProgram::UniformLocation(NameHash i_Hash) const
{
    const auto found = std::ranges::lower_bound(m_UniformTable, i_Hash, {}, &std::pair<NameHash, std::int32_t>::first);
    return found != m_UniformTable.end() && found->first == i_Hash ? found->second : -1;
}

void VShaderProgram::SetUniform(int i_Location, GLint i_Value)
{
    if (m_pProgram)
        m_pProgram->setUniformValue(i_Location, i_Value);
}

void VShaderProgram::SetUniform(int i_Location, GLuint i_Value)
{
    if (m_pProgram)
        m_pProgram->setUniformValue(i_Location, i_Value);
}

void VShaderProgram::SetUniform(int i_Location, float i_Value)
{
    if (m_pProgram)
        m_pProgram->setUniformValue(i_Location, i_Value);
}

void VShaderProgram::SetUniform(int i_Location, const QSize& i_rValue)
{
    if (m_pProgram)
        m_pProgram->setUniformValue(i_Location, i_rValue);
}

void VShaderProgram::SetUniform(int i_Location, const QPoint& i_rValue)
{
    if (m_pProgram)
        m_pProgram->setUniformValue(i_Location, i_rValue);
}

void VShaderProgram::SetUniform(int i_Location, const QVector2D& i_rValue)
{
    if (m_pProgram)
        m_pProgram->setUniformValue(i_Location, i_rValue);
}

void VShaderProgram::SetUniform(int i_Location, const QVector3D& i_rValue)
{
    if (m_pProgram)
        m_pProgram->setUniformValue(i_Location, i_rValue);
}

void VShaderProgram::SetUniform(int i_Location, const QVector4D& i_rValue)
{
    if (m_pProgram)
        m_pProgram->setUniformValue(i_Location, i_rValue);
}

void VShaderProgram::SetUniform(int i_Location, const QMatrix4x4& i_rValue)
{
    if (m_pProgram)
        m_pProgram->setUniformValue(i_Location, i_rValue);
}

} // namespace CoreGraphics

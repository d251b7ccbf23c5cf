#pragma once

#include <QtCore/QByteArray>

#include <cstdint>
#include <memory>
#include <string>

class QOpenGLShader;

namespace CoreGraphics
{

enum class EShaderKind : std::int32_t
{
    Vertex = 0,
    Fragment = 1
};

/// One compiled shader. Every source, written with attribute/varying or with in/out, is compiled as GLSL ES 3.00 behind
/// a preamble and reports its own line numbers; it must not hold a #version or a precision statement. A file that
/// cannot be read or compiled is an error in the log and leaves an empty shader. Owned by Resources and the programs
/// made of it. Render thread, with a context current at construction.
class VShader
{
public:
    /// A path of the file system or of the Qt resources (":/VertexShaders/Simple.glsl").
    VShader(EShaderKind i_Kind, const std::string& i_rPath);
    ~VShader();
    VShader(const VShader&) = delete;
    VShader& operator=(const VShader&) = delete;

    EShaderKind Kind() const { return m_Kind; }
    const std::string& Path() const { return m_Path; }
    /// Null when the shader could not be read or compiled.
    QOpenGLShader* Compiled() const { return m_pShader.get(); }

private:
    void Compile(const QByteArray& i_rSource);

    EShaderKind m_Kind;
    std::string m_Path;
    std::unique_ptr<QOpenGLShader> m_pShader;
};

} // namespace CoreGraphics

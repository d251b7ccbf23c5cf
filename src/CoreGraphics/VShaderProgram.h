#pragma once

#include "CoreGraphics/NameHash.h"

#include <QtGui/qopengl.h>

#include <array>
#include <cstddef>
#include <cstdint>
#include <memory>
#include <utility>
#include <vector>

class QMatrix4x4;
class QOpenGLContext;
class QOpenGLShaderProgram;
class QPoint;
class QSize;
class QVector2D;
class QVector3D;
class QVector4D;

namespace CoreGraphics
{

class VShader;

/// The uniforms that RenderContext::UseProgram writes into every program that has them.
enum class EStandardUniform : std::uint8_t
{
    ViewProjection,
    View,
    Projection,
    View2D,
    ViewportSize,
    ViewportOffset,
    FrameSize,
    LightVector,
    Up,
    GlobalTime,
    CameraPosition,
    Count
};

enum class EStandardAttribute : std::uint8_t
{
    Position,
    Normal,
    Colour,
    Uv,
    BoneIndices,
    BoneWeights,
    Count
};

/// A linked pair of shaders with the locations of its variables. Made and kept by Resources, shared by its users. A
/// failed link is an error in the log and leaves the program unusable: all locations are -1. Render thread, with a
/// context of the same group current.
class VShaderProgram
{
public:
    VShaderProgram(std::shared_ptr<VShader> i_pVertexShader, std::shared_ptr<VShader> i_pFragmentShader);
    ~VShaderProgram();
    VShaderProgram(const VShaderProgram&) = delete;
    VShaderProgram& operator=(const VShaderProgram&) = delete;

    bool IsLinked() const { return m_pProgram != nullptr; }
    bool Bind();
    void Release();

    /// The location of a uniform, -1 for one that the linked program does not use. By hash it costs a binary search and
    /// no text; an array stands under its name with "[0]".
    int UniformLocation(const char* i_pName) const;
    int UniformLocation(NameHash i_Hash) const;
    int UniformLocation(EStandardUniform i_Uniform) const { return m_Uniforms[static_cast<std::size_t>(i_Uniform)]; }
    int AttributeLocation(EStandardAttribute i_Attribute) const
    {
        return m_Attributes[static_cast<std::size_t>(i_Attribute)];
    }

    /// The program must be bound. Location -1 has no effect. A QSize or QPoint is a vec2.
    void SetUniform(int i_Location, GLint i_Value);
    void SetUniform(int i_Location, GLuint i_Value);
    void SetUniform(int i_Location, float i_Value);
    void SetUniform(int i_Location, const QSize& i_rValue);
    void SetUniform(int i_Location, const QPoint& i_rValue);
    void SetUniform(int i_Location, const QVector2D& i_rValue);
    void SetUniform(int i_Location, const QVector3D& i_rValue);
    void SetUniform(int i_Location, const QVector4D& i_rValue);
    void SetUniform(int i_Location, const QMatrix4x4& i_rValue);

private:
    void Link();
    void ListUniforms();

    std::shared_ptr<VShader> m_pVertexShader;
    std::shared_ptr<VShader> m_pFragmentShader;
    std::unique_ptr<QOpenGLShaderProgram> m_pProgram;
    std::array<std::int32_t, static_cast<std::size_t>(EStandardUniform::Count)> m_Uniforms;
    std::array<std::int32_t, static_cast<std::size_t>(EStandardAttribute::Count)> m_Attributes;
    std::vector<std::pair<NameHash, std::int32_t>> m_UniformTable; // sorted by hash
};

} // namespace CoreGraphics

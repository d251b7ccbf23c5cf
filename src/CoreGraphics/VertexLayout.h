#pragma once

#include "CoreGraphics/VShaderProgram.h"

#include <cstdint>
#include <initializer_list>
#include <vector>

namespace CoreGraphics
{

enum class EVertexType : std::uint8_t
{
    Float,
    Byte,
    UnsignedByte,
    Short,
    UnsignedShort,
    Int,
    UnsignedInt
};

/// One attribute of a vertex.
struct VertexAttribute
{
    EStandardAttribute Attribute = EStandardAttribute::Position;
    std::uint8_t ComponentCount = 2;
    bool bNormalised = false; ///< integers stand for 0..1 or -1..1
    EVertexType Type = EVertexType::Float;
    std::int32_t Offset = 0; ///< bytes from the start of the vertex

    friend bool operator==(const VertexAttribute&, const VertexAttribute&) = default;
};
static_assert(sizeof(VertexAttribute) == 8);

/// How the bytes of one vertex are read: at most eight attributes, and the distance in bytes from vertex to vertex. A
/// plain value. A ninth attribute is a fault of the program and ends it.
class VertexLayout
{
public:
    static constexpr std::size_t MaximumAttributes = 8;

    VertexLayout() = default;
    VertexLayout(std::initializer_list<VertexAttribute> i_Attributes, std::uint32_t i_Stride);

    /// a_position as two floats, stride 8.
    static VertexLayout TwoFloats();

    const std::vector<VertexAttribute>& Attributes() const { return m_Attributes; }
    std::uint32_t Stride() const { return m_Stride; }

    friend bool operator==(const VertexLayout&, const VertexLayout&) = default;

private:
    std::vector<VertexAttribute> m_Attributes;
    std::uint32_t m_Stride = 0;
};

} // namespace CoreGraphics

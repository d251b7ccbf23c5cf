#pragma once

#include <cstdint>

namespace CoreGraphics
{

/// Blending, culling, depth and write masks of the draws that follow. A plain value; the numbers are those that
/// ApplyRenderState turns into OpenGL's.
struct RenderState
{
    static constexpr std::uint32_t BlendNone = 0;          ///< off, unless an alpha mode is set
    static constexpr std::uint32_t BlendAlpha = 1;         ///< source alpha, one minus source alpha
    static constexpr std::uint32_t BlendAdditive = 2;      ///< source alpha, one
    static constexpr std::uint32_t BlendConstant = 3;      ///< BlendConstant times the source, one
    static constexpr std::uint32_t BlendPremultiplied = 4; ///< one, one minus source alpha

    std::uint32_t BlendMode = BlendNone;
    std::uint32_t AlphaBlendMode = 0; ///< source factor 1 unless 0; destination factor 1 for 0 and 1, else 0
    std::uint32_t CullMode = 0;       ///< 0 off, 1 front faces, other back faces
    std::uint32_t DepthFunction = 1;  ///< never, less or equal, greater, greater or equal, not equal, equal
    float BlendConstantValue = 1.0f;  ///< in all four channels, for BlendConstant
    bool bDepthTest = false;
    bool bDepthWrite = true;
    bool bColourWrite = true;
    bool bAlphaWrite = true;
};

/// How the bound two-dimensional texture is sampled. A plain value.
struct SamplerState
{
    static constexpr std::uint32_t NearestMipmapNearest = 0;
    static constexpr std::uint32_t LinearMipmapNearest = 1;
    static constexpr std::uint32_t LinearMipmapLinear = 2;
    static constexpr std::uint32_t Nearest = 3;

    std::uint32_t MinifyingFilter = Nearest;
    bool bLinearMagnification = false;
    bool bClampS = true; ///< clamp to edge, else repeat
    bool bClampT = true;
};

} // namespace CoreGraphics

#include "CoreGraphics/PixelFormat.h"

#include <algorithm>
#include <array>

namespace CoreGraphics
{
namespace
{

// Internal formats by number: an OpenGL ES header need not name them all.
constexpr GLenum c_RGB8 = 0x8051;
constexpr GLenum c_RGBA8 = 0x8058;
constexpr GLenum c_R8 = 0x8229;
constexpr GLenum c_RG8 = 0x822B;
constexpr GLenum c_R32F = 0x822E;
constexpr GLenum c_RGBA32F = 0x8814;
constexpr GLenum c_RGB32F = 0x8815;
constexpr GLenum c_RGB565 = 0x8D62;

constexpr GLenum c_Red = 0x1903;
constexpr GLenum c_RG = 0x8227;
constexpr GLenum c_UnsignedShort565 = 0x8363;

struct Row
{
    GLenum InternalFormat;
    PixelFormat Pixels;
};

constexpr std::array<Row, 8> c_Table{{
    {c_RGBA32F, {GL_RGBA, GL_FLOAT, 16}},
    {c_RGB32F, {GL_RGB, GL_FLOAT, 12}},
    {c_RGB565, {GL_RGB, c_UnsignedShort565, 2}},
    {c_RG8, {c_RG, GL_UNSIGNED_BYTE, 2}},
    {c_RGB8, {GL_RGB, GL_UNSIGNED_BYTE, 3}},
    {c_RGBA8, {GL_RGBA, GL_UNSIGNED_BYTE, 4}},
    {c_R8, {c_Red, GL_UNSIGNED_BYTE, 1}},
    {c_R32F, {c_Red, GL_FLOAT, 4}},
}};

} // namespace

std::optional<PixelFormat> FindPixelFormat(GLenum i_InternalFormat)
{
    const auto found =
        std::find_if(c_Table.begin(), c_Table.end(),
                     [i_InternalFormat](const Row& i_rRow) { return i_rRow.InternalFormat == i_InternalFormat; });
    return found == c_Table.end() ? std::nullopt : std::optional(found->Pixels);
}

} // namespace CoreGraphics

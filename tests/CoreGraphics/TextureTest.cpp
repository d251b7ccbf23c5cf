#include "CoreGraphics/GraphicsFixture.h"
#include "CoreGraphics/PixelFormat.h"
#include "CoreGraphics/Texture2D.h"

#include <QtGui/QOpenGLExtraFunctions>

#include <algorithm>
#include <cstdint>
#include <vector>

using namespace TestCoreGraphics;
using CoreGraphics::Texture2D;

namespace
{

class TextureTest : public GraphicsTest
{
protected:
    /// The texels of the texture bound at the active unit, lowest row first.
    std::vector<std::uint8_t> ReadBound(const Texture2D& i_rTexture)
    {
        QOpenGLExtraFunctions* pGl = m_pGl->Context().extraFunctions();
        GLint texture = 0;
        pGl->glGetIntegerv(GL_TEXTURE_BINDING_2D, &texture);
        GLuint framebuffer = 0;
        pGl->glGenFramebuffers(1, &framebuffer);
        pGl->glBindFramebuffer(GL_FRAMEBUFFER, framebuffer);
        pGl->glFramebufferTexture2D(GL_FRAMEBUFFER, GL_COLOR_ATTACHMENT0, GL_TEXTURE_2D, static_cast<GLuint>(texture),
                                    0);
        const int bytes = CoreGraphics::FindPixelFormat(i_rTexture.InternalFormat())->BytesPerPixel;
        std::vector<std::uint8_t> texels(static_cast<std::size_t>(i_rTexture.Width() * i_rTexture.Height() * bytes));
        m_pRender->ReadPixels(i_rTexture.InternalFormat(), QRect(0, 0, i_rTexture.Width(), i_rTexture.Height()),
                              texels.data());
        pGl->glBindFramebuffer(GL_FRAMEBUFFER, m_pFramebuffer->handle());
        pGl->glDeleteFramebuffers(1, &framebuffer);
        return texels;
    }
};

} // namespace

// Widths of 3 make rows that do not end at four bytes; the middle rows are written last, over the first upload.
TEST_F(TextureTest, RowsComeBackAsUploadedInEveryFormat)
{
    Start(4, 4);
    const std::pair<GLenum, int> formats[]{{GL_RGBA32F, 16}, {GL_RGB32F, 12}, {GL_RGB565, 2}, {GL_RG8, 2},
                                           {GL_RGB8, 3},     {GL_RGBA8, 4},   {GL_R8, 1},     {GL_R32F, 4}};
    for (const auto& [format, bytesPerTexel] : formats)
    {
        constexpr int width = 3;
        constexpr int height = 8;
        const std::size_t rowBytes = static_cast<std::size_t>(width * bytesPerTexel);
        std::vector<std::uint8_t> all(rowBytes * height);
        for (std::size_t i = 0; i < all.size(); ++i)
            all[i] = static_cast<std::uint8_t>(i % 120); // as bytes of floats these are finite
        std::vector<std::uint8_t> middle(rowBytes * 3, 0x41);

        Texture2D texture;
        ASSERT_TRUE(texture.Create(*m_pRender, format, width, height)) << std::hex << format;
        texture.UploadRows(*m_pRender, 0, height, all.data());
        texture.UploadRows(*m_pRender, 2, 5, middle.data());
        texture.UploadRows(*m_pRender, 7, 9, middle.data());  // beyond the last row
        texture.UploadRows(*m_pRender, 4, 4, middle.data());  // no row
        texture.UploadRows(*m_pRender, -1, 2, middle.data()); // before the first
        std::ranges::copy(middle, all.begin() + static_cast<std::ptrdiff_t>(rowBytes * 2));
        EXPECT_EQ(ReadBound(texture), all) << std::hex << format;
        EXPECT_TRUE(texture.Matches(format, width, height));
        EXPECT_EQ(m_pGl->Context().functions()->glGetError(), static_cast<GLenum>(GL_NO_ERROR)) << std::hex << format;
    }
}

TEST_F(TextureTest, RefusalsLeaveAnEmptyTexture)
{
    Start(4, 4);
    Texture2D texture;
    EXPECT_FALSE(texture.Bind(*m_pRender, 0));
    ASSERT_TRUE(texture.Create(*m_pRender, GL_R8, 2, 2));
    EXPECT_FALSE(texture.Create(*m_pRender, GL_DEPTH_COMPONENT, 2, 2));
    EXPECT_FALSE(texture.IsCreated());
    EXPECT_FALSE(texture.Create(*m_pRender, GL_RGBA32F, 3, 1 << 24));
    EXPECT_FALSE(texture.Create(*m_pRender, GL_RGBA32F, 0, 4));
    EXPECT_FALSE(texture.Matches(GL_RGBA32F, 0, 4));
    EXPECT_EQ(m_pGl->Context().functions()->glGetError(), static_cast<GLenum>(GL_NO_ERROR));
}

TEST_F(TextureTest, NamesAreFreedAndMovedOnce)
{
    Start(4, 4);
    QOpenGLFunctions* pGl = m_pGl->Context().functions();
    Texture2D texture;
    ASSERT_TRUE(texture.Create(*m_pRender, GL_R8, 2, 2));
    GLint name = 0;
    pGl->glGetIntegerv(GL_TEXTURE_BINDING_2D, &name);
    {
        const Texture2D moved(std::move(texture));
        EXPECT_FALSE(texture.IsCreated());
        EXPECT_TRUE(moved.Bind(*m_pRender, 2));
        EXPECT_TRUE(pGl->glIsTexture(static_cast<GLuint>(name)));
    }
    EXPECT_FALSE(pGl->glIsTexture(static_cast<GLuint>(name)));
}

TEST_F(TextureTest, ATextureOfAnotherGroupIsNotBound)
{
    Start(4, 4);
    auto pOther = std::make_unique<OffscreenContext>();
    CoreGraphics::RenderContext otherRender;
    otherRender.Initialise();
    Texture2D texture;
    ASSERT_TRUE(texture.Create(otherRender, GL_R8, 2, 2));
    ASSERT_TRUE(m_pGl->MakeCurrent());
    EXPECT_FALSE(texture.Bind(*m_pRender, 0));
    pOther.reset();
    EXPECT_FALSE(texture.IsCreated()) << "its group is gone";
}

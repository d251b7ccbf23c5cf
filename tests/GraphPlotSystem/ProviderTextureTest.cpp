#include "GraphPlotSystem/MemoryBlock.h"
#include "support/ManualPostalService.h"

#include "CoreGraphics/RenderContext.h"
#include "GraphPlotSystem/Traces/VTraceDataProvider.h"

#include <gtest/gtest.h>

#include <QtGui/QOffscreenSurface>
#include <QtGui/QOpenGLContext>
#include <QtGui/QOpenGLFunctions>

#include <array>
#include <cmath>
#include <string>
#include <vector>

using GraphPlotUI::TraceRenderInfo;
using TestSupport::Gap;
using TestSupport::MemoryBlock;
using TestSupport::Ramp;
using TQL::IResult;
namespace Result = TQL::Result;

/// What arrives in the texture, read back from OpenGL.
class ProviderTexture : public ::testing::Test
{
protected:
    void SetUp() override
    {
        m_Surface.create();
        if (!m_Gl.create() || !m_Gl.makeCurrent(&m_Surface) || m_Gl.isOpenGLES())
            GTEST_SKIP() << "no desktop OpenGL context here: textures are not tested";
        m_Context.Initialise();
    }

    void TearDown() override
    {
        if (m_Gl.isValid())
            m_Provider.ReleaseTextures();
        m_Gl.doneCurrent();
    }

    void Update(const MemoryBlock& i_rBlock, TQL::TickRange i_Ticks, std::uint8_t i_Level = 0)
    {
        m_Provider.UpdateTrace(m_Channel, i_rBlock, i_Ticks, i_Ticks, i_Level);
    }

    TraceRenderInfo Info() const
    {
        IResult result;
        TraceRenderInfo info;
        m_Provider.GetTraceRenderInfo(result, m_Channel, info);
        EXPECT_EQ(result, Result::Ok);
        return info;
    }

    /// "value/distance" of a component, in the order and number that the render info tells.
    std::string TextureText(std::uint32_t i_Component, std::uint32_t i_Components)
    {
        const TraceRenderInfo info = Info();
        IResult result;
        m_Provider.BindTraceTexture(result, m_Channel, m_Context, 0);
        EXPECT_EQ(result, Result::Ok);
        using GetTexImage = void(QOPENGLF_APIENTRYP)(GLenum, GLint, GLenum, GLenum, void*);
        const auto getTexImage = reinterpret_cast<GetTexImage>(m_Gl.getProcAddress("glGetTexImage"));
        std::vector<std::array<float, 4>> texels(std::size_t{4096} * i_Components);
        getTexImage(GL_TEXTURE_2D, 0, GL_RGBA, GL_FLOAT, texels.data());
        EXPECT_EQ(m_Gl.functions()->glGetError(), GLenum{GL_NO_ERROR});
        std::string text;
        for (std::uint32_t i = 0; i < info.SampleCount; ++i)
        {
            const std::size_t row = (info.CircularStart + i) % info.CircularCapacity;
            const std::array<float, 4>& rTexel = texels[row * i_Components + i_Component];
            text += (std::isinf(rTexel[1]) ? "-" : std::to_string(std::lround(rTexel[0]))) + "/" +
                    std::to_string(std::lround(rTexel[3])) + " ";
        }
        return text;
    }

    const TQL::IChannelInstanceId m_Channel = {"Take 1", "Marker", 1, 0, ""};
    QOffscreenSurface m_Surface;
    QOpenGLContext m_Gl;
    CoreGraphics::RenderContext m_Context;
    GraphPlotUI::VTraceDataProvider m_Provider{std::make_shared<TestSupport::ManualPostalService>()};
};

TEST_F(ProviderTexture, HoldsTheRowsAsOfTheLastUpload)
{
    MemoryBlock block(2);
    block.Append({1, 10, Gap, 20, 3, 30});
    Update(block, block.Range());
    EXPECT_EQ(Info().SampleCount, 0u) << "the renderer sees nothing before the upload";
    m_Provider.UpdateTextures(m_Context);
    EXPECT_EQ(TextureText(0, 2), "1/1 -/1 3/2 ");
    EXPECT_EQ(TextureText(1, 2), "10/1 20/1 30/1 ");
    EXPECT_EQ(Info().LongestSteps, (std::vector<std::uint32_t>{2, 1}));

    block.Append({4, 40});
    Update(block, block.Range());
    EXPECT_EQ(TextureText(1, 2), "10/1 20/1 30/1 ");
    m_Provider.UpdateTextures(m_Context);
    EXPECT_EQ(TextureText(1, 2), "10/1 20/1 30/1 40/1 ");
    const TraceRenderInfo info = Info();
    EXPECT_EQ(info.OriginTick, 0);
    EXPECT_EQ(info.TicksPerSample, 10);
    EXPECT_EQ(info.CircularCapacity, 16u) << "what few rows need";
    EXPECT_EQ(info.Level, 0);
}

TEST_F(ProviderTexture, FollowsTheRingOverItsEndAndToAnotherWidth)
{
    MemoryBlock block;
    block.Append(Ramp(0, 4090));
    Update(block, block.Range());
    m_Provider.UpdateTextures(m_Context);
    for (int step = 0; step < 4; ++step)
    {
        block.Append(Ramp(block.End(), block.End() + 3));
        block.TrimHead(block.End() - block.First() - 5);
        Update(block, block.Range());
        m_Provider.UpdateTextures(m_Context);
    }
    EXPECT_EQ(TextureText(0, 1), "4097/1 4098/1 4099/1 4100/1 4101/1 ");

    MemoryBlock wider(3);
    wider.Append({1, 2, 3, 4, 5, 6});
    Update(wider, wider.Range());
    m_Provider.UpdateTextures(m_Context);
    EXPECT_EQ(TextureText(2, 3), "3/1 6/1 ");
    EXPECT_EQ(Info().Colours.size(), 3u);
}

TEST_F(ProviderTexture, IsUploadedWholeAfterItsRelease)
{
    MemoryBlock block;
    block.Append({1, 2, 3});
    Update(block, block.Range());
    m_Provider.UpdateTextures(m_Context);
    m_Provider.ReleaseTextures();
    IResult result;
    m_Provider.BindTraceTexture(result, m_Channel, m_Context, 0);
    EXPECT_EQ(result, Result::NotAvailable);
    block.Append({4});
    Update(block, block.Range());
    m_Provider.UpdateTextures(m_Context);
    EXPECT_EQ(TextureText(0, 1), "1/1 2/1 3/1 4/1 ");
}

TEST_F(ProviderTexture, ColoursReachTheRendererWithTheNextUpload)
{
    MemoryBlock block(2);
    block.Append({1, 2});
    Update(block, block.Range());
    m_Provider.UpdateTextures(m_Context);
    const GraphPlotUI::Colour4f grey = {0.5f, 0.5f, 0.5f, 1.0f};
    const GraphPlotUI::Colour4f red = {1.0f, 0.0f, 0.0f, 1.0f};
    EXPECT_EQ(Info().Colours, (std::vector{grey, grey}));
    m_Provider.SetPalette(std::vector{red});
    IResult result;
    m_Provider.AssignTraceColour(result, {m_Channel, 1});
    m_Provider.UpdateTextures(m_Context);
    EXPECT_EQ(Info().Colours, (std::vector{grey, red}));
}

TEST_F(ProviderTexture, IsReleasedWithItsChannel)
{
    MemoryBlock block;
    block.Append({1});
    Update(block, block.Range());
    m_Provider.UpdateTextures(m_Context);
    IResult result;
    m_Provider.BindTraceTexture(result, m_Channel, m_Context, 0);
    GLint name = 0;
    m_Gl.functions()->glGetIntegerv(GL_TEXTURE_BINDING_2D, &name);
    ASSERT_NE(name, 0);
    m_Provider.RemoveTrace(m_Channel);
    m_Provider.BindTraceTexture(result, m_Channel, m_Context, 0);
    EXPECT_EQ(result, Result::NotAvailable);
    EXPECT_TRUE(m_Gl.functions()->glIsTexture(static_cast<GLuint>(name)));
    m_Provider.UpdateTextures(m_Context);
    EXPECT_FALSE(m_Gl.functions()->glIsTexture(static_cast<GLuint>(name)));
    m_Provider.BindTraceTexture(result, m_Channel, m_Context, 0);
    EXPECT_EQ(result, Result::NotFound);
}

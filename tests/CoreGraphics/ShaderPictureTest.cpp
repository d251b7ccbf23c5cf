#include "CoreGraphics/GraphicsFixture.h"

#include <QtGui/QVector4D>

using namespace TestCoreGraphics;
using CoreGraphics::EStandardAttribute;
using CoreGraphics::EVertexType;
using CoreGraphics::HashName;

namespace
{

class ShaderPictureTest : public GraphicsTest
{
};

} // namespace

// Dashes are measured in the units of the vertices: 4 on, 4 off, whatever the third and fourth coordinate are.
TEST_F(ShaderPictureTest, StippledLineCountsFromItsSourcePoint)
{
    Start(32, 1);
    QMatrix4x4 projection;
    projection.ortho(0, 32, 0, 1, -1, 1);
    m_pRender->SetProjection(projection);
    const float line[]{0, 0, 32, 0, 0, 1, 32, 1};
    CoreGraphics::VertexBuffer buffer;
    buffer.SetData(line, sizeof(line), CoreGraphics::VertexLayout::TwoFloats());
    const auto pProgram = m_Resources.GetProgram("ColoredLine", "StippledLine");
    const auto draw = [&](float i_SourceX)
    {
        m_pRender->Clear(true, false);
        EXPECT_TRUE(m_pRender->UseProgram(pProgram));
        pProgram->SetUniform(pProgram->UniformLocation(HashName("u_ModelColour")), QVector4D(1, 1, 1, 1));
        pProgram->SetUniform(pProgram->UniformLocation(HashName("u_SourcePoint")), QVector4D(i_SourceX, 0.5f, 0, 0));
        m_pRender->BindVertexBuffer(buffer);
        m_pRender->DrawVertexBuffer(GL_TRIANGLE_STRIP, buffer);
        std::string dashes;
        for (int x = 0; x < 32; ++x)
            dashes += PixelAt(x, 0)[0] == 1.0f ? '#' : '.';
        return dashes;
    };
    EXPECT_EQ(draw(0.0f), "####....####....####....####....");
    EXPECT_EQ(draw(16.0f), "....####....########....####....");
}

// Light from above 0.8, from below 0.2, from the camera 0.5, ambient 0.2; a normal that faces away adds nothing.
TEST_F(ShaderPictureTest, LightingSumsItsFourParts)
{
    struct Case
    {
        QVector3D Normal;
        float Lighting;
    };
    const Case cases[]{
        {{0, 1, 0}, 1.0f}, {{0, -1, 0}, 0.4f}, {{0, 0, 2}, 0.7f}, {{0, 0, -1}, 0.2f}, {{0, 0.6f, 0.8f}, 1.08f}};
    Start(9, 9);
    QMatrix4x4 view;
    view.translate(0, 0, -1e6f); // the camera far away on the z axis looks at the origin
    QMatrix4x4 projection;
    projection.ortho(-1, 1, -1, 1, 0, 2e6f);
    m_pRender->SetView(view);
    m_pRender->SetProjection(projection);
    m_pRender->SetUp(QVector3D(0, 1, 0));
    const auto pProgram = m_Resources.GetProgram("Simple3DModelColour", "SimpleLighting");
    for (const Case& rCase : cases)
    {
        std::vector<float> vertices;
        for (const auto& [x, y] : {std::pair(-1.f, -1.f), {1.f, -1.f}, {-1.f, 1.f}, {1.f, 1.f}})
            vertices.insert(vertices.end(), {x, y, 0.0f, rCase.Normal.x(), rCase.Normal.y(), rCase.Normal.z()});
        CoreGraphics::VertexBuffer buffer;
        buffer.SetData(vertices.data(), vertices.size() * sizeof(float),
                       {{{EStandardAttribute::Position, 3, false, EVertexType::Float, 0},
                         {EStandardAttribute::Normal, 3, false, EVertexType::Float, 12}},
                        24});
        ASSERT_TRUE(m_pRender->UseProgram(pProgram));
        pProgram->SetUniform(pProgram->UniformLocation("u_ModelTransform"), QMatrix4x4());
        pProgram->SetUniform(pProgram->UniformLocation("u_ModelColour"), QVector4D(1.0f, 0.5f, 0.0f, 0.25f));
        m_pRender->BindVertexBuffer(buffer);
        m_pRender->DrawVertexBuffer(GL_TRIANGLE_STRIP, buffer);
        const Pixel pixel = PixelAt(4, 4);
        EXPECT_NEAR(pixel[0], rCase.Lighting, 1e-4f);
        EXPECT_NEAR(pixel[1], rCase.Lighting / 2, 1e-4f);
        EXPECT_EQ(pixel[3], 0.25f) << "alpha is not lit";
    }
}

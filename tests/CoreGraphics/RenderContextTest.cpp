#include "CoreGraphics/GraphicsFixture.h"

#include <QtGui/QOpenGLFunctions>
#include <QtGui/QVector4D>
#include <QtOpenGL/QOpenGLBuffer>

#include <cmath>
#include <cstdint>
#include <functional>
#include <iterator>
#include <sstream>

using namespace TestCoreGraphics;
using CoreGraphics::EStandardAttribute;
using CoreGraphics::EVertexType;
using CoreGraphics::RenderState;
using CoreGraphics::VertexBuffer;
using CoreGraphics::VertexLayout;

namespace
{

constexpr GLenum c_VertexArrayBinding = 0x85B5;
constexpr GLenum c_PixelUnpackBufferBinding = 0x88EF;

class RenderContextTest : public GraphicsTest
{
protected:
    void UseFlat(const QVector4D& i_rColour)
    {
        const auto pProgram = m_Resources.GetProgram("Simple", "UniformColour");
        ASSERT_TRUE(m_pRender->UseProgram(pProgram));
        pProgram->SetUniform(pProgram->UniformLocation(CoreGraphics::HashName("u_colour")), i_rColour);
    }

    /// What a frame could leave behind, as text.
    std::string StateText()
    {
        QOpenGLFunctions* pGl = m_pGl->Context().functions();
        std::ostringstream text;
        const auto integer = [&](const char* i_pName, GLenum i_Name)
        {
            GLint values[4]{};
            pGl->glGetIntegerv(i_Name, values);
            text << i_pName << '=' << values[0] << ' ';
        };
        integer("program", GL_CURRENT_PROGRAM);
        integer("array", GL_ARRAY_BUFFER_BINDING);
        integer("elements", GL_ELEMENT_ARRAY_BUFFER_BINDING);
        integer("unpackBuffer", c_PixelUnpackBufferBinding);
        integer("vao", c_VertexArrayBinding);
        integer("unpack", GL_UNPACK_ALIGNMENT);
        integer("pack", GL_PACK_ALIGNMENT);
        integer("unit", GL_ACTIVE_TEXTURE);
        integer("depthMask", GL_DEPTH_WRITEMASK);
        integer("cullFace", GL_CULL_FACE_MODE);
        integer("source", GL_BLEND_SRC_RGB);
        integer("destination", GL_BLEND_DST_ALPHA);
        for (const GLenum capability : {GL_BLEND, GL_DEPTH_TEST, GL_CULL_FACE, GL_SCISSOR_TEST, GL_STENCIL_TEST})
            text << int{pGl->glIsEnabled(capability)};
        GLboolean mask[4]{};
        pGl->glGetBooleanv(GL_COLOR_WRITEMASK, mask);
        text << " mask=" << int{mask[0]} << int{mask[1]} << int{mask[2]} << int{mask[3]} << " textures=";
        for (GLenum unit = 0; unit < 4; ++unit)
        {
            GLint texture = 0;
            pGl->glActiveTexture(GL_TEXTURE0 + unit);
            pGl->glGetIntegerv(GL_TEXTURE_BINDING_2D, &texture);
            text << (texture != 0);
        }
        pGl->glActiveTexture(GL_TEXTURE0);
        text << " arrays=";
        for (GLuint i = 0; i < 8; ++i)
        {
            GLint enabled = 0;
            pGl->glGetVertexAttribiv(i, GL_VERTEX_ATTRIB_ARRAY_ENABLED, &enabled);
            text << enabled;
        }
        return text.str();
    }
};

} // namespace

TEST_F(RenderContextTest, AFrameLeavesNothingBehindAndDrawsOnEveryProfile)
{
    for (const QSurfaceFormat& rFormat : {QSurfaceFormat(), CoreFormat(4, 5), CoreFormat(3, 3)})
    {
        Start(4, 4, rFormat);
        const std::string clean = StateText();
        RenderState state;
        state.BlendMode = RenderState::BlendAlpha;
        state.CullMode = 2;
        state.bDepthTest = true;
        state.bDepthWrite = false;
        state.bAlphaWrite = false;
        UseFlat({0.25f, 0.5f, 0.75f, 1.0f});
        m_pRender->ApplyRenderState(state);
        m_pRender->SetScissor(QRect(0, 0, 2, 4));
        const float white = 1.0f;
        for (const unsigned unit : {0u, 3u})
        {
            m_pRender->BindTexture(unit, m_pRender->CreateTexture(GL_R32F, 1, 1));
            m_pRender->UploadSubImage(GL_R32F, QRect(0, 0, 1, 1), &white);
        }
        DrawQuad();
        EXPECT_NE(StateText(), clean);
        EXPECT_EQ(PixelAt(1, 1), (Pixel{0.25f, 0.5f, 0.75f, 0.0f}));
        EXPECT_EQ(PixelAt(2, 1), (Pixel{})) << "outside the scissor";
        m_pRender->ResetState();
        EXPECT_EQ(StateText(), clean);
        EXPECT_THAT(clean, ::testing::HasSubstr("program=0 array=0 elements=0 unpackBuffer=0 vao=0 unpack=4 pack=4"));
        EXPECT_THAT(clean, ::testing::HasSubstr("00000 mask=1111 textures=0000 arrays=00000000"));
        EXPECT_EQ(m_pGl->Context().functions()->glGetError(), static_cast<GLenum>(GL_NO_ERROR));
        m_Log.Take(); // the 3.3 context is named
    }
}

TEST_F(RenderContextTest, BlendModes)
{
    struct Case
    {
        std::uint32_t Mode;
        std::uint32_t AlphaMode;
        Pixel Expected; // of source (0.5, 0.5, 0.5, 0.25) with constant 0.5 over destination (1, 0.5, 0, 0.5)
    };
    const Case cases[]{
        {0, 0, {0.5f, 0.5f, 0.5f, 0.25f}},      {1, 0, {0.875f, 0.5f, 0.125f, 0.5f}},
        {1, 1, {0.875f, 0.5f, 0.125f, 0.75f}},  {1, 2, {0.875f, 0.5f, 0.125f, 0.25f}},
        {2, 0, {1.125f, 0.625f, 0.125f, 0.5f}}, {3, 0, {1.25f, 0.75f, 0.25f, 0.5f}},
        {4, 0, {1.25f, 0.875f, 0.5f, 0.5f}},    {0, 1, {0.5f, 0.5f, 0.5f, 0.75f}},
    };
    Start(1, 1);
    for (const Case& rCase : cases)
    {
        UseFlat({1.0f, 0.5f, 0.0f, 0.5f});
        m_pRender->ApplyRenderState({});
        DrawQuad();
        UseFlat({0.5f, 0.5f, 0.5f, 0.25f});
        RenderState state;
        state.BlendMode = rCase.Mode;
        state.AlphaBlendMode = rCase.AlphaMode;
        state.BlendConstantValue = 0.5f;
        m_pRender->ApplyRenderState(state);
        DrawQuad();
        EXPECT_EQ(PixelAt(0, 0), rCase.Expected) << rCase.Mode << " " << rCase.AlphaMode;
    }
}

TEST_F(RenderContextTest, MasksCullingAndClear)
{
    Start(1, 1);
    const auto draw = [this](std::function<void(RenderState&)> i_Change)
    {
        m_pRender->SetClearColour(QColor(0, 0, 0, 0));
        m_pRender->Clear(true, true); // whatever masks the former draw has left
        UseFlat({1.0f, 1.0f, 1.0f, 1.0f});
        RenderState state;
        i_Change(state);
        m_pRender->ApplyRenderState(state);
        DrawQuad(); // counter-clockwise: a front face
        return PixelAt(0, 0);
    };
    EXPECT_EQ(draw([](RenderState& o_rState) { o_rState.bColourWrite = false; }), (Pixel{0, 0, 0, 1}));
    EXPECT_EQ(draw([](RenderState& o_rState) { o_rState.bAlphaWrite = false; }), (Pixel{1, 1, 1, 0}));
    EXPECT_EQ(draw([](RenderState& o_rState) { o_rState.CullMode = 1; }), (Pixel{0, 0, 0, 0}));
    EXPECT_EQ(draw([](RenderState& o_rState) { o_rState.CullMode = 2; }), (Pixel{1, 1, 1, 1}));
    EXPECT_EQ(draw([](RenderState&) {}), (Pixel{1, 1, 1, 1}));
}

TEST_F(RenderContextTest, StandardUniformsFollowTheContextAtTheNextUseProgram)
{
    struct Case
    {
        const char* pExpression;
        Pixel Expected;
    };
    const Case cases[]{
        {"vec4(u_ViewportSize, u_ViewportOffset)", {3, 2, 1, 1}},
        {"vec4(u_FrameSize, u_GlobalTime, 0.0)", {640, 480, 1.5f, 0}},
        {"u_View2D", {1, 2, 3, 4}},
        {"vec4(u_LightVector, u_Up.y)", {5, 6, 7, 8}},
        {"vec4(u_CameraPosition, 1.0)", {-10, -20, -30, 1}},
        {"u_View * vec4(0.0, 0.0, 0.0, 1.0)", {10, 20, 30, 1}},
        {"u_Projection * vec4(1.0)", {2, 3, 4, 1}},
        {"u_ViewProjection * vec4(0.0, 0.0, 0.0, 1.0)", {20, 60, 120, 1}},
    };
    const std::string declarations =
        "uniform mat4 u_ViewProjection; uniform mat4 u_View; uniform mat4 u_Projection; uniform vec4 u_View2D;\n"
        "uniform vec2 u_ViewportSize; uniform vec2 u_ViewportOffset; uniform vec2 u_FrameSize;\n"
        "uniform vec3 u_LightVector; uniform vec3 u_Up; uniform float u_GlobalTime; uniform vec3 u_CameraPosition;\n";
    m_Folder.Write("VertexShaders/Simple.glsl", "attribute vec4 a_position; void main() { gl_Position = a_position; }");
    for (std::size_t i = 0; i < std::size(cases); ++i)
    {
        const std::string path = "FragmentShaders/Case" + std::to_string(i) + ".glsl";
        const std::string source = declarations + "void main() { gl_FragColor = " + cases[i].pExpression + "; }";
        m_Folder.Write(path.c_str(), source.c_str());
    }
    Start(5, 4);
    m_pRender->SetViewport(QRect(1, 1, 3, 2));
    m_pRender->SetFrameSize(QSize(640, 480));
    m_pRender->SetGlobalTime(1.5f);
    m_pRender->SetView2D(QVector4D(1, 2, 3, 4));
    m_pRender->SetLightVector(QVector3D(5, 6, 7));
    m_pRender->SetUp(QVector3D(0, 8, 0));
    QMatrix4x4 view;
    view.translate(10, 20, 30);
    QMatrix4x4 projection;
    projection.scale(2, 3, 4);

    const auto run = [&](std::size_t i_Case)
    {
        EXPECT_TRUE(m_pRender->UseProgram(m_Resources.GetProgram("Simple", "Case" + std::to_string(i_Case))));
        DrawQuad();
        return PixelAt(2, 2);
    };
    EXPECT_EQ(run(5), (Pixel{0, 0, 0, 1}));
    m_pRender->SetView(view);
    m_pRender->SetProjection(projection);
    DrawQuad();
    EXPECT_EQ(PixelAt(2, 2), (Pixel{0, 0, 0, 1})) << "matrices wait for UseProgram";
    for (std::size_t i = 0; i < std::size(cases); ++i)
        EXPECT_EQ(run(i), cases[i].Expected) << cases[i].pExpression;
    EXPECT_EQ(PixelAt(0, 0), (Pixel{})) << "outside the viewport";
    EXPECT_EQ(PixelAt(4, 2), (Pixel{}));
}

// Two attributes of one buffer, then a buffer with one: the colour array must not stay on for the second.
TEST_F(RenderContextTest, InterleavedAttributesIndicesAndInstances)
{
    struct Vertex
    {
        float Position[2];
        std::uint8_t Colour[4];
    };
    const Vertex vertices[]{{{-1, -1}, {255, 0, 255, 255}},
                            {{1, -1}, {255, 0, 255, 255}},
                            {{-1, 1}, {255, 0, 255, 255}},
                            {{1, 1}, {255, 0, 255, 255}}};
    m_Folder.Write("VertexShaders/Columns.glsl",
                   "attribute vec4 a_position; void main() { float x = (a_position.x * 0.5 + 0.5 + "
                   "float(gl_InstanceID) * 2.0) / 8.0; gl_Position = vec4(x * 2.0 - 1.0, a_position.y, 0.0, 1.0); }");
    m_Folder.Write("VertexShaders/Colours.glsl", "attribute vec4 a_position; attribute vec4 a_colour; varying vec4 "
                                                 "v_colour; void main() { gl_Position = a_position; v_colour = "
                                                 "a_colour; }");
    m_Folder.Write("FragmentShaders/Colour.glsl", "varying vec4 v_colour; void main() { gl_FragColor = v_colour; }");
    m_Folder.Write("FragmentShaders/White.glsl", "void main() { gl_FragColor = vec4(1.0); }");
    Start(8, 1);

    const VertexLayout layout({{EStandardAttribute::Position, 2, false, EVertexType::Float, 0},
                               {EStandardAttribute::Normal, 2, false, EVertexType::Float, 0}, // not in the program
                               {EStandardAttribute::Colour, 4, true, EVertexType::UnsignedByte, 8}},
                              sizeof(Vertex));
    VertexBuffer buffer;
    ASSERT_TRUE(buffer.Resize(4, layout));
    buffer.Write(vertices, 0, sizeof(vertices));
    const std::uint8_t junk[sizeof(vertices) + 1]{};
    buffer.Write(junk, 0, sizeof(junk)); // too long: ignored
    buffer.Write(junk, sizeof(vertices), 1);
    buffer.Write(junk, ~std::uint64_t{0}, 2);
    EXPECT_EQ(buffer.VertexCount(), 4u);

    QOpenGLBuffer indices(QOpenGLBuffer::IndexBuffer);
    const std::uint16_t order[]{0, 1, 2, 2, 1, 3};
    indices.create();
    indices.bind();
    indices.allocate(order, sizeof(order));
    indices.release();
    ASSERT_TRUE(m_pRender->UseProgram(m_Resources.GetProgram("Colours", "Colour")));
    m_pRender->BindVertexBuffer(buffer);
    m_pRender->DrawIndexed(GL_TRIANGLES, indices, 6, GL_UNSIGNED_SHORT);
    EXPECT_EQ(PixelAt(5, 0), (Pixel{1.0f, 0.0f, 1.0f, 1.0f}));

    m_pRender->Clear(true, false);
    ASSERT_TRUE(m_pRender->UseProgram(m_Resources.GetProgram("Columns", "White")));
    DrawQuad(3);
    GLint enabled = 0;
    m_pGl->Context().functions()->glGetVertexAttribiv(1, GL_VERTEX_ATTRIB_ARRAY_ENABLED, &enabled);
    EXPECT_EQ(enabled, 0);
    std::string columns;
    for (int x = 0; x < 8; ++x)
        columns += PixelAt(x, 0)[0] == 1.0f ? '#' : '.';
    EXPECT_EQ(columns, "#.#.#...");
    EXPECT_EQ(m_pGl->Context().functions()->glGetError(), static_cast<GLenum>(GL_NO_ERROR));
}

TEST_F(RenderContextTest, ADebugContextSaysSoAndDrainsTheDriversMessages)
{
    const QSurfaceFormat former = QSurfaceFormat::defaultFormat();
    QSurfaceFormat format = former;
    format.setOption(QSurfaceFormat::DebugContext);
    QSurfaceFormat::setDefaultFormat(format);
    Start(1, 1, format);
    QSurfaceFormat::setDefaultFormat(former);
    const auto started = m_Log.Take();
    ASSERT_GE(started.size(), 2u);
    EXPECT_EQ(started[0].Text, "Debug OpenGL context requested");
    EXPECT_EQ(started[0].Severity, TQL::ELogSeverity::Information);
    if (started[1].Text == "GL_KHR_debug not available")
        return;
    EXPECT_EQ(started[1].Text, "Initialising debug logger");

    m_pGl->Context().functions()->glEnable(0xFFFF); // an error that the driver reports
    m_pRender->SetViewport(QRect(0, 0, 1, 1));
    const auto messages = m_Log.Take();
    ASSERT_FALSE(messages.empty());
    EXPECT_EQ(messages.back().Category, "CoreGraphics");
    EXPECT_EQ(messages.back().Severity, TQL::ELogSeverity::Error);
}

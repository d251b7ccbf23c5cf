#include "CoreGraphics/GraphicsFixture.h"

#include <QtCore/QDirIterator>

#include <algorithm>

using namespace TestCoreGraphics;
using CoreGraphics::Resources;

namespace
{

constexpr const char* c_AnyVertex = "attribute vec4 a_position; void main() { gl_Position = a_position; }";

std::string FragmentWithUniform(const std::string& i_rName)
{
    return "uniform vec4 " + i_rName + "; void main() { gl_FragColor = " + i_rName + "; }";
}

class ResourcesTest : public ::testing::Test
{
protected:
    void SetUp() override
    {
        if (!HasOpenGL())
            GTEST_SKIP() << "no OpenGL context can be made here: run under an X server (xvfb-run)";
    }

    TestSupport::LogGuard m_Log;
};

} // namespace

TEST_F(ResourcesTest, EveryBuiltInShaderCompilesAndEveryPairInUseLinks)
{
    const std::pair<const char*, const char*> pairs[]{
        {"Simple", "UniformColour"},
        {"SimpleColour", "Colour"},
        {"Simple3D", "UniformColour"},
        {"Simple3DPointSize", "UniformColour"},
        {"Simple3DUniformColour", "Colour"},
        {"Simple3DVertexColour", "Colour"},
        {"Simple3DModel", "SimpleLighting"},
        {"Simple3DModel", "Colour"},
        {"Simple3DModelColour", "SimpleLighting"},
        {"Simple3DModelColour", "Colour"},
        {"Simple3DModelWireframe", "Colour"},
        {"ColoredLine", "StippledLine"},
    };
    for (const QSurfaceFormat& rFormat : {QSurfaceFormat(), CoreFormat(4, 5)})
    {
        const OffscreenContext gl(rFormat);
        ASSERT_TRUE(gl.IsCurrent());
        Resources resources(true);
        resources.Initialise();
        for (const auto& [vertex, fragment] : pairs)
        {
            const auto pProgram = resources.GetProgram(vertex, fragment);
            ASSERT_TRUE(pProgram) << vertex << " " << fragment;
            EXPECT_TRUE(pProgram->IsLinked()) << vertex << " " << fragment;
            EXPECT_EQ(resources.GetProgram(vertex, fragment), pProgram) << "linked once";
        }
        EXPECT_FALSE(resources.GetProgram("Simple", "NoSuchShader"));
        EXPECT_FALSE(resources.GetProgram("NoSuchShader", "Colour"));
    }
}

TEST_F(ResourcesTest, SourcesLeavePrecisionToThePreamble)
{
    for (const char* pFolder : {":/VertexShaders", ":/FragmentShaders"})
    {
        int count = 0;
        for (QDirIterator files(pFolder); files.hasNext(); ++count)
        {
            QFile file(files.next());
            ASSERT_TRUE(file.open(QIODevice::ReadOnly));
            const QByteArray source = file.readAll();
            EXPECT_FALSE(source.contains("precision") || source.contains("#version")) << file.fileName().toStdString();
        }
        EXPECT_GE(count, 4) << pFolder;
    }
}

TEST_F(ResourcesTest, AnOldDesktopContextIsNamedAndStillRenders)
{
    OffscreenContext gl(CoreFormat(3, 3));
    ASSERT_TRUE(gl.IsCurrent());
    if (gl.Context().format().version() >= std::pair(4, 3))
        GTEST_SKIP() << "this driver gives no version below 4.3";
    Resources resources(false);
    resources.Initialise();
    const auto entries = m_Log.Take();
    ASSERT_EQ(entries.size(), 1u);
    EXPECT_EQ(entries[0].Category, "CoreGraphics");
    EXPECT_EQ(entries[0].Severity, TQL::ELogSeverity::Warning);
    EXPECT_EQ(entries[0].Text, "OpenGL context version 3.3 is unsupported");
    const auto pProgram = resources.GetProgram("Simple3DPointSize", "UniformColour");
    EXPECT_TRUE(pProgram && pProgram->IsLinked());
}

TEST_F(ResourcesTest, OneExternalVertexShaderSwitchesTheBuiltInSetOff)
{
    ShaderFolder folder;
    folder.Write("VertexShaders/Mine.glsl", c_AnyVertex);
    for (const bool bUseSearchFolders : {true, false})
    {
        const OffscreenContext gl;
        Resources resources(bUseSearchFolders);
        resources.AddSearchFolder(folder.Path());
        resources.Initialise();
        EXPECT_EQ(resources.GetProgram("Simple", "UniformColour") == nullptr, bUseSearchFolders);
        EXPECT_FALSE(resources.GetProgram("Mine", "UniformColour")) << "fragment shaders are built in, all or nothing";
    }
}

TEST_F(ResourcesTest, ExternalFragmentShadersAloneAreReplacedByTheBuiltInOnes)
{
    ShaderFolder folder;
    folder.Write("FragmentShaders/UniformColour.glsl", FragmentWithUniform("u_mine").c_str());
    folder.Write("FragmentShaders/Mine.glsl", FragmentWithUniform("u_mine").c_str());
    const OffscreenContext gl;
    Resources resources(true);
    resources.AddSearchFolder(folder.Path());
    resources.Initialise();
    EXPECT_NE(resources.GetProgram("Simple", "UniformColour")->UniformLocation("u_colour"), -1);
    EXPECT_NE(resources.GetProgram("Simple", "Mine")->UniformLocation("u_mine"), -1);
}

TEST_F(ResourcesTest, LaterFoldersWinAndOtherSuffixesAreSkipped)
{
    ShaderFolder first;
    first.Write("VertexShaders/Plain.glsl", c_AnyVertex);
    first.Write("VertexShaders/Plain.vert", "no shader at all");
    first.Write("VertexShaders/Plain.glsl.bak", "no shader at all");
    first.Write("FragmentShaders/Shared.glsl", FragmentWithUniform("u_first").c_str());
    first.Write("FragmentShaders/OnlyFirst.glsl", FragmentWithUniform("u_first").c_str());
    ShaderFolder second;
    second.Write("FragmentShaders/Shared.glsl", FragmentWithUniform("u_second").c_str());
    const OffscreenContext gl;
    Resources resources(true);
    for (const std::string& rFolder : {first.Path(), std::string("/no/such/folder"), second.Path()})
        resources.AddSearchFolder(rFolder);
    resources.Initialise();

    const auto pShared = resources.GetProgram("Plain", "Shared");
    EXPECT_EQ(pShared->UniformLocation("u_first"), -1);
    EXPECT_NE(pShared->UniformLocation("u_second"), -1);
    EXPECT_NE(resources.GetProgram("Plain", "OnlyFirst")->UniformLocation("u_first"), -1);
}

TEST_F(ResourcesTest, ABrokenShaderIsNamedWithItsOwnLineAndLeavesTheProgramUnusable)
{
    ShaderFolder folder;
    folder.Write("VertexShaders/Broken.glsl", "attribute vec4 a_position;\nvoid main()\n{\n    oops;\n}\n");
    folder.Write("VertexShaders/Whole.glsl", c_AnyVertex);
    folder.Write("FragmentShaders/Flat.glsl", FragmentWithUniform("u_colour").c_str());
    folder.Write("FragmentShaders/Unmatched.glsl", "varying vec4 v_missing; void main() { gl_FragColor = v_missing; }");
    const OffscreenContext gl;
    Resources resources(true);
    resources.AddSearchFolder(folder.Path());
    resources.Initialise();
    auto entries = m_Log.Take();
    ASSERT_EQ(entries.size(), 1u);
    EXPECT_THAT(entries[0].Text, ::testing::StartsWith("Shader Failed To Compile<" + folder.Path() +
                                                       "/VertexShaders/Broken.glsl> Log=<"));
    EXPECT_THAT(entries[0].Text, ::testing::ContainsRegex("0:4[(:]"));

    const std::pair<const char*, const char*> unusable[]{{"Broken", "Flat"}, {"Whole", "Unmatched"}};
    CoreGraphics::RenderContext render;
    render.Initialise();
    for (const auto& [vertex, fragment] : unusable)
    {
        const auto pProgram = resources.GetProgram(vertex, fragment);
        ASSERT_TRUE(pProgram);
        EXPECT_FALSE(render.UseProgram(pProgram));
        EXPECT_EQ(pProgram->UniformLocation("u_colour"), -1);
        EXPECT_EQ(pProgram->UniformLocation(CoreGraphics::HashName("u_colour")), -1);
        pProgram->SetUniform(-1, 1.0f);
    }
    entries = m_Log.Take();
    ASSERT_EQ(entries.size(), 1u) << "the failed link is told, the failed shader was";
    EXPECT_FALSE(render.UseProgram(nullptr));
}

TEST_F(ResourcesTest, UniformsAreFoundByNameAndByHashAlike)
{
    const OffscreenContext gl;
    Resources resources(false);
    resources.Initialise();
    const auto pProgram = resources.GetProgram("Simple3DModelColour", "SimpleLighting");
    int found = 0;
    for (const char* pName : {"u_ViewProjection", "u_ModelTransform", "u_ModelColour", "u_Up", "u_CameraPosition",
                              "u_NotThere", "", "u_ModelColou"})
    {
        EXPECT_EQ(pProgram->UniformLocation(CoreGraphics::HashName(pName)), pProgram->UniformLocation(pName)) << pName;
        found += pProgram->UniformLocation(pName) != -1;
    }
    EXPECT_EQ(found, 5);
}

TEST_F(ResourcesTest, ContextsThatDoNotShareHaveProgramsOfTheirOwn)
{
    Resources resources(false);
    OffscreenContext first;
    resources.Initialise();
    const auto pFirst = resources.GetProgram("Simple3D", "UniformColour");
    {
        const OffscreenContext second;
        EXPECT_FALSE(resources.GetProgram("Simple3D", "UniformColour")) << "not initialised for this group";
        resources.Initialise();
        const auto pSecond = resources.GetProgram("Simple3D", "UniformColour");
        ASSERT_TRUE(pSecond && pSecond->IsLinked());
        EXPECT_NE(pSecond, pFirst);
    }
    ASSERT_TRUE(first.MakeCurrent());
    EXPECT_EQ(resources.GetProgram("Simple3D", "UniformColour"), pFirst);
    first.Context().doneCurrent();
    EXPECT_FALSE(resources.GetProgram("Simple3D", "UniformColour")) << "no context";
    resources.Initialise();
}

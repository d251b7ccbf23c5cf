#pragma once

#include "CoreGraphics/RenderContext.h"
#include "CoreGraphics/Resources.h"
#include "support/LogGuard.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <QtCore/QDir>
#include <QtCore/QFile>
#include <QtCore/QTemporaryDir>
#include <QtGui/QColor>
#include <QtGui/QOffscreenSurface>
#include <QtGui/QOpenGLContext>
#include <QtGui/QSurfaceFormat>
#include <QtOpenGL/QOpenGLFramebufferObject>

#include <array>
#include <memory>
#include <string>
#include <utility>
#include <vector>

namespace TestCoreGraphics
{

/// An OpenGL context without a window, current while it lives unless another one is made so.
class OffscreenContext
{
public:
    explicit OffscreenContext(const QSurfaceFormat& i_rFormat = {})
    {
        m_Context.setFormat(i_rFormat);
        m_Surface.setFormat(i_rFormat);
        m_Surface.create();
        m_bCurrent = m_Context.create() && MakeCurrent();
    }

    bool IsCurrent() const { return m_bCurrent; }
    bool MakeCurrent() { return m_Context.makeCurrent(&m_Surface); }
    QOpenGLContext& Context() { return m_Context; }

private:
    QOffscreenSurface m_Surface;
    QOpenGLContext m_Context;
    bool m_bCurrent = false;
};

inline QSurfaceFormat CoreFormat(int i_Major, int i_Minor)
{
    QSurfaceFormat format;
    format.setVersion(i_Major, i_Minor);
    format.setProfile(QSurfaceFormat::CoreProfile);
    return format;
}

inline bool HasOpenGL()
{
    return OffscreenContext().IsCurrent();
}

/// A folder of shader sources that a Resources object searches.
class ShaderFolder
{
public:
    /// i_pPath as in "VertexShaders/Name.glsl".
    void Write(const char* i_pPath, const char* i_pSource)
    {
        QDir(m_Folder.path()).mkpath(QFileInfo(QString(i_pPath)).path());
        QFile file(m_Folder.filePath(i_pPath));
        ASSERT_TRUE(file.open(QIODevice::WriteOnly));
        file.write(i_pSource);
    }
    std::string Path() const { return m_Folder.path().toStdString(); }

private:
    QTemporaryDir m_Folder;
};

/// A context, resources with one search folder, and a framebuffer of floats to draw into. Skips its test where there is
/// no OpenGL.
class GraphicsTest : public ::testing::Test
{
protected:
    using Pixel = std::array<float, 4>;

    void SetUp() override
    {
        if (!HasOpenGL())
            GTEST_SKIP() << "no OpenGL context can be made here: run under an X server (xvfb-run)";
    }

    void Start(int i_Width, int i_Height, const QSurfaceFormat& i_rFormat = {})
    {
        m_pRender.reset();
        m_pFramebuffer.reset();
        m_pGl.reset();
        m_pGl = std::make_unique<OffscreenContext>(i_rFormat);
        ASSERT_TRUE(m_pGl->IsCurrent());
        m_Resources.AddSearchFolder(m_Folder.Path());
        m_Resources.Initialise();
        m_pFramebuffer = std::make_unique<QOpenGLFramebufferObject>(
            i_Width, i_Height, QOpenGLFramebufferObject::NoAttachment, GL_TEXTURE_2D, GL_RGBA32F);
        ASSERT_TRUE(m_pFramebuffer->bind());
        m_pRender = std::make_unique<CoreGraphics::RenderContext>();
        m_pRender->Initialise();
        m_pRender->ResetState();
        m_pRender->SetViewport(QRect(0, 0, i_Width, i_Height));
        m_pRender->SetClearColour(QColor(0, 0, 0, 0));
        m_pRender->Clear(true, true);
    }

    /// Row 0 is the lowest, as OpenGL has it.
    Pixel PixelAt(int i_X, int i_Y)
    {
        Pixel pixel{};
        m_pRender->ReadPixels(GL_RGBA32F, QRect(i_X, i_Y, 1, 1), pixel.data());
        return pixel;
    }

    /// Covers the viewport of a program that takes positions as given.
    void DrawQuad(int i_FurtherInstances = 0)
    {
        const float corners[]{-1, -1, 1, -1, -1, 1, 1, 1};
        CoreGraphics::VertexBuffer quad;
        quad.SetData(corners, sizeof(corners), CoreGraphics::VertexLayout::TwoFloats());
        m_pRender->BindVertexBuffer(quad);
        m_pRender->DrawVertexBuffer(GL_TRIANGLE_STRIP, quad);
        m_pRender->DrawInstanced(GL_TRIANGLE_STRIP, 4, i_FurtherInstances);
    }

    ShaderFolder m_Folder;
    TestSupport::LogGuard m_Log;
    std::unique_ptr<OffscreenContext> m_pGl;
    CoreGraphics::Resources m_Resources{true};
    std::unique_ptr<QOpenGLFramebufferObject> m_pFramebuffer;
    std::unique_ptr<CoreGraphics::RenderContext> m_pRender;
};

} // namespace TestCoreGraphics

#pragma once

#include "CoreGraphics/RenderContext.h"
#include "CoreGraphics/Resources.h"
#include "GraphPlotUI/Frame/VBaseGraphRenderType.h"
#include "GraphPlotUI/RegisterResources.h"
#include "RingProvider.h"
#include "support/LogGuard.h"

#include <gtest/gtest.h>

#include <QtCore/QVariant>
#include <QtGui/QColor>
#include <QtGui/QImage>
#include <QtGui/QOffscreenSurface>
#include <QtGui/QOpenGLContext>
#include <QtOpenGL/QOpenGLFramebufferObject>

#include <initializer_list>
#include <memory>
#include <string>
#include <vector>

namespace TestGraphPlotUI
{

/// Renders graph items into a framebuffer as a window's renderer would, without a window. Skips its test where there is
/// no OpenGL.
class PlotTest : public ::testing::Test
{
protected:
    void SetUp() override
    {
        GraphPlotUI::RegisterGraphPlotResources();
        m_Surface.create();
        if (!m_Gl.create() || !m_Gl.makeCurrent(&m_Surface))
            GTEST_SKIP() << "no OpenGL context can be made here: run under an X server (xvfb-run)";
        m_pResources = std::make_shared<CoreGraphics::Resources>(false);
        m_pResources->Initialise();
        m_Render.Initialise();
    }

    void TearDown() override
    {
        m_pProvider->ReleaseTextures();
        m_pFramebuffer.reset();
        GraphPlotUI::UnregisterGraphPlotResources();
    }

    void SetSize(int i_Width, int i_Height)
    {
        m_pFramebuffer = std::make_unique<QOpenGLFramebufferObject>(i_Width, i_Height);
    }

    /// Row 0 of the picture is the top of the items.
    QImage Render(std::initializer_list<GraphPlotUI::VBaseGraphRenderType*> i_Items)
    {
        m_pFramebuffer->bind();
        m_Render.ResetState();
        m_Render.SetClearColour(QColor(32, 32, 32, 255));
        m_Render.Clear(true, true);
        m_pProvider->UpdateTextures(m_Render);
        for (GraphPlotUI::VBaseGraphRenderType* pItem : i_Items)
        {
            pItem->SetTraceDataProvider(m_pProvider);
            if (!pItem->IsInitialised())
                pItem->Initialise(m_pResources);
            pItem->Render(m_Render);
        }
        m_Render.ResetState();
        const QImage image = m_pFramebuffer->toImage(false).convertToFormat(QImage::Format_RGB32);
        const QString folder = qEnvironmentVariable("GRAPHPLOTS_TEST_PICTURES");
        if (!folder.isEmpty())
        {
            const auto* pTest = ::testing::UnitTest::GetInstance()->current_test_info();
            image.save(QString("%1/%2.%3.png").arg(folder, pTest->name()).arg(m_PictureCount++));
        }
        return image;
    }

    TestSupport::LogGuard m_Log;
    QOffscreenSurface m_Surface;
    QOpenGLContext m_Gl;
    std::shared_ptr<CoreGraphics::Resources> m_pResources;
    CoreGraphics::RenderContext m_Render;
    std::unique_ptr<QOpenGLFramebufferObject> m_pFramebuffer;
    std::shared_ptr<RingProvider> m_pProvider = std::make_shared<RingProvider>();
    int m_PictureCount = 0;
};

inline QVariant ToVariant(const std::vector<TQL::ITraceId>& i_rTraces)
{
    QVariantList list;
    for (const TQL::ITraceId& rTrace : i_rTraces)
        list.push_back(QVariant::fromValue(rTrace));
    return list;
}

} // namespace TestGraphPlotUI

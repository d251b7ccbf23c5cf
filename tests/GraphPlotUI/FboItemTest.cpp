#include "CoreGraphics/RenderContext.h"
#include "CoreGraphics/Resources.h"
#include "GraphPlotSystem/Traces/ITraceDataProvider.h"
#include "GraphPlotSystem/VGraphPlotContext.h"
#include "GraphPlotUI/Frame/VBaseGraphRenderType.h"
#include "GraphPlotUI/Frame/VGraphPlotFBO.h"
#include "support/LogGuard.h"

#include <gtest/gtest.h>

#include <QtCore/QCoreApplication>
#include <QtCore/QFile>
#include <QtCore/QTemporaryDir>
#include <QtGui/QColor>
#include <QtGui/QImage>
#include <QtGui/QOffscreenSurface>
#include <QtGui/QOpenGLContext>
#include <QtGui/QSurfaceFormat>
#include <QtGui/QVector4D>
#include <QtQml/qqml.h>
#include <QtQuickWidgets/QQuickWidget>

#include <cmath>
#include <functional>
#include <limits>
#include <memory>
#include <span>
#include <string>
#include <vector>

using namespace GraphPlotUI;

namespace
{

/// Writes down what the renderer asks of it.
class FakeProvider : public TQL::ITraceDataProvider
{
public:
    explicit FakeProvider(std::string& o_rCalls) : m_rCalls(o_rCalls) {}

    void GetTicksPerFrame(std::int64_t& o_rTicks) const override { o_rTicks = 1; }
    std::int64_t GetLatestFrameIndex() const override { return 0; }
    std::uint64_t GetRevision() const override { return Revision; }
    void UpdateTextures(CoreGraphics::RenderContext&) override { m_rCalls += "update "; }
    void ReleaseTextures() override { m_rCalls += QOpenGLContext::currentContext() ? "release " : "release-blind "; }
    void BindTraceTexture(TQL::IResult&, const TQL::IChannelInstanceId&, CoreGraphics::RenderContext&,
                          unsigned) override
    {
    }
    void GetTraceRenderInfo(TQL::IResult&, const TQL::IChannelInstanceId&, TraceRenderInfo&) const override {}
    void SetPalette(std::span<const Colour4f>) override {}
    void AssignChannelColour(TQL::IResult&, const TQL::ITraceId&, std::uint32_t) override {}
    void AssignTraceColour(TQL::IResult&, const TQL::ITraceId&) override {}
    void GetTraceColour(Colour4f&, const TQL::ITraceId&) const override {}
    void ResetColours() override {}

    std::uint64_t Revision = 0;

private:
    std::string& m_rCalls;
};

/// Fills the quarter next to its origin, at the lower left, with its colour and the rest with a dark grey.
class QuarterRenderType : public VBaseGraphRenderType
{
    Q_OBJECT
    Q_PROPERTY(QColor colour MEMBER m_Colour)
    Q_PROPERTY(QString name MEMBER m_Name)

public:
    using VBaseGraphRenderType::LockTraceDataProvider;
    using VBaseGraphRenderType::VBaseGraphRenderType;

    inline static std::string s_Calls;         // of all objects, in the order of the calls
    inline static bool s_bCoreProfile = false; // of the context that drew last

    void Initialise(std::shared_ptr<CoreGraphics::Resources> i_pResources) override
    {
        s_Calls += "initialise-" + m_Name.toStdString() + " ";
        m_pProgram = i_pResources->GetProgram("Simple3D", "UniformColour");
        const float corners[]{0, 0, 1, 0, 0, 1, 1, 1};
        m_Quad.SetData(corners, sizeof(corners), CoreGraphics::VertexLayout::TwoFloats());
        VBaseGraphRenderType::Initialise(std::move(i_pResources));
    }

    void Render(CoreGraphics::RenderContext& i_rContext) override
    {
        s_Calls += "render-" + m_Name.toStdString() + " ";
        s_bCoreProfile = QOpenGLContext::currentContext()->format().profile() == QSurfaceFormat::CoreProfile;
        i_rContext.SetViewport(GetViewport());
        i_rContext.SetProjection(GetProjection());
        Fill(i_rContext, 1.0f, QColor(26, 26, 26));
        Fill(i_rContext, 0.5f, m_Colour);
    }

private:
    void Fill(CoreGraphics::RenderContext& i_rContext, float i_Part, const QColor& i_rColour)
    {
        QMatrix4x4 view;
        view.scale(i_Part * static_cast<float>(GetScaledRect().width()),
                   i_Part * static_cast<float>(GetScaledRect().height()));
        i_rContext.SetView(view);
        ASSERT_TRUE(i_rContext.UseProgram(m_pProgram));
        m_pProgram->SetUniform(m_pProgram->UniformLocation(CoreGraphics::HashName("u_colour")),
                               QVector4D(i_rColour.redF(), i_rColour.greenF(), i_rColour.blueF(), 1.0f));
        i_rContext.ApplyRenderState({});
        i_rContext.BindVertexBuffer(m_Quad);
        i_rContext.DrawVertexBuffer(GL_TRIANGLE_STRIP, m_Quad);
    }

    QColor m_Colour;
    QString m_Name;
    std::shared_ptr<CoreGraphics::VShaderProgram> m_pProgram;
    CoreGraphics::VertexBuffer m_Quad;
};

constexpr const char* c_Scene = R"(
import QtQuick
import TestGraphs

Item {
    id: root
    property var graphContext: null
    property alias fbo: fbo
    property alias first: first
    property alias second: second
    Rectangle { anchors.fill: parent; color: "blue" }
    GraphPlotFBO {
        id: fbo
        x: 10; y: 20; width: 200; height: 100
        QuarterRenderType { id: first; name: "first"; colour: "red"; screenRect: Qt.rect(0, 0, 100, 40) }
        QuarterRenderType { id: second; name: "second"; colour: "lime"; screenRect: Qt.rect(120, 50, 60, 40) }
        Component.onCompleted: { registerRenderType(first); registerRenderType(second); registerRenderType(root) }
    }
    // Drawn by the scene graph after the framebuffer: what the renderer leaves behind would spoil these.
    Rectangle { x: 220; y: 20; width: 40; height: 100; color: "yellow"; opacity: 0.5; radius: 4 }
    Text { x: 220; y: 30; text: "abc"; color: "black" }
}
)";

class FboItemTest : public ::testing::Test
{
protected:
    void SetUp() override
    {
        QOffscreenSurface surface;
        surface.create();
        QOpenGLContext probe;
        if (!probe.create() || !probe.makeCurrent(&surface))
            GTEST_SKIP() << "no OpenGL context can be made here: run under an X server (xvfb-run)";
        qmlRegisterType<VGraphPlotFBO>("TestGraphs", 1, 0, "GraphPlotFBO");
        qmlRegisterType<QuarterRenderType>("TestGraphs", 1, 0, "QuarterRenderType");
        QuarterRenderType::s_Calls.clear();
    }

    void Load(const QSurfaceFormat& i_rFormat = QSurfaceFormat::defaultFormat())
    {
        QFile file(m_Folder.filePath("Scene.qml"));
        ASSERT_TRUE(file.open(QIODevice::WriteOnly));
        file.write(c_Scene);
        file.close();
        m_pWidget = std::make_unique<QQuickWidget>();
        m_pWidget->setFormat(i_rFormat);
        m_pWidget->resize(280, 140);
        m_pWidget->setResizeMode(QQuickWidget::SizeRootObjectToView);
        m_pWidget->setSource(QUrl::fromLocalFile(file.fileName()));
        ASSERT_NE(m_pWidget->rootObject(), nullptr);
        m_pWidget->show();
    }

    /// One frame of the whole widget.
    QImage Grab()
    {
        Fbo().update();
        QCoreApplication::processEvents();
        QuarterRenderType::s_Calls.clear();
        m_ProviderCalls.clear();
        Fbo().update();
        return m_pWidget->grabFramebuffer().convertToFormat(QImage::Format_RGB32);
    }

    template <typename T = QuarterRenderType>
    T& Find(const char* i_pName)
    {
        return *m_pWidget->rootObject()->property(i_pName).value<T*>();
    }
    VGraphPlotFBO& Fbo() { return Find<VGraphPlotFBO>("fbo"); }

    std::string m_ProviderCalls;
    TestSupport::LogGuard m_Log;
    std::shared_ptr<CoreGraphics::Resources> m_pResources = std::make_shared<CoreGraphics::Resources>(false);
    std::shared_ptr<FakeProvider> m_pProvider = std::make_shared<FakeProvider>(m_ProviderCalls);
    VGraphPlotContext m_Context{m_pResources, m_pProvider};
    QTemporaryDir m_Folder;
    std::unique_ptr<QQuickWidget> m_pWidget;
};

std::string Pixel(const QImage& i_rImage, int i_X, int i_Y)
{
    return i_rImage.pixelColor(i_X, i_Y).name().toStdString();
}

} // namespace

TEST(BaseGraphRenderType, ScreenRectangleRules)
{
    struct Case
    {
        QRectF Rect;
        bool bTaken;
    };
    const double infinity = std::numeric_limits<double>::infinity();
    const Case cases[]{
        {{0, 0, 1.0, 10}, false},
        {{0, 0, 10, 1.0}, false},
        {{0, 0, 1.01, 10}, true},
        {{0, 0, 1.01, 10}, false},
        {{0, 0, 1.01 * (1 + 5e-13), 10}, false},
        {{0, 0, 1.01 * (1 + 2e-12), 10}, true},
        {{5e-13, 0, 1.01 * (1 + 2e-12), 10}, false}, // against 0: an absolute 1e-12
        {{2e-12, 0, 1.01 * (1 + 2e-12), 10}, true},
        {{3, 4, 2147483648.0, 10}, false},
        {{3, 4, 2147483647.0, 10}, true},
        {{3, 4, -20, 10}, false},
        {{3, 4, std::nan(""), 10}, false},
        {{3, 4, 10, infinity}, false},
        {{-3, 4, 20, 10}, true},
    };
    QuarterRenderType item;
    EXPECT_EQ(item.GetScaledRect(), QRectF(0, 0, 1, 1));
    int changes = 0;
    QObject::connect(&item, &VBaseGraphRenderType::ScreenRectChanged, [&changes] { ++changes; });
    QRectF expected;
    int expectedChanges = 0;
    for (const Case& rCase : cases)
    {
        item.SetScreenRect(rCase.Rect);
        if (rCase.bTaken)
            expected = rCase.Rect;
        expectedChanges += rCase.bTaken;
        const std::string text = std::to_string(&rCase - cases);
        EXPECT_EQ(changes, expectedChanges) << text;
        EXPECT_EQ(item.GetScreenRect().width(), expected.width()) << text;
        EXPECT_EQ(item.GetScreenRect().x(), expected.x()) << text;
    }

    item.SetDevicePixelRatio(2.0);
    item.SetDevicePixelRatio(2.0);
    EXPECT_EQ(changes, expectedChanges + 1);
    EXPECT_EQ(item.GetScaledRect(), QRectF(-6, 8, 40, 20));
}

TEST(FboItem, TypesFollowTheContextAndLeaveWhenDestroyed)
{
    std::string calls;
    const auto pProvider = std::make_shared<FakeProvider>(calls);
    VGraphPlotContext context(nullptr, pProvider);
    VGraphPlotContext other(nullptr, nullptr);
    auto pFbo = std::make_unique<VGraphPlotFBO>();
    int changes = 0;
    QObject::connect(pFbo.get(), &VGraphPlotFBO::graphPlotContextChanged, [&changes] { ++changes; });

    QuarterRenderType early;
    QObject stranger;
    pFbo->registerRenderType(&early);
    pFbo->registerRenderType(&early);
    pFbo->registerRenderType(&stranger);
    pFbo->registerRenderType(nullptr);
    EXPECT_EQ(pFbo->GetGeneration(), 1u);
    EXPECT_EQ(early.LockTraceDataProvider(), nullptr);

    for (QObject* pContext : {static_cast<QObject*>(nullptr), static_cast<QObject*>(&context),
                              static_cast<QObject*>(&context), static_cast<QObject*>(nullptr)})
        pFbo->SetGraphPlotContext(pContext);
    EXPECT_EQ(changes, 1);
    EXPECT_EQ(early.LockTraceDataProvider(), pProvider);
    {
        QuarterRenderType late;
        pFbo->registerRenderType(&late);
        EXPECT_EQ(late.LockTraceDataProvider(), pProvider);
        EXPECT_EQ(pFbo->GetRenderTypes(), (std::vector<IGraphRenderType*>{&early, &late}));
    }
    EXPECT_EQ(pFbo->GetRenderTypes(), (std::vector<IGraphRenderType*>{&early}));
    EXPECT_EQ(pFbo->GetGeneration(), 3u);

    pFbo->SetGraphPlotContext(&stranger);
    EXPECT_EQ(pFbo->GetGraphPlotContextObject(), nullptr);
    EXPECT_EQ(early.LockTraceDataProvider(), pProvider) << "no context takes nothing away";
    pFbo->SetGraphPlotContext(&other);
    EXPECT_EQ(early.LockTraceDataProvider(), nullptr);
    EXPECT_EQ(changes, 3);
    pFbo.reset(); // before the type: its destructor must not call into the dead item
}

TEST_F(FboItemTest, NothingIsDrawnWithoutAContext)
{
    Load();
    Grab();
    EXPECT_EQ(QuarterRenderType::s_Calls, "");
    EXPECT_EQ(m_ProviderCalls, "");
}

TEST_F(FboItemTest, TypesDrawAtItemCoordinatesInOrderOfRegistration)
{
    const QSurfaceFormat former = QSurfaceFormat::defaultFormat();
    QSurfaceFormat core = former;
    core.setVersion(4, 5);
    core.setProfile(QSurfaceFormat::CoreProfile);
    for (const bool bCoreProfile : {false, true})
    {
        QSurfaceFormat::setDefaultFormat(bCoreProfile ? core : former);
        Load(QSurfaceFormat::defaultFormat());
        QSurfaceFormat::setDefaultFormat(former);
        Fbo().SetGraphPlotContext(&m_Context);
        const QImage image = Grab();
        if (const QString folder = qEnvironmentVariable("GRAPHPLOTS_TEST_PICTURES"); !folder.isEmpty())
            image.save(folder + (bCoreProfile ? "/fbo-core.png" : "/fbo.png"));

        EXPECT_EQ(m_ProviderCalls, "update ");
        EXPECT_EQ(QuarterRenderType::s_Calls, "render-first render-second ");
        EXPECT_EQ(QuarterRenderType::s_bCoreProfile, bCoreProfile);
        EXPECT_TRUE(Find("first").IsInitialised());
        EXPECT_EQ(Pixel(image, 5, 5), "#0000ff");
        EXPECT_EQ(Pixel(image, 115, 65), "#202020") << "the clear colour";
        EXPECT_EQ(Pixel(image, 11, 58), "#ff0000") << "lower left quarter of the first: values grow upwards";
        EXPECT_EQ(Pixel(image, 58, 41), "#ff0000");
        EXPECT_EQ(Pixel(image, 61, 38), "#1a1a1a") << "the rest of the first";
        EXPECT_EQ(Pixel(image, 11, 21), "#1a1a1a");
        EXPECT_EQ(Pixel(image, 108, 58), "#1a1a1a");
        EXPECT_EQ(Pixel(image, 111, 58), "#202020") << "beyond its viewport";
        EXPECT_EQ(Pixel(image, 108, 61), "#202020");
        EXPECT_EQ(Pixel(image, 131, 108), "#00ff00") << "lower left quarter of the second";
        EXPECT_EQ(Pixel(image, 158, 91), "#00ff00");
        EXPECT_EQ(Pixel(image, 131, 71), "#1a1a1a");
        EXPECT_EQ(Pixel(image, 131, 68), "#202020");
        EXPECT_EQ(Pixel(image, 250, 100), "#80807f") << "the scene graph's own drawing after it";
        EXPECT_EQ(Pixel(image, 205, 115), "#202020") << "the clear colour up to the item's corner";
        m_pWidget.reset();
        EXPECT_EQ(m_ProviderCalls, "update release ") << "textures go while their context is current";
    }
}

TEST_F(FboItemTest, DevicePixelRatioScalesRectangleAndViewport)
{
    Load();
    Fbo().SetGraphPlotContext(&m_Context);
    Find("first").setProperty("devicePixelRatio", 2.0);
    const QImage image = Grab(); // the framebuffer has one pixel a unit here, so the type is twice as large
    EXPECT_EQ(Pixel(image, 108, 98), "#ff0000");
    EXPECT_EQ(Pixel(image, 108, 61), "#ff0000");
    EXPECT_EQ(Pixel(image, 112, 62), "#1a1a1a");
    EXPECT_EQ(Pixel(image, 208, 21), "#1a1a1a");
    EXPECT_EQ(Pixel(image, 208, 98), "#1a1a1a");
    EXPECT_EQ(Pixel(image, 208, 102), "#202020");
}

TEST_F(FboItemTest, ATypeDestroyedBetweenFramesIsNotDrawnAgain)
{
    Load();
    Fbo().SetGraphPlotContext(&m_Context);
    Grab();
    delete &Find("first");
    const QImage image = Grab();
    EXPECT_EQ(QuarterRenderType::s_Calls, "render-second ");
    EXPECT_EQ(Pixel(image, 11, 21), "#202020");
    EXPECT_EQ(Pixel(image, 131, 108), "#00ff00");
}

TEST_F(FboItemTest, ATickAsksForAFrameWhereOneWouldShowSomethingElse)
{
    Load();
    // What the clock of the scene does, and what comes of it.
    const auto tick = [this]
    {
        QCoreApplication::processEvents();
        QuarterRenderType::s_Calls.clear();
        Fbo().updateIfChanged();
        m_pWidget->grabFramebuffer();
        return !QuarterRenderType::s_Calls.empty();
    };
    VGraphPlotContext other(m_pResources, m_pProvider);
    auto& rFirst = Find("first");
    const auto addRows = [this]
    {
        ++m_pProvider->Revision;
    };
    struct Case
    {
        const char* pName;
        std::function<void()> Change;
        bool bDrawn = true;
    };
    const Case cases[]{
        {"context",
         [&]
         {
             Fbo().SetGraphPlotContext(&m_Context);
         }},
        {"rows", addRows},
        {"no frame while hidden", [&] { m_pWidget->hide(), addRows(); }, false},
        {"seen again",
         [&]
         {
             m_pWidget->show();
         }},
        {"no frame while minimised", [&] { m_pWidget->showMinimized(), addRows(); }, false},
        {"seen once more",
         [&]
         {
             m_pWidget->showNormal();
         }},
        {"rectangle",
         [&]
         {
             rFirst.SetScreenRect({0, 0, 50, 40});
         }},
        {"the same rectangle",
         [&] {
             rFirst.SetScreenRect({0, 0, 50, 40});
         },
         false},
        {"one of two hidden",
         [&]
         {
             rFirst.setVisible(false);
         }},
        {"provider of a type",
         [&]
         {
             rFirst.SetTraceDataProvider(m_pProvider);
         }},
        {"one of two gone",
         [&]
         {
             delete &rFirst;
         }},
        {"another context",
         [&]
         {
             Fbo().SetGraphPlotContext(&other);
         }},
        {"a frame that somebody else asked for", [&] { addRows(), Grab(); }, false},
    };
    for (const Case& rCase : cases)
    {
        rCase.Change();
        EXPECT_EQ(tick(), rCase.bDrawn) << rCase.pName;
        if (rCase.bDrawn)
        {
            EXPECT_FALSE(tick()) << rCase.pName << ", and then nothing";
        }
    }
}

TEST_F(FboItemTest, AnotherContextReleasesTheTexturesOfTheFormerProvider)
{
    Load();
    Fbo().SetGraphPlotContext(&m_Context);
    Grab();
    std::string otherCalls;
    auto pOther = std::make_shared<FakeProvider>(otherCalls);
    VGraphPlotContext empty(m_pResources, std::make_shared<FakeProvider>(otherCalls));
    VGraphPlotContext other(m_pResources, pOther);
    Fbo().SetGraphPlotContext(&empty);
    Fbo().SetGraphPlotContext(&other);
    m_ProviderCalls.clear();
    Fbo().update();
    m_pWidget->grabFramebuffer();
    EXPECT_EQ(m_ProviderCalls, "release ");
    EXPECT_EQ(otherCalls, "update ");
    m_pWidget.reset();
    EXPECT_EQ(m_ProviderCalls, "release ");
    EXPECT_EQ(otherCalls, "update release ");
}

#include "FboItemTest.moc"

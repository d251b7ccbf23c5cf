#include "Bench.h"
#include "Channels/Blocks/VSampleBlock.h"
#include "Channels/Samples/VSampleStore.h"
#include "CoreGraphics/RenderContext.h"
#include "CoreGraphics/Resources.h"
#include "GraphPlotSystem/Traces/TraceLevelChoice.h"
#include "GraphPlotSystem/Traces/VTraceDataProvider.h"
#include "GraphPlotUI/RegisterResources.h"
#include "GraphPlotUI/Traces/VSubplotRenderType.h"

#include <QtGui/QColor>
#include <QtGui/QOffscreenSurface>
#include <QtGui/QOpenGLContext>
#include <QtGui/QOpenGLFunctions>
#include <QtGui/QPixmap>
#include <QtOpenGL/QOpenGLFramebufferObject>

#include <array>
#include <cmath>
#include <cstdio>
#include <memory>
#include <numeric>
#include <random>
#include <string>
#include <vector>

#if __has_include(<qcustomplot.h>)
#include <qcustomplot.h>
#define GRAPHPLOTS_HAS_YARDSTICK 1
#endif

namespace Bench
{

void RunRedraw(Table& o_rTable);

#ifdef GRAPHPLOTS_HAS_YARDSTICK
namespace
{

constexpr int s_Width = 1280;
constexpr int s_Height = 720;
constexpr int s_Traces = 20;
constexpr int s_Repeats = 15;
constexpr double s_Pan = 0.01; // of what is in view
constexpr std::int64_t s_Period = 1'125'000;

using Samples = std::vector<float>;

/// Waves of 3 to 22 cycles and of growing amplitude, with noise of that standard deviation, between -1 and 1.
std::vector<Samples> MakeTraces(int i_Count, float i_Noise)
{
    std::mt19937 generator(1);
    std::normal_distribution<float> noise(0.0f, i_Noise);
    std::vector<Samples> traces(s_Traces, Samples(static_cast<std::size_t>(i_Count)));
    for (int trace = 0; trace < s_Traces; ++trace)
    {
        const double phase = 2.0 * M_PI * (3 + trace) / i_Count;
        const double amplitude = 0.8 * (trace + 1) / s_Traces;
        for (int i = 0; i < i_Count; ++i)
            traces[static_cast<std::size_t>(trace)][static_cast<std::size_t>(i)] =
                static_cast<float>(amplitude * std::sin(phase * i)) + noise(generator);
    }
    return traces;
}

QColor TraceColour(int i_Trace)
{
    return QColor::fromHsv(i_Trace * 17, 255, 255);
}

/// Nobody listens to the provider here.
class DeafPostalService : public TQL::IPostalService
{
public:
    void Post(Job, std::uint64_t) override {}
    void GetDispatchTraits(TQL::DispatchTraits& o_rTraits) const override
    {
        o_rTraits = {TQL::DispatchTraits::KindSerial, TQL::DispatchTraits::FlagOrdered};
    }
};

/// One subplot with all traces, as in a graph window: provider, rings, textures, shaders, framebuffer.
class OurPlot
{
public:
    explicit OurPlot(const std::vector<Samples>& i_rTraces)
        : m_pProvider(std::make_shared<GraphPlotUI::VTraceDataProvider>(std::make_shared<DeafPostalService>()))
        , m_Framebuffer(s_Width, s_Height)
    {
        m_pResources->Initialise();
        m_Context.Initialise();
        m_pProvider->SetTicksPerFrame(s_Period);
        std::vector<GraphPlotUI::Colour4f> palette;
        for (int i = 0; i < s_Traces; ++i)
        {
            const QColor colour = TraceColour(i);
            palette.push_back({static_cast<float>(colour.redF()), static_cast<float>(colour.greenF()),
                               static_cast<float>(colour.blueF()), 1.0f});
        }
        m_pProvider->SetPalette(palette);
        QVariantList ids;
        for (const Samples& rTrace : i_rTraces)
            ids.push_back(QVariant::fromValue(AddTrace(rTrace)));
        m_Subplot.SetTraceDataProvider(m_pProvider);
        m_Subplot.SetTraceIds(ids);
        m_Subplot.SetScreenRect({0.0, 0.0, s_Width, s_Height});
        m_Subplot.SetValueRangeY({-1.0, 1.0});
        m_Subplot.SetLiveContext(false);
        m_Subplot.Initialise(m_pResources);
    }

    ~OurPlot() { m_pProvider->ReleaseTextures(); }

    /// Reads the new rows, draws, and waits until a pixel can be read.
    void Redraw(double i_First, double i_Last)
    {
        for (const Channel& rChannel : m_Channels)
        {
            TQL::TickRange range;
            rChannel.pBlock->GetRange(range);
            const TQL::TickRange view{TQL::FramesToTicks(i_First, s_Period), TQL::FramesToTicks(i_Last, s_Period)};
            const auto level = GraphPlotUI::ChooseLevel(s_Period, s_Period, {i_First, i_Last}, s_Width);
            m_pProvider->UpdateTrace(rChannel.Id, *rChannel.pBlock, view, range, level);
        }
        m_Subplot.SetValueRangeX({i_First, i_Last});
        m_Framebuffer.bind();
        m_Context.ResetState();
        m_Context.SetClearColour(QColor(32, 32, 32));
        m_Context.Clear(true, true);
        m_pProvider->UpdateTextures(m_Context);
        m_Subplot.Render(m_Context);
        m_Context.ResetState();
        QOpenGLContext::currentContext()->functions()->glFinish();
        std::array<std::uint8_t, 4> pixel{};
        m_Context.ReadPixels(GL_RGBA8, QRect(0, 0, 1, 1), pixel.data());
        Keep(pixel);
    }

    QImage Picture() const { return m_Framebuffer.toImage(false); }

private:
    struct Channel
    {
        TQL::IChannelInstanceId Id;
        std::unique_ptr<Channels::VSampleBlock> pBlock;
    };

    TQL::ITraceId AddTrace(const Samples& i_rSamples)
    {
        auto pStore = std::make_shared<Channels::VSampleStore>(s_Period, 0, 1);
        pStore->EnableSummaries();
        pStore->Append(i_rSamples);
        Channel channel{{"Review", "Cache", m_Channels.size(), 0, ""},
                        std::make_unique<Channels::VSampleBlock>(pStore, Channels::VSummaryPyramid::LevelCount)};
        const TQL::ITraceId id(channel.Id, 0);
        TQL::IResult result;
        m_pProvider->AssignTraceColour(result, id);
        m_Channels.push_back(std::move(channel));
        return id;
    }

    std::shared_ptr<CoreGraphics::Resources> m_pResources = std::make_shared<CoreGraphics::Resources>(false);
    CoreGraphics::RenderContext m_Context;
    std::shared_ptr<GraphPlotUI::VTraceDataProvider> m_pProvider;
    std::vector<Channel> m_Channels;
    QOpenGLFramebufferObject m_Framebuffer;
    GraphPlotUI::VSubplotRenderType m_Subplot;
};

/// The same traces in a QCustomPlot, antialiased, replotted into a pixmap.
class TheirPlot
{
public:
    explicit TheirPlot(const std::vector<Samples>& i_rTraces)
    {
        m_Plot.resize(s_Width, s_Height);
        m_Plot.setAntialiasedElements(QCP::aeAll);
        m_Plot.yAxis->setRange(-1.0, 1.0);
        for (const Samples& rTrace : i_rTraces)
        {
            QVector<double> keys(static_cast<qsizetype>(rTrace.size()));
            std::iota(keys.begin(), keys.end(), 0.0);
            QCPGraph* pGraph = m_Plot.addGraph();
            pGraph->setData(keys, QVector<double>(rTrace.begin(), rTrace.end()), true);
            pGraph->setPen(QPen(TraceColour(m_Plot.graphCount() - 1)));
        }
    }

    void Redraw(double i_First, double i_Last)
    {
        m_Plot.xAxis->setRange(i_First, i_Last);
        QCPPainter painter(&m_Pixmap);
        m_Plot.toPainter(&painter, s_Width, s_Height);
        painter.end();
        Keep(m_Pixmap);
    }

    const QPixmap& Picture() const { return m_Pixmap; }

private:
    QCustomPlot m_Plot;
    QPixmap m_Pixmap{s_Width, s_Height};
};

/// Shows all samples, or all moved by the pan, in turn.
template <typename TPlot>
class Panned
{
public:
    explicit Panned(const std::vector<Samples>& i_rTraces)
        : m_Plot(i_rTraces), m_Count(static_cast<double>(i_rTraces.front().size()))
    {
    }

    void Redraw()
    {
        const double first = m_bPanned ? s_Pan * m_Count : 0.0;
        m_bPanned = !m_bPanned;
        m_Plot.Redraw(first, first + m_Count);
    }

    const TPlot& Plot() const { return m_Plot; }

private:
    TPlot m_Plot;
    double m_Count;
    bool m_bPanned = false;
};

void SavePictures(const OurPlot& i_rOurs, const TheirPlot& i_rTheirs, const std::string& i_rName)
{
    const QString folder = qEnvironmentVariable("GRAPHPLOTS_BENCH_PICTURES");
    if (folder.isEmpty())
        return;
    i_rOurs.Picture().save(QString("%1/%2 ours.png").arg(folder, QString::fromStdString(i_rName)));
    i_rTheirs.Picture().save(QString("%1/%2 theirs.png").arg(folder, QString::fromStdString(i_rName)));
}

void Compare(Table& o_rTable, int i_Count, float i_Noise, const std::string& i_rName, EGoal i_Goal)
{
    const std::vector<Samples> traces = MakeTraces(i_Count, i_Noise);
    Panned<OurPlot> ours(traces);
    Panned<TheirPlot> theirs(traces);
    const auto redrawOurs = [&]
    {
        ours.Redraw();
    };
    const auto redrawTheirs = [&]
    {
        theirs.Redraw();
    };
    BestSecondsPaired(4, redrawOurs, redrawTheirs); // shaders and memory
    const auto [ourSeconds, theirSeconds] = BestSecondsPaired(s_Repeats, redrawOurs, redrawTheirs);
    SavePictures(ours.Plot(), theirs.Plot(), i_rName);
    o_rTable.push_back({"redraw after a pan by 1 %, 20 traces x " + i_rName + ", 1280 x 720 (time of ours / theirs)",
                        ourSeconds * 1e3, "ms", "QCustomPlot, antialiased", theirSeconds * 1e3,
                        ourSeconds / theirSeconds, i_Goal, 0.5});
}

} // namespace

void RunRedraw(Table& o_rTable)
{
    QOffscreenSurface surface;
    surface.create();
    QOpenGLContext context;
    if (!context.create() || !context.makeCurrent(&surface))
    {
        std::fputs("redraw: left out, no OpenGL context can be made here\n", stderr);
        return;
    }
    std::fprintf(stderr, "redraw: on %s\n", context.functions()->glGetString(GL_RENDERER));
    GraphPlotUI::RegisterGraphPlotResources();
    Compare(o_rTable, 1'000'000, 0.1f, "1,000,000 samples", EGoal::AtMost);
    Compare(o_rTable, 1'000'000, 0.01f, "1,000,000 samples with little noise", EGoal::Report);
    Compare(o_rTable, 2'000, 0.1f, "2,000 samples", EGoal::Report);
    Compare(o_rTable, 2'000, 0.01f, "2,000 samples with little noise", EGoal::Report);
    GraphPlotUI::UnregisterGraphPlotResources();
}
#else
void RunRedraw(Table&)
{
    std::fputs("redraw: left out, built without QCustomPlot\n", stderr);
}
#endif

} // namespace Bench

// The smallest program that hosts the Graph Plots module: one recorded sine, one window.
//
//     minimal-host MODULE [--frames N]
//
// With --frames it looks at what it draws and quits: status 0 when N frames were drawn, the sine was among them, and
// the module kept the rules of its host. docs/hosting.md tells the same story in words.
#include "ChannelSystemSelection/VChannelSelectionManager.h"
#include "Channels/Common/ChannelTypes.h"
#include "Channels/Contexts/VRecordedContext.h"
#include "Channels/VChannelService.h"
#include "OrvanePluginInterface/ITimeController.h"
#include "Services/Common/VHostSubscriptions.h"
#include "Services/Selection/VSelectionSource.h"
#include "Services/Time/VContextTimeFeed.h"
#include "Services/Time/VTimeController.h"
#include "Services/VGlobalLogSink.h"
#include "Services/VHostServices.h"
#include "Services/VPluginHost.h"

#include <QtCore/QTimer>
#include <QtQuick/QQuickWindow>
#include <QtQuickWidgets/QQuickWidget>
#include <QtWidgets/QApplication>
#include <QtWidgets/QVBoxLayout>

#include <cmath>
#include <cstdio>
#include <cstdlib>
#include <memory>
#include <numbers>
#include <string>
#include <vector>

namespace
{

constexpr const char* c_ContextName = "sine";
constexpr const char* c_ContentName = "Graph Plots";

/// Ten seconds of a sine of 1 Hz, sampled 120 times a second.
std::shared_ptr<const Recordings::VRecording> MakeSine()
{
    constexpr int rows = 1200;
    Recordings::RecordedChannel channel;
    channel.Name = "sine";
    channel.ComponentNames = {""};
    channel.Units = "mm";
    channel.Rate = 120.0;
    for (int row = 0; row < rows; ++row)
        channel.Samples.push_back(static_cast<float>(100.0 * std::sin(row * 2.0 * std::numbers::pi / 120.0)));

    Recordings::VRecording recording;
    recording.Name = c_ContextName;
    recording.Range = {0, rows * channel.SamplePeriod};
    recording.Channels.push_back(std::move(channel));
    return std::make_shared<const Recordings::VRecording>(std::move(recording));
}

/// The channels of this host, its time and its selection: what an application has of its own.
class Data
{
public:
    explicit Data(Services::VHostServices& i_rServices)
    {
        const auto pSelection = i_rServices.Selection();
        const auto pManager = TQL::MakeShared<ChannelSystemSelection::VChannelSelectionManager>(pSelection);
        i_rServices.Ledger()->Add(pSelection->Changed().get()); // the manager's subscription is ours, not the module's
        for (const Channels::ChannelType& rType : Channels::GetChannelTypeTable())
            pManager->RegisterChannelType(rType.Name, rType.Kind, static_cast<std::uint32_t>(rType.Flags));
        m_pChannels->SetSelectionManager(pManager);
        i_rServices.SetChannelService(m_pChannels);

        // The context first: whoever hears of the time source looks for the context of its name.
        m_pContext =
            std::make_shared<Channels::VRecordedContext>(c_ContextName, m_pChannels->GetSubTypes(), MakeSine());
        m_pChannels->AddContext(m_pContext);
        const auto pTime = i_rServices.TimeController();
        const auto pSource = pTime->AddSource(c_ContextName, OrvanePluginInterface::ETimeMode::Review);
        m_pTimeFeed = std::make_unique<Services::VContextTimeFeed>(m_pContext, pSource, i_rServices.Ledger());
        pTime->SetCurrentSource(c_ContextName);

        // What is selected is plotted.
        const auto pSine = m_pContext->GetChannels()->front();
        pSelection->Set({Channels::SelectionOfChannel(pSine->GetInstanceId()).value()});
    }

private:
    const std::shared_ptr<Channels::VChannelService> m_pChannels = std::make_shared<Channels::VChannelService>();
    std::shared_ptr<Channels::VRecordedContext> m_pContext;
    std::unique_ptr<Services::VContextTimeFeed> m_pTimeFeed;
};

/// Whether a coloured line runs across the picture; all but the traces is grey, or small.
bool ShowsTrace(const QImage& i_rPicture)
{
    int columns = 0;
    for (int x = 0; x < i_rPicture.width(); ++x)
        for (int y = 0; y < i_rPicture.height(); ++y)
            if (const QColor colour = i_rPicture.pixelColor(x, y); colour.saturation() > 100 && colour.value() > 100)
            {
                ++columns;
                break;
            }
    return 2 * columns > i_rPicture.width();
}

/// For --frames: quits once so many frames were drawn and the sine is to be seen.
class Trial : public QObject
{
public:
    Trial(QQuickWidget& i_rScene, int i_Frames) : m_rScene(i_rScene), m_Wanted(i_Frames)
    {
        connect(&i_rScene, &QQuickWidget::sceneGraphError, this,
                [this](auto, const QString& i_rText) { End(i_rText); });
        connect(i_rScene.quickWindow(), &QQuickWindow::afterRendering, this, [this] { CountFrame(); });
        QTimer::singleShot(30'000, this,
                           [this] { End(QString("no sine was drawn in 30 s, in %1 frames").arg(m_Drawn)); });
    }

    const QString& Problem() const { return m_Problem; }

private:
    void CountFrame()
    {
        ++m_Drawn;
        QMetaObject::invokeMethod(
            this, [this] { Look(); }, Qt::QueuedConnection); // not while it draws
    }

    void Look()
    {
        if (m_Drawn < m_Wanted)
            m_rScene.quickWindow()->update(); // a plot draws no frame that would show the same again
        else if (m_rScene.quickWindow()->rendererInterface()->graphicsApi() != QSGRendererInterface::OpenGL)
            End("this display offers no OpenGL");
        else if (ShowsTrace(m_rScene.grabFramebuffer()))
            End({});
        else
            m_rScene.quickWindow()->update(); // the data may come a few frames later than the window
    }

    void End(const QString& i_rProblem)
    {
        m_Problem = i_rProblem;
        QCoreApplication::quit();
    }

    QQuickWidget& m_rScene;
    const int m_Wanted;
    int m_Drawn = 0;
    QString m_Problem;
};

int Fail(const std::string& i_rProblem)
{
    std::fprintf(stderr, "minimal-host: %s\n", i_rProblem.c_str());
    return EXIT_FAILURE;
}

/// Shows one content until its window is closed. Returns what went wrong, empty for nothing.
std::string ShowContent(Services::VPluginHost& i_rPlugin, int i_Frames)
{
    QWidget frame; // its destruction closes the content
    frame.resize(640, 400);
    const QPointer<QWidget> pContent = i_rPlugin.OpenContent(c_ContentName, &frame);
    if (!pContent)
        return "the module could not make a content \"Graph Plots\"";
    (new QVBoxLayout(&frame))->addWidget(pContent);
    auto* pScene = pContent->findChild<QQuickWidget*>();
    if (!pScene)
        return "the content shows no scene";
    std::unique_ptr<Trial> pTrial;
    if (i_Frames > 0)
        pTrial = std::make_unique<Trial>(*pScene, i_Frames);
    frame.show();
    QApplication::exec();
    return pTrial ? pTrial->Problem().toStdString() : std::string();
}

int Run(const std::string& i_rModule, int i_Frames)
{
    Services::HostOptions options;
    options.bChecking = true; // the faults that Run tells of
    Services::VHostServices services(options);
    const Data data(services);

    Services::VPluginHost plugin(services);
    std::string problem;
    if (plugin.Load(i_rModule, problem).IsError())
        return Fail(problem);
    problem = ShowContent(plugin, i_Frames);
    const TQL::IResult unloaded = plugin.Unload();
    for (const std::string& rFault : services.Faults())
        problem += (problem.empty() ? "" : "; ") + rFault;
    if (problem.empty() && unloaded != TQL::Result::Ok)
        problem = "the module was not unloaded cleanly";
    return problem.empty() ? EXIT_SUCCESS : Fail(problem);
}

} // namespace

int main(int i_ArgumentCount, char** i_ppArguments)
{
    // Before the application object: all windows share their OpenGL objects, and Qt Quick draws with OpenGL.
    QCoreApplication::setAttribute(Qt::AA_ShareOpenGLContexts);
    QQuickWindow::setGraphicsApi(QSGRendererInterface::OpenGL);
    const QApplication application(i_ArgumentCount, i_ppArguments);
    const Services::VGlobalLogSink log(0, nullptr, stderr);
    const std::vector<std::string> words(i_ppArguments + 1, i_ppArguments + i_ArgumentCount);
    const bool bFrames = words.size() == 3 && words[1] == "--frames";
    const int frames = bFrames ? std::atoi(words[2].c_str()) : 0;
    if (bFrames ? frames < 1 : words.size() != 1)
        return Fail("usage: minimal-host MODULE [--frames N]");
    return Run(words[0], frames);
}

#include "Channels/VChannelService.h"
#include "Services/Selection/VSelectionSource.h"
#include "Studio/Commands/CommandLine.h"
#include "Studio/Commands/CommandSession.h"
#include "Studio/Commands/Commands.h"
#include "Studio/Common/OutputTarget.h"
#include "Studio/Common/Paths.h"
#include "Studio/Plots/PlotContent.h"
#include "Studio/Plots/VPlotFrame.h"
#include "Studio/Session/ContextNames.h"
#include "Studio/Session/VStudioSession.h"
#include "Studio/Tree/ChannelLeaves.h"

#include <QtCore/QCoreApplication>
#include <QtCore/QElapsedTimer>
#include <QtCore/QEventLoop>
#include <QtCore/QTimer>
#include <QtQml/QQmlError>
#include <QtQuickWidgets/QQuickWidget>

#include <algorithm>
#include <chrono>
#include <filesystem>
#include <functional>

namespace Studio
{

namespace
{

using Milliseconds = std::chrono::milliseconds;

constexpr Milliseconds patience{20'000};    // for the window to have data
constexpr Milliseconds longestFill{60'000}; // for all of a recording's samples to be in the traces
constexpr Milliseconds shortestFill{2'000}; // however short the operator's patience
constexpr int turnsToDraw = 20;             // of 10 ms and more
constexpr Milliseconds settleLive{1'500};
constexpr std::int64_t liveHistory = 1200; // frames: a live window shows the last ten seconds
constexpr std::pair<int, int> usualSize{1280, 720};

/// Runs the event loop until the condition holds; false when it does not within the time.
bool WaitFor(Milliseconds i_Longest, const std::function<bool()>& i_rCondition)
{
    QElapsedTimer clock;
    clock.start();
    QEventLoop loop;
    QTimer poll;
    QObject::connect(&poll, &QTimer::timeout, &loop,
                     [&]
                     {
                         if (i_rCondition() || clock.hasExpired(i_Longest.count()))
                             loop.quit();
                     });
    poll.start(Milliseconds(10));
    if (!i_rCondition())
        loop.exec();
    return i_rCondition();
}

void WaitAlways(Milliseconds i_Time)
{
    WaitFor(i_Time, [] { return false; });
}

/// Takes one picture. The session and its contexts stand when it is made.
class VSnapshot
{
public:
    VSnapshot(VStudioSession& i_rSession, const CommandLine& i_rCommandLine, std::string& o_rError)
        : m_rSession(i_rSession), m_rCommandLine(i_rCommandLine), m_rError(o_rError)
    {
    }

    bool Run() { return OpenContext() && SelectChannels() && OpenWindow() && WaitForData() && SetRanges() && Save(); }

private:
    bool Fail(std::string i_Error)
    {
        m_rError = std::move(i_Error);
        return false;
    }

    bool OpenContext()
    {
        std::string name = LiveContextName;
        if (m_rCommandLine.bLive)
            m_rSession.StartLive(m_rCommandLine.Subjects, liveHistory);
        else if (m_rSession.OpenFile(PathFromText(m_rCommandLine.Files.front()), name, m_rError).IsError())
            return false;
        m_rSession.ShowContext(name);
        return true;
    }

    bool SelectChannels()
    {
        const auto things = ListThings(*m_rSession.CurrentContext(), m_rSession.Channels().GetGlobalChannels().get());
        if (things.empty())
            return Fail(m_rCommandLine.Files.front() + " has no channels; there is nothing to show");
        std::vector<TQL::SelectionItem> items{ItemsByRank(things).front()};
        if (!m_rCommandLine.Patterns.empty())
        {
            std::string unmatched;
            items = FindItems(things, m_rCommandLine.Patterns, unmatched);
            if (items.empty())
                return Fail("no channel matches \"" + unmatched + "\"; " +
                            (m_rCommandLine.bLive ? "one is called \"" + things.front().Name + "\""
                                                  : "graphplots-studio channels FILE lists the names"));
        }
        m_rSession.Host().Selection()->Set(items);
        return true;
    }

    bool OpenWindow()
    {
        if (m_rSession.LoadModule(ModulePathOf(m_rCommandLine), m_rError).IsError())
            return false;
        const auto [width, height] = m_rCommandLine.Size.value_or(usualSize);
        m_Frame.setAttribute(Qt::WA_ShowWithoutActivating);
        m_Frame.resize(width, height);
        if (m_Frame.Open(m_rSession, m_rError).IsError())
            return false;
        m_pQuickWidget = FindQuickWidget(*m_Frame.Content());
        if (!m_pQuickWidget)
            return Fail("the Graph Plots window of the module shows no scene; load another with --module PATH");
        QObject::connect(m_pQuickWidget, &QQuickWidget::sceneGraphError, m_pQuickWidget,
                         [this](QQuickWindow::SceneGraphError, const QString& i_rText)
                         { m_SceneError = i_rText.simplified().toStdString(); });
        m_Frame.show();
        return true;
    }

    bool WaitForData()
    {
        const auto isBroken = [this]
        {
            return !m_SceneError.empty() || m_pQuickWidget->status() == QQuickWidget::Error;
        };
        const bool bEnded = WaitFor(patience, [&] { return isBroken() || HasTraceData(*m_pQuickWidget); });
        if (!m_SceneError.empty())
            return Fail("no picture without OpenGL: " + m_SceneError);
        if (isBroken())
        {
            const auto errors = m_pQuickWidget->errors();
            return Fail("the scene of the Graph Plots window cannot be loaded: " +
                        (errors.empty() ? std::string("no reason given")
                                        : errors.front().toString().simplified().toStdString()));
        }
        if (!DrawsWithOpenGL(*m_pQuickWidget))
            return Fail("no picture without OpenGL, which this display does not offer; run it on a desktop or under "
                        "xvfb-run");
        if (!bEnded)
            return Fail("the window had no data within " + std::to_string(patience.count() / 1000) +
                        " s; choose a channel with samples by --channel");
        return true;
    }

    bool SetRanges()
    {
        const auto point = [](const std::pair<double, double>& i_rRange)
        {
            return QPointF(i_rRange.first, i_rRange.second);
        };
        if (m_rCommandLine.Range && SetTimeRange(*m_pQuickWidget, point(*m_rCommandLine.Range)).IsError())
            return Fail("the module does not let its time range be set; leave --range out");
        if (m_rCommandLine.Values && SetValueRange(*m_pQuickWidget, point(*m_rCommandLine.Values)).IsError())
            return Fail("the module does not let its value range be set; leave --values out");
        const bool bWhole = m_rCommandLine.bLive ? WaitLive() : WaitUntilFilled();
        if (!m_SceneError.empty())
            return Fail("no picture without OpenGL: " + m_SceneError);
        return bWhole || Fail("the window had not read all of its traces in time; try again with a longer --after");
    }

    bool WaitLive()
    {
        WaitAlways(m_rCommandLine.AfterMilliseconds ? Milliseconds(*m_rCommandLine.AfterMilliseconds) : settleLive);
        return true;
    }

    /// Until every trace that has data is filled and drawn; at the latest when the operator's patience ends.
    bool WaitUntilFilled()
    {
        const Milliseconds longest =
            m_rCommandLine.AfterMilliseconds ? Milliseconds(*m_rCommandLine.AfterMilliseconds) : longestFill;
        Channels::VChannelService& rChannels = m_rSession.Channels();
        rChannels.ForgetReads();
        // Rows that were read are drawn by one of the next turns of the scene's clock.
        int turns = 0;
        return WaitFor(std::max(longest, shortestFill),
                       [&]
                       {
                           turns = rChannels.IsReadEnough() ? turns + 1 : 0;
                           return turns > turnsToDraw;
                       });
    }

    bool Save()
    {
        return SavePicture(m_pQuickWidget->grabFramebuffer(), PathFromText(m_rCommandLine.PicturePath), m_rError)
            .IsSuccess();
    }

    VStudioSession& m_rSession;
    const CommandLine& m_rCommandLine;
    std::string& m_rError;
    VPlotFrame m_Frame;
    QQuickWidget* m_pQuickWidget = nullptr; ///< in the frame's content
    std::string m_SceneError;
};

} // namespace

int RunSnapshot(const CommandLine& i_rCommandLine, std::string& o_rError)
{
    const auto source = i_rCommandLine.bLive ? std::filesystem::path() : PathFromText(i_rCommandLine.Files.front());
    if (!MayWrite(PathFromText(i_rCommandLine.PicturePath), source, i_rCommandLine.bForce, o_rError))
        return StatusFailed;
    VStudioSession session({i_rCommandLine.bCheck, {}});
    if (!VSnapshot(session, i_rCommandLine, o_rError).Run())
        return StatusFailed;
    return EndSession(session, o_rError);
}

} // namespace Studio

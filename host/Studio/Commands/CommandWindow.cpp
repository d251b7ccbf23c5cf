#include "Studio/Commands/CommandLine.h"
#include "Studio/Commands/CommandLive.h"
#include "Studio/Commands/CommandSession.h"
#include "Studio/Commands/Commands.h"
#include "Studio/Commands/VEndSignals.h"
#include "Studio/Common/Paths.h"
#include "Studio/Files/VOpenFiles.h"
#include "Studio/Log/VLogModel.h"
#include "Studio/Session/ContextNames.h"
#include "Studio/Session/VStudioSession.h"
#include "Studio/Window/VMainWindow.h"

#include <QtWidgets/QApplication>

#include <filesystem>
#include <vector>

namespace Studio
{

namespace
{

/// The file is read in the background like any other; when it is there, it becomes the live input.
void ReplayWhenRead(VMainWindow& i_rWindow, VStudioSession& i_rSession, const CommandLine& i_rCommandLine)
{
    VRecordingLoader& rLoader = i_rWindow.Files().Loader();
    const std::filesystem::path path = PathFromText(i_rCommandLine.ReplayPath);
    i_rWindow.OpenFile(path);
    const int number = rLoader.LastNumber();
    QObject::connect(&rLoader, &VRecordingLoader::Finished, &i_rWindow,
                     [&i_rWindow, &i_rSession, number, speed = i_rCommandLine.Speed,
                      bLoop = i_rCommandLine.bLoop](int i_Number, const QString& i_rContextName)
                     {
                         if (i_Number != number || !i_rSession.MayLoseLive())
                             return;
                         std::string error;
                         if (i_rSession.StartReplay(i_rContextName.toStdString(), speed, bLoop, error).IsError())
                             return i_rWindow.ShowMessage("Not replayed: " + error);
                         i_rSession.ShowContext(LiveContextName);
                     });
}

} // namespace

int RunWindow(const CommandLine& i_rCommandLine, std::string& o_rError)
{
    VLogModel log; // from the beginning on, so that the panel has it all
    VStudioSession session({i_rCommandLine.bCheck, {}});
    if (session.LoadModule(ModulePathOf(i_rCommandLine), o_rError).IsError())
        return StatusFailed;
    {
        VMainWindow window(session, &log);
        if (!window.Restore(o_rError))
            return StatusFailed;
        const VEndSignals signals;
        QObject::connect(&signals, &VEndSignals::Asked, &window, &QWidget::close);
        window.show();
        if (i_rCommandLine.bLive)
        {
            session.StartLive(i_rCommandLine.Subjects);
            session.ShowContext(LiveContextName);
        }
        if (i_rCommandLine.OscPort != 0 && !StartListening(session, i_rCommandLine, o_rError))
            return StatusFailed;
        if (!i_rCommandLine.ReplayPath.empty())
            ReplayWhenRead(window, session, i_rCommandLine);
        std::vector<std::filesystem::path> files;
        for (const std::string& rFile : i_rCommandLine.Files)
            files.push_back(PathFromText(rFile));
        window.OpenFiles(files);
        QApplication::exec();
        session.StopLive();
    }
    return EndSession(session, o_rError);
}

} // namespace Studio

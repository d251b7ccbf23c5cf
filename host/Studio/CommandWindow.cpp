#include "Studio/CommandLine.h"
#include "Studio/CommandSession.h"
#include "Studio/Commands.h"
#include "Studio/ContextNames.h"
#include "Studio/Paths.h"
#include "Studio/VMainWindow.h"
#include "Studio/VStudioSession.h"

#include <QtCore/QCoreApplication>
#include <QtWidgets/QApplication>

#include <filesystem>
#include <vector>

namespace Studio
{

namespace
{

/// What the studio begins with.
struct Beginning
{
    std::vector<std::filesystem::path> Files;
    bool bLive = false;
    std::string Message; ///< for the status bar
};

Beginning DecideBeginning(const CommandLine& i_rCommandLine)
{
    Beginning beginning;
    beginning.bLive = i_rCommandLine.bLive;
    for (const std::string& rFile : i_rCommandLine.Files)
        beginning.Files.push_back(PathFromText(rFile));
    if (!beginning.Files.empty() || beginning.bLive)
        return beginning;
    beginning.bLive = true;
    const auto sample = FindSample(PathFromText(QCoreApplication::applicationDirPath().toStdString()));
    if (sample.empty())
        beginning.Message = "The sample recording is missing: samples/walk.c3d";
    else
        beginning.Files.push_back(sample);
    return beginning;
}

/// Opens everything; the first recording is shown, or the capture when the operator named no file. False when files
/// were named and none could be read.
bool OpenAll(VStudioSession& o_rSession, const CommandLine& i_rCommandLine, Beginning& o_rBeginning,
             std::string& o_rError)
{
    std::string shown;
    for (const auto& rPath : o_rBeginning.Files)
    {
        std::string name, error;
        if (o_rSession.OpenFile(rPath, name, error).IsError())
            o_rBeginning.Message = error;
        else if (shown.empty())
            shown = name;
    }
    if (shown.empty() && !i_rCommandLine.Files.empty())
    {
        o_rError = o_rBeginning.Message;
        return false;
    }
    if (o_rBeginning.bLive)
        o_rSession.StartLive(i_rCommandLine.Subjects);
    o_rSession.ShowContext(i_rCommandLine.Files.empty() && o_rBeginning.bLive ? LiveContextName : shown);
    return true;
}

} // namespace

int RunWindow(const CommandLine& i_rCommandLine, std::string& o_rError)
{
    VStudioSession session({i_rCommandLine.bCheck, {}});
    Beginning beginning = DecideBeginning(i_rCommandLine);
    if (!OpenAll(session, i_rCommandLine, beginning, o_rError))
        return StatusFailed;
    if (session.LoadModule(ModulePathOf(i_rCommandLine), o_rError).IsError())
        return StatusFailed;
    {
        VMainWindow window(session);
        if (!window.OpenPlot(o_rError))
            return StatusFailed;
        if (!beginning.Message.empty())
            window.ShowMessage(beginning.Message);
        window.show();
        QApplication::exec();
        session.StopLive();
    }
    return EndSession(session, o_rError);
}

} // namespace Studio

#include "Studio/CommandLine.h"
#include "Studio/CommandLive.h"
#include "Studio/CommandSession.h"
#include "Studio/Commands.h"
#include "Studio/ContextNames.h"
#include "Studio/Paths.h"
#include "Studio/VLogModel.h"
#include "Studio/VMainWindow.h"
#include "Studio/VStudioSession.h"

#include <QtWidgets/QApplication>

#include <filesystem>
#include <vector>

namespace Studio
{

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
        window.show();
        if (i_rCommandLine.bLive)
        {
            session.StartLive(i_rCommandLine.Subjects);
            session.ShowContext(LiveContextName);
        }
        if (NamesLiveInput(i_rCommandLine))
        {
            std::string message;
            if (!StartLiveInput(session, i_rCommandLine, message, o_rError))
                return StatusFailed;
            if (!message.empty())
                window.ShowMessage(message);
        }
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

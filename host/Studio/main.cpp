#include "Services/VGlobalLogSink.h"
#include "Studio/Commands/CommandLine.h"
#include "Studio/Commands/Commands.h"
#include "Studio/Commands/OpenGLCheck.h"
#include "Studio/Commands/QtMessages.h"

#include <QtCore/QCoreApplication>
#include <QtQuick/QQuickWindow>
#include <QtWidgets/QApplication>

#include <cstdio>
#include <string>
#include <vector>

namespace
{

using namespace Studio;

void Name()
{
    QCoreApplication::setApplicationName(QStringLiteral("graphplots-studio"));
    QCoreApplication::setOrganizationName(QStringLiteral("graphplots"));
}

/// What the log says of warnings and errors, for a command that has gone well and whose output is elsewhere.
void PrintProblems(const Services::VGlobalLogSink& i_rSink)
{
    for (const auto& rLine : i_rSink.Lines())
        if (rLine.Severity <= TQL::ELogSeverity::Warning)
            std::fprintf(stderr, "graphplots-studio: %s\n", rLine.Text.c_str());
}

int RunWithDisplay(const CommandLine& i_rCommandLine, int& o_rArgumentCount, char** o_ppArguments,
                   std::string& o_rError)
{
    o_rError = FindDisplayProblem();
    if (!o_rError.empty())
        return StatusFailed;
    InstallQtMessages();
    const Services::VGlobalLogSink kept(1000, nullptr, nullptr);
    QCoreApplication::setAttribute(Qt::AA_ShareOpenGLContexts);
    QQuickWindow::setGraphicsApi(QSGRendererInterface::OpenGL);
    const QApplication application(o_rArgumentCount, o_ppArguments);
    NoteApplicationStarted();
    Name();
    o_rError = FindOpenGLProblem();
    if (!o_rError.empty())
        return StatusFailed;
    if (i_rCommandLine.Command == ECommand::Window)
    {
        const Services::VGlobalLogSink shown(0, nullptr, stderr);
        return RunWindow(i_rCommandLine, o_rError);
    }
    const int status = RunSnapshot(i_rCommandLine, o_rError);
    if (status == StatusOk)
        PrintProblems(kept);
    return status;
}

int Run(const CommandLine& i_rCommandLine, int& o_rArgumentCount, char** o_ppArguments, std::string& o_rError)
{
    switch (i_rCommandLine.Command)
    {
    case ECommand::Help:
        std::fputs(HelpText().c_str(), stdout);
        return StatusOk;
    case ECommand::Version:
        std::fputs("graphplots-studio " GRAPHPLOTS_VERSION "\n", stdout);
        return StatusOk;
    case ECommand::Channels:
        return RunChannels(i_rCommandLine, o_rError);
    case ECommand::Export:
        return RunExport(i_rCommandLine, o_rError);
    case ECommand::CheckStore:
        return RunCheckStore(i_rCommandLine, o_rError);
    case ECommand::Record:
        return RunRecord(i_rCommandLine, o_rError);
    case ECommand::Window:
    case ECommand::Snapshot:
        break;
    }
    return RunWithDisplay(i_rCommandLine, o_rArgumentCount, o_ppArguments, o_rError);
}

/// One line, whatever the text holds.
std::string OneLine(std::string i_Text)
{
    for (char& rCharacter : i_Text)
        if (rCharacter == '\n' || rCharacter == '\r')
            rCharacter = ' ';
    return i_Text;
}

} // namespace

int main(int i_ArgumentCount, char** i_ppArguments)
{
    const std::vector<std::string> words(i_ppArguments + 1, i_ppArguments + i_ArgumentCount);
    CommandLine commandLine;
    std::string error;
    int status = StatusFailed;
    if (ParseCommandLine(words, commandLine, error).IsSuccess())
        status = Run(commandLine, i_ArgumentCount, i_ppArguments, error);
    if (status == StatusFailed)
        std::fprintf(stderr, "graphplots-studio: %s\n", OneLine(error).c_str());
    return status;
}

#include "Studio/Commands/QtMessages.h"

#include "Studio/Commands/Commands.h"
#include "TQL/Log.h"

#include <QtCore/QByteArray>
#include <QtCore/QString>
#include <QtCore/QtGlobal>

#include <atomic>
#include <cstdio>
#include <cstdlib>

namespace Studio
{

namespace
{

std::atomic<bool> bStarted = false;

constexpr const char* displayAdvice = "; run it on a desktop or under xvfb-run";

TQL::ELogSeverity SeverityOf(QtMsgType i_Type)
{
    switch (i_Type)
    {
    case QtDebugMsg:
        return TQL::ELogSeverity::Detail;
    case QtInfoMsg:
        return TQL::ELogSeverity::Information;
    case QtWarningMsg:
        return TQL::ELogSeverity::Warning;
    case QtCriticalMsg:
    case QtFatalMsg:
        break;
    }
    return TQL::ELogSeverity::Error;
}

QByteArray DisplayFailure()
{
    const QByteArray platform = qgetenv("QT_QPA_PLATFORM");
    if (!platform.isEmpty() && platform != "xcb" && platform != "wayland")
        return "no display: QT_QPA_PLATFORM names \"" + platform + "\", which does not work here" + displayAdvice;
    const QByteArray display = qgetenv("DISPLAY");
    return "no display: cannot open " + (display.isEmpty() ? qgetenv("WAYLAND_DISPLAY") : display) + displayAdvice;
}

[[noreturn]] void GiveUp(const QString& i_rText)
{
    const QByteArray reason = bStarted ? i_rText.simplified().toUtf8() : DisplayFailure();
    std::fprintf(stderr, "graphplots-studio: %s\n", reason.constData());
    std::fflush(stderr);
    std::_Exit(StatusFailed);
}

void HandleMessage(QtMsgType i_Type, const QMessageLogContext& i_rContext, const QString& i_rText)
{
    if (i_Type == QtFatalMsg)
        GiveUp(i_rText);
    // A missing folder of the desktop's is nothing that an operator of this program could mend.
    const bool bDesktop = i_rText.startsWith(QLatin1String("QStandardPaths:"));
    const TQL::ELogSeverity severity = bDesktop ? TQL::ELogSeverity::Detail : SeverityOf(i_Type);
    TQL::Log::Write(TQL::Log::GetCategory("Qt"), severity, i_rText.toStdString(),
                    {i_rContext.file ? i_rContext.file : "Qt", i_rContext.line});
}

} // namespace

void InstallQtMessages()
{
    qInstallMessageHandler(&HandleMessage);
}

void NoteApplicationStarted()
{
    bStarted = true;
}

std::string FindDisplayProblem()
{
#ifdef Q_OS_LINUX
    for (const char* pVariable : {"QT_QPA_PLATFORM", "DISPLAY", "WAYLAND_DISPLAY"})
        if (!qEnvironmentVariableIsEmpty(pVariable))
            return {};
    return std::string("no display: DISPLAY is not set") + displayAdvice;
#else
    return {};
#endif
}

} // namespace Studio

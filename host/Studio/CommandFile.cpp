#include "Recordings/CsvExport.h"
#include "Recordings/OpenRecording.h"
#include "Studio/ChannelTable.h"
#include "Studio/CommandLine.h"
#include "Studio/Commands.h"
#include "Studio/Paths.h"

#include <cerrno>
#include <cstdio>
#include <cstring>

namespace Studio
{

namespace
{

/// What the reader had to leave out or to guess goes to standard error, so that the output stays what was asked for.
void PrintWarnings(const Recordings::VRecording& i_rRecording)
{
    for (const std::string& rWarning : i_rRecording.Warnings)
        std::fprintf(stderr, "graphplots-studio: warning: %s\n", rWarning.c_str());
}

} // namespace

int RunChannels(const CommandLine& i_rCommandLine, std::string& o_rError)
{
    Recordings::VRecording recording;
    if (Recordings::OpenRecording(PathFromText(i_rCommandLine.Files.front()), recording, o_rError).IsError())
        return StatusFailed;
    PrintWarnings(recording);
    const std::string text = i_rCommandLine.bJson ? FormatChannelJson(recording) : FormatChannelTable(recording);
    errno = 0;
    if (std::fwrite(text.data(), 1, text.size(), stdout) != text.size() || std::fflush(stdout) != 0)
    {
        o_rError = std::string("cannot write the list: ") + std::strerror(errno);
        return StatusFailed;
    }
    return StatusOk;
}

int RunExport(const CommandLine& i_rCommandLine, std::string& o_rError)
{
    Recordings::VRecording recording;
    if (Recordings::OpenRecording(PathFromText(i_rCommandLine.Files.front()), recording, o_rError).IsError())
        return StatusFailed;
    PrintWarnings(recording);
    const TQL::IResult result =
        Recordings::ExportCsv(recording, PathFromText(i_rCommandLine.CsvPath), i_rCommandLine.Patterns, o_rError);
    return result.IsError() ? StatusFailed : StatusOk;
}

} // namespace Studio

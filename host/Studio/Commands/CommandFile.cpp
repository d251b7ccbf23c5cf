#include "Recordings/OpenRecording.h"
#include "Recordings/Tables/CsvExport.h"
#include "Studio/Commands/ChannelTable.h"
#include "Studio/Commands/CommandLine.h"
#include "Studio/Commands/Commands.h"
#include "Studio/Common/OutputTarget.h"
#include "Studio/Common/Paths.h"
#include "Studio/StoreLint/CheckStoreReport.h"
#include "UtilsFileSystem/FileIO.h"

#include <cerrno>
#include <cstdio>
#include <cstring>
#include <filesystem>
#include <span>

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

int Print(const std::string& i_rText, std::string& o_rError)
{
    errno = 0;
    if (std::fwrite(i_rText.data(), 1, i_rText.size(), stdout) == i_rText.size() && std::fflush(stdout) == 0)
        return StatusOk;
    o_rError = std::string("cannot write the output: ") + std::strerror(errno);
    return StatusFailed;
}

TQL::IResult ReadText(const std::string& i_rPath, std::string& o_rText)
{
    const auto [pFile, opened] = UtilsFileSystem::OpenInputFile(i_rPath, UtilsFileSystem::EOpenMode::Binary);
    if (opened.IsError())
        return opened;
    const auto [size, sized] = pFile->GetSize();
    if (sized.IsError())
        return sized;
    o_rText.resize(size);
    const auto [count, read] = pFile->Read(std::as_writable_bytes(std::span(o_rText)));
    o_rText.resize(count);
    return read;
}

} // namespace

int RunChannels(const CommandLine& i_rCommandLine, std::string& o_rError)
{
    Recordings::VRecording recording;
    if (Recordings::OpenRecording(PathFromText(i_rCommandLine.Files.front()), recording, o_rError,
                                  {.bResample = i_rCommandLine.bResample})
            .IsError())
        return StatusFailed;
    PrintWarnings(recording);
    return Print(i_rCommandLine.bJson ? FormatChannelJson(recording) : FormatChannelTable(recording), o_rError);
}

int RunExport(const CommandLine& i_rCommandLine, std::string& o_rError)
{
    const std::filesystem::path source = PathFromText(i_rCommandLine.Files.front());
    if (!MayWrite(PathFromText(i_rCommandLine.CsvPath), source, i_rCommandLine.bForce, o_rError))
        return StatusFailed;
    Recordings::VRecording recording;
    if (Recordings::OpenRecording(source, recording, o_rError, {.bResample = i_rCommandLine.bResample}).IsError())
        return StatusFailed;
    PrintWarnings(recording);
    const TQL::IResult result =
        Recordings::ExportCsv(recording, PathFromText(i_rCommandLine.CsvPath), i_rCommandLine.Patterns, o_rError);
    return result.IsError() ? StatusFailed : StatusOk;
}

int RunCheckStore(const CommandLine& i_rCommandLine, std::string& o_rError)
{
    const std::string& rPath = i_rCommandLine.Files.front();
    std::string text;
    if (const TQL::IResult read = ReadText(rPath, text); read.IsError())
    {
        o_rError = "cannot read " + rPath + ": " + std::string(read.Description());
        return StatusFailed;
    }
    const CheckStoreReport report = MakeCheckStoreReport(rPath, text);
    const int printed = Print(report.Text, o_rError);
    return printed == StatusOk && report.Problems != 0 ? StatusProblems : printed;
}

} // namespace Studio

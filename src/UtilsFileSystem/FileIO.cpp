#include "UtilsFileSystem/FileIO.h"

#include "UtilsFileSystem/FileResult.h"
#include "UtilsFileSystem/SystemCalls.h"
#include "UtilsFileSystem/VMemoryMappedInputFile.h"

#include <cerrno>
#include <filesystem>
#include <random>
#include <string_view>

namespace UtilsFileSystem
{
namespace
{

constexpr std::size_t s_BufferSize = 0x800000;

TQL::IResult OpenFailed(const std::error_code& i_rError, const char* i_pLockedFormat, const std::string& i_rPath)
{
    const TQL::IResult result = ResultFromError(i_rError);
    if (result == TQL::Result::NotPermitted) // only then: the query is dear
        LogLockers(i_pLockedFormat, i_rPath);
    return result;
}

template <typename Stream>
std::pair<std::unique_ptr<Stream>, TQL::IResult> OpenCFile(const std::string& i_rPath, System::EOpen i_Open,
                                                           EOpenMode i_Mode, const char* i_pLockedFormat)
{
    std::FILE* pFile = nullptr;
    if (const auto error = System::Open(i_rPath, i_Open, i_Mode == EOpenMode::Binary, pFile))
        return {nullptr, OpenFailed(error, i_pLockedFormat, i_rPath)};
    if (std::setvbuf(pFile, nullptr, _IOFBF, s_BufferSize) != 0)
        LogFile(TQL::ELogSeverity::Warning, "Failed to enable full buffering for file stream %1%.", i_rPath);
    return {std::make_unique<Stream>(pFile), TQL::Result::Ok};
}

/// No path where the text holds a zero, at which the system would cut it off.
std::filesystem::path NativePath(const std::string& i_rPath)
{
    if (i_rPath.find('\0') != std::string::npos)
        return {};
    return std::filesystem::path(std::u8string(i_rPath.begin(), i_rPath.end()));
}

template <typename Stream>
std::error_code OpenStandardStream(Stream& io_rStream, const std::string& i_rPath, std::ios::openmode i_Mode)
try
{
    errno = 0;
    io_rStream.open(NativePath(i_rPath), i_Mode);
    if (io_rStream.is_open())
        return {};
    return errno != 0 ? LastCError() : std::make_error_code(std::errc::io_error);
}
catch (const std::exception&) // a path that is no text of the system's
{
    return std::make_error_code(std::errc::no_such_file_or_directory);
}

std::ios::openmode BinaryFlag(EOpenMode i_Mode)
{
    return i_Mode == EOpenMode::Binary ? std::ios::binary : std::ios::openmode{};
}

std::error_code OpenQuietly(const std::string& i_rPath, System::EOpen i_Open,
                            std::unique_ptr<VFileOutputStream>& o_rpFile)
{
    std::FILE* pFile = nullptr;
    if (const auto error = System::Open(i_rPath, i_Open, true, pFile))
        return error;
    o_rpFile = std::make_unique<VFileOutputStream>(pFile);
    return {};
}

/// The path with 80 random bits and ".part" behind its name, which is cut where there is no room for them.
std::string SideName(const std::string& i_rPath)
{
    constexpr std::string_view letters = "abcdefghijklmnopqrstuvwxyz234567";
    constexpr std::size_t longestName = 255;
    std::string suffix = ".";
    std::random_device random;
    for (int i = 0; i < 16; ++i)
        suffix += letters[random() % letters.size()];
    suffix += ".part";
    std::size_t end = i_rPath.size();
    const std::size_t name = end - NativePath(i_rPath).filename().u8string().size();
    if (end - name > longestName - suffix.size())
        for (end = name + longestName - suffix.size(); (static_cast<unsigned char>(i_rPath[end]) & 0xC0) == 0x80;)
            --end; // inside a character
    return i_rPath.substr(0, end) + suffix;
}

} // namespace

std::pair<std::unique_ptr<VFileInputStream>, TQL::IResult> OpenInputFile(const std::string& i_rPath, EOpenMode i_Mode)
{
    return OpenCFile<VFileInputStream>(i_rPath, System::EOpen::Read, i_Mode,
                                       "Failed to open input file %1% locked by processes '%2%'.");
}

std::pair<std::unique_ptr<VFileOutputStream>, TQL::IResult> OpenOutputFile(const std::string& i_rPath, EOpenMode i_Mode,
                                                                           bool i_bOverwrite)
{
    return OpenCFile<VFileOutputStream>(i_rPath, i_bOverwrite ? System::EOpen::Overwrite : System::EOpen::Create,
                                        i_Mode, "Failed to open output file %1% locked by processes '%2%'.");
}

std::pair<std::unique_ptr<std::ifstream>, TQL::IResult> OpenInputFileStream(const std::string& i_rPath,
                                                                            EOpenMode i_Mode)
{
    auto pStream = std::make_unique<std::ifstream>();
    std::error_code error = OpenStandardStream(*pStream, i_rPath, std::ios::in | BinaryFlag(i_Mode));
    if (!error)
        error = System::CheckNoFolder(i_rPath);
    if (error)
        return {nullptr, OpenFailed(error, "Failed to open input file stream %1% locked by processes '%2%'.", i_rPath)};
    return {std::move(pStream), TQL::Result::Ok};
}

std::pair<std::unique_ptr<std::ofstream>, TQL::IResult> OpenOutputFileStream(const std::string& i_rPath,
                                                                             EOpenMode i_Mode, bool i_bOverwrite)
{
    auto pStream = std::make_unique<std::ofstream>();
    std::error_code error;
    if (!i_bOverwrite) // the standard streams cannot insist on a new file: take the name first
    {
        std::FILE* pFile = nullptr;
        error = System::Open(i_rPath, System::EOpen::Create, true, pFile);
        if (!error)
            (void)std::fclose(pFile);
    }
    if (!error)
        error = OpenStandardStream(*pStream, i_rPath, std::ios::out | std::ios::trunc | BinaryFlag(i_Mode));
    if (error)
        return {nullptr,
                OpenFailed(error, "Failed to open output file stream %1% locked by processes '%2%'.", i_rPath)};
    return {std::move(pStream), TQL::Result::Ok};
}

std::pair<std::unique_ptr<TQL::IInputStreamSeekable>, TQL::IResult>
OpenBestInputStream(const std::string& i_rPath, std::uint64_t i_WindowMebibytes, std::int32_t i_Option)
{
    auto pMapped = std::make_unique<VMemoryMappedInputStreamVirtual>();
    const TQL::IResult result = pMapped->Open(i_rPath, i_WindowMebibytes, i_Option);
    if (result.IsSuccess())
        return {std::move(pMapped), result};
    if (result == TQL::Result::FileNotFound)
        return {nullptr, result};
    LogFile(TQL::ELogSeverity::Warning,
            "Failed to open memory mapped input file stream %1% (%2%), falling back to a standard input file stream.",
            i_rPath, result.Description());
    auto [pFile, plainResult] = OpenInputFile(i_rPath, EOpenMode::Binary);
    if (!pFile)
        return {nullptr, plainResult};
    return {std::make_unique<VFileInputStreamVirtual>(std::move(*pFile)), plainResult};
}

TQL::IResult CopyFile(const std::string& i_rFrom, const std::string& i_rTo, bool i_bOverwrite)
{
    return ResultOf(System::Copy(i_rFrom, i_rTo, i_bOverwrite));
}

TQL::IResult MoveFile(const std::string& i_rFrom, const std::string& i_rTo)
{
    return ResultOf(System::Move(i_rFrom, i_rTo));
}

TQL::IResult ReplaceFile(const std::string& i_rFrom, const std::string& i_rTo, const std::string& i_rBackup)
{
    bool bRefused = false;
    const std::error_code error = System::Replace(i_rFrom, i_rTo, i_rBackup, bRefused);
    return error && bRefused ? TQL::Result::NotPermitted : ResultOf(error);
}

TQL::IResult ReplaceFileByRename(const std::string& i_rFrom, const std::string& i_rTo, const std::string& i_rBackup)
{
    if (!i_rBackup.empty() && System::Exists(i_rTo))
    {
        if (const auto error = System::Rename(i_rTo, i_rBackup))
        {
            LogFile(TQL::ELogSeverity::Error, "Failed to create backup file %1% while replacing file: %2%.", i_rBackup,
                    error.message());
            return ResultFromError(error);
        }
    }
    const std::error_code error = System::Rename(i_rFrom, i_rTo);
    if (error)
        LogFile(TQL::ELogSeverity::Error, "Failed to replace file %1% with file %2%: %3%.", i_rTo, i_rFrom,
                error.message());
    return ResultOf(error);
}

TQL::IResult RemoveFile(const std::string& i_rPath)
{
    const std::error_code error = System::Remove(i_rPath);
    if (!error)
    {
        LogFile(TQL::ELogSeverity::Detail, "Removed file '%1%'.", i_rPath);
        return TQL::Result::Ok;
    }
    if (error == std::errc::no_such_file_or_directory)
    {
        LogFile(TQL::ELogSeverity::Detail, "Nothing to remove: '%1%' did not exist.", i_rPath);
        return TQL::Result::OkButNoEffect;
    }
    const TQL::IResult result = ResultFromError(error);
    if (result != TQL::Result::NotPermitted ||
        !LogLockers("Failed to remove file '%1%': file is locked by processes '%2%'.", i_rPath))
    {
        LogFile(TQL::ELogSeverity::Error, "Failed to remove file '%1%': %2%", i_rPath, error.message());
    }
    return result;
}

std::string ResolveLink(const std::string& i_rPath)
{
    return System::ResolveLink(i_rPath);
}

std::error_code CreateFileBeside(const std::string& i_rPath, std::string& o_rCreated,
                                 std::unique_ptr<VFileOutputStream>& o_rpFile)
{
    o_rCreated = SideName(i_rPath);
    return OpenQuietly(o_rCreated, System::EOpen::Create, o_rpFile);
}

std::error_code CreateFileAt(const std::string& i_rPath, std::unique_ptr<VFileOutputStream>& o_rpFile)
{
    return OpenQuietly(i_rPath, System::EOpen::Overwrite, o_rpFile);
}

bool FindLockingProcesses(const std::string& i_rPath, std::vector<std::string>& o_rNames)
{
    return System::FindLockers(i_rPath, o_rNames);
}

} // namespace UtilsFileSystem

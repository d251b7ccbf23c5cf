#pragma once

#include "UtilsFileSystem/VFileStream.h"

#include <cstdint>
#include <fstream>
#include <memory>
#include <string>
#include <system_error>
#include <utility>
#include <vector>

/// The operating system's file calls with every failure as a result, always by the same mapping, and with the processes
/// that hold a file named in the log where the system refuses it. Paths are UTF-8 on every system. Nothing throws;
/// nothing is shared, so any thread may call.
namespace UtilsFileSystem
{

/// 1 is binary, anything else text.
enum class EOpenMode : std::int32_t
{
    Text = 0,
    Binary = 1
};

/// Opens with full buffering. The stream is null on failure. A folder gives `InvalidType`.
std::pair<std::unique_ptr<VFileInputStream>, TQL::IResult> OpenInputFile(const std::string& i_rPath, EOpenMode i_Mode);

/// Empties or creates the file. Without i_bOverwrite an existing file is left alone and gives `AlreadyPresent`.
std::pair<std::unique_ptr<VFileOutputStream>, TQL::IResult> OpenOutputFile(const std::string& i_rPath, EOpenMode i_Mode,
                                                                           bool i_bOverwrite);

/// The same through the standard stream classes.
std::pair<std::unique_ptr<std::ifstream>, TQL::IResult> OpenInputFileStream(const std::string& i_rPath,
                                                                            EOpenMode i_Mode);
std::pair<std::unique_ptr<std::ofstream>, TQL::IResult> OpenOutputFileStream(const std::string& i_rPath,
                                                                             EOpenMode i_Mode, bool i_bOverwrite);

/// Opens a memory-mapped stream, or a plain binary one where the file cannot be mapped. The window is in units of
/// 1048576 bytes, 0 maps the whole file; window and option are those of VMemoryMappedInputFile::Open.
std::pair<std::unique_ptr<TQL::IInputStreamSeekable>, TQL::IResult>
OpenBestInputStream(const std::string& i_rPath, std::uint64_t i_WindowMebibytes, std::int32_t i_Option);

/// Copies bytes and permissions. Without i_bOverwrite an existing target gives `AlreadyPresent`.
TQL::IResult CopyFile(const std::string& i_rFrom, const std::string& i_rTo, bool i_bOverwrite);

/// `AlreadyPresent` when the target exists.
TQL::IResult MoveFile(const std::string& i_rFrom, const std::string& i_rTo);

/// Puts i_rFrom in the place of i_rTo, as close to one step as the system allows, and keeps the previous i_rTo under
/// i_rBackup (empty: it is not kept). A missing i_rTo makes it a move, a missing i_rFrom gives `FileNotFound` and
/// touches nothing.
TQL::IResult ReplaceFile(const std::string& i_rFrom, const std::string& i_rTo, const std::string& i_rBackup = {});

/// The same by two plain renames, so with a moment in which i_rTo is missing; it may copy between volumes. Stops with
/// i_rTo in its place when the backup cannot be made.
TQL::IResult ReplaceFileByRename(const std::string& i_rFrom, const std::string& i_rTo,
                                 const std::string& i_rBackup = {});

/// `OkButNoEffect` when there is nothing to remove. Never removes a folder.
TQL::IResult RemoveFile(const std::string& i_rPath);

/// Where the path leads when it is a symbolic link, be it to nowhere; else the path itself.
std::string ResolveLink(const std::string& i_rPath);

/// For callers that tell of a failure in their own words, by the system's error, which is empty when it worked; nothing
/// is logged. The first creates a file beside i_rPath, for what is to take its place, under a new name that nobody can
/// guess, so that nobody can put a link there before; o_rCreated is its path. The second empties or creates i_rPath.
std::error_code CreateFileBeside(const std::string& i_rPath, std::string& o_rCreated,
                                 std::unique_ptr<VFileOutputStream>& o_rpFile);
std::error_code CreateFileAt(const std::string& i_rPath, std::unique_ptr<VFileOutputStream>& o_rpFile);

/// Appends the full image paths of the processes that hold the file ("unknown process" where the system does not tell).
/// False when the query failed or found more than ten; nothing is appended then.
bool FindLockingProcesses(const std::string& i_rPath, std::vector<std::string>& o_rNames);

} // namespace UtilsFileSystem

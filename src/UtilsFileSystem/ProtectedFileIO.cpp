#include "UtilsFileSystem/ProtectedFileIO.h"

#include "UtilsFileSystem/FileIO.h"
#include "UtilsFileSystem/FileResult.h"
#include "UtilsFileSystem/SystemCalls.h"

namespace UtilsFileSystem
{
namespace
{

using TQL::ELogSeverity;

std::string NewName(const std::string& i_rPath)
{
    return i_rPath + ".new";
}

std::string OldName(const std::string& i_rPath)
{
    return i_rPath + ".old";
}

/// A zero in the text would cut the suffix off: the side file would be the file itself.
bool IsUsable(const std::string& i_rPath)
{
    return !i_rPath.empty() && i_rPath.find('\0') == std::string::npos;
}

/// Brings the file to the state in which a load reads it.
void Repair(const std::string& i_rPath)
{
    const std::string newPath = NewName(i_rPath);
    const std::string oldPath = OldName(i_rPath);
    const bool bMain = System::Exists(i_rPath);
    const bool bOld = System::Exists(oldPath);
    const bool bNew = System::Exists(newPath);
    if (bNew && !bOld) // the writer may have been cut off half way
    {
        LogFile(ELogSeverity::Warning,
                "Interrupted save detected for [%1%], ignoring potentially corrupt new data [%2%]", i_rPath, newPath);
    }
    else if (bNew) // the swap had begun, so the writer had finished
    {
        LogFile(ELogSeverity::Warning,
                "Interrupted save detected for [%1%], attempting to complete save of new data [%2%]...", i_rPath,
                newPath);
        (void)CompleteProtectedSave(i_rPath, newPath, EWriteMode::Overwrite);
    }
    else if (bOld && bMain)
    {
        (void)RemoveFile(oldPath);
    }
    else if (bOld)
    {
        LogFile(ELogSeverity::Warning, "File [%1%] not found but backup [%2%] is present, restoring backup...", i_rPath,
                oldPath);
        if (const TQL::IResult result = ResultOf(System::Rename(oldPath, i_rPath)); result.IsError())
            LogFile(ELogSeverity::Warning, "Failed to restore backup: %1%", result.Description());
    }
}

/// Before a writer begins no old file may be left, for beside one a new file is trusted even if it is torn. Where the
/// file itself is missing the old one is all that there is, so it is brought back first.
TQL::IResult ClearOldFile(const std::string& i_rPath)
{
    const std::string oldPath = OldName(i_rPath);
    if (!System::Exists(oldPath))
        return TQL::Result::Ok;
    if (!System::Exists(i_rPath))
        Repair(i_rPath);
    if (!System::Exists(oldPath))
        return TQL::Result::Ok;
    return System::Exists(i_rPath) ? RemoveFile(oldPath) : TQL::Result::FileIOFailure;
}

/// Without the locker query. A missing file is no error.
std::error_code RemoveIntermediate(const std::string& i_rNewPath)
{
    const std::error_code error = System::Remove(i_rNewPath);
    if (!error || error == std::errc::no_such_file_or_directory)
        return {};
    LogFile(ELogSeverity::Error, "Failed to remove intermediate file [%1%]: %2%", i_rNewPath, error.message());
    return error;
}

TQL::IResult MoveNewFile(const std::string& i_rPath, const std::string& i_rNewPath)
{
    const TQL::IResult result = MoveFile(i_rNewPath, i_rPath);
    if (result.IsSuccess())
    {
        LogFile(ELogSeverity::Detail, "Protected save: new file [%1%] moved to [%2%].", i_rNewPath, i_rPath);
        return result;
    }
    // A refusal to overwrite is what the caller asked for, hence no warning.
    LogFile(ELogSeverity::Detail, "Protected save: new file [%1%] could not be moved to [%2%]: %3%", i_rNewPath,
            i_rPath, result.Description());
    if (const TQL::IResult removed = RemoveFile(i_rNewPath); removed.IsError())
        LogFile(ELogSeverity::Warning, "Protected save: failed removing intermediate file [%1%]: %3%", i_rNewPath,
                i_rPath, removed.Description());
    return result;
}

void RemoveBackup(const std::string& i_rPath, const std::string& i_rOldPath)
{
    const TQL::IResult result = RemoveFile(i_rOldPath);
    if (result.IsSuccess())
        LogFile(ELogSeverity::Detail, "Protected save: removed backup file [%1%].", i_rOldPath);
    else if (result != TQL::Result::FileNotFound)
        LogFile(ELogSeverity::Warning, "Protected save: failed removing backup file [%1%]: %3%", i_rOldPath, i_rPath,
                result.Description());
}

/// A link is not replaced but followed: the side files stand beside the file itself, and so does the swap. Whoever
/// refuses to overwrite refuses a link too.
std::string TargetOf(const std::string& i_rPath, EWriteMode i_Mode)
{
    return i_Mode == EWriteMode::Exclusive ? i_rPath : System::ResolveLink(i_rPath);
}

} // namespace

TQL::IResult ProtectedSave(const FileCallback& i_rWriter, const std::string& i_rPath, EWriteMode i_Mode)
{
    if (!IsUsable(i_rPath))
        return TQL::Result::FileNotFound;
    const std::string path = TargetOf(i_rPath, i_Mode);
    if (const TQL::IResult cleared = ClearOldFile(path); cleared.IsError())
        return cleared;
    const std::string newPath = NewName(path);
    // A new file that a cut off move left can be a second name of the file itself: writing to it would empty both.
    if (const auto error = RemoveIntermediate(newPath))
        return ResultFromError(error);
    TQL::IResult result = i_rWriter(newPath);
    if (result.IsSuccess())
        result = ResultOf(System::SyncFile(newPath));
    if (result.IsError())
    {
        (void)RemoveIntermediate(newPath);
        return result;
    }
    return CompleteProtectedSave(path, newPath, i_Mode);
}

TQL::IResult CompleteProtectedSave(const std::string& i_rPath, const std::string& i_rNewPath, EWriteMode i_Mode)
{
    if (i_Mode == EWriteMode::Exclusive)
    {
        const TQL::IResult moved = MoveNewFile(i_rPath, i_rNewPath);
        if (moved.IsSuccess())
            System::SyncFolderOf(i_rPath);
        return moved;
    }
    const std::string path = TargetOf(i_rPath, i_Mode);
    const std::string oldPath = OldName(path);
    const TQL::IResult result = ReplaceFile(i_rNewPath, path, oldPath);
    if (result == TQL::Result::FileNotFound) // a repair that finds the swap done
    {
        LogFile(ELogSeverity::Detail, "Protected save: new file [%1%] doesn't exist so it wasn't moved to [%2%].",
                i_rNewPath, path);
    }
    else if (result.IsError())
    {
        LogFile(ELogSeverity::Error, "Protected save: new file [%1%] could not be moved to [%2%]: %3%", i_rNewPath,
                path, result.Description());
        return result;
    }
    else
    {
        System::SyncFolderOf(path);
        LogFile(ELogSeverity::Detail, "Protected save: new file [%1%] moved to [%2%].", i_rNewPath, path);
    }
    RemoveBackup(path, oldPath);
    return result;
}

TQL::IResult ProtectedLoad(const FileCallback& i_rReader, const std::string& i_rPath)
{
    if (!IsUsable(i_rPath))
        return TQL::Result::FileNotFound;
    Repair(System::ResolveLink(i_rPath));
    return i_rReader(i_rPath);
}

} // namespace UtilsFileSystem

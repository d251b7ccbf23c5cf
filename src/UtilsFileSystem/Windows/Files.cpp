#include "UtilsFileSystem/SystemCalls.h"
#include "UtilsFileSystem/Windows/System.h"

#include <cerrno>

#include <fcntl.h>
#include <io.h>
#include <share.h>
#include <sys/stat.h>

namespace UtilsFileSystem::System
{
namespace
{

constexpr DWORD s_ReplaceFlags = REPLACEFILE_IGNORE_MERGE_ERRORS | 0x4; // 4: errors of the access control too
constexpr DWORD s_RenameFlags = MOVEFILE_REPLACE_EXISTING | MOVEFILE_COPY_ALLOWED;

std::error_code CError(int i_Number)
{
    return {i_Number, std::generic_category()};
}

} // namespace

// The C library's "x" is not known everywhere, so the descriptor is opened first.
std::error_code Open(const std::string& i_rPath, EOpen i_Open, bool i_bBinary, std::FILE*& o_rpFile)
{
    const std::wstring path = Wide(i_rPath);
    if (path.empty())
        return CError(ENOENT);
    int flags = (i_bBinary ? _O_BINARY : _O_TEXT) | _O_NOINHERIT;
    flags |= i_Open == EOpen::Read ? _O_RDONLY : _O_WRONLY | _O_CREAT | (i_Open == EOpen::Create ? _O_EXCL : _O_TRUNC);
    int descriptor = -1;
    if (const int error = ::_wsopen_s(&descriptor, path.c_str(), flags, _SH_DENYNO, _S_IREAD | _S_IWRITE))
        return CError(error);
    const std::wstring mode = std::wstring(i_Open == EOpen::Read ? L"r" : L"w") + (i_bBinary ? L"b" : L"t");
    o_rpFile = ::_wfdopen(descriptor, mode.c_str());
    if (o_rpFile)
        return {};
    const std::error_code error = CError(errno);
    ::_close(descriptor);
    return error;
}

std::error_code CheckNoFolder(const std::string&)
{
    return {}; // the system does not open folders
}

std::error_code Seek(std::FILE* i_pFile, std::int64_t i_Offset, int i_Origin)
{
    return ::_fseeki64(i_pFile, i_Offset, i_Origin) == 0 ? std::error_code() : CError(errno);
}

std::int64_t Tell(std::FILE* i_pFile)
{
    return ::_ftelli64(i_pFile);
}

std::error_code Copy(const std::string& i_rFrom, const std::string& i_rTo, bool i_bOverwrite)
{
    const std::wstring from = Wide(i_rFrom);
    const std::wstring to = Wide(i_rTo);
    if (::CompareStringOrdinal(from.c_str(), -1, to.c_str(), -1, TRUE) == CSTR_EQUAL)
        return CError(Exists(i_rFrom) ? EEXIST : ENOENT);
    return Check(::CopyFileW(from.c_str(), to.c_str(), i_bOverwrite ? FALSE : TRUE));
}

std::error_code Move(const std::string& i_rFrom, const std::string& i_rTo)
{
    return Check(::MoveFileW(Wide(i_rFrom).c_str(), Wide(i_rTo).c_str()));
}

std::error_code Rename(const std::string& i_rFrom, const std::string& i_rTo)
{
    return Check(::MoveFileExW(Wide(i_rFrom).c_str(), Wide(i_rTo).c_str(), s_RenameFlags));
}

std::error_code Replace(const std::string& i_rFrom, const std::string& i_rTo, const std::string& i_rBackup,
                        bool& o_rbRefused)
{
    const std::wstring from = Wide(i_rFrom);
    const std::wstring to = Wide(i_rTo);
    const std::wstring backup = Wide(i_rBackup);
    const DWORD attributes = ::GetFileAttributesW(to.c_str());
    if (attributes != INVALID_FILE_ATTRIBUTES && (attributes & FILE_ATTRIBUTE_DIRECTORY) && Exists(i_rFrom))
        return Win32Error(ERROR_DIRECTORY);
    if (::ReplaceFileW(to.c_str(), from.c_str(), backup.empty() ? nullptr : backup.c_str(), s_ReplaceFlags, nullptr,
                       nullptr))
        return {};
    DWORD code = ::GetLastError();
    if (code == ERROR_FILE_NOT_FOUND) // there is nothing to replace, or nothing to replace it with
    {
        if (::MoveFileW(from.c_str(), to.c_str()))
            return {};
        code = ::GetLastError();
        if (code == ERROR_ALREADY_EXISTS && !Exists(i_rFrom))
            code = ERROR_FILE_NOT_FOUND;
    }
    if (code == ERROR_UNABLE_TO_MOVE_REPLACEMENT_2 && !backup.empty()) // the target has already gone to the backup
        ::MoveFileW(backup.c_str(), to.c_str());
    o_rbRefused = code == ERROR_UNABLE_TO_REMOVE_REPLACED || code == ERROR_UNABLE_TO_MOVE_REPLACEMENT ||
                  code == ERROR_UNABLE_TO_MOVE_REPLACEMENT_2;
    return Win32Error(code);
}

std::error_code Remove(const std::string& i_rPath)
{
    return Check(::DeleteFileW(Wide(i_rPath).c_str()));
}

bool Exists(const std::string& i_rPath)
{
    return ::GetFileAttributesW(Wide(i_rPath).c_str()) != INVALID_FILE_ATTRIBUTES;
}

std::string ResolveLink(const std::string& i_rPath)
{
    return i_rPath;
}

std::error_code SyncFile(const std::string& i_rPath)
{
    const Handle file(::CreateFileW(Wide(i_rPath).c_str(), GENERIC_WRITE,
                                    FILE_SHARE_READ | FILE_SHARE_WRITE | FILE_SHARE_DELETE, nullptr, OPEN_EXISTING,
                                    FILE_ATTRIBUTE_NORMAL, nullptr));
    if (!file.IsOpen() || ::FlushFileBuffers(file.Get()))
        return {};
    const std::error_code error = LastError();
    const bool bLost = error == std::errc::no_space_on_device || error.value() == ERROR_WRITE_FAULT ||
                       error.value() == ERROR_IO_DEVICE || error.value() == ERROR_CRC;
    return bLost ? error : std::error_code();
}

void SyncFolderOf(const std::string&)
{
    // the system keeps its folders in a journal and has no call for it
}

} // namespace UtilsFileSystem::System

#include "UtilsFileSystem/Posix/Descriptor.h"
#include "UtilsFileSystem/SystemCalls.h"

#include <array>
#include <climits>
#include <cstdlib>
#include <string_view>

#include <fcntl.h>
#include <sys/stat.h>

namespace UtilsFileSystem::System
{
namespace
{

std::error_code CopyBytes(int i_From, int i_To)
{
    std::array<char, 131072> buffer;
    for (;;)
    {
        const ssize_t got = ::read(i_From, buffer.data(), buffer.size());
        if (got == 0)
            return {};
        if (got < 0 && errno != EINTR)
            return Error(errno);
        for (ssize_t done = 0; done < got;)
        {
            const ssize_t put = ::write(i_To, buffer.data() + done, static_cast<std::size_t>(got - done));
            if (put < 0 && errno != EINTR)
                return Error(errno);
            done += put > 0 ? put : 0;
        }
    }
}

bool IsSameFile(const struct stat& i_rA, const struct stat& i_rB)
{
    return i_rA.st_dev == i_rB.st_dev && i_rA.st_ino == i_rB.st_ino;
}

std::error_code OpenForCopy(const std::string& i_rFrom, int& o_rFrom, struct stat& o_rStatus)
{
    Descriptor from(::open(Raw(i_rFrom), O_RDONLY | O_CLOEXEC));
    if (!from.IsOpen() || ::fstat(from.Get(), &o_rStatus) == -1)
        return Error(errno);
    if (S_ISDIR(o_rStatus.st_mode))
        return Error(EISDIR);
    o_rFrom = from.Release();
    return {};
}

/// Copies into an open file. Its end is what a close that failed says too.
std::error_code FillCopy(int i_From, const struct stat& i_rFromStatus, int i_To)
{
    Descriptor to(i_To);
    std::error_code error = CopyBytes(i_From, to.Get());
    if (error)
        return error;
    (void)::fchmod(to.Get(), i_rFromStatus.st_mode & 07777);
    return Check(::close(to.Release()));
}

/// Copies beside the target and renames, so that the target is never seen in part.
std::error_code RenameAcross(const std::string& i_rFrom, const std::string& i_rTo)
{
    int source = -1;
    struct stat status;
    if (const auto error = OpenForCopy(i_rFrom, source, status))
        return error;
    const Descriptor from(source);
    std::string temporary = i_rTo + ".XXXXXX";
    const int to = ::mkostemp(temporary.data(), O_CLOEXEC);
    if (to == -1)
        return Error(errno);
    std::error_code error = FillCopy(from.Get(), status, to);
    if (!error)
        error = Check(::rename(temporary.c_str(), Raw(i_rTo)));
    if (error)
    {
        (void)::unlink(temporary.c_str());
        return error;
    }
    return Check(::unlink(Raw(i_rFrom)));
}

/// Without links either nothing better is left than to look first.
std::error_code MoveByLink(const std::string& i_rFrom, const std::string& i_rTo)
{
    if (::link(Raw(i_rFrom), Raw(i_rTo)) == 0)
        return Check(::unlink(Raw(i_rFrom)));
    const bool bNoLinks = errno == EPERM || errno == EOPNOTSUPP || errno == ENOSYS;
    if (!bNoLinks || Exists(i_rTo))
        return Error(bNoLinks ? EEXIST : errno);
    return Check(::rename(Raw(i_rFrom), Raw(i_rTo)));
}

/// Keeps i_rTo under i_rBackup as well, or only there where the file system has no links.
std::error_code MakeBackup(const std::string& i_rTo, const std::string& i_rBackup)
{
    (void)::unlink(Raw(i_rBackup));
    if (::link(Raw(i_rTo), Raw(i_rBackup)) == 0)
        return {};
    return Check(::rename(Raw(i_rTo), Raw(i_rBackup)));
}

/// Removes the second name or moves the only one back.
void UndoBackup(const std::string& i_rTo, const std::string& i_rBackup)
{
    if (Exists(i_rTo))
        (void)::unlink(Raw(i_rBackup));
    else
        (void)::rename(Raw(i_rBackup), Raw(i_rTo));
}

} // namespace

std::error_code Open(const std::string& i_rPath, EOpen i_Open, bool i_bBinary, std::FILE*& o_rpFile)
{
    std::string mode = i_Open == EOpen::Read ? "r" : "w";
    if (i_bBinary)
        mode += 'b';
    if (i_Open == EOpen::Create)
        mode += 'x';
    std::FILE* pFile = std::fopen(Raw(i_rPath), (mode + 'e').c_str());
    if (!pFile)
        return Error(errno);
    struct stat status;
    if (i_Open == EOpen::Read && ::fstat(::fileno(pFile), &status) == 0 && S_ISDIR(status.st_mode))
    {
        (void)std::fclose(pFile);
        return Error(EISDIR);
    }
    o_rpFile = pFile;
    return {};
}

std::error_code CheckNoFolder(const std::string& i_rPath)
{
    struct stat status;
    const bool bFolder = ::stat(Raw(i_rPath), &status) == 0 && S_ISDIR(status.st_mode);
    return bFolder ? Error(EISDIR) : std::error_code();
}

std::error_code Seek(std::FILE* i_pFile, std::int64_t i_Offset, int i_Origin)
{
    return Check(::fseeko(i_pFile, i_Offset, i_Origin));
}

std::int64_t Tell(std::FILE* i_pFile)
{
    return ::ftello(i_pFile);
}

std::error_code Copy(const std::string& i_rFrom, const std::string& i_rTo, bool i_bOverwrite)
{
    int source = -1;
    struct stat fromStatus;
    if (const auto error = OpenForCopy(i_rFrom, source, fromStatus))
        return error;
    const Descriptor from(source);
    const int flags = O_WRONLY | O_CREAT | O_CLOEXEC | (i_bOverwrite ? 0 : O_EXCL);
    Descriptor to(::open(Raw(i_rTo), flags, fromStatus.st_mode & 0777));
    struct stat toStatus;
    if (!to.IsOpen() || ::fstat(to.Get(), &toStatus) == -1)
        return Error(errno);
    if (IsSameFile(fromStatus, toStatus)) // emptying the target would empty the source
        return Error(EEXIST);
    if (i_bOverwrite && ::ftruncate(to.Get(), 0) == -1)
        return Error(errno);
    const std::error_code error = FillCopy(from.Get(), fromStatus, to.Release());
    if (error && !i_bOverwrite)
        (void)::unlink(Raw(i_rTo));
    return error;
}

std::error_code Move(const std::string& i_rFrom, const std::string& i_rTo)
{
    if (::renameat2(AT_FDCWD, Raw(i_rFrom), AT_FDCWD, Raw(i_rTo), RENAME_NOREPLACE) == 0)
        return {};
    if (errno == EINVAL || errno == ENOSYS) // the file system does not know the flag
        return MoveByLink(i_rFrom, i_rTo);
    if (errno != EXDEV)
        return Error(errno);
    if (const auto error = Copy(i_rFrom, i_rTo, false))
        return error;
    return Check(::unlink(Raw(i_rFrom)));
}

std::error_code Rename(const std::string& i_rFrom, const std::string& i_rTo)
{
    if (::rename(Raw(i_rFrom), Raw(i_rTo)) == 0)
        return {};
    return errno == EXDEV ? RenameAcross(i_rFrom, i_rTo) : Error(errno);
}

std::error_code Replace(const std::string& i_rFrom, const std::string& i_rTo, const std::string& i_rBackup,
                        bool& o_rbRefused)
{
    struct stat status;
    if (::lstat(Raw(i_rFrom), &status) == -1)
        return Error(errno);
    if (::lstat(Raw(i_rTo), &status) == -1)
        return errno == ENOENT ? Move(i_rFrom, i_rTo) : Error(errno);
    if (S_ISDIR(status.st_mode))
        return Error(EISDIR);
    std::error_code error = i_rBackup.empty() ? std::error_code() : MakeBackup(i_rTo, i_rBackup);
    if (!error)
    {
        if (!S_ISLNK(status.st_mode))
            (void)::chmod(Raw(i_rFrom), status.st_mode & 07777);
        error = Check(::rename(Raw(i_rFrom), Raw(i_rTo)));
        if (error && !i_rBackup.empty())
            UndoBackup(i_rTo, i_rBackup);
    }
    o_rbRefused = error == std::errc::device_or_resource_busy;
    return error;
}

std::error_code Remove(const std::string& i_rPath)
{
    return Check(::unlink(Raw(i_rPath)));
}

bool Exists(const std::string& i_rPath)
{
    struct stat status;
    return ::lstat(Raw(i_rPath), &status) == 0;
}

std::string ResolveLink(const std::string& i_rPath)
{
    constexpr int mostLinks = 40; // as the system's own
    std::string path = i_rPath;
    std::array<char, PATH_MAX> target;
    for (int link = 0; link < mostLinks; ++link)
    {
        const ssize_t length = ::readlink(Raw(path), target.data(), target.size());
        if (length <= 0)
            return path;
        const std::string_view next(target.data(), static_cast<std::size_t>(length));
        const std::size_t folder = next.front() == '/' ? 0 : path.rfind('/') + 1; // npos + 1 is 0
        path.replace(folder, std::string::npos, next);
    }
    return i_rPath;
}

std::error_code SyncFile(const std::string& i_rPath)
{
    const Descriptor file(::open(Raw(i_rPath), O_RDONLY | O_CLOEXEC));
    if (!file.IsOpen() || ::fsync(file.Get()) == 0)
        return {};
    const bool bLost = errno == EIO || errno == ENOSPC || errno == EDQUOT || errno == EFBIG;
    return bLost ? Error(errno) : std::error_code();
}

void SyncFolderOf(const std::string& i_rPath)
{
    const std::size_t slash = i_rPath.rfind('/');
    const std::string folder = slash == std::string::npos ? "." : i_rPath.substr(0, slash + 1);
    const Descriptor descriptor(::open(folder.c_str(), O_RDONLY | O_DIRECTORY | O_CLOEXEC));
    if (descriptor.IsOpen())
        (void)::fsync(descriptor.Get());
}

} // namespace UtilsFileSystem::System

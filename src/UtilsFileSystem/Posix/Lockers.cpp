#include "UtilsFileSystem/Posix/Descriptor.h"
#include "UtilsFileSystem/SystemCalls.h"

#include <algorithm>
#include <array>
#include <cctype>
#include <climits>
#include <cstdlib>
#include <fstream>
#include <functional>
#include <memory>
#include <set>
#include <sstream>

#include <dirent.h>
#include <fcntl.h>
#include <sys/stat.h>
#include <sys/sysmacros.h>

// The system has no register of who holds a file. What there is stands in /proc: the descriptors and mappings of each
// process, and one list of all file locks.

namespace UtilsFileSystem::System
{
namespace
{

struct Wanted
{
    dev_t Device;
    ino_t Node;
    std::string Path; ///< without links; the mappings of some file systems tell another device than the file itself
};

/// Calls i_rVisit with the names of a folder until it returns true; whether it did.
bool AnyName(int i_Folder, const char* i_pName, const std::function<bool(const char*)>& i_rVisit)
{
    const int folder = ::openat(i_Folder, i_pName, O_RDONLY | O_DIRECTORY | O_CLOEXEC);
    if (folder == -1)
        return false;
    const std::unique_ptr<DIR, int (*)(DIR*)> pFolder(::fdopendir(folder), &::closedir);
    while (const dirent* pEntry = pFolder ? ::readdir(pFolder.get()) : nullptr)
        if (i_rVisit(pEntry->d_name))
            return true;
    return false;
}

bool HasDescriptor(int i_Process, const Wanted& i_rWanted)
{
    return AnyName(i_Process, "fd",
                   [&](const char* i_pName)
                   {
                       struct stat status;
                       const std::string link = std::string("fd/") + i_pName;
                       return ::fstatat(i_Process, link.c_str(), &status, 0) == 0 &&
                              status.st_dev == i_rWanted.Device && status.st_ino == i_rWanted.Node;
                   });
}

std::string ReadAll(int i_Folder, const char* i_pName)
{
    const Descriptor file(::openat(i_Folder, i_pName, O_RDONLY | O_CLOEXEC));
    std::string text;
    std::array<char, 16384> buffer;
    for (ssize_t got = 1; file.IsOpen() && got > 0;)
    {
        got = ::read(file.Get(), buffer.data(), buffer.size());
        text.append(buffer.data(), got > 0 ? static_cast<std::size_t>(got) : 0);
    }
    return text;
}

/// Lines such as "7f00-7f10 r--p 00000000 fd:01 131074   /folder/file".
bool HasMapping(int i_Process, const Wanted& i_rWanted)
{
    std::istringstream lines(ReadAll(i_Process, "maps"));
    for (std::string line; std::getline(lines, line);)
    {
        std::istringstream fields(line);
        std::string range, rights, offset, path;
        unsigned major = 0;
        unsigned minor = 0;
        char colon = 0;
        ino_t node = 0;
        fields >> range >> rights >> offset >> std::hex >> major >> colon >> minor >> std::dec >> node >> std::ws;
        std::getline(fields, path);
        if (node == i_rWanted.Node && (::makedev(major, minor) == i_rWanted.Device || path == i_rWanted.Path))
            return true;
    }
    return false;
}

/// Those with a lock on the file; lines such as "1: POSIX  ADVISORY  WRITE 708 fd:01:131074 0 EOF".
std::set<std::string> FindLockOwners(int i_Proc, const Wanted& i_rWanted)
{
    std::set<std::string> owners;
    std::istringstream lines(ReadAll(i_Proc, "locks"));
    for (std::string line; std::getline(lines, line);)
    {
        std::istringstream fields(line);
        std::string number, kind, strictness, access, owner;
        unsigned major = 0;
        unsigned minor = 0;
        char colon = 0;
        ino_t node = 0;
        fields >> number >> kind >> strictness >> access >> owner;
        fields >> std::hex >> major >> colon >> minor >> colon >> std::dec >> node;
        if (kind != "->" && node == i_rWanted.Node && ::makedev(major, minor) == i_rWanted.Device)
            owners.insert(owner); // an arrow marks one that only waits for the lock
    }
    return owners;
}

std::string ImagePath(int i_Process)
{
    std::array<char, PATH_MAX> path;
    const ssize_t length = ::readlinkat(i_Process, "exe", path.data(), path.size());
    return length > 0 ? std::string(path.data(), static_cast<std::size_t>(length)) : UnknownLocker;
}

} // namespace

bool FindLockers(const std::string& i_rPath, std::vector<std::string>& o_rNames)
{
    struct stat status;
    const Descriptor proc(::open("/proc", O_RDONLY | O_DIRECTORY | O_CLOEXEC));
    if (!proc.IsOpen() || ::stat(Raw(i_rPath), &status) == -1)
        return false;
    const std::unique_ptr<char, void (*)(void*)> pPath(::realpath(Raw(i_rPath), nullptr), &std::free);
    const Wanted wanted{status.st_dev, status.st_ino, pPath ? pPath.get() : ""};
    const std::set<std::string> owners = FindLockOwners(proc.Get(), wanted);
    std::vector<std::string> names;
    const bool bTooMany =
        AnyName(proc.Get(), ".",
                [&](const char* i_pName)
                {
                    if (!std::isdigit(static_cast<unsigned char>(*i_pName)))
                        return false;
                    // Everything is read through this folder, which stays empty when another process gets the number.
                    const Descriptor process(::openat(proc.Get(), i_pName, O_RDONLY | O_DIRECTORY | O_CLOEXEC));
                    if (process.IsOpen() && (owners.contains(i_pName) || HasDescriptor(process.Get(), wanted) ||
                                             HasMapping(process.Get(), wanted)))
                    {
                        names.push_back(ImagePath(process.Get()));
                    }
                    return names.size() > MaximumLockers;
                });
    if (bTooMany)
        return false;
    o_rNames.insert(o_rNames.end(), names.begin(), names.end());
    return true;
}

} // namespace UtilsFileSystem::System

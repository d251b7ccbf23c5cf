#pragma once

#include <cstdint>
#include <cstdio>
#include <string>
#include <system_error>
#include <vector>

/// What differs between operating systems, and nothing else: Posix/ and Windows/ implement it. For this room only.
/// Paths are UTF-8; one that the system cannot spell is treated as a missing file. Each call answers with the system's
/// error, empty when it worked.
namespace UtilsFileSystem::System
{

enum class EOpen
{
    Read,
    Overwrite,
    Create ///< fails when the file exists
};

std::error_code Open(const std::string& i_rPath, EOpen i_Open, bool i_bBinary, std::FILE*& o_rpFile);

/// For a path that was just opened for reading: an error where it turns out to be a folder.
std::error_code CheckNoFolder(const std::string& i_rPath);

std::error_code Seek(std::FILE* i_pFile, std::int64_t i_Offset, int i_Origin);
std::int64_t Tell(std::FILE* i_pFile);

std::error_code Copy(const std::string& i_rFrom, const std::string& i_rTo, bool i_bOverwrite);

/// Never replaces a target.
std::error_code Move(const std::string& i_rFrom, const std::string& i_rTo);

/// Replaces a target; may copy between volumes.
std::error_code Rename(const std::string& i_rFrom, const std::string& i_rTo);

/// Puts i_rFrom in the place of i_rTo, which stays under i_rBackup unless that is empty. A missing i_rTo makes it a
/// move. o_rbRefused tells that the system does not let the files be swapped, whatever the error.
std::error_code Replace(const std::string& i_rFrom, const std::string& i_rTo, const std::string& i_rBackup,
                        bool& o_rbRefused);

/// A missing file is an error here.
std::error_code Remove(const std::string& i_rPath);

/// Whether the name is taken, be it by a link to nowhere. Any failure counts as missing.
bool Exists(const std::string& i_rPath);

/// Where the path leads when its last name is a link, be it to nowhere; else, and where links go in a circle, the path
/// itself, as always on Windows, where links are rare.
std::string ResolveLink(const std::string& i_rPath);

/// Brings the bytes of a file, or the names in the folder of a file, to the disk as far as the file system can do that.
/// An error only where the system says that bytes were lost.
std::error_code SyncFile(const std::string& i_rPath);
void SyncFolderOf(const std::string& i_rPath);

enum class EMapping
{
    Read,
    ReadSequentially,
    Write
};

/// An open file of which views can be mapped.
struct MappedFile
{
    std::intptr_t File = -1;
    std::intptr_t Mapping = 0; ///< where the system has an object of its own for it
    std::uint64_t Size = 0;
    EMapping Access = EMapping::Read;

    bool IsOpen() const { return File != -1; }
};

/// i_Size is the size that a file for writing gets. o_rbMappingFailed: the file could be opened but not mapped.
std::error_code OpenMapped(const std::string& i_rPath, EMapping i_Access, std::uint64_t i_Size, MappedFile& o_rFile,
                           bool& o_rbMappingFailed);
void CloseMapped(MappedFile& io_rFile);
std::error_code MapView(const MappedFile& i_rFile, std::uint64_t i_Offset, std::uint64_t i_Length, void*& o_rpView);
void UnmapView(void* i_pView, std::uint64_t i_Length);

/// Gives back the memory of a view for reading; the file is read again where the view is touched again.
void ForgetView(void* i_pView, std::uint64_t i_Length);

/// Lets reads of a view go on with zeros where another program has shortened the file, instead of ending the process.
/// Gives a number for the two calls below; negative where there is no guard, because the system needs none or because
/// too many views are guarded already. The guard is released before its view is unmapped.
int GuardView(void* i_pView, std::uint64_t i_Length);
bool HasGuardActed(int i_Guard); ///< zeros were read
void ReleaseGuard(int i_Guard);

/// The bytes that the file has now, 0 where that cannot be told.
std::uint64_t GetSizeNow(const MappedFile& i_rFile);

std::uint64_t GetAllocationGranularity();

/// See UtilsFileSystem::FindLockingProcesses.
bool FindLockers(const std::string& i_rPath, std::vector<std::string>& o_rNames);
inline constexpr std::size_t MaximumLockers = 10;
inline constexpr const char* UnknownLocker = "unknown process";

} // namespace UtilsFileSystem::System

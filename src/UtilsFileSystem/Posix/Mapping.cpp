#include "UtilsFileSystem/Posix/Descriptor.h"
#include "UtilsFileSystem/SystemCalls.h"

#include <limits>

#include <fcntl.h>
#include <sys/mman.h>
#include <sys/stat.h>

namespace UtilsFileSystem::System
{
namespace
{

/// Takes the room on the disk too: writing to a view for which there is none would end the process.
std::error_code SetSize(int i_File, std::uint64_t i_Size)
{
    if (i_Size > static_cast<std::uint64_t>(std::numeric_limits<off_t>::max()))
        return Error(EFBIG);
    return i_Size == 0 ? std::error_code() : Error(::posix_fallocate(i_File, 0, static_cast<off_t>(i_Size)));
}

} // namespace

std::error_code OpenMapped(const std::string& i_rPath, EMapping i_Access, std::uint64_t i_Size, MappedFile& o_rFile,
                           bool& o_rbMappingFailed)
{
    const bool bWrite = i_Access == EMapping::Write;
    const int flags = O_CLOEXEC | (bWrite ? O_RDWR | O_CREAT | O_TRUNC : O_RDONLY);
    Descriptor file(::open(Raw(i_rPath), flags, 0666));
    struct stat status;
    if (!file.IsOpen() || ::fstat(file.Get(), &status) == -1)
        return Error(errno);
    if (S_ISDIR(status.st_mode))
        return Error(EISDIR);
    if (bWrite)
    {
        if (const auto error = SetSize(file.Get(), i_Size))
        {
            o_rbMappingFailed = true;
            return error;
        }
    }
    o_rFile = {file.Release(), 0, bWrite ? i_Size : static_cast<std::uint64_t>(status.st_size), i_Access};
    return {};
}

void CloseMapped(MappedFile& io_rFile)
{
    if (io_rFile.IsOpen())
        ::close(static_cast<int>(io_rFile.File));
    io_rFile = {};
}

std::error_code MapView(const MappedFile& i_rFile, std::uint64_t i_Offset, std::uint64_t i_Length, void*& o_rpView)
{
    const bool bWrite = i_rFile.Access == EMapping::Write;
    void* pView =
        ::mmap(nullptr, i_Length, bWrite ? PROT_READ | PROT_WRITE : PROT_READ, bWrite ? MAP_SHARED : MAP_PRIVATE,
               static_cast<int>(i_rFile.File), static_cast<off_t>(i_Offset));
    if (pView == MAP_FAILED)
        return Error(errno);
    if (i_rFile.Access == EMapping::ReadSequentially)
        (void)::madvise(pView, i_Length, MADV_SEQUENTIAL);
    o_rpView = pView;
    return {};
}

void UnmapView(void* i_pView, std::uint64_t i_Length)
{
    ::munmap(i_pView, i_Length);
}

void ForgetView(void* i_pView, std::uint64_t i_Length)
{
    (void)::madvise(i_pView, i_Length, MADV_DONTNEED);
}

std::uint64_t GetSizeNow(const MappedFile& i_rFile)
{
    struct stat status;
    const bool bKnown = ::fstat(static_cast<int>(i_rFile.File), &status) == 0;
    return bKnown ? static_cast<std::uint64_t>(status.st_size) : 0;
}

std::uint64_t GetAllocationGranularity()
{
    return static_cast<std::uint64_t>(::sysconf(_SC_PAGESIZE));
}

} // namespace UtilsFileSystem::System

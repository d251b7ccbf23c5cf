#include "UtilsFileSystem/SystemCalls.h"
#include "UtilsFileSystem/Windows/System.h"

namespace UtilsFileSystem::System
{
namespace
{

HANDLE AsHandle(std::intptr_t i_Value)
{
    return reinterpret_cast<HANDLE>(i_Value);
}

std::intptr_t AsNumber(HANDLE i_Handle)
{
    return reinterpret_cast<std::intptr_t>(i_Handle);
}

DWORD High(std::uint64_t i_Value)
{
    return static_cast<DWORD>(i_Value >> 32);
}

DWORD Low(std::uint64_t i_Value)
{
    return static_cast<DWORD>(i_Value);
}

HANDLE OpenFileFor(const std::string& i_rPath, EMapping i_Access)
{
    const bool bWrite = i_Access == EMapping::Write;
    return ::CreateFileW(Wide(i_rPath).c_str(), bWrite ? GENERIC_READ | GENERIC_WRITE : GENERIC_READ,
                         bWrite ? 0 : FILE_SHARE_READ, nullptr, bWrite ? CREATE_ALWAYS : OPEN_EXISTING,
                         i_Access == EMapping::ReadSequentially ? FILE_FLAG_SEQUENTIAL_SCAN : FILE_ATTRIBUTE_NORMAL,
                         nullptr);
}

} // namespace

std::error_code OpenMapped(const std::string& i_rPath, EMapping i_Access, std::uint64_t i_Size, MappedFile& o_rFile,
                           bool& o_rbMappingFailed)
{
    const bool bWrite = i_Access == EMapping::Write;
    Handle file(OpenFileFor(i_rPath, i_Access));
    LARGE_INTEGER length;
    if (!file.IsOpen() || !::GetFileSizeEx(file.Get(), &length))
        return LastError();
    const std::uint64_t size = bWrite ? i_Size : static_cast<std::uint64_t>(length.QuadPart);
    HANDLE mapping = nullptr;
    if (size != 0) // an empty file has no mapping
    {
        mapping = ::CreateFileMappingW(file.Get(), nullptr, bWrite ? PAGE_READWRITE : PAGE_READONLY, High(size),
                                       Low(size), nullptr);
        if (!mapping)
        {
            o_rbMappingFailed = true;
            return LastError();
        }
    }
    o_rFile = {AsNumber(file.Release()), AsNumber(mapping), size, i_Access};
    return {};
}

void CloseMapped(MappedFile& io_rFile)
{
    const Handle mapping(AsHandle(io_rFile.Mapping));
    const Handle file(AsHandle(io_rFile.File));
    io_rFile = {};
}

std::error_code MapView(const MappedFile& i_rFile, std::uint64_t i_Offset, std::uint64_t i_Length, void*& o_rpView)
{
    const DWORD access = i_rFile.Access == EMapping::Write ? FILE_MAP_WRITE : FILE_MAP_READ;
    o_rpView = ::MapViewOfFile(AsHandle(i_rFile.Mapping), access, High(i_Offset), Low(i_Offset), i_Length);
    return o_rpView ? std::error_code() : LastError();
}

void UnmapView(void* i_pView, std::uint64_t)
{
    ::UnmapViewOfFile(i_pView);
}

void ForgetView(void* i_pView, std::uint64_t i_Length)
{
    (void)::VirtualUnlock(i_pView, i_Length); // of pages that are not locked: takes them off the working set
}

int GuardView(void*, std::uint64_t)
{
    return -1; // a file that is mapped cannot be shortened
}

bool HasGuardActed(int)
{
    return false;
}

void ReleaseGuard(int) {}

std::uint64_t GetSizeNow(const MappedFile& i_rFile)
{
    LARGE_INTEGER length;
    return ::GetFileSizeEx(AsHandle(i_rFile.File), &length) ? static_cast<std::uint64_t>(length.QuadPart) : 0;
}

std::uint64_t GetAllocationGranularity()
{
    SYSTEM_INFO info;
    ::GetSystemInfo(&info);
    return info.dwAllocationGranularity;
}

} // namespace UtilsFileSystem::System

#pragma once

#include "TQL/IResult.h"
#include "UtilsFileSystem/SystemCalls.h"

#include <cstddef>
#include <cstdint>
#include <map>
#include <mutex>
#include <string>
#include <utility>

namespace UtilsFileSystem
{

/// Owns an open file and the views that are mapped of it; closing unmaps what is left. Views may be made and released
/// from any thread, opening and closing belong to one.
class VMemoryMappedFileBase
{
public:
    VMemoryMappedFileBase() = default;
    ~VMemoryMappedFileBase() { CloseFile(); }
    VMemoryMappedFileBase(const VMemoryMappedFileBase&) = delete;
    VMemoryMappedFileBase& operator=(const VMemoryMappedFileBase&) = delete;

    bool IsOpen() const { return m_File.IsOpen(); }

    /// `AlreadyPresent` when a file is open already; `NotSupported` where the file cannot be mapped.
    TQL::IResult OpenInput(const std::string& i_rPath, bool i_bSequential);

    /// Creates or empties a file of that many bytes, whose views can be written.
    TQL::IResult OpenOutput(const std::string& i_rPath, std::uint64_t i_Size);

    void CloseFile();

    /// Maps from the offset rounded down to the allocation granularity and gives the address of the offset itself, null
    /// on failure. i_Length is not 0 and ends within the file. Views of an input file must not be written.
    std::pair<std::byte*, TQL::IResult> MapView(std::uint64_t i_Offset, std::uint64_t i_Length);

    /// Takes an address that MapView gave.
    void UnmapView(const std::byte* i_pView);

    /// Gives back the memory that the views of an input file hold; where they are read again, so is the file.
    void ForgetViews();

    /// From now on reads of all views give zeros where another program has shortened the file, instead of ending the
    /// process, as far as the system can do that. Ask IsStillWhole before what was read is believed.
    void GuardViews();

    /// Whether the open file still has all its bytes, and had them whenever a guarded view was read.
    bool IsStillWhole();

protected:
    std::uint64_t GetFileSize() const { return m_File.Size; }

private:
    struct View
    {
        std::uint64_t Length = 0;
        int Guard = -1;
    };
    using Views = std::map<std::uintptr_t, View>; // by base address

    TQL::IResult Open(const std::string& i_rPath, System::EMapping i_Mapping, std::uint64_t i_Size);
    void ReleaseLocked(Views::iterator i_View);

    System::MappedFile m_File;
    std::mutex m_Mutex;
    Views m_Views;             // guarded by m_Mutex
    bool m_bGuarding = false;  // guarded by m_Mutex
    bool m_bReadZeros = false; // guarded by m_Mutex; in a view that is gone
    const std::uint64_t m_Granularity = System::GetAllocationGranularity();
};

} // namespace UtilsFileSystem

#include "UtilsFileSystem/VMemoryMappedFileBase.h"

#include "UtilsFileSystem/FileResult.h"

#include <algorithm>

namespace UtilsFileSystem
{
namespace
{

TQL::IResult MappingFailed(const std::error_code& i_rError)
{
    const bool bNever = i_rError == std::errc::no_such_device || i_rError == std::errc::not_supported;
    return bNever ? TQL::Result::NotSupported : TQL::Result::FileIOFailure;
}

} // namespace

TQL::IResult VMemoryMappedFileBase::OpenInput(const std::string& i_rPath, bool i_bSequential)
{
    return Open(i_rPath, i_bSequential ? System::EMapping::ReadSequentially : System::EMapping::Read, 0);
}

TQL::IResult VMemoryMappedFileBase::OpenOutput(const std::string& i_rPath, std::uint64_t i_Size)
{
    const TQL::IResult result = Open(i_rPath, System::EMapping::Write, i_Size);
    if (result == TQL::Result::NotPermitted)
        LogLockers("Failed to open output file '%1%' locked by processes '%2%'.", i_rPath);
    return result;
}

TQL::IResult VMemoryMappedFileBase::Open(const std::string& i_rPath, System::EMapping i_Mapping, std::uint64_t i_Size)
{
    if (IsOpen())
        return TQL::Result::AlreadyPresent;
    bool bMappingFailed = false;
    const std::error_code error = System::OpenMapped(i_rPath, i_Mapping, i_Size, m_File, bMappingFailed);
    return error && bMappingFailed ? MappingFailed(error) : ResultOf(error);
}

void VMemoryMappedFileBase::CloseFile()
{
    {
        const std::lock_guard lock(m_Mutex);
        while (!m_Views.empty())
            ReleaseLocked(m_Views.begin());
        m_bGuarding = m_bReadZeros = false;
    }
    System::CloseMapped(m_File);
}

std::pair<std::byte*, TQL::IResult> VMemoryMappedFileBase::MapView(std::uint64_t i_Offset, std::uint64_t i_Length)
{
    if (!IsOpen())
        return {nullptr, TQL::Result::FileNotOpen};
    if (i_Length == 0 || i_Offset > m_File.Size || i_Length > m_File.Size - i_Offset)
        return {nullptr, TQL::Result::InvalidArgument};
    const std::uint64_t remainder = i_Offset % m_Granularity;
    const std::uint64_t length = i_Length + remainder;
    void* pView = nullptr;
    if (const auto error = System::MapView(m_File, i_Offset - remainder, length, pView))
        return {nullptr, MappingFailed(error)};
    const std::lock_guard lock(m_Mutex);
    m_Views[reinterpret_cast<std::uintptr_t>(pView)] = {length, m_bGuarding ? System::GuardView(pView, length) : -1};
    return {static_cast<std::byte*>(pView) + remainder, TQL::Result::Ok};
}

void VMemoryMappedFileBase::ForgetViews()
{
    const std::lock_guard lock(m_Mutex);
    for (const auto& [base, rView] : m_Views)
        System::ForgetView(reinterpret_cast<void*>(base), rView.Length);
}

void VMemoryMappedFileBase::GuardViews()
{
    const std::lock_guard lock(m_Mutex);
    m_bGuarding = true;
    for (auto& [base, rView] : m_Views)
        if (rView.Guard < 0)
            rView.Guard = System::GuardView(reinterpret_cast<void*>(base), rView.Length);
}

bool VMemoryMappedFileBase::IsStillWhole()
{
    const auto hasReadZeros = [](const auto& i_rPair)
    {
        return i_rPair.second.Guard >= 0 && System::HasGuardActed(i_rPair.second.Guard);
    };
    const std::lock_guard lock(m_Mutex);
    return System::GetSizeNow(m_File) >= m_File.Size && !m_bReadZeros && std::ranges::none_of(m_Views, hasReadZeros);
}

void VMemoryMappedFileBase::ReleaseLocked(Views::iterator i_View)
{
    const auto& [length, guard] = i_View->second;
    if (guard >= 0)
    {
        m_bReadZeros = m_bReadZeros || System::HasGuardActed(guard);
        System::ReleaseGuard(guard);
    }
    System::UnmapView(reinterpret_cast<void*>(i_View->first), length);
    m_Views.erase(i_View);
}

void VMemoryMappedFileBase::UnmapView(const std::byte* i_pView)
{
    const std::lock_guard lock(m_Mutex);
    auto found = m_Views.upper_bound(reinterpret_cast<std::uintptr_t>(i_pView)); // the first base behind the address
    if (found == m_Views.begin())
        return;
    --found;
    if (reinterpret_cast<std::uintptr_t>(i_pView) - found->first < found->second.Length)
        ReleaseLocked(found);
}

} // namespace UtilsFileSystem

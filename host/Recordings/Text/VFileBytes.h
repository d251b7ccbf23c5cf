#pragma once

#include "TQL/IResult.h"
#include "UtilsFileSystem/VMemoryMappedInputFile.h"

#include <cstddef>
#include <filesystem>
#include <span>
#include <string>
#include <vector>

namespace Recordings
{

/// The bytes of a file while it is read. A small file is loaded, so that nothing that others do to it matters; a larger
/// one is mapped, so that its bytes need no memory of their own. Where another program shortens a mapped file its bytes
/// read as zeros: what was read counts only if IsWhole says so afterwards. Owned by the one who reads; one thread.
class VFileBytes
{
public:
    /// Files above that many bytes are mapped.
    static constexpr std::size_t LargestLoaded = std::size_t{1} << 20;

    /// A folder, a device, an empty file and a file that may not be read are errors, told in one sentence without the
    /// name of the file.
    [[nodiscard]] TQL::IResult Open(const std::filesystem::path& i_rPath, std::string& o_rError);

    std::span<const std::byte> GetBytes() const { return m_Bytes; }

    /// Whether all bytes were those of the file up to now.
    bool IsWhole() { return !m_Mapped.IsOpen() || m_Mapped.IsStillWhole(); }

    /// Gives back the memory of the bytes that were read; they can be read again.
    void Forget() { m_Mapped.ForgetViews(); }

private:
    TQL::IResult Load(const std::filesystem::path& i_rPath, std::size_t i_Size, std::string& o_rError);
    bool Map(const std::filesystem::path& i_rPath);

    std::vector<std::byte> m_Loaded;
    UtilsFileSystem::VMemoryMappedInputFile m_Mapped;
    std::span<const std::byte> m_Bytes;
};

} // namespace Recordings

#pragma once

#include "TQL/IResult.h"
#include "UtilsFileSystem/VFileStream.h"

#include <cstddef>
#include <filesystem>
#include <memory>
#include <span>
#include <string>
#include <string_view>
#include <system_error>

namespace Recordings
{

/// Writes a file beside its final place and moves it there when all of it is on the disk: under the final name there is
/// the old file or the whole new one, never half of one. The file beside is new and its name nobody can guess. What is
/// not committed is removed. A symbolic link stays, the file behind it is replaced. A place that is no ordinary file (a
/// pipe, a device) is written directly. Owned by the operation that writes; one thread.
class VFileReplacement
{
public:
    explicit VFileReplacement(std::filesystem::path i_Path);
    ~VFileReplacement();
    VFileReplacement(const VFileReplacement&) = delete;
    VFileReplacement& operator=(const VFileReplacement&) = delete;

    /// On failure o_rError is one line that names the file; so it is with the other two.
    [[nodiscard]] TQL::IResult Open(std::string& o_rError);
    [[nodiscard]] TQL::IResult Write(std::span<const std::byte> i_Bytes, std::string& o_rError);
    [[nodiscard]] TQL::IResult Write(std::string_view i_Text, std::string& o_rError);
    [[nodiscard]] TQL::IResult Commit(std::string& o_rError);

private:
    TQL::IResult Fail(int i_SystemError, std::string& o_rError);
    TQL::IResult MoveIntoPlace(std::string& o_rError);
    std::error_code OpenBeside();

    std::filesystem::path m_Path;                                // as given, for messages
    std::filesystem::path m_Target;                              // where links lead to
    std::filesystem::path m_Temporary;                           // empty when the target is written directly
    std::unique_ptr<UtilsFileSystem::VFileOutputStream> m_pFile; // null until Open, and from Commit on
};

} // namespace Recordings

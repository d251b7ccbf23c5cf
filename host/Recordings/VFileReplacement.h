#pragma once

#include "TQL/IResult.h"

#include <cstddef>
#include <filesystem>
#include <fstream>
#include <span>
#include <string>
#include <string_view>

namespace Recordings
{

/// Writes a file beside its final place and moves it there when all of it is on the disk: under the final name there is
/// the old file or the whole new one, never half of one. What is not committed is removed. A place that is no ordinary
/// file (a pipe, a device) is written directly. Owned by the operation that writes; one thread.
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

    std::filesystem::path m_Path;      // as given, for messages
    std::filesystem::path m_Target;    // where links lead to
    std::filesystem::path m_Temporary; // empty when the target is written directly
    std::ofstream m_Stream;
};

} // namespace Recordings

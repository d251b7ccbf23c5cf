#pragma once

#include "Recordings/Common/VRecording.h"

#include <filesystem>
#include <string>
#include <vector>

namespace TestRecordings
{

/// A recording as text: a line for it, a line a channel (a bar between rows, "-" for a missing value), a line an event,
/// a line a warning or remark.
std::string TextOf(const Recordings::VRecording& i_rRecording);

std::string WarningsOf(const Recordings::VRecording& i_rRecording);

/// One channel by name; a test failure and an empty one when there is none.
const Recordings::RecordedChannel& ChannelNamed(const Recordings::VRecording& i_rRecording, const std::string& i_rName);

std::string ReadText(const std::filesystem::path& i_rPath);
void WriteBytes(const std::filesystem::path& i_rPath, const std::vector<std::byte>& i_rBytes);

/// An empty folder that goes away with its content.
class TemporaryFolder
{
public:
    TemporaryFolder();
    ~TemporaryFolder();
    TemporaryFolder(const TemporaryFolder&) = delete;
    TemporaryFolder& operator=(const TemporaryFolder&) = delete;

    std::filesystem::path operator/(const std::string& i_rName) const { return m_Path / i_rName; }
    const std::filesystem::path& Path() const { return m_Path; }
    std::vector<std::string> FileNames() const; ///< sorted

private:
    std::filesystem::path m_Path;
};

} // namespace TestRecordings

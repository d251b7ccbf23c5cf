#pragma once

#include <cstdint>
#include <filesystem>

namespace Studio
{

/// What tells one state of a file from another. All zero for a file that is not there.
struct FileStamp
{
    bool bExists = false;
    std::uintmax_t Size = 0;
    std::filesystem::file_time_type Time;
    bool operator==(const FileStamp&) const = default;
};

FileStamp StampOf(const std::filesystem::path& i_rPath);

/// When a file that is looked at now and then counts as changed: once it is another than the one that is known, is
/// there, and was the same at two looks. A value; no thread.
class VFileSettling
{
public:
    explicit VFileSettling(const FileStamp& i_rKnown) : m_Known(i_rKnown), m_Seen(i_rKnown) {}

    enum class ELook
    {
        Still,  ///< as it is known, or not there
        Moving, ///< look again
        Changed ///< told once; from now on this is the one that is known
    };

    ELook Look(const FileStamp& i_rNow);

private:
    FileStamp m_Known;
    FileStamp m_Seen;
};

} // namespace Studio

#include "Studio/Files/FileSettling.h"

#include <system_error>

namespace Studio
{

FileStamp StampOf(const std::filesystem::path& i_rPath)
{
    FileStamp stamp;
    std::error_code sizeError, timeError;
    stamp.Size = std::filesystem::file_size(i_rPath, sizeError);
    stamp.Time = std::filesystem::last_write_time(i_rPath, timeError);
    stamp.bExists = true;
    return sizeError || timeError ? FileStamp() : stamp;
}

VFileSettling::ELook VFileSettling::Look(const FileStamp& i_rNow)
{
    const bool bMoved = i_rNow != m_Seen;
    m_Seen = i_rNow;
    if (bMoved)
        return ELook::Moving;
    if (!i_rNow.bExists || i_rNow == m_Known)
        return ELook::Still;
    m_Known = i_rNow;
    return ELook::Changed;
}

} // namespace Studio

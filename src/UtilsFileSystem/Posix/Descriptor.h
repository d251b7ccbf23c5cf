#pragma once

#include <cerrno>
#include <string>
#include <system_error>
#include <utility>

#include <unistd.h>

namespace UtilsFileSystem::System
{

/// Owns a file descriptor.
class Descriptor
{
public:
    explicit Descriptor(int i_Value) : m_Value(i_Value) {}
    ~Descriptor()
    {
        if (m_Value >= 0)
            ::close(m_Value);
    }
    Descriptor(const Descriptor&) = delete;
    Descriptor& operator=(const Descriptor&) = delete;

    int Get() const { return m_Value; }
    bool IsOpen() const { return m_Value >= 0; }
    int Release() { return std::exchange(m_Value, -1); }

private:
    int m_Value;
};

/// The path for a system call; the empty path, which never exists, where a zero in the text would cut it off.
inline const char* Raw(const std::string& i_rPath)
{
    return i_rPath.find('\0') == std::string::npos ? i_rPath.c_str() : "";
}

inline std::error_code Error(int i_Number)
{
    return {i_Number, std::generic_category()};
}

/// The error of a call that answers -1 on failure.
inline std::error_code Check(int i_Answer)
{
    return i_Answer == -1 ? Error(errno) : std::error_code();
}

} // namespace UtilsFileSystem::System

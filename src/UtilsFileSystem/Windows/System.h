#pragma once

#ifndef UNICODE
#define UNICODE
#endif
#ifndef NOMINMAX
#define NOMINMAX
#endif
#ifndef WIN32_LEAN_AND_MEAN
#define WIN32_LEAN_AND_MEAN
#endif
#include <windows.h>

#include <string>
#include <system_error>

namespace UtilsFileSystem::System
{

/// An error of the Windows calls, with the system's text in UTF-8 and the standard conditions that it stands for.
std::error_code Win32Error(DWORD i_Code);

/// What GetLastError holds. Never no error: it is asked only after a failure.
std::error_code LastError();

/// The error of a call that answers FALSE on failure.
inline std::error_code Check(BOOL i_bDone)
{
    return i_bDone ? std::error_code() : LastError();
}

/// The path for a system call; the empty path, which never exists, where the text is no UTF-8 or a zero would cut it
/// off.
std::wstring Wide(const std::string& i_rText);
std::string Narrow(const wchar_t* i_pText, int i_Length);

/// Owns a handle of the kernel.
class Handle
{
public:
    explicit Handle(HANDLE i_Value) : m_Value(i_Value) {}
    ~Handle()
    {
        if (IsOpen())
            ::CloseHandle(m_Value);
    }
    Handle(const Handle&) = delete;
    Handle& operator=(const Handle&) = delete;

    HANDLE Get() const { return m_Value; }
    bool IsOpen() const { return m_Value != nullptr && m_Value != INVALID_HANDLE_VALUE; }
    HANDLE Release()
    {
        const HANDLE value = m_Value;
        m_Value = nullptr;
        return value;
    }

private:
    HANDLE m_Value;
};

} // namespace UtilsFileSystem::System

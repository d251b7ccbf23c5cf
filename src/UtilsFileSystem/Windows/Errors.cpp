#include "UtilsFileSystem/Windows/System.h"

namespace UtilsFileSystem::System
{
namespace
{

struct Row
{
    DWORD Code;
    std::errc Condition;
};

constexpr Row s_Rows[] = {
    {ERROR_FILE_NOT_FOUND, std::errc::no_such_file_or_directory},
    {ERROR_PATH_NOT_FOUND, std::errc::no_such_file_or_directory},
    {ERROR_BAD_NETPATH, std::errc::no_such_file_or_directory},
    {ERROR_ACCESS_DENIED, std::errc::permission_denied},
    {ERROR_SHARING_VIOLATION, std::errc::permission_denied},
    {ERROR_LOCK_VIOLATION, std::errc::permission_denied},
    {ERROR_UNABLE_TO_REMOVE_REPLACED, std::errc::permission_denied},
    {ERROR_UNABLE_TO_MOVE_REPLACEMENT, std::errc::permission_denied},
    {ERROR_UNABLE_TO_MOVE_REPLACEMENT_2, std::errc::permission_denied},
    {ERROR_FILE_EXISTS, std::errc::file_exists},
    {ERROR_ALREADY_EXISTS, std::errc::file_exists},
    {ERROR_INVALID_PARAMETER, std::errc::invalid_argument},
    {ERROR_INVALID_NAME, std::errc::invalid_argument},
    {ERROR_NOT_SUPPORTED, std::errc::not_supported},
    {ERROR_DIRECTORY, std::errc::not_a_directory},
    {ERROR_DISK_FULL, std::errc::no_space_on_device},
    {ERROR_HANDLE_DISK_FULL, std::errc::no_space_on_device},
};

class Category : public std::error_category
{
public:
    const char* name() const noexcept override { return "win32"; }

    std::string message(int i_Code) const override
    {
        wchar_t text[512];
        const DWORD length =
            ::FormatMessageW(FORMAT_MESSAGE_FROM_SYSTEM | FORMAT_MESSAGE_IGNORE_INSERTS, nullptr,
                             static_cast<DWORD>(i_Code), 0, text, static_cast<DWORD>(std::size(text)), nullptr);
        std::string narrow = Narrow(text, static_cast<int>(length));
        while (!narrow.empty() && (narrow.back() == '\n' || narrow.back() == '\r' || narrow.back() == ' '))
            narrow.pop_back();
        return narrow.empty() ? "error " + std::to_string(i_Code) : narrow;
    }

    std::error_condition default_error_condition(int i_Code) const noexcept override
    {
        for (const Row& rRow : s_Rows)
            if (rRow.Code == static_cast<DWORD>(i_Code))
                return std::make_error_condition(rRow.Condition);
        return {i_Code, *this};
    }
};

} // namespace

std::error_code Win32Error(DWORD i_Code)
{
    static const Category category;
    return {static_cast<int>(i_Code), category};
}

std::error_code LastError()
{
    const DWORD code = ::GetLastError();
    return Win32Error(code != 0 ? code : static_cast<DWORD>(ERROR_GEN_FAILURE));
}

std::wstring Wide(const std::string& i_rText)
{
    if (i_rText.empty() || i_rText.find('\0') != std::string::npos)
        return {};
    const int size = static_cast<int>(i_rText.size());
    std::wstring wide(i_rText.size(), L'\0');
    const int length = ::MultiByteToWideChar(CP_UTF8, MB_ERR_INVALID_CHARS, i_rText.data(), size, wide.data(), size);
    wide.resize(static_cast<std::size_t>(length));
    return wide;
}

std::string Narrow(const wchar_t* i_pText, int i_Length)
{
    if (i_Length <= 0)
        return {};
    std::string narrow(static_cast<std::size_t>(i_Length) * 3, '\0');
    const int length = ::WideCharToMultiByte(CP_UTF8, 0, i_pText, i_Length, narrow.data(),
                                             static_cast<int>(narrow.size()), nullptr, nullptr);
    narrow.resize(static_cast<std::size_t>(length));
    return narrow;
}

} // namespace UtilsFileSystem::System

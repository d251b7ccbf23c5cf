#include "UtilsFileSystem/SystemCalls.h"
#include "UtilsFileSystem/Windows/System.h"

#include <restartmanager.h>

#include <array>
#include <optional>

namespace UtilsFileSystem::System
{
namespace
{

/// One session with the Restart Manager, ended when destroyed.
class Session
{
public:
    Session() { m_bStarted = ::RmStartSession(&m_Number, 0, m_Key) == ERROR_SUCCESS; }
    ~Session()
    {
        if (m_bStarted)
            ::RmEndSession(m_Number);
    }
    Session(const Session&) = delete;
    Session& operator=(const Session&) = delete;

    bool Register(const std::wstring& i_rPath)
    {
        LPCWSTR pPath = i_rPath.c_str();
        return m_bStarted && ::RmRegisterResources(m_Number, 1, &pPath, 0, nullptr, 0, nullptr) == ERROR_SUCCESS;
    }

    /// False also when there are more than the list has room for.
    bool GetList(std::array<RM_PROCESS_INFO, MaximumLockers>& o_rList, UINT& o_rCount)
    {
        UINT needed = 0;
        DWORD reasons = 0;
        o_rCount = static_cast<UINT>(o_rList.size());
        return ::RmGetList(m_Number, &needed, &o_rCount, o_rList.data(), &reasons) == ERROR_SUCCESS;
    }

private:
    DWORD m_Number = 0;
    WCHAR m_Key[CCH_RM_SESSION_KEY + 1] = {};
    bool m_bStarted = false;
};

/// The full image path. Nothing for a process that cannot be opened.
std::optional<std::string> NameOf(const RM_UNIQUE_PROCESS& i_rProcess)
{
    const Handle process(::OpenProcess(PROCESS_QUERY_LIMITED_INFORMATION, FALSE, i_rProcess.dwProcessId));
    if (!process.IsOpen())
        return {};
    FILETIME started, exited, kernel, user;
    // Another start time: the number has gone to another process since.
    if (!::GetProcessTimes(process.Get(), &started, &exited, &kernel, &user) ||
        ::CompareFileTime(&started, &i_rProcess.ProcessStartTime) != 0)
        return UnknownLocker;
    std::array<wchar_t, 32768> path;
    DWORD length = static_cast<DWORD>(path.size());
    if (!::QueryFullProcessImageNameW(process.Get(), 0, path.data(), &length))
        return UnknownLocker;
    return Narrow(path.data(), static_cast<int>(length));
}

} // namespace

bool FindLockers(const std::string& i_rPath, std::vector<std::string>& o_rNames)
{
    Session session;
    std::array<RM_PROCESS_INFO, MaximumLockers> list{};
    UINT count = 0;
    if (!session.Register(Wide(i_rPath)) || !session.GetList(list, count))
        return false;
    for (UINT i = 0; i < count; ++i)
        if (const auto name = NameOf(list[i].Process))
            o_rNames.push_back(*name);
    return true;
}

} // namespace UtilsFileSystem::System

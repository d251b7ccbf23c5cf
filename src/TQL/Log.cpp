#include "TQL/Log.h"

#include <boost/format.hpp>

#include <algorithm>
#include <atomic>
#include <cstdio>
#include <map>
#include <mutex>
#include <vector>

namespace TQL
{

class VLogCategory
{
public:
    VLogCategory(std::string_view i_Name, int i_Threshold) : m_Name(i_Name), m_Threshold(i_Threshold) {}

    const std::string m_Name;
    std::atomic<int> m_Threshold;
};

namespace Log
{
namespace
{

struct LogState
{
    std::mutex m_Mutex; // guards the three members below
    std::map<std::string, std::unique_ptr<VLogCategory>, std::less<>> m_Categories;
    int m_DefaultThreshold = static_cast<int>(ELogSeverity::Information);
    std::vector<std::shared_ptr<const Sink>> m_Sinks;
    std::mutex m_WriteMutex; // one message at a time
};

LogState& GetState()
{
    static LogState* pState = new LogState; // never destroyed: threads may log until the process ends
    return *pState;
}

/// The last folder and the name of a source file, without its ending.
std::string_view SourceName(std::string_view i_Path)
{
    const std::size_t file = i_Path.find_last_of("/\\");
    const std::size_t folder =
        file == std::string_view::npos || file == 0 ? file : i_Path.find_last_of("/\\", file - 1);
    const std::string_view name = folder == std::string_view::npos ? i_Path : i_Path.substr(folder + 1);
    return name.substr(0, name.find_last_of('.'));
}

} // namespace

VLogCategory& GetCategory(std::string_view i_Name)
{
    LogState& rState = GetState();
    const std::lock_guard lock(rState.m_Mutex);
    auto found = rState.m_Categories.find(i_Name);
    if (found == rState.m_Categories.end())
    {
        auto pCategory = std::make_unique<VLogCategory>(i_Name, rState.m_DefaultThreshold);
        found = rState.m_Categories.emplace(std::string(i_Name), std::move(pCategory)).first;
    }
    return *found->second;
}

void SetThreshold(VLogCategory& i_rCategory, ELogSeverity i_Severity)
{
    i_rCategory.m_Threshold = static_cast<int>(i_Severity);
}

void SetDefaultThreshold(ELogSeverity i_Severity)
{
    LogState& rState = GetState();
    const std::lock_guard lock(rState.m_Mutex);
    rState.m_DefaultThreshold = static_cast<int>(i_Severity);
}

bool IsEnabled(const VLogCategory& i_rCategory, ELogSeverity i_Severity)
{
    return static_cast<int>(i_Severity) <= i_rCategory.m_Threshold.load(std::memory_order_relaxed);
}

void Write(const VLogCategory& i_rCategory, ELogSeverity i_Severity, std::string_view i_Text, const LogPlace& i_rPlace)
{
    if (!IsEnabled(i_rCategory, i_Severity))
        return;
    LogState& rState = GetState();
    std::vector<std::shared_ptr<const Sink>> sinks;
    {
        const std::lock_guard lock(rState.m_Mutex);
        sinks = rState.m_Sinks;
    }
    const LogMessage message{i_rCategory.m_Name, i_Severity, i_Text, SourceName(i_rPlace.Path), i_rPlace.Line};
    const std::lock_guard lock(rState.m_WriteMutex);
    for (const auto& pSink : sinks)
        (*pSink)(message);
    if (sinks.empty())
        std::fprintf(stderr, "%s: %.*s\n", i_rCategory.m_Name.c_str(), static_cast<int>(i_Text.size()), i_Text.data());
}

void WriteFormatted(const VLogCategory& i_rCategory, ELogSeverity i_Severity, const LogText& i_rFormat,
                    std::span<const LogArgument> i_Arguments)
{
    try
    {
        boost::format format(i_rFormat.pText);
        for (const LogArgument& rArgument : i_Arguments)
            std::visit([&format](const auto& i_rValue) { format % i_rValue; }, rArgument);
        Write(i_rCategory, i_Severity, format.str(), i_rFormat.Place);
    }
    catch (const boost::io::format_error&)
    {
        Write(i_rCategory, ELogSeverity::Error, i_rFormat.pText, i_rFormat.Place);
    }
}

std::shared_ptr<void> AddSink(Sink i_Sink)
{
    LogState& rState = GetState();
    auto pSink = std::make_shared<const Sink>(std::move(i_Sink));
    {
        const std::lock_guard lock(rState.m_Mutex);
        rState.m_Sinks.push_back(pSink);
    }
    const Sink* pKey = pSink.get();
    return std::shared_ptr<void>(&rState,
                                 [pKey](void* i_pState)
                                 {
                                     LogState& rReleased = *static_cast<LogState*>(i_pState);
                                     std::shared_ptr<const Sink> pGone; // what it owns may log: after the mutex
                                     const std::lock_guard lock(rReleased.m_Mutex);
                                     const auto found = std::ranges::find(
                                         rReleased.m_Sinks, pKey, [](const auto& i_rpSink) { return i_rpSink.get(); });
                                     pGone = std::move(*found);
                                     rReleased.m_Sinks.erase(found);
                                 });
}

} // namespace Log
} // namespace TQL

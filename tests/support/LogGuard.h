#pragma once

#include "TQL/Log.h"

#include <gtest/gtest.h>

#include <mutex>
#include <string>
#include <vector>

namespace TestSupport
{

/// Collects what is logged while it lives. An error that the test did not take with Take fails the test.
class LogGuard
{
public:
    struct Entry
    {
        std::string Category;
        TQL::ELogSeverity Severity;
        std::string Text;
    };

    LogGuard()
        : m_pSink(TQL::Log::AddSink(
              [this](const TQL::LogMessage& i_rMessage)
              {
                  const std::lock_guard lock(m_Mutex);
                  m_Entries.push_back(
                      {std::string(i_rMessage.Category), i_rMessage.Severity, std::string(i_rMessage.Text)});
              }))
    {
    }

    ~LogGuard()
    {
        m_pSink.reset();
        for (const Entry& rEntry : m_Entries)
            if (rEntry.Severity == TQL::ELogSeverity::Error)
                ADD_FAILURE() << "unexpected error in the log: " << rEntry.Category << ": " << rEntry.Text;
    }

    LogGuard(const LogGuard&) = delete;
    LogGuard& operator=(const LogGuard&) = delete;

    /// What has been logged so far; the guard forgets it.
    std::vector<Entry> Take()
    {
        const std::lock_guard lock(m_Mutex);
        return std::exchange(m_Entries, {});
    }

private:
    std::mutex m_Mutex;
    std::vector<Entry> m_Entries; // guarded by m_Mutex
    std::shared_ptr<void> m_pSink;
};

} // namespace TestSupport

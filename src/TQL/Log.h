#pragma once

#include <boost/format.hpp>

#include <cstdint>
#include <functional>
#include <memory>
#include <string>
#include <string_view>

namespace TQL
{

enum class ELogSeverity : int
{
    Error = 2,
    Warning = 3,
    Information = 4,
    Detail = 6
};

/// One category of the log, made on first use and never destroyed. Compared by address.
class VLogCategory;

/// One message as a sink gets it.
struct LogMessage
{
    std::string_view Category;
    ELogSeverity Severity;
    std::string_view Text;
    std::string_view Source; ///< for example "CoreGraphics/Resources"
    int Line;
};

/// The process-wide log. Any thread may write; sinks are called one at a time, on the writing thread, and must not log.
namespace Log
{

using Sink = std::function<void(const LogMessage&)>;

/// The category of that name, always the same one.
VLogCategory& GetCategory(std::string_view i_Name);

/// The severest number that is still written (6 writes everything). A new category has the default threshold, 4.
void SetThreshold(VLogCategory& i_rCategory, ELogSeverity i_Severity);
void SetDefaultThreshold(ELogSeverity i_Severity);

bool IsEnabled(const VLogCategory& i_rCategory, ELogSeverity i_Severity);
void Write(const VLogCategory& i_rCategory, ELogSeverity i_Severity, std::string_view i_Text, std::string_view i_Source,
           int i_Line);

/// Adds a receiver; releasing the returned token removes it. Without any sink messages go to standard error.
[[nodiscard]] std::shared_ptr<void> AddSink(Sink i_Sink);

/// Writes a Boost.Format text with its arguments, formatting only when the category admits the severity. When the
/// formatting fails the bare text is written at severity 2.
template <typename... Args>
void Format(const VLogCategory& i_rCategory, ELogSeverity i_Severity, std::string_view i_Source, int i_Line,
            const char* i_pFormat, const Args&... i_rArgs)
{
    if (!IsEnabled(i_rCategory, i_Severity))
        return;
    try
    {
        boost::format format(i_pFormat);
        (void)(format % ... % i_rArgs);
        Write(i_rCategory, i_Severity, format.str(), i_Source, i_Line);
    }
    catch (const boost::io::format_error&)
    {
        Write(i_rCategory, ELogSeverity::Error, i_pFormat, i_Source, i_Line);
    }
}

} // namespace Log
} // namespace TQL

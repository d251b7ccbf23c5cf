#pragma once

#include <array>
#include <concepts>
#include <cstdint>
#include <functional>
#include <memory>
#include <source_location>
#include <span>
#include <string>
#include <string_view>
#include <variant>

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
    std::string_view Source; ///< room and file, for example "CoreGraphics/Resources"
    int Line;
};

/// Where a message comes from: by itself the line in the source that makes it, or a place that the message is known by.
struct LogPlace
{
    // Implicit: as a default argument it stands for the line of the call.
    LogPlace(const std::source_location& i_rWhere) : Path(i_rWhere.file_name()), Line(static_cast<int>(i_rWhere.line()))
    {
    }
    LogPlace(std::string_view i_Path, int i_Line) : Path(i_Path), Line(i_Line) {}

    std::string_view Path; ///< of a source file, or room and file alone
    int Line;
};

/// A Boost.Format text and the place where it stands. Made by writing the text down as an argument.
struct LogText
{
    LogText(const char* i_pText, const LogPlace& i_rPlace = std::source_location::current())
        : pText(i_pText), Place(i_rPlace)
    {
    }

    const char* pText; ///< outlives the message
    LogPlace Place;
};

/// What takes the place of a placeholder: any number, character or text.
using LogArgument = std::variant<std::int64_t, std::uint64_t, double, char, std::string_view>;

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
void Write(const VLogCategory& i_rCategory, ELogSeverity i_Severity, std::string_view i_Text,
           const LogPlace& i_rPlace = std::source_location::current());

/// Adds a receiver; releasing the returned token removes it. Without any sink messages go to standard error.
[[nodiscard]] std::shared_ptr<void> AddSink(Sink i_Sink);

/// Of an argument of Format, which has to outlive it.
template <typename T>
LogArgument MakeLogArgument(const T& i_rValue)
{
    if constexpr (std::same_as<T, char>)
        return i_rValue;
    else if constexpr (std::floating_point<T>)
        return double{i_rValue};
    else if constexpr (std::signed_integral<T>)
        return std::int64_t{i_rValue};
    else if constexpr (std::unsigned_integral<T>)
        return std::uint64_t{i_rValue};
    else
        return std::string_view(i_rValue);
}

void WriteFormatted(const VLogCategory& i_rCategory, ELogSeverity i_Severity, const LogText& i_rFormat,
                    std::span<const LogArgument> i_Arguments);

/// Writes a Boost.Format text with its arguments, formatting only when the category admits the severity. When the
/// formatting fails the bare text is written at severity 2.
template <typename... Args>
void Format(const VLogCategory& i_rCategory, ELogSeverity i_Severity, const LogText& i_rFormat, const Args&... i_rArgs)
{
    if (!IsEnabled(i_rCategory, i_Severity))
        return;
    const std::array<LogArgument, sizeof...(Args)> arguments{MakeLogArgument(i_rArgs)...};
    WriteFormatted(i_rCategory, i_Severity, i_rFormat, arguments);
}

} // namespace Log
} // namespace TQL

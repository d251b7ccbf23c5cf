#include "Recordings/C3d/C3dFrameCount.h"

#include <algorithm>
#include <cmath>
#include <optional>
#include <string_view>

namespace Recordings
{

namespace
{

constexpr std::uint64_t LargestWord = 0xFFFF;
constexpr double LargestCount = 4294967295.0;

// A frame number of 32 bits as two words, the low one first.
std::optional<std::uint64_t> LongField(const VC3dParameters& i_rParameters, std::string_view i_Name)
{
    const std::vector<double> words = i_rParameters.Numbers("TRIAL", i_Name, 2, EWordKind::Unsigned);
    const auto isWord = [](double i_Value)
    {
        return i_Value >= 0.0 && i_Value <= static_cast<double>(LargestWord);
    };
    if (words.size() != 2 || !std::all_of(words.begin(), words.end(), isWord))
        return std::nullopt;
    return static_cast<std::uint64_t>(words[0]) + static_cast<std::uint64_t>(words[1]) * (LargestWord + 1);
}

std::uint64_t CountParameter(const VC3dParameters& i_rParameters, std::string_view i_Name)
{
    const double value = i_rParameters.Number("POINT", i_Name, EWordKind::Unsigned).value_or(0.0);
    return value >= 1.0 && value <= LargestCount ? static_cast<std::uint64_t>(value) : 0;
}

// Whether a 16-bit count is what is left of a longer one: the largest word, or the low word.
bool IsCutOff(std::uint64_t i_Count, std::uint64_t i_Longer)
{
    return i_Longer > LargestWord && (i_Count == LargestWord || i_Count == (i_Longer & LargestWord));
}

} // namespace

std::vector<C3dFrameSpan> C3dFrameSpans(const C3dHeader& i_rHeader, const VC3dParameters& i_rParameters)
{
    // Frames count from 1; a file that counts from 0 holds as many, from 1 on.
    const std::int64_t first = std::max<std::int64_t>(1, i_rHeader.FirstFrame);
    std::vector<C3dFrameSpan> spans;
    const auto add = [&spans](std::int64_t i_First, std::uint64_t i_Count)
    {
        if (i_Count > 0 && (spans.empty() || !IsCutOff(i_Count, spans.front().Count)))
            spans.push_back({i_First, i_Count});
    };

    const auto start = LongField(i_rParameters, "ACTUAL_START_FIELD");
    const auto end = LongField(i_rParameters, "ACTUAL_END_FIELD");
    if (start && end && *end >= *start && *end > 0)
        add(std::max<std::int64_t>(1, static_cast<std::int64_t>(*start)), *end - *start + 1);
    add(first, CountParameter(i_rParameters, "LONG_FRAMES"));
    add(first, CountParameter(i_rParameters, "FRAMES"));
    // A header whose last frame is the largest word has no room for the true one.
    const bool bSaturated = i_rHeader.LastFrame == LargestWord && !spans.empty() && spans.front().Count > LargestWord;
    if (i_rHeader.LastFrame >= i_rHeader.FirstFrame && i_rHeader.LastFrame > 0 && !bSaturated)
        add(first, static_cast<std::uint64_t>(i_rHeader.LastFrame - i_rHeader.FirstFrame) + 1);
    return spans;
}

} // namespace Recordings

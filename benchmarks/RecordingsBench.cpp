#include "Bench.h"
#include "Recordings/OpenRecording.h"

#include <charconv>
#include <cmath>
#include <cstddef>
#include <cstdlib>
#include <filesystem>
#include <fstream>
#include <iterator>
#include <string>
#include <string_view>
#include <system_error>

#include <malloc.h>
#include <unistd.h>

namespace Bench
{
namespace
{

constexpr std::size_t s_CsvBytes = 20'000'000;
constexpr int s_Repeats = 5;

void AppendNumber(double i_Value, std::string& io_rText)
{
    char digits[32];
    io_rText.append(digits, std::to_chars(std::begin(digits), std::end(digits), static_cast<float>(i_Value)).ptr);
}

/// A table as programs export it: times at 120 Hz, then values with as many digits as a float has.
std::string MakeCsv(int i_Columns)
{
    std::string text = "time";
    for (int i = 0; i < i_Columns; ++i)
        text += ",column " + std::to_string(i);
    for (int row = 0; text.size() < s_CsvBytes; ++row)
    {
        char time[32];
        text += '\n';
        text.append(time, std::to_chars(std::begin(time), std::end(time), row / 120.0).ptr);
        for (int i = 0; i < i_Columns; ++i)
        {
            text += ',';
            AppendNumber(1000.0 * std::sin(0.001 * row * (i + 1) + i), text);
        }
    }
    return text += '\n';
}

/// A file in the temporary folder that goes away with it.
class TemporaryFile
{
public:
    explicit TemporaryFile(std::string_view i_Text)
        : m_Path(std::filesystem::temp_directory_path() / ("recordings-bench-" + std::to_string(getpid()) + ".csv"))
    {
        std::ofstream stream(m_Path, std::ios::binary);
        stream.write(i_Text.data(), static_cast<std::streamsize>(i_Text.size()));
        if (!stream.flush())
            std::abort();
    }
    ~TemporaryFile()
    {
        std::error_code ignored;
        std::filesystem::remove(m_Path, ignored);
    }
    TemporaryFile(const TemporaryFile&) = delete;
    TemporaryFile& operator=(const TemporaryFile&) = delete;

    const std::filesystem::path& Path() const { return m_Path; }

private:
    std::filesystem::path m_Path;
};

Recordings::VRecording Open(const std::filesystem::path& i_rPath)
{
    Recordings::VRecording recording;
    std::string error;
    if (Recordings::OpenRecording(i_rPath, recording, error).IsError() || recording.Channels.empty() ||
        !recording.Warnings.empty())
        std::abort();
    return recording;
}

float SumOfNumbers(std::string_view i_Numbers)
{
    float sum = 0.0f;
    const char* const pEnd = i_Numbers.data() + i_Numbers.size();
    for (const char* p = i_Numbers.data(); p < pEnd; ++p)
    {
        float value = 0.0f;
        p = std::from_chars(p, pEnd, value).ptr;
        sum += value;
    }
    return sum;
}

std::size_t HeapBytes()
{
    const struct mallinfo2 info = mallinfo2();
    return info.uordblks + info.hblkhd;
}

std::size_t SampleBytes(const Recordings::VRecording& i_rRecording)
{
    std::size_t bytes = 0;
    for (const Recordings::RecordedChannel& rChannel : i_rRecording.Channels)
        bytes += rChannel.Samples.size() * sizeof(float);
    return bytes;
}

void RunCsv(int i_Columns, Table& o_rTable)
{
    const std::string text = MakeCsv(i_Columns);
    const std::string_view numbers = std::string_view(text).substr(text.find('\n') + 1);
    const TemporaryFile file(text);
    const auto [seconds, yardstick] = BestSecondsPaired(
        s_Repeats, [&] { Keep(Open(file.Path())); }, [&] { Keep(SumOfNumbers(numbers)); });
    const std::string name = "CSV of 20 MB, " + std::to_string(i_Columns) + " columns";
    o_rTable.push_back({name + ", opened from its file", seconds * 1e3, "ms", "std::from_chars over its numbers",
                        yardstick * 1e3, seconds / yardstick, EGoal::AtMost, 2.0});

    const std::size_t before = HeapBytes();
    const Recordings::VRecording recording = Open(file.Path());
    const auto held = static_cast<double>(HeapBytes() - before);
    const auto samples = static_cast<double>(SampleBytes(recording));
    o_rTable.push_back({name + ", memory of the open recording", held / 1e6, "MB", "its samples as float32",
                        samples / 1e6, held / samples, EGoal::AtMost, 1.5});
}

} // namespace

void RunRecordings(Table& o_rTable)
{
    RunCsv(6, o_rTable);
    RunCsv(60, o_rTable);
}

} // namespace Bench

#include "Bench.h"
#include "Channels/Contexts/VRecordedContext.h"
#include "Channels/Samples/VSampleStore.h"
#include "Recordings/C3d/C3dWriter.h"
#include "Recordings/OpenRecording.h"

#include <algorithm>
#include <cmath>
#include <cstddef>
#include <cstdint>
#include <cstdlib>
#include <cstring>
#include <filesystem>
#include <fstream>
#include <limits>
#include <memory>
#include <string>
#include <system_error>
#include <utility>
#include <vector>

#include <malloc.h>
#include <unistd.h>

namespace Bench
{
namespace
{

constexpr std::size_t s_Points = 100;
constexpr std::size_t s_Outputs = 32;
constexpr std::size_t s_Frames = 10 * 60 * 120;
constexpr std::size_t s_SamplesPerFrame = 10;
constexpr int s_Repeats = 12;

/// Ten minutes of waves at 120 and 1200 Hz, each marker out of sight now and then.
Recordings::VRecording MakeRecording()
{
    Recordings::VRecording recording;
    recording.Range = {0, static_cast<std::int64_t>(s_Frames) * recording.FramePeriod};
    for (std::size_t i = 0; i < s_Points + s_Outputs; ++i)
    {
        const bool bPoint = i < s_Points;
        Recordings::RecordedChannel channel;
        channel.Kind = bPoint ? Recordings::EChannelKind::Marker : Recordings::EChannelKind::Analog;
        channel.Name = std::string(1, bPoint ? 'P' : 'A').append(std::to_string(i));
        channel.ComponentNames = bPoint ? std::vector<std::string>{"X", "Y", "Z"} : std::vector<std::string>{""};
        channel.Units = std::string(bPoint ? "mm" : "V");
        channel.Rate = bPoint ? 120.0 : 1200.0;
        channel.SamplePeriod = Recordings::PeriodOfRate(channel.Rate);
        channel.Samples.resize(s_Frames * (bPoint ? 3 : s_SamplesPerFrame));
        for (std::size_t n = 0; n < channel.Samples.size(); ++n)
            channel.Samples[n] = 1000.0f * std::sin(0.0007f * static_cast<float>(n % 100'000) + static_cast<float>(i));
        for (std::size_t gap = 3000 + 90 * i; bPoint && gap + 180 < channel.Samples.size(); gap += 9000)
            std::fill_n(channel.Samples.begin() + static_cast<std::ptrdiff_t>(gap / 3 * 3), 180,
                        std::numeric_limits<float>::quiet_NaN());
        recording.Channels.push_back(std::move(channel));
    }
    return recording;
}

/// The recording as a C3D file in the temporary folder, which goes away with it.
class TemporaryC3d
{
public:
    TemporaryC3d()
        : m_Path(std::filesystem::temp_directory_path() / ("open-bench-" + std::to_string(getpid()) + ".c3d"))
    {
        std::string error;
        if (Recordings::WriteC3d(MakeRecording(), m_Path, error) != TQL::Result::Ok)
            std::abort();
    }
    ~TemporaryC3d()
    {
        std::error_code ignored;
        std::filesystem::remove(m_Path, ignored);
    }
    TemporaryC3d(const TemporaryC3d&) = delete;
    TemporaryC3d& operator=(const TemporaryC3d&) = delete;

    const std::filesystem::path& Path() const { return m_Path; }

private:
    std::filesystem::path m_Path;
};

std::shared_ptr<Channels::VRecordedContext> Open(const std::filesystem::path& i_rPath)
{
    auto pRecording = std::make_shared<Recordings::VRecording>();
    std::string error;
    if (Recordings::OpenRecording(i_rPath, *pRecording, error).IsError() || !pRecording->Warnings.empty())
        std::abort();
    return std::make_shared<Channels::VRecordedContext>("bench", std::make_shared<Channels::VSubTypeTable>(),
                                                        std::move(pRecording));
}

/// As it happens to each channel that is plotted.
void Summarise(const Channels::VRecordedContext& i_rContext)
{
    const auto pChannels = i_rContext.GetChannels();
    if (pChannels->size() != s_Points + s_Outputs)
        std::abort();
    for (const auto& rpChannel : *pChannels)
        rpChannel->GetSamples()->EnableSummaries();
}

/// The yardstick. Its memory is there before it begins, which is more than a reader that opens a file can have.
class PlainLoop
{
public:
    explicit PlainLoop(const std::filesystem::path& i_rPath)
        : m_Path(i_rPath), m_Bytes(std::filesystem::file_size(i_rPath)), m_Values(m_Bytes.size() / sizeof(float))
    {
    }

    void Run()
    {
        std::ifstream stream(m_Path, std::ios::binary);
        if (!stream.read(m_Bytes.data(), static_cast<std::streamsize>(m_Bytes.size())))
            std::abort();
        for (std::size_t i = 0; i < m_Values.size(); ++i)
        {
            float value;
            std::memcpy(&value, m_Bytes.data() + i * sizeof(value), sizeof(value));
            m_Values[i] = value * 0.5f;
        }
        Keep(m_Values);
    }

private:
    std::filesystem::path m_Path;
    std::vector<char> m_Bytes;
    std::vector<float> m_Values;
};

/// A line of /proc/self/status in bytes.
double StatusBytes(const std::string& i_rKey)
{
    std::ifstream stream("/proc/self/status");
    for (std::string word; stream >> word;)
    {
        double kilobytes = 0.0;
        if (word == i_rKey + ":" && stream >> kilobytes)
            return kilobytes * 1024.0;
    }
    std::abort();
}

/// The highest resident memory from now on begins with what there is now.
void ForgetPeak()
{
    malloc_trim(0);
    std::ofstream("/proc/self/clear_refs") << "5";
}

void AddMemory(Table& o_rTable, const std::filesystem::path& i_rPath)
{
    constexpr double samples = sizeof(float) * (s_Points * s_Frames * 3.0 + s_Outputs * s_Frames * s_SamplesPerFrame);
    const auto add = [&](const char* i_pWhat, double i_Bytes)
    {
        o_rTable.push_back({i_pWhat, i_Bytes / 1e6, "MB", "its samples as float32", samples / 1e6, i_Bytes / samples,
                            EGoal::AtMost, 1.5});
    };
    ForgetPeak();
    const double before = StatusBytes("VmRSS");
    const auto pContext = Open(i_rPath);
    add("C3D of 10 min, memory: most at any moment of opening", StatusBytes("VmHWM") - before);
    add("C3D of 10 min, memory: open", StatusBytes("VmRSS") - before);
    Summarise(*pContext);
    add("C3D of 10 min, memory: open, with the summaries of all channels", StatusBytes("VmRSS") - before);
}

} // namespace

void RunOpenRecording(Table& o_rTable)
{
    const TemporaryC3d file;
    AddMemory(o_rTable, file.Path());
    PlainLoop loop(file.Path());
    const auto [seconds, yardstick] = BestSecondsPaired(
        s_Repeats, [&] { Summarise(*Open(file.Path())); }, [&] { loop.Run(); });
    o_rTable.push_back({"C3D of 10 min, 100 points and 32 analog channels, into stores with summaries", seconds * 1e3,
                        "ms", "reading its bytes and converting them in a plain loop", yardstick * 1e3,
                        seconds / yardstick, EGoal::AtMost, 3.0});
}

} // namespace Bench

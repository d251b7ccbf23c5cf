#include "RecordingText.h"

#include <gtest/gtest.h>

#include <stdlib.h>

#include <algorithm>
#include <cmath>
#include <fstream>
#include <sstream>

namespace TestRecordings
{

using Recordings::EChannelKind;
using Recordings::RecordedChannel;

namespace
{

std::string NameOf(const RecordedChannel& i_rChannel)
{
    switch (i_rChannel.Kind)
    {
    case EChannelKind::Marker:
        return "marker ";
    case EChannelKind::SegmentPose:
        return "pose ";
    case EChannelKind::Analog:
        return "analog ";
    case EChannelKind::JointAngles:
        return "joint ";
    case EChannelKind::ModelOutput:
        return "output " + i_rChannel.Quantity + " ";
    case EChannelKind::Column:
        break;
    }
    return "column ";
}

void AppendSamples(const RecordedChannel& i_rChannel, std::ostringstream& io_rText)
{
    for (std::size_t i = 0; i < i_rChannel.Samples.size(); ++i)
    {
        io_rText << (i > 0 && i % i_rChannel.ComponentCount() == 0 ? " | " : " ");
        if (std::isnan(i_rChannel.Samples[i]))
            io_rText << "-";
        else
            io_rText << i_rChannel.Samples[i];
    }
}

} // namespace

std::string TextOf(const Recordings::VRecording& i_rRecording)
{
    std::ostringstream text;
    text.precision(9);
    text << i_rRecording.Format << " " << i_rRecording.Range.First << ".." << i_rRecording.Range.Last << " by "
         << i_rRecording.FramePeriod << "\n";
    for (const RecordedChannel& rChannel : i_rRecording.Channels)
    {
        text << NameOf(rChannel) << rChannel.Name;
        if (!rChannel.Subject.empty())
            text << " of " << rChannel.Subject;
        text << " [" << rChannel.Units << "] " << rChannel.Rate << " Hz, " << rChannel.FirstTick << " by "
             << rChannel.SamplePeriod << ":";
        AppendSamples(rChannel, text);
        text << "\n";
    }
    for (const Recordings::RecordedEvent& rEvent : i_rRecording.Events)
        text << "event " << rEvent.Subject << "/" << rEvent.Context << "/" << rEvent.Label << " at "
             << static_cast<float>(rEvent.Seconds) << (rEvent.bOn ? "" : " off") << "\n";
    text << WarningsOf(i_rRecording);
    return text.str();
}

std::string WarningsOf(const Recordings::VRecording& i_rRecording)
{
    std::string text;
    for (const std::string& rWarning : i_rRecording.Warnings)
        text += "warning: " + rWarning + "\n";
    for (const std::string& rRemark : i_rRecording.Remarks)
        text += "remark: " + rRemark + "\n";
    return text;
}

const RecordedChannel& ChannelNamed(const Recordings::VRecording& i_rRecording, const std::string& i_rName)
{
    static const RecordedChannel none;
    const auto found = std::find_if(i_rRecording.Channels.begin(), i_rRecording.Channels.end(),
                                    [&](const RecordedChannel& i_rChannel) { return i_rChannel.Name == i_rName; });
    if (found != i_rRecording.Channels.end())
        return *found;
    ADD_FAILURE() << "no channel " << i_rName;
    return none;
}

std::string ReadText(const std::filesystem::path& i_rPath)
{
    std::ifstream stream(i_rPath, std::ios::binary);
    std::ostringstream text;
    text << stream.rdbuf();
    return text.str();
}

void WriteBytes(const std::filesystem::path& i_rPath, const std::vector<std::byte>& i_rBytes)
{
    std::ofstream stream(i_rPath, std::ios::binary);
    stream.write(reinterpret_cast<const char*>(i_rBytes.data()), static_cast<std::streamsize>(i_rBytes.size()));
    ASSERT_TRUE(stream.good());
}

TemporaryFolder::TemporaryFolder()
{
    std::string name = (std::filesystem::temp_directory_path() / "recordingsXXXXXX").string();
    if (mkdtemp(name.data()) == nullptr)
        ADD_FAILURE() << "no temporary folder";
    m_Path = name;
}

TemporaryFolder::~TemporaryFolder()
{
    std::error_code ignored;
    std::filesystem::remove_all(m_Path, ignored);
}

std::vector<std::string> TemporaryFolder::FileNames() const
{
    std::vector<std::string> names;
    for (const auto& rEntry : std::filesystem::directory_iterator(m_Path))
        names.push_back(rEntry.path().filename().string());
    std::sort(names.begin(), names.end());
    return names;
}

} // namespace TestRecordings

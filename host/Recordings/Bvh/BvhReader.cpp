#include "Recordings/Bvh/BvhReader.h"

#include "Recordings/Bvh/BvhHierarchy.h"
#include "Recordings/Bvh/BvhPoses.h"
#include "Recordings/Common/VReadProgress.h"
#include "Recordings/Text/C3dText.h"
#include "Recordings/Text/TextScan.h"
#include "Recordings/Time/TimeGrid.h"

#include <algorithm>
#include <cmath>
#include <cstdint>
#include <limits>
#include <new>
#include <string_view>
#include <utility>
#include <vector>

namespace Recordings
{

namespace
{

constexpr const char* s_pExportAgain = ". Export the file again from the program that made it.";

/// Takes i_Word off the front of a line, in any case; false when the line does not begin with it.
bool TakeWord(std::string_view& io_rLine, std::string_view i_Word)
{
    if (io_rLine.size() < i_Word.size() || !EqualsAnyCase(io_rLine.substr(0, i_Word.size()), i_Word))
        return false;
    io_rLine = TrimBlanks(io_rLine.substr(i_Word.size()));
    return true;
}

/// The two lines between MOTION and the first frame, in any order; both may be absent.
struct MotionHeader
{
    std::uint64_t Frames = 0;
    bool bFrames = false;
    double Rate = AssumedRate;
};

/// The roundest rate that gives the frame time as it was written; AssumedRate for one that is no time.
double RateOfFrameTime(std::string_view i_Cell, VRecording& io_rRecording)
{
    double time = 0.0;
    if (ReadNumber(i_Cell, false, time) != ECell::Number || !(time > 0.0) || !IsUsableRate(1.0 / time))
    {
        io_rRecording.Warnings.push_back("The frame time \"" + CellText(i_Cell.substr(0, 40)) +
                                         "\" is no usable time; " + NumberText(AssumedRate) +
                                         " frames a second are assumed.");
        return AssumedRate;
    }
    const double half = 0.5 * std::pow(10.0, -DecimalsOf(i_Cell));
    const double highest = time > half ? 1.0 / (time - half) : 1.0 / time;
    const double rate = RoundRate(1.0 / (time + half), highest, 1.0 / time);
    if (std::abs(rate * time - 1.0) > 1e-9)
        io_rRecording.Remarks.push_back("The frame time " + CellText(i_Cell) + " s is taken as " + NumberText(rate) +
                                        " frames a second.");
    return rate;
}

MotionHeader ReadMotionHeader(VLineScanner& io_rLines, VRecording& io_rRecording)
{
    MotionHeader header;
    bool bTime = false;
    for (;;)
    {
        const std::size_t offset = io_rLines.GetOffset();
        const std::size_t lines = io_rLines.GetLineCount();
        std::string_view line;
        if (!io_rLines.Next(line))
            break;
        line = TrimBlanks(line);
        if (TakeWord(line, "Frames:"))
            header.bFrames = ReadCount(line, header.Frames);
        else if (TakeWord(line, "Frame Time:"))
        {
            header.Rate = RateOfFrameTime(line, io_rRecording);
            bTime = true;
        }
        else if (!line.empty())
        {
            io_rLines.SkipTo(offset, lines);
            break;
        }
    }
    if (!bTime)
        io_rRecording.Warnings.push_back("The file has no frame time; " + NumberText(AssumedRate) +
                                         " frames a second are assumed.");
    return header;
}

/// The axes of a joint's turns in their order, "ZXY"; empty for fewer than three turns, or two in a row about one axis.
std::string RotationOrderOf(const BvhJoint& i_rJoint)
{
    std::string order;
    for (const EBvhChannel channel : i_rJoint.Channels)
        if (IsRotation(channel))
            order += static_cast<char>('X' + static_cast<int>(channel) - static_cast<int>(EBvhChannel::XRotation));
    const bool bThree = order.size() == 3 && order[0] != order[1] && order[1] != order[2];
    return bThree ? order : std::string();
}

/// Turns the numbers of frames into the samples of the channels, frame by frame.
class FrameSink
{
public:
    FrameSink(const BvhHierarchy& i_rHierarchy, double i_Rate, std::size_t i_ExpectedFrames, VRecording& o_rRecording)
        : m_rHierarchy(i_rHierarchy), m_Poses(i_rHierarchy), m_rRecording(o_rRecording), m_Rate(i_Rate)
    {
        std::vector<std::string> names;
        for (const BvhJoint& rJoint : i_rHierarchy.Joints)
            names.push_back(rJoint.Name);
        m_Names = UniqueLabels(std::move(names), i_rHierarchy.Joints.size(), "Joint");
        AddWritten(EChannelKind::JointAngles, IsRotation, "", "deg");
        AddWritten(EChannelKind::Column, IsPosition, " position", "");
        m_FirstPose = m_rRecording.Channels.size();
        for (const std::size_t joint : m_Poses.GetJoints())
            Add(EChannelKind::SegmentPose, m_Names[joint], "").ComponentNames = {"RX", "RY", "RZ", "TX", "TY", "TZ"};
        for (RecordedChannel& rChannel : m_rRecording.Channels)
            rChannel.Samples.reserve(i_ExpectedFrames * rChannel.ComponentCount());
        m_Row.resize(m_Poses.GetJoints().size() * VBvhPoses::ComponentCount);
    }

    void Take(std::span<const double> i_Frame)
    {
        for (std::size_t i = 0; i < m_Columns.size(); ++i)
            m_rRecording.Channels[m_ChannelOfColumn[i]].Samples.push_back(static_cast<float>(i_Frame[m_Columns[i]]));
        m_Poses.Solve(i_Frame, m_Row);
        for (std::size_t i = 0; i < m_Poses.GetJoints().size(); ++i)
        {
            const auto pose = std::span<const float>(m_Row).subspan(i * VBvhPoses::ComponentCount, 6);
            std::vector<float>& rSamples = m_rRecording.Channels[m_FirstPose + i].Samples;
            rSamples.insert(rSamples.end(), pose.begin(), pose.end());
        }
        ++m_Frames;
    }

    std::uint64_t GetFrameCount() const { return m_Frames; }

private:
    RecordedChannel& Add(EChannelKind i_Kind, std::string i_Name, std::string i_Units)
    {
        RecordedChannel& rChannel = m_rRecording.Channels.emplace_back();
        rChannel.Kind = i_Kind;
        rChannel.Name = std::move(i_Name);
        rChannel.Units = std::move(i_Units);
        rChannel.Rate = m_Rate;
        rChannel.SamplePeriod = PeriodOfRate(m_Rate);
        return rChannel;
    }

    /// A channel for each joint that has columns of that sort, as they are written.
    void AddWritten(EChannelKind i_Kind, bool (*i_pIsOfSort)(EBvhChannel), const char* i_pSuffix, const char* i_pUnits)
    {
        for (std::size_t joint = 0; joint < m_rHierarchy.Joints.size(); ++joint)
        {
            const BvhJoint& rJoint = m_rHierarchy.Joints[joint];
            if (std::ranges::none_of(rJoint.Channels, i_pIsOfSort))
                continue;
            RecordedChannel& rChannel = Add(i_Kind, m_Names[joint] + i_pSuffix, i_pUnits);
            if (i_Kind == EChannelKind::JointAngles)
                rChannel.RotationOrder = RotationOrderOf(rJoint);
            else
                rChannel.Quantity = LengthQuantity;
            for (std::size_t i = 0; i < rJoint.Channels.size(); ++i)
                if (i_pIsOfSort(rJoint.Channels[i]))
                {
                    rChannel.ComponentNames.push_back(rJoint.ChannelNames[i]);
                    m_Columns.push_back(rJoint.FirstColumn + i);
                    m_ChannelOfColumn.push_back(m_rRecording.Channels.size() - 1);
                }
        }
    }

    const BvhHierarchy& m_rHierarchy;
    VBvhPoses m_Poses;
    VRecording& m_rRecording;
    const double m_Rate;
    std::vector<std::string> m_Names;           ///< of the joints, no two equal
    std::vector<std::size_t> m_Columns;         ///< those that are kept as written, channel by channel
    std::vector<std::size_t> m_ChannelOfColumn; ///< beside m_Columns
    std::size_t m_FirstPose = 0;
    std::vector<float> m_Row;
    std::uint64_t m_Frames = 0;
};

/// Whether frames run across lines: none of the first lines holds just one frame.
bool AreFramesWrapped(VLineScanner i_Lines, std::size_t i_Columns)
{
    int lines = 0;
    for (std::string_view line; lines < 3 && i_Lines.Next(line);)
    {
        std::size_t words = 0;
        for (std::string_view word; NextWord(line, word);)
            ++words;
        if (words == i_Columns)
            return false;
        lines += words != 0 ? 1 : 0;
    }
    return true;
}

/// Reads the frames: a line each, or words one after another where frames run across lines.
class FrameReader
{
public:
    FrameReader(std::size_t i_Columns, FrameSink& io_rSink)
        : m_rSink(io_rSink), m_Frame(i_Columns, std::numeric_limits<double>::quiet_NaN())
    {
    }

    /// i_Text: the whole file, of which io_rLines gives the lines.
    TQL::IResult Read(std::string_view i_Text, VLineScanner& io_rLines, VReadProgress* i_pProgress,
                      std::vector<std::string>& io_rWarnings, std::string& o_rError)
    {
        const bool bWrapped = AreFramesWrapped(io_rLines, m_Frame.size());
        const char* const pEnd = i_Text.data() + i_Text.size();
        for (std::string_view line; io_rLines.Next(line);)
        {
            const std::size_t words = TakeWords(line, bWrapped);
            if (words != 0 && words < m_Frame.size() && !bWrapped && line.data() + line.size() == pEnd)
                m_bTorn = true; // its last number may be half of one
            else if (words != 0 && !bWrapped)
                EndLine(words);
            if (m_Absent > std::max(FreeNumbers, i_Text.size()))
                return RefuseShortLines(o_rError);
            if (!TellProgress(i_pProgress, io_rLines.GetOffset(), i_Text.size()))
                return StoppedReading(o_rError);
        }
        if (m_bTorn || (bWrapped && m_Filled != 0))
            io_rWarnings.push_back("The last frame is not complete; it is left out.");
        Tell(io_rWarnings, m_Unreadable, "numbers could not be read; they are missing samples.");
        Tell(io_rWarnings, m_UnequalLines,
             "lines hold another number of values than the hierarchy has channels; values without a channel are left "
             "out, absent ones are missing samples.");
        return TQL::Result::Ok;
    }

private:
    static constexpr std::size_t FreeNumbers = 1 << 13; ///< that a small file may lack

    TQL::IResult RefuseShortLines(std::string& o_rError) const
    {
        o_rError = "the hierarchy has " + std::to_string(m_Frame.size()) +
                   " channels, but most lines of the motion are much shorter" + s_pExportAgain;
        return TQL::Result::InvalidFormat;
    }

    static void Tell(std::vector<std::string>& io_rWarnings, std::size_t i_Count, const char* i_pWhat)
    {
        if (i_Count != 0)
            io_rWarnings.push_back(std::to_string(i_Count) + ' ' + i_pWhat);
    }

    /// Gives how many words the line held. Frames that are full in the middle of wrapped words are taken.
    std::size_t TakeWords(std::string_view i_Line, bool i_bWrapped)
    {
        std::size_t words = 0;
        for (std::string_view word; NextWord(i_Line, word); ++words)
        {
            if (m_Filled == m_Frame.size())
                continue;
            double& rValue = m_Frame[m_Filled++];
            m_Unreadable += ReadNumber(word, false, rValue) == ECell::Number ? 0u : 1u;
            if (i_bWrapped && m_Filled == m_Frame.size())
                TakeFrame();
        }
        return words;
    }

    void EndLine(std::size_t i_Words)
    {
        m_UnequalLines += i_Words == m_Frame.size() ? 0u : 1u;
        m_Absent += m_Frame.size() - m_Filled;
        TakeFrame();
    }

    void TakeFrame()
    {
        m_rSink.Take(m_Frame);
        std::ranges::fill(m_Frame, std::numeric_limits<double>::quiet_NaN());
        m_Filled = 0;
    }

    FrameSink& m_rSink;
    std::vector<double> m_Frame;
    std::size_t m_Filled = 0;
    std::size_t m_Unreadable = 0;
    std::size_t m_UnequalLines = 0;
    std::size_t m_Absent = 0; ///< numbers that no line holds: they cost memory, but nothing in the file
    bool m_bTorn = false;
};

/// The frames that the rest of the file can hold at most, or what the header says if that is less.
std::size_t ExpectedFrames(const MotionHeader& i_rHeader, std::size_t i_BytesLeft, std::size_t i_Columns)
{
    const std::size_t most = i_BytesLeft / (2 * i_Columns) + 1;
    return i_rHeader.bFrames ? static_cast<std::size_t>(std::min<std::uint64_t>(i_rHeader.Frames, most)) : 0;
}

TQL::IResult ReadAll(std::span<const std::byte> i_File, const ReadOptions& i_rOptions, VRecording& o_rRecording,
                     std::string& o_rError)
{
    VRecording recording;
    recording.Format = "BVH";
    const std::string_view text = TextOfBytes(i_File);
    VLineScanner lines(text);
    BvhHierarchy hierarchy;
    if (const TQL::IResult result = ReadBvhHierarchy(lines, hierarchy, recording.Warnings, o_rError); result.IsError())
        return result;
    const MotionHeader header = ReadMotionHeader(lines, recording);
    FrameSink sink(
        hierarchy, header.Rate,
        ExpectedFrames(header, text.size() - std::min(lines.GetOffset(), text.size()), hierarchy.ColumnCount),
        recording);
    if (const TQL::IResult result = FrameReader(hierarchy.ColumnCount, sink)
                                        .Read(text, lines, i_rOptions.pProgress, recording.Warnings, o_rError);
        result.IsError())
        return result;
    if (sink.GetFrameCount() == 0)
    {
        o_rError = std::string("the file holds no frame of motion") + s_pExportAgain;
        return TQL::Result::InvalidFormat;
    }
    if (header.bFrames && header.Frames != sink.GetFrameCount())
        recording.Warnings.push_back("The file promises " + std::to_string(header.Frames) + " frames and holds " +
                                     std::to_string(sink.GetFrameCount()) + ".");
    recording.FramePeriod = PeriodOfRate(header.Rate);
    recording.Range = {0, static_cast<std::int64_t>(sink.GetFrameCount()) * recording.FramePeriod};
    o_rRecording = std::move(recording);
    return TQL::Result::Ok;
}

} // namespace

bool LooksLikeBvh(std::span<const std::byte> i_File)
{
    std::string_view text = TextOfBytes(i_File.first(std::min<std::size_t>(i_File.size(), 4096)));
    std::string_view word;
    return NextWord(text, word) && EqualsAnyCase(word, "HIERARCHY");
}

TQL::IResult ReadBvh(std::span<const std::byte> i_File, const ReadOptions& i_rOptions, VRecording& o_rRecording,
                     std::string& o_rError)
{
    try
    {
        return ReadAll(i_File, i_rOptions, o_rRecording, o_rError);
    }
    catch (const std::bad_alloc&)
    {
        o_rError = "the recording does not fit into memory. Close other programs or choose a shorter one.";
        return TQL::Result::AllocationFailure;
    }
}

} // namespace Recordings

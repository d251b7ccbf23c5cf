#include "Recordings/C3d/VC3dStream.h"

#include "Recordings/C3d/C3dHead.h"
#include "Recordings/C3d/C3dHeader.h"
#include "Recordings/C3d/C3dParameterWriter.h"
#include "Recordings/Common/FileMessage.h"
#include "Recordings/Text/ByteDecoder.h"

#include <algorithm>
#include <cerrno>
#include <cmath>
#include <cstdio>
#include <limits>
#include <random>
#include <system_error>
#include <utility>

namespace Recordings
{

namespace
{

constexpr std::size_t ParameterBlocks = 255; // all that the format knows: the names are not known when frames begin
constexpr std::size_t LongestName = 255;     // bytes
constexpr auto DataBlock = static_cast<std::uint16_t>(FirstC3dParameterBlock + ParameterBlocks);
constexpr std::uint64_t DataOffset = (DataBlock - 1) * C3dBlockBytes;
constexpr std::size_t PieceBytes = 1 << 20; // frames are moved in pieces of about this size
constexpr std::int64_t MostFrames = std::numeric_limits<std::uint32_t>::max();
constexpr std::size_t PointBytes = 16;
constexpr std::size_t RealBytes = 4;

/// A name that nobody knows beforehand, as short as the system may ask for.
std::filesystem::path GrowingName(const std::filesystem::path& i_rTarget)
{
    std::random_device random;
    char text[40];
    std::snprintf(text, sizeof(text), ".recording-%08x%08x.part", random(), random());
    return i_rTarget.parent_path() / text;
}

/// False, with errno set, when there is something of that name, a link that leads nowhere among them.
bool CreateAlone(const std::filesystem::path& i_rPath)
{
    errno = 0;
    std::FILE* pFile = std::fopen(i_rPath.string().c_str(), "wbx");
    if (pFile)
        std::fclose(pFile);
    return pFile != nullptr;
}

/// "name.component"; what is too long loses the end of its name.
std::string NameOf(const C3dStreamChannel& i_rChannel, const std::string& i_rComponent)
{
    const std::string end = i_rComponent.empty() ? std::string() : "." + i_rComponent;
    return i_rChannel.Name.substr(0, LongestName - std::min(LongestName, end.size())) + end;
}

} // namespace

VC3dStream::VC3dStream(std::filesystem::path i_Path) : m_Path(std::move(i_Path)), m_Target(m_Path) {}

VC3dStream::~VC3dStream()
{
    m_File.close();
    std::error_code ignored;
    if (!m_Growing.empty() && m_Frames == 0)
        std::filesystem::remove(m_Growing, ignored);
}

TQL::IResult VC3dStream::Open(std::string& o_rError)
{
    std::error_code error;
    const auto status = std::filesystem::status(m_Path, error);
    if (std::filesystem::exists(status) && !std::filesystem::is_regular_file(status))
    {
        o_rError = FileMessage(m_Path, std::filesystem::is_directory(status)
                                           ? "this is a folder. Give the name of a file in it."
                                           : "this is no ordinary file. Give the name of one.");
        return TQL::Result::InvalidArgument;
    }
    const auto resolved = std::filesystem::weakly_canonical(m_Path, error);
    m_Target = error ? m_Path : resolved;
    const std::filesystem::path growing = GrowingName(m_Target);
    if (!CreateAlone(growing))
        return Fail(errno, o_rError);
    m_Growing = growing;
    m_File.rdbuf()->pubsetbuf(nullptr, 0); // a buffer would keep what a full disk did not take, and try it again
    errno = 0;
    m_File.open(m_Growing, std::ios::binary | std::ios::in | std::ios::out);
    if (!m_File || !Reserve(DataOffset))
        return Fail(errno, o_rError);
    return TQL::Result::Ok;
}

void VC3dStream::SetRate(double i_FramesPerSecond, std::int64_t i_FramePeriod)
{
    m_Rate = i_FramesPerSecond;
    m_FramePeriod = i_FramePeriod;
}

/// The shape of the file as it is. It points into the names.
C3dWritePlan VC3dStream::MakePlan(std::vector<RecordedChannel>& o_rNames) const
{
    o_rNames.clear();
    for (const C3dStreamChannel& rChannel : m_Channels)
    {
        const EChannelKind kind = rChannel.bMarker ? EChannelKind::Marker : EChannelKind::Analog;
        const auto add = [&](const std::string& i_rComponent)
        {
            RecordedChannel& rName = o_rNames.emplace_back();
            rName.Kind = kind;
            rName.Name = NameOf(rChannel, i_rComponent);
            rName.Units = rChannel.Units;
        };
        if (rChannel.bMarker)
            add({});
        else
            std::ranges::for_each(rChannel.ComponentNames, add);
    }
    C3dWritePlan plan;
    for (const RecordedChannel& rName : o_rNames)
        (rName.Kind == EChannelKind::Marker ? plan.Points : plan.Analog).push_back(&rName);
    plan.Frames = static_cast<std::size_t>(m_Frames);
    plan.AnalogSamplesPerFrame = plan.Analog.empty() ? 0 : 1;
    plan.Rate = m_Rate;
    return plan;
}

bool VC3dStream::HasRoom() const
{
    std::vector<RecordedChannel> names;
    C3dWritePlan plan = MakePlan(names);
    plan.Frames = static_cast<std::size_t>(MostFrames); // what a long file needs besides
    return MakeC3dParameters({}, plan, DataBlock).has_value();
}

std::size_t VC3dStream::AddChannels(std::span<const C3dStreamChannel> i_Channels)
{
    const std::size_t before = m_Channels.size();
    const auto take = [&](std::size_t i_Count)
    {
        m_Channels.resize(before);
        m_Channels.insert(m_Channels.end(), i_Channels.begin(),
                          i_Channels.begin() + static_cast<std::ptrdiff_t>(i_Count));
        return HasRoom();
    };
    std::size_t fits = 0;
    if (take(i_Channels.size()))
        fits = i_Channels.size();
    for (std::size_t tooMany = i_Channels.size(); fits + 1 < tooMany;)
    {
        const std::size_t middle = (fits + tooMany) / 2;
        (take(middle) ? fits : tooMany) = middle;
    }
    (void)take(fits);
    CountNumbers();
    return fits;
}

void VC3dStream::CountNumbers()
{
    m_Numbers = 0;
    for (const C3dStreamChannel& rChannel : m_Channels)
        m_Numbers += rChannel.NumberCount();
}

std::size_t VC3dStream::FrameBytes(std::size_t i_Channels) const
{
    std::size_t bytes = 0;
    for (std::size_t i = 0; i < i_Channels; ++i)
        bytes += m_Channels[i].bMarker ? PointBytes : m_Channels[i].NumberCount() * RealBytes;
    return bytes;
}

/// The markers come first in a frame.
void VC3dStream::EncodeFrame(std::span<const float> i_Values, std::size_t i_Channels,
                             std::vector<std::byte>& o_rBytes) const
{
    for (const bool bMarkers : {true, false})
    {
        std::size_t at = 0;
        for (std::size_t i = 0; i < i_Channels; at += m_Channels[i].NumberCount(), ++i)
        {
            if (m_Channels[i].bMarker != bMarkers)
                continue;
            const auto values = i_Values.subspan(at, m_Channels[i].NumberCount());
            if (bMarkers)
                AppendC3dPoint(values, o_rBytes);
            else
                for (const float value : values)
                    AppendC3dReal(value, o_rBytes);
        }
    }
}

void VC3dStream::DecodeFrame(std::span<const std::byte> i_Bytes, std::size_t i_Channels,
                             std::span<float> o_Values) const
{
    const VByteDecoder decoder(EProcessor::Intel);
    std::size_t from = 0;
    for (const bool bMarkers : {true, false})
    {
        std::size_t at = 0;
        for (std::size_t i = 0; i < i_Channels; at += m_Channels[i].NumberCount(), ++i)
        {
            if (m_Channels[i].bMarker != bMarkers)
                continue;
            for (std::size_t number = 0; number < m_Channels[i].NumberCount(); ++number, from += RealBytes)
                o_Values[at + number] = decoder.Real(i_Bytes.subspan(from, RealBytes));
            if (!bMarkers)
                continue;
            if (decoder.Real(i_Bytes.subspan(from, RealBytes)) < 0.0f)
                std::ranges::fill(o_Values.subspan(at, 3), std::numeric_limits<float>::quiet_NaN());
            from += RealBytes;
        }
    }
}

bool VC3dStream::WriteAt(std::uint64_t i_Offset, std::span<const std::byte> i_Bytes)
{
    errno = 0;
    m_File.seekp(static_cast<std::streamoff>(i_Offset));
    m_File.write(reinterpret_cast<const char*>(i_Bytes.data()), static_cast<std::streamsize>(i_Bytes.size()));
    m_File.flush();
    return m_File.good();
}

bool VC3dStream::ReadAt(std::uint64_t i_Offset, std::span<std::byte> o_Bytes)
{
    errno = 0;
    m_File.seekg(static_cast<std::streamoff>(i_Offset));
    m_File.read(reinterpret_cast<char*>(o_Bytes.data()), static_cast<std::streamsize>(o_Bytes.size()));
    return m_File.good();
}

/// Makes the file that long, on the disk. One that the disk has no room for is as it was.
bool VC3dStream::Reserve(std::uint64_t i_Bytes)
{
    std::error_code error;
    const std::uint64_t before = std::filesystem::file_size(m_Growing, error);
    if (error)
        return false;
    const std::vector<std::byte> zeros(PieceBytes);
    for (std::uint64_t at = before; at < i_Bytes; at += PieceBytes)
        if (!WriteAt(at, std::span(zeros).first(std::min<std::uint64_t>(PieceBytes, i_Bytes - at))))
        {
            const int reason = errno;
            m_File.clear();
            std::filesystem::resize_file(m_Growing, before, error);
            errno = reason;
            return false;
        }
    return true;
}

TQL::IResult VC3dStream::Append(std::int64_t i_Frames, std::span<const float> i_Values, std::string& o_rError)
{
    if (m_bFailed || i_Frames <= 0)
        return m_bFailed ? TQL::Result::FileIOFailure : TQL::Result::Ok;
    if (m_Frames + i_Frames > MostFrames)
    {
        m_bFailed = true;
        o_rError = FileMessage(m_Path, "a C3D file cannot hold more frames.");
        return TQL::Result::NotSupported;
    }
    if (m_Segments.empty() || m_Segments.back().Channels != m_Channels.size())
    {
        const Segment last = m_Segments.empty() ? Segment{0, 0, DataOffset} : m_Segments.back();
        const auto bytes = static_cast<std::uint64_t>(m_Frames - last.FirstFrame) * FrameBytes(last.Channels);
        m_Segments.push_back({m_Frames, m_Channels.size(), last.Offset + bytes});
    }
    const Segment& rSegment = m_Segments.back();
    const std::size_t frameBytes = FrameBytes(rSegment.Channels);
    m_Bytes.clear();
    for (std::int64_t frame = 0; frame < i_Frames; ++frame)
        EncodeFrame(i_Values.subspan(static_cast<std::size_t>(frame) * m_Numbers, m_Numbers), rSegment.Channels,
                    m_Bytes);
    if (WriteAt(rSegment.Offset + static_cast<std::uint64_t>(m_Frames - rSegment.FirstFrame) * frameBytes, m_Bytes))
    {
        m_Frames += i_Frames;
        return TQL::Result::Ok;
    }
    const int reason = errno;
    m_bFailed = true;
    m_File.clear();
    std::error_code error;
    if (const std::uint64_t size = std::filesystem::file_size(m_Growing, error); !error && frameBytes > 0)
        m_Frames = std::clamp(rSegment.FirstFrame + static_cast<std::int64_t>((size - rSegment.Offset) / frameBytes),
                              m_Frames, m_Frames + i_Frames);
    return Fail(reason, o_rError);
}

void VC3dStream::Put(std::int64_t i_Frame, std::size_t i_Channel, std::span<const float> i_Values)
{
    m_Singles.push_back({i_Frame, i_Channel, {i_Values.begin(), i_Values.end()}});
}

TQL::IResult VC3dStream::SaveHead(std::string& o_rError)
{
    std::vector<RecordedChannel> names;
    const C3dWritePlan plan = MakePlan(names);
    auto parameters = MakeC3dParameters({}, plan, DataBlock);
    if (!parameters)
        return TQL::Result::NotSupported; // they were asked for when they were added
    // What is left of its place belongs to the section, so that the frames follow it.
    parameters->resize(ParameterBlocks * C3dBlockBytes);
    (*parameters)[2] = static_cast<std::byte>(ParameterBlocks);
    std::vector<std::byte> bytes = MakeC3dHeader(plan, DataBlock);
    bytes.insert(bytes.end(), parameters->begin(), parameters->end());
    return WriteAt(0, bytes) ? TQL::Result::Ok : Fail(errno, o_rError);
}

/// Moves frames of a segment to where they stand when all frames have the first i_Channels channels.
bool VC3dStream::MoveFrames(const Segment& i_rFrom, std::int64_t i_First, std::int64_t i_End, std::size_t i_Channels)
{
    const std::size_t from = FrameBytes(i_rFrom.Channels);
    const std::size_t to = FrameBytes(i_Channels);
    std::vector<std::byte> old(from * static_cast<std::size_t>(i_End - i_First));
    if (!ReadAt(i_rFrom.Offset + static_cast<std::uint64_t>(i_First - i_rFrom.FirstFrame) * from, old))
        return false;
    std::vector<float> values(m_Numbers);
    m_Bytes.clear();
    for (std::size_t at = 0; at + from <= old.size() && m_Bytes.size() < to * static_cast<std::size_t>(i_End - i_First);
         at += from)
    {
        std::ranges::fill(values, std::numeric_limits<float>::quiet_NaN());
        DecodeFrame(std::span(old).subspan(at, from), i_rFrom.Channels, values);
        EncodeFrame(values, i_Channels, m_Bytes);
    }
    return WriteAt(DataOffset + static_cast<std::uint64_t>(i_First) * to, m_Bytes);
}

/// Gives all frames the same channels: all, or those of the first where the disk has no room for more.
bool VC3dStream::Even()
{
    if (m_Segments.size() == 1 && m_Segments.front().Channels == m_Channels.size())
        return true;
    if (Reserve(DataOffset + static_cast<std::uint64_t>(m_Frames) * FrameBytes(m_Channels.size())))
        return Widen();
    return m_Segments.front().Channels > 0 && Narrow();
}

/// From the end on, since each frame comes to lie behind where it was. There is room for that.
bool VC3dStream::Widen()
{
    const std::size_t width = FrameBytes(m_Channels.size());
    const auto step = static_cast<std::int64_t>(std::max<std::size_t>(1, PieceBytes / std::max<std::size_t>(1, width)));
    std::int64_t end = m_Frames;
    for (std::size_t i = m_Segments.size(); i-- > 0;)
        for (const Segment& rSegment = m_Segments[i]; end > rSegment.FirstFrame;)
        {
            const std::int64_t first = std::max(rSegment.FirstFrame, end - step);
            if (!MoveFrames(rSegment, first, end, m_Channels.size()))
                return false;
            end = first;
        }
    return true;
}

/// From the beginning on, since each frame comes to lie before where it was.
bool VC3dStream::Narrow()
{
    const std::size_t channels = m_Segments.front().Channels;
    const std::size_t width = FrameBytes(m_Segments.back().Channels);
    const auto step = static_cast<std::int64_t>(std::max<std::size_t>(1, PieceBytes / std::max<std::size_t>(1, width)));
    for (std::size_t i = 1; i < m_Segments.size(); ++i)
    {
        const std::int64_t end = i + 1 < m_Segments.size() ? m_Segments[i + 1].FirstFrame : m_Frames;
        for (std::int64_t first = m_Segments[i].FirstFrame; first < end; first += step)
            if (!MoveFrames(m_Segments[i], first, std::min(end, first + step), channels))
                return false;
    }
    m_Channels.resize(channels);
    CountNumbers();
    return true;
}

bool VC3dStream::WriteSingles()
{
    const std::size_t width = FrameBytes(m_Channels.size());
    std::vector<float> values(m_Numbers);
    for (const Single& rSingle : m_Singles)
    {
        if (rSingle.Channel >= m_Channels.size() || rSingle.Frame >= m_Frames)
            continue;
        const std::uint64_t offset = DataOffset + static_cast<std::uint64_t>(rSingle.Frame) * width;
        std::vector<std::byte> bytes(width);
        if (!ReadAt(offset, bytes))
            return false;
        DecodeFrame(bytes, m_Channels.size(), values);
        std::size_t at = 0;
        for (std::size_t i = 0; i < rSingle.Channel; ++i)
            at += m_Channels[i].NumberCount();
        std::ranges::copy(rSingle.Values, values.begin() + static_cast<std::ptrdiff_t>(at));
        bytes.clear();
        EncodeFrame(values, m_Channels.size(), bytes);
        if (!WriteAt(offset, bytes))
            return false;
    }
    return true;
}

TQL::IResult VC3dStream::Finish(std::string& o_rError)
{
    if (m_Frames == 0 || m_Channels.empty())
    {
        o_rError = FileMessage(m_Path, "there are no frames to write. Choose a recording with samples.");
        return TQL::Result::InvalidArgument;
    }
    m_bFailed = true; // nothing comes any more
    const TQL::IResult result = Complete(o_rError);
    if (result.IsError())
        o_rError += " What was recorded is in " + m_Growing.string() + ".";
    return result;
}

TQL::IResult VC3dStream::Complete(std::string& o_rError)
{
    if (!Even() || !WriteSingles())
        return Fail(errno, o_rError);
    std::error_code error;
    std::filesystem::resize_file(
        m_Growing, DataOffset + static_cast<std::uint64_t>(m_Frames) * FrameBytes(m_Channels.size()), error);
    if (const TQL::IResult result = SaveHead(o_rError); result.IsError())
        return result;
    errno = 0;
    m_File.close();
    return m_File.fail() ? Fail(errno, o_rError) : MoveIntoPlace(o_rError);
}

TQL::IResult VC3dStream::MoveIntoPlace(std::string& o_rError)
{
    std::error_code error;
    const auto old = std::filesystem::status(m_Target, error);
    if (std::filesystem::exists(old))
        std::filesystem::permissions(m_Growing, old.permissions(), error);
    std::filesystem::rename(m_Growing, m_Target, error);
    if (error)
        return Fail(error.value(), o_rError);
    m_Growing.clear();
    return TQL::Result::Ok;
}

TQL::IResult VC3dStream::Fail(int i_SystemError, std::string& o_rError)
{
    m_File.clear();
    const bool bFull = i_SystemError == ENOSPC || i_SystemError == EFBIG;
    const std::string reason =
        i_SystemError == 0 ? "unknown reason" : std::error_code(i_SystemError, std::generic_category()).message();
    o_rError = FileMessage(m_Path, "the file cannot be written (" + reason + "). " +
                                       (bFull ? "Free some space or choose another disk."
                                              : "Choose a folder that exists and that you may write to."));
    return bFull ? TQL::Result::DiskFull : TQL::Result::FileIOFailure;
}

} // namespace Recordings

#pragma once

#include "Recordings/C3d/C3dWritePlan.h"
#include "TQL/IResult.h"

#include <cstddef>
#include <cstdint>
#include <filesystem>
#include <fstream>
#include <span>
#include <string>
#include <vector>

namespace Recordings
{

/// A channel of a file that grows: a marker, or numbers that become an analog channel each ("name.component").
struct C3dStreamChannel
{
    bool bMarker = false;
    std::string Name;
    std::string Units = {};
    std::vector<std::string> ComponentNames = {""}; ///< of the numbers; a marker has its three coordinates

    std::size_t NumberCount() const { return bMarker ? 3 : ComponentNames.size(); }
};

/// Writes a C3D file while its frames come, in memory that does not grow with them. The file grows beside its final
/// place under a name of its own and is moved there at the end; until then what is under the final name stays as it
/// was. Its head has its place from the beginning on, so that a full disk costs no frame that was written, and it is
/// brought up to date when asked, so that the growing file can be opened after a crash. Channels may be added between
/// frames; frames before have missing samples. Owned by the one who records; one thread.
class VC3dStream
{
public:
    explicit VC3dStream(std::filesystem::path i_Path);
    /// A growing file that has frames and was not finished is left where it is.
    ~VC3dStream();
    VC3dStream(const VC3dStream&) = delete;
    VC3dStream& operator=(const VC3dStream&) = delete;

    /// Makes the growing file. On failure o_rError is one line that names the file; so it is with the others.
    [[nodiscard]] TQL::IResult Open(std::string& o_rError);

    /// Before the first frame. The period is in ticks.
    void SetRate(double i_FramesPerSecond, std::int64_t i_FramePeriod);

    /// Adds channels, the first ones up to the first for whose names the format has no room; returns how many.
    std::size_t AddChannels(std::span<const C3dStreamChannel> i_Channels);

    /// Appends frames: for each the numbers of all channels in the order in which they were added, NaN for missing
    /// ones. On failure, DiskFull among others, the frames that are wholly in the file stay, and no more can be
    /// appended.
    [[nodiscard]] TQL::IResult Append(std::int64_t i_Frames, std::span<const float> i_Values, std::string& o_rError);

    /// The numbers of a channel in a frame that may lie before the channel was added. They are kept in memory until the
    /// file is finished: for single ones.
    void Put(std::int64_t i_Frame, std::size_t i_Channel, std::span<const float> i_Values);

    /// Makes the growing file one that can be read as far as it is.
    [[nodiscard]] TQL::IResult SaveHead(std::string& o_rError);

    /// Makes the file whole and moves it into its place. Where the disk has no room for channels that were added after
    /// the first frame they are left out: ChannelCount says how many are in the file.
    [[nodiscard]] TQL::IResult Finish(std::string& o_rError);

    std::int64_t FrameCount() const { return m_Frames; }
    std::size_t ChannelCount() const { return m_Channels.size(); }
    std::size_t NumberCount() const { return m_Numbers; } ///< in a frame
    const std::filesystem::path& GrowingPath() const { return m_Growing; }

private:
    struct Segment ///< frames with the same channels
    {
        std::int64_t FirstFrame = 0;
        std::size_t Channels = 0;
        std::uint64_t Offset = 0; ///< in the file
    };

    struct Single
    {
        std::int64_t Frame = 0;
        std::size_t Channel = 0;
        std::vector<float> Values;
    };

    C3dWritePlan MakePlan(std::vector<RecordedChannel>& o_rNames) const;
    bool HasRoom() const;
    void CountNumbers();
    std::size_t FrameBytes(std::size_t i_Channels) const;
    void EncodeFrame(std::span<const float> i_Values, std::size_t i_Channels, std::vector<std::byte>& o_rBytes) const;
    void DecodeFrame(std::span<const std::byte> i_Bytes, std::size_t i_Channels, std::span<float> o_Values) const;
    bool WriteAt(std::uint64_t i_Offset, std::span<const std::byte> i_Bytes);
    bool ReadAt(std::uint64_t i_Offset, std::span<std::byte> o_Bytes);
    bool Reserve(std::uint64_t i_Bytes);
    bool Even();
    bool Widen();
    bool Narrow();
    bool MoveFrames(const Segment& i_rFrom, std::int64_t i_First, std::int64_t i_End, std::size_t i_Channels);
    bool WriteSingles();
    TQL::IResult Complete(std::string& o_rError);
    TQL::IResult MoveIntoPlace(std::string& o_rError);
    TQL::IResult Fail(int i_SystemError, std::string& o_rError);

    const std::filesystem::path m_Path; // as given, for messages
    std::filesystem::path m_Target;     // where links lead to
    std::filesystem::path m_Growing;    // empty before Open and after Finish
    std::fstream m_File;
    std::vector<C3dStreamChannel> m_Channels;
    std::size_t m_Numbers = 0;
    std::vector<Segment> m_Segments;
    std::vector<Single> m_Singles;
    std::int64_t m_Frames = 0;
    double m_Rate = 0.0;
    std::int64_t m_FramePeriod = 0;
    bool m_bFailed = false;
    std::vector<std::byte> m_Bytes; // scratch
};

} // namespace Recordings

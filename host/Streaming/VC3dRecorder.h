#pragma once

#include "Recordings/C3d/VC3dStream.h"
#include "Streaming/VOscClock.h"
#include "TQL/IResult.h"

#include <cstddef>
#include <cstdint>
#include <filesystem>
#include <memory>
#include <mutex>
#include <string>
#include <vector>

namespace Channels
{
class VLiveContext;
class VSourceChannel;
} // namespace Channels

namespace Streaming
{

/// Records a live context, all of whose channels have the rate of its frames, into a C3D file while the frames come. It
/// follows the context at a distance of Lag, so that channels that speak regularly are known when the first frame is
/// written, and keeps nothing else in memory: a context that holds Lag twice is enough for a capture of any length. A
/// channel of which there is a single sample gets its place at the end, so that strays do not take that of others.
/// Owned by the one who records. SetContext may come from any thread, the rest is for one.
class VC3dRecorder
{
public:
    static constexpr LocalTime Lag = std::chrono::seconds(2);
    static constexpr LocalTime Quiet = std::chrono::seconds(1); ///< without a new frame: what there is is written

    explicit VC3dRecorder(const std::filesystem::path& i_rPath) : m_Stream(i_rPath) {}

    /// Makes the growing file. On failure o_rError is one line that names the file.
    [[nodiscard]] TQL::IResult Open(std::string& o_rError) { return m_Stream.Open(o_rError); }

    /// Once. The frames are those of the context from its first on.
    void SetContext(std::shared_ptr<const Channels::VLiveContext> i_pContext, double i_FramesPerSecond);

    /// Writes what is due. On failure there is nothing more to do but to finish: what was written is kept.
    [[nodiscard]] TQL::IResult Work(LocalTime i_Now, std::string& o_rError);

    /// Writes the rest and puts the file into its place. o_rRemarks says what was changed or left out, by name.
    /// io_rStopped is the sentence of a Work that failed, or becomes one when the rest cannot be written: the file then
    /// has what came before.
    [[nodiscard]] TQL::IResult Finish(std::vector<std::string>& o_rRemarks, std::string& io_rStopped,
                                      std::string& o_rError);

    std::int64_t FrameCount() const { return m_Stream.FrameCount(); }
    std::size_t ChannelCount() const { return m_Stream.ChannelCount(); }
    double Seconds() const; ///< that are written

private:
    static constexpr std::size_t NoPlace = SIZE_MAX;

    struct Entry ///< a channel of the context
    {
        Recordings::C3dStreamChannel Channel;
        std::size_t Place = NoPlace; ///< in the file
        std::int64_t Samples = 0;    ///< while it has no place
        std::int64_t SingleFrame = 0;
        std::vector<float> Single; ///< its first sample
        bool bLeftOut = false;
    };

    bool FindContext();
    TQL::IResult WriteUpTo(std::int64_t i_EndFrame, std::string& o_rError);
    TQL::IResult WriteFrames(std::int64_t i_Frames, std::string& o_rError);
    void AddEntries();
    void ReadRows(const Channels::VSourceChannel& i_rChannel, std::int64_t i_Frames, std::size_t i_Numbers);
    void Look(const Channels::VSourceChannel& i_rChannel, std::int64_t i_Frames, Entry& io_rEntry);
    void GivePlaces(std::int64_t i_FewestSamples);
    void AddRemarks(std::vector<std::string>& o_rRemarks) const;

    Recordings::VC3dStream m_Stream;
    std::mutex m_Mutex;
    std::shared_ptr<const Channels::VLiveContext> m_pGiven; // guarded by m_Mutex
    double m_GivenRate = 0.0;                               // guarded by m_Mutex
    std::shared_ptr<const Channels::VLiveContext> m_pContext;
    double m_Rate = 0.0;
    std::int64_t m_FirstFrame = 0; ///< of the context
    std::int64_t m_NextFrame = 0;
    std::int64_t m_SeenEnd = 0;
    LocalTime m_SeenAt{0};
    LocalTime m_HeadAt{0};
    bool m_bFailed = false;
    std::vector<Entry> m_Entries;
    std::vector<std::size_t> m_Places; ///< which of them has it
    std::vector<float> m_Values;       // scratch
    std::vector<float> m_Rows;         // scratch
};

} // namespace Streaming

#pragma once

#include "Channels/Contexts/VLiveContext.h"
#include "Recordings/Common/VRecording.h"
#include "TQL/IResult.h"

#include <cstddef>
#include <cstdint>
#include <memory>
#include <string>
#include <vector>

namespace Streaming
{

/// Puts a recording into a live context as if it were captured now: its channels with the ids that the opened recording
/// gives them (but for the context's name), its frames when it is told to. The first pass has the ticks of the
/// recording; a loop goes on behind them. Channels whose samples do not fall evenly into the frames are laid on the
/// frames. One thread at a time.
class VReplayFeed
{
public:
    struct Options
    {
        bool bLoop = false;
    };

    /// A context for the replay of a recording: its frames, from its first one on.
    static Channels::VLiveContext::Options ContextOptions(const Recordings::VRecording& i_rRecording);

    /// The context is new, with the options from above. What had to be changed is told in Warnings.
    VReplayFeed(std::shared_ptr<const Recordings::VRecording> i_pRecording,
                std::shared_ptr<Channels::VLiveContext> i_pContext, const Options& i_rOptions);

    std::int64_t FirstFrame() const { return m_FirstFrame; }
    std::int64_t FrameCount() const { return m_FrameCount; } ///< of one pass
    double FramesPerSecond() const;                          ///< as recorded
    const std::vector<std::string>& Warnings() const { return m_Warnings; }

    /// Appends frames. The first one follows the last one of the call before. OkButNoEffect when the recording is at
    /// its end and is not looped.
    [[nodiscard]] TQL::IResult Produce(std::int64_t i_FirstFrame, std::int64_t i_FrameCount);

private:
    struct Lane ///< one channel
    {
        const Recordings::RecordedChannel* pRecorded = nullptr;
        std::uint32_t Channel = 0; ///< of the context
        std::int64_t Period = 0;   ///< ticks, as it is replayed
        std::vector<float> Rows;   ///< scratch
    };

    void AddChannels();
    void Fill(Lane& io_rLane, std::int64_t i_FrameInPass, std::int64_t i_FrameCount) const;

    const std::shared_ptr<const Recordings::VRecording> m_pRecording;
    const std::shared_ptr<Channels::VLiveContext> m_pContext;
    const Options m_Options;
    const std::int64_t m_FirstFrame;
    const std::int64_t m_FrameCount;
    std::vector<Lane> m_Lanes;
    std::vector<Channels::ChannelRows> m_Rows; // scratch
    std::vector<std::string> m_Warnings;
};

} // namespace Streaming

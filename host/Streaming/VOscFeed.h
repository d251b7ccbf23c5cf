#pragma once

#include "Streaming/VOscReceiver.h"
#include "TQL/IResult.h"

#include <cstddef>
#include <cstdint>
#include <map>
#include <memory>
#include <string>
#include <vector>

namespace Channels
{
class VLiveContext;
struct ChannelRows;
} // namespace Channels

namespace Streaming
{

/// Lays samples that come at any times on the even frames of a live context.
///
/// The first sample stands on the context's next frame; the time of every other one gives its place from there. While a
/// channel's samples come at most three quarters of a frame late or a tenth of a second early they take frame after
/// frame: neither jitter nor several at once lose any. A sample that is later leaves a gap of missing samples. One that
/// is earlier takes the frame of the sample before it, which it replaces, or is left out if that was handed on.
///
/// Frames are handed on when their first sample has waited for Hold, so that the other channels can join. Time stands
/// still while nothing comes. One thread at a time.
class VOscFeed
{
public:
    static constexpr LocalTime Hold = std::chrono::milliseconds(50);

    /// i_Rate is that of the context's frames, as somebody stated or measured it. The troubles get what is left out.
    VOscFeed(std::shared_ptr<Channels::VLiveContext> i_pContext, double i_Rate, VOscTroubles& i_rTroubles,
             bool i_bRateStated = false);

    /// Adds the channels that the context does not have yet. Call it before their samples come.
    [[nodiscard]] TQL::IResult AddChannels(const std::vector<OscChannel>& i_rChannels);

    /// Places the samples in the order of their times, and hands on the frames that have waited.
    [[nodiscard]] TQL::IResult Take(const OscSamples& i_rSamples, LocalTime i_Now);

    /// Hands on all that waits.
    [[nodiscard]] TQL::IResult Finish();

    /// The next sample follows the last one, however long ago that was: for the end of a pause.
    void SkipTime() { m_bHasOrigin = false; }

private:
    static constexpr std::int64_t NoFrame = INT64_MIN;

    struct Lane ///< the frames of one channel that wait, from m_FirstFrame on, as far as it has any
    {
        void Reach(std::size_t i_Frames);
        /// Forgets its first frames. Gives its memory back after a rest.
        void Drop(std::size_t i_Frames, std::int64_t i_FirstFrame, std::int64_t i_LongestRest);

        std::uint32_t Channel = 0; ///< of the context
        std::size_t Components = 1;
        std::int64_t NextFrame = NoFrame; ///< behind its last sample
        std::vector<float> Rows;
        std::vector<char> Taken; ///< which frames have a sample
    };

    std::int64_t FrameOf(const Lane& i_rLane, LocalTime i_Time) const;
    TQL::IResult MakeRoomFor(std::int64_t i_Frame);
    TQL::IResult Place(const OscSamples::Sample& i_rSample, const float* i_pValues, LocalTime i_Now);
    TQL::IResult HandOn(std::int64_t i_EndFrame);

    const std::shared_ptr<Channels::VLiveContext> m_pContext;
    const double m_Rate;
    const std::int64_t m_Capacity; ///< frames that can wait
    VOscTroubles& m_rTroubles;
    const EOscTrouble m_Shared; ///< what a frame with two samples is told as
    std::vector<Lane> m_Lanes;
    std::map<std::string, std::uint64_t> m_Subjects;       ///< their numbers
    std::map<std::uint64_t, std::uint64_t> m_MarkerCounts; ///< by subject
    std::uint64_t m_ColumnCount = 0;
    std::vector<LocalTime> m_FirstSeen; ///< when the first sample of a waiting frame was placed; 0 before
    std::int64_t m_FirstFrame;          ///< the oldest that waits or can come
    std::int64_t m_EndFrame;            ///< behind the last that has a sample
    bool m_bHasOrigin = false;
    LocalTime m_Origin{0}; ///< the time of m_OriginFrame
    std::int64_t m_OriginFrame = 0;
    std::vector<std::size_t> m_Order;          // scratch
    std::vector<Channels::ChannelRows> m_Rows; // scratch
};

} // namespace Streaming

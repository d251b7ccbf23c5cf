#pragma once

#include "Channels/Contexts/VChannelContext.h"

#include <atomic>
#include <cstdint>
#include <span>
#include <string>

namespace Channels
{

/// The rows of one channel in a batch of frames. Values begins at the first row; Stride is the distance of rows in
/// values, 0 for rows that follow each other. So a channel can be picked out of a larger interleaved array.
struct ChannelRows
{
    std::uint32_t Channel = 0; ///< as AddChannel gave it
    std::span<const float> Values;
    std::size_t Stride = 0;
};

/// Looks on while frames come in. Called on the thread of the producer, with no lock of the context held.
class IFrameMeter
{
public:
    virtual ~IFrameMeter() = default;

    /// Frames from i_FirstFrame on were appended. For each the share of the measured channels that have a sample in it,
    /// from 0 to 1; NaN while there are none. Cameras and the like are not measured.
    virtual void OnFrames(std::int64_t i_FirstFrame, std::span<const float> i_Shares) = 0;
};

/// A live capture. One producer at a time appends frames, on any thread; everybody may read meanwhile. Keeps the newest
/// history and forgets what is older. Channels may be added while frames come in; they begin with the next frame.
class VLiveContext : public VChannelContext
{
public:
    struct Options
    {
        std::int64_t FramePeriod = TQL::DefaultFramePeriod; ///< ticks
        std::int64_t FirstFrame = 0;
        std::int64_t HistoryTicks = 3600 * TQL::DefaultTickRate; ///< how much is kept
        /// Keeps less where that needs more than this. A channel that never spoke, or once, needs next to nothing.
        std::uint64_t MemoryLimitBytes = 2ull << 30;
    };

    VLiveContext(std::string i_Name, std::shared_ptr<VSubTypeTable> i_pSubTypes, const Options& i_rOptions);

    /// i_SamplePeriod divides the frame period, or is 0 for it; else InvalidArgument. AlreadyPresent for an id that is
    /// there. InvalidType for a type that is not in the table. o_rChannel is the number to append with.
    TQL::IResult AddChannel(const ChannelDefinition& i_rDefinition, std::int64_t i_SamplePeriod,
                            std::uint32_t& o_rChannel);

    /// Appends i_FrameCount frames from i_FirstFrame on: i_FrameCount x (frame period / sample period) rows for each
    /// channel named. The other channels, and frames left out since the last batch, get missing samples. Raises
    /// RangeChanged once. InvalidArgument, and nothing is appended, for frames that are there already, an unknown
    /// channel or rows of another size. A leap ahead by more than the history starts anew like Restart.
    TQL::IResult AppendFrames(std::int64_t i_FirstFrame, std::int64_t i_FrameCount,
                              std::span<const ChannelRows> i_Rows);

    /// Drops all samples; the next frame is i_FirstFrame. Every output that was handed out is stale.
    void Restart(std::int64_t i_FirstFrame);

    /// From the next frame on; null for none.
    void SetMeter(std::shared_ptr<IFrameMeter> i_pMeter);

    /// Frames that are kept with the channels as they are.
    std::int64_t GetHistoryFrames() const { return m_HistoryFrames.load(std::memory_order_relaxed); }

    TQL::TickRange GetTickRange() const override;

private:
    struct Inlet ///< a channel as the producer sees it
    {
        std::shared_ptr<VSourceChannel> pChannel;
        std::int64_t RowsPerFrame = 1;
        std::int64_t EndFrame = 0; ///< the frame that its next row belongs to
        bool bHasData = false;     ///< since the last restart
        bool bMeasured = true;     ///< it can have no sample
        int Batches = 0;           ///< with samples of it, counted up to FewestBatches
    };

    TQL::IResult CheckLocked(std::int64_t i_FirstFrame, std::int64_t i_FrameCount,
                             std::span<const ChannelRows> i_Rows) const;
    void AppendLocked(std::int64_t i_FirstFrame, std::int64_t i_FrameCount, std::span<const ChannelRows> i_Rows,
                      std::span<float> io_Shares);
    void RestartLocked(std::int64_t i_FirstFrame);
    void FillUpLocked(Inlet& io_rInlet, std::int64_t i_EndFrame);
    void TrimLocked();
    void UpdateHistoryLocked();
    void SetRangeLocked();
    void NotifyAppeared();

    const Options m_Options;
    std::mutex m_ProducerMutex;                              // held while frames or channels are added
    std::vector<Inlet> m_Inlets;                             // guarded by m_ProducerMutex
    std::vector<std::shared_ptr<VSourceChannel>> m_Appeared; // guarded by m_ProducerMutex: had their first samples now
    std::shared_ptr<IFrameMeter> m_pMeter;                   // guarded by m_ProducerMutex; may be null
    std::int64_t m_StartFrame;                               // guarded by m_ProducerMutex: oldest frame that is kept
    std::int64_t m_EndFrame;                                 // guarded by m_ProducerMutex
    std::int64_t m_TrimFrame;                                // guarded by m_ProducerMutex: no trimming before it
    std::atomic<std::int64_t> m_HistoryFrames;
    mutable std::mutex m_RangeMutex;
    TQL::TickRange m_Range; // guarded by m_RangeMutex
};

} // namespace Channels

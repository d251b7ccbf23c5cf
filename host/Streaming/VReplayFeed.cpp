#include "Streaming/VReplayFeed.h"

#include "Channels/Contexts/VChannelNumbering.h"

#include <algorithm>
#include <limits>
#include <span>

namespace Streaming
{

namespace
{

constexpr std::int64_t LongestBatch = 256; // frames

} // namespace

Channels::VLiveContext::Options VReplayFeed::ContextOptions(const Recordings::VRecording& i_rRecording)
{
    Channels::VLiveContext::Options options;
    options.FramePeriod = i_rRecording.FramePeriod;
    options.FirstFrame = TQL::FloorDivide(i_rRecording.Range.First, i_rRecording.FramePeriod);
    return options;
}

VReplayFeed::VReplayFeed(std::shared_ptr<const Recordings::VRecording> i_pRecording,
                         std::shared_ptr<Channels::VLiveContext> i_pContext, const Options& i_rOptions)
    : m_pRecording(std::move(i_pRecording))
    , m_pContext(std::move(i_pContext))
    , m_Options(i_rOptions)
    , m_FirstFrame(TQL::FloorDivide(m_pRecording->Range.First, m_pRecording->FramePeriod))
    , m_FrameCount(
          TQL::FloorDivide(m_pRecording->Range.Last + m_pRecording->FramePeriod - 1, m_pRecording->FramePeriod) -
          m_FirstFrame)
{
    AddChannels();
}

double VReplayFeed::FramesPerSecond() const
{
    return static_cast<double>(TQL::DefaultTickRate) / static_cast<double>(m_pRecording->FramePeriod);
}

void VReplayFeed::AddChannels()
{
    const std::int64_t framePeriod = m_pRecording->FramePeriod;
    const auto definitions = Channels::VChannelNumbering().DefineAll(*m_pRecording);
    for (std::size_t i = 0; i < definitions.size(); ++i)
    {
        const Recordings::RecordedChannel& rRecorded = m_pRecording->Channels[i];
        Lane lane{&rRecorded, 0, rRecorded.SamplePeriod, {}};
        // Rates whose period in ticks had to be rounded: as many samples a frame as were meant.
        if (rRecorded.SamplePeriod > 0 && framePeriod % rRecorded.SamplePeriod != 0)
        {
            lane.Period = framePeriod;
            m_Warnings.push_back(rRecorded.Name + " is replayed at the rate of the frames: its own does not fit them");
        }
        const TQL::IResult result = rRecorded.SamplePeriod > 0 && rRecorded.ComponentCount() ==
                                                                      Channels::ComponentNamesOf(definitions[i]).size()
                                        ? m_pContext->AddChannel(definitions[i], lane.Period, lane.Channel)
                                        : TQL::IResult(TQL::Result::InvalidInfo);
        if (result.IsSuccess())
            m_Lanes.push_back(std::move(lane));
        else
            m_Warnings.push_back(rRecorded.Name + " is not replayed: " + std::string(result.Description()));
    }
}

/// The rows of frames of one pass; missing where the recording has none. A row stands where the recorded one nearest to
/// it stands, if that is less than half a period away.
void VReplayFeed::Fill(Lane& io_rLane, std::int64_t i_FrameInPass, std::int64_t i_FrameCount) const
{
    const Recordings::RecordedChannel& rRecorded = *io_rLane.pRecorded;
    const std::size_t components = rRecorded.ComponentCount();
    const std::int64_t rows = i_FrameCount * (m_pRecording->FramePeriod / io_rLane.Period);
    const std::int64_t tick = (m_FirstFrame + i_FrameInPass) * m_pRecording->FramePeriod;
    const auto recorded = static_cast<std::int64_t>(rRecorded.RowCount());
    io_rLane.Rows.assign(static_cast<std::size_t>(rows) * components, std::numeric_limits<float>::quiet_NaN());
    for (std::int64_t row = 0; row < rows; ++row)
    {
        const std::int64_t from = tick + row * io_rLane.Period - rRecorded.FirstTick;
        const std::int64_t nearest = TQL::FloorDivide(from + rRecorded.SamplePeriod / 2, rRecorded.SamplePeriod);
        if (nearest >= 0 && nearest < recorded)
            std::copy_n(rRecorded.Samples.begin() + nearest * static_cast<std::int64_t>(components), components,
                        io_rLane.Rows.begin() + row * static_cast<std::int64_t>(components));
    }
}

TQL::IResult VReplayFeed::Produce(std::int64_t i_FirstFrame, std::int64_t i_FrameCount)
{
    const std::int64_t end = i_FirstFrame + i_FrameCount;
    for (std::int64_t first = i_FirstFrame; first < end;)
    {
        const std::int64_t inAll = first - m_FirstFrame;
        if (m_FrameCount == 0 || (inAll >= m_FrameCount && !m_Options.bLoop))
            return TQL::Result::OkButNoEffect;
        const std::int64_t inPass = inAll % m_FrameCount;
        const std::int64_t count = std::min({end - first, m_FrameCount - inPass, LongestBatch});
        m_Rows.clear();
        for (Lane& rLane : m_Lanes)
        {
            Fill(rLane, inPass, count);
            m_Rows.push_back({rLane.Channel, rLane.Rows, 0});
        }
        if (const TQL::IResult result = m_pContext->AppendFrames(first, count, m_Rows); result.IsError())
            return result;
        first += count;
    }
    return TQL::Result::Ok;
}

} // namespace Streaming

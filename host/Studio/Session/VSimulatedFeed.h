#pragma once

#include "Simulation/VWalkSimulator.h"
#include "TQL/IResult.h"

#include <cstdint>
#include <memory>
#include <vector>

namespace Channels
{
class VLiveContext;
struct ChannelRows;
} // namespace Channels

namespace Studio
{

/// Puts the simulated capture into a live context: its channels when it is made, its frames when it is told to. The
/// same channels come out with the same ids as from a recording of the simulator; beside them stand the poses of the
/// cameras and the number of markers of all subjects that were seen. One thread at a time.
class VSimulatedFeed
{
public:
    VSimulatedFeed(const Simulation::VWalkSimulator::Options& i_rOptions,
                   std::shared_ptr<Channels::VLiveContext> i_pContext);
    ~VSimulatedFeed();

    /// Appends frames in batches of at most a second. The first frame follows the last one of the call before.
    [[nodiscard]] TQL::IResult Produce(std::int64_t i_FirstFrame, std::int64_t i_FrameCount);

private:
    struct Source; ///< one array of the simulator and the channels in it

    void AddSubject(std::uint32_t i_Subject);
    void AddAnalog();
    void AddCameras();
    void AddSampleCount();
    float CountSamples(std::size_t i_Row) const;
    [[nodiscard]] TQL::IResult ProduceBatch(std::int64_t i_FirstFrame, std::int64_t i_FrameCount);

    const Simulation::VWalkSimulator m_Simulator;
    const std::shared_ptr<Channels::VLiveContext> m_pContext;
    std::vector<Source> m_Sources;
    std::vector<Channels::ChannelRows> m_Rows;
    std::int64_t m_BatchFirst = 0; ///< frame
};

} // namespace Studio

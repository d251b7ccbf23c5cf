#pragma once

#include <cstdint>
#include <memory>
#include <span>
#include <string>
#include <vector>

namespace Simulation
{

/// Writes the frames of a simulated capture: subjects that walk, each with markers, segment poses and believable
/// occlusions, and one analog device. Deterministic: frame n depends on the options and n alone, so live capture and
/// recordings agree and any frame can be asked for at any time. No thread of its own; one instance, one thread.
class VWalkSimulator
{
public:
    static constexpr double FrameRate = 120.0;
    static constexpr std::uint32_t AnalogSamplesPerFrame = 10; ///< 1200 Hz
    static constexpr std::uint32_t MarkersPerSubject = 53;
    static constexpr std::uint32_t AnalogOutputs = 16;

    struct Options
    {
        std::uint32_t Subjects = 2;
        std::uint64_t Seed = 1;
    };

    explicit VWalkSimulator(const Options& i_rOptions);
    ~VWalkSimulator();

    const Options& GetOptions() const;
    std::string SubjectName(std::uint32_t i_Subject) const;
    std::string AnalogName(std::uint32_t i_Output) const;
    std::string AnalogUnits(std::uint32_t i_Output) const;

    /// The same for every subject.
    static const std::vector<std::string>& MarkerNames();
    static const std::vector<std::string>& SegmentNames();

    /// Marker positions of one subject in millimetres, x y z for each marker; NaN where the marker is occluded.
    void ReadMarkers(std::int64_t i_Frame, std::uint32_t i_Subject, std::span<float> o_Positions) const;

    /// Segment poses of one subject: angle-axis rotation in radians (rx ry rz), wrapped to at most pi as a solver gives
    /// it, then position in millimetres (x y z), for each segment.
    void ReadSegments(std::int64_t i_Frame, std::uint32_t i_Subject, std::span<float> o_Poses) const;

    /// The analog samples of one frame: AnalogSamplesPerFrame rows of AnalogOutputs values. Units as AnalogUnits says.
    void ReadAnalog(std::int64_t i_Frame, std::span<float> o_Samples) const;

    /// A foot that meets or leaves the floor.
    struct FootEvent
    {
        std::uint32_t Subject = 0;
        double Seconds = 0.0;    ///< since frame 0
        const char* pLabel = ""; ///< "LHS", "RHS" heel strikes, "LTO", "RTO" toe-offs
    };

    /// The foot events of all subjects in [frame, frame + count), in the order of time.
    std::vector<FootEvent> ReadEvents(std::int64_t i_FirstFrame, std::int64_t i_Frames) const;

private:
    class Model;
    std::unique_ptr<const Model> m_pModel;
};

} // namespace Simulation

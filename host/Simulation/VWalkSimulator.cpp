#include "Simulation/VWalkSimulator.h"

#include "Simulation/AnalogModel.h"
#include "Simulation/BodyTables.h"
#include "Simulation/GaitCurves.h"
#include "Simulation/Noise.h"
#include "Simulation/Occlusions.h"
#include "Simulation/WalkerPose.h"

#include <algorithm>
#include <cassert>
#include <cmath>
#include <limits>
#include <numbers>

namespace Simulation
{

namespace
{

constexpr double markerNoise = 0.15; // millimetres

/// What differs from person to person, drawn once from the seed.
WalkerStyle MakeStyle(std::uint64_t i_Seed, std::uint32_t i_Subject)
{
    const auto between = [&](std::int64_t i_Which, double i_Low, double i_High)
    {
        return i_Low + (i_High - i_Low) * Uniform(Word(i_Seed, 1000 + i_Subject, i_Which));
    };
    WalkerStyle style;
    style.Scale = between(0, 0.92, 1.08);
    style.StrideFrequency = between(1, 0.86, 1.02);
    style.StartPhase = between(2, 0.0, 1.0);
    style.PathRadius = between(3, 1500.0, 2100.0);
    style.PathStart = between(4, -std::numbers::pi, std::numbers::pi);
    style.Turn = i_Subject % 2 == 0 ? 1.0 : -1.0;
    style.PathCentre = Eigen::Vector2d(5000.0 * (i_Subject % 4), 5000.0 * (i_Subject / 4));
    style.ArmSwing = between(5, 0.8, 1.15);
    style.MassKilograms = between(6, 58.0, 92.0);
    return style;
}

} // namespace

class VWalkSimulator::Model
{
public:
    explicit Model(const Options& i_rOptions) : m_Options(i_rOptions)
    {
        for (std::uint32_t i = 0; i < m_Options.Subjects; ++i)
            m_Styles.push_back(MakeStyle(m_Options.Seed, i));
    }

    std::uint64_t MarkerSeed(std::uint32_t i_Subject, std::size_t i_Marker) const
    {
        return Word(m_Options.Seed, 1 + i_Subject, static_cast<std::int64_t>(i_Marker));
    }

    OcclusionSource OcclusionOf(std::uint32_t i_Subject, std::size_t i_Marker, EOcclusion i_Kind) const
    {
        const WalkerStyle& rStyle = m_Styles[i_Subject];
        return {MarkerSeed(i_Subject, i_Marker), i_Kind, rStyle.StartPhase, rStyle.StrideFrequency / FrameRate};
    }

    Options m_Options;
    std::vector<WalkerStyle> m_Styles;
};

VWalkSimulator::VWalkSimulator(const Options& i_rOptions) : m_pModel(std::make_unique<const Model>(i_rOptions)) {}

VWalkSimulator::~VWalkSimulator() = default;

const VWalkSimulator::Options& VWalkSimulator::GetOptions() const
{
    return m_pModel->m_Options;
}

std::string VWalkSimulator::SubjectName(std::uint32_t i_Subject) const
{
    return "Walker" + std::to_string(i_Subject + 1);
}

std::string VWalkSimulator::AnalogName(std::uint32_t i_Output) const
{
    return GetAnalogTable()[i_Output].pName;
}

std::string VWalkSimulator::AnalogUnits(std::uint32_t i_Output) const
{
    return GetAnalogTable()[i_Output].pUnits;
}

const std::vector<std::string>& VWalkSimulator::MarkerNames()
{
    static const std::vector<std::string> names = []
    {
        std::vector<std::string> result;
        for (const MarkerRow& rRow : GetMarkerTable())
            result.push_back(rRow.Name);
        return result;
    }();
    return names;
}

const std::vector<std::string>& VWalkSimulator::SegmentNames()
{
    static const std::vector<std::string> names = []
    {
        std::vector<std::string> result;
        for (const SegmentRow& rRow : GetSegmentTable())
            result.emplace_back(rRow.pName);
        return result;
    }();
    return names;
}

void VWalkSimulator::ReadMarkers(std::int64_t i_Frame, std::uint32_t i_Subject, std::span<float> o_Positions) const
{
    const auto markers = GetMarkerTable();
    assert(o_Positions.size() == markers.size() * 3);
    const WalkerStyle& rStyle = m_pModel->m_Styles[i_Subject];
    const BodyPose pose = PoseAt(rStyle, static_cast<double>(i_Frame) / FrameRate);
    for (std::size_t marker = 0; marker < markers.size(); ++marker)
    {
        const auto out = o_Positions.subspan(marker * 3, 3);
        const MarkerRow& rRow = markers[marker];
        if (IsOccluded(m_pModel->OcclusionOf(i_Subject, marker, rRow.Occlusion), i_Frame))
        {
            std::ranges::fill(out, std::numeric_limits<float>::quiet_NaN());
            continue;
        }
        const SegmentPose& rSegment = pose[static_cast<std::size_t>(rRow.Segment)];
        const Eigen::Vector3d position =
            rSegment.Position + rSegment.Rotation * (Eigen::Vector3d(rRow.Offset) * rStyle.Scale);
        const std::uint64_t seed = m_pModel->MarkerSeed(i_Subject, marker);
        for (int axis = 0; axis < 3; ++axis)
            out[static_cast<std::size_t>(axis)] = static_cast<float>(
                position[axis] + markerNoise * Bell(Word(seed, 10 + static_cast<std::uint64_t>(axis), i_Frame)));
    }
}

void VWalkSimulator::ReadSegments(std::int64_t i_Frame, std::uint32_t i_Subject, std::span<float> o_Poses) const
{
    assert(o_Poses.size() == SegmentCount * 6);
    const BodyPose pose = PoseAt(m_pModel->m_Styles[i_Subject], static_cast<double>(i_Frame) / FrameRate);
    for (std::size_t segment = 0; segment < SegmentCount; ++segment)
    {
        const Eigen::Vector3d rotation = AngleAxisOf(pose[segment].Rotation);
        for (int axis = 0; axis < 3; ++axis)
        {
            o_Poses[segment * 6 + static_cast<std::size_t>(axis)] = static_cast<float>(rotation[axis]);
            o_Poses[segment * 6 + 3 + static_cast<std::size_t>(axis)] =
                static_cast<float>(pose[segment].Position[axis]);
        }
    }
}

void VWalkSimulator::ReadAnalog(std::int64_t i_Frame, std::span<float> o_Samples) const
{
    assert(o_Samples.size() == std::size_t{AnalogSamplesPerFrame} * AnalogOutputs);
    if (m_pModel->m_Styles.empty())
    {
        std::ranges::fill(o_Samples, 0.0f);
        return;
    }
    const std::uint64_t seed = Word(m_pModel->m_Options.Seed, 0, 0);
    for (std::uint32_t row = 0; row < AnalogSamplesPerFrame; ++row)
        AnalogAt(m_pModel->m_Styles.front(), seed, i_Frame * AnalogSamplesPerFrame + row,
                 FrameRate * AnalogSamplesPerFrame, o_Samples.subspan(std::size_t{row} * AnalogOutputs, AnalogOutputs));
}

std::vector<VWalkSimulator::FootEvent> VWalkSimulator::ReadEvents(std::int64_t i_FirstFrame,
                                                                  std::int64_t i_Frames) const
{
    static constexpr struct
    {
        const char* pLabel;
        double Phase; // of the left leg
    } rows[] = {{"LHS", 0.0}, {"RHS", 0.5}, {"LTO", ToeOffPhase}, {"RTO", ToeOffPhase + 0.5}};

    const double from = static_cast<double>(i_FirstFrame) / FrameRate;
    const double to = static_cast<double>(i_FirstFrame + i_Frames) / FrameRate;
    std::vector<FootEvent> events;
    for (std::uint32_t subject = 0; subject < m_pModel->m_Styles.size(); ++subject)
    {
        const WalkerStyle& rStyle = m_pModel->m_Styles[subject];
        for (const auto& rRow : rows)
            for (double cycle = std::ceil(rStyle.LeftPhase(from) - rRow.Phase);; cycle += 1.0)
            {
                const double seconds = (cycle + rRow.Phase - rStyle.StartPhase) / rStyle.StrideFrequency;
                if (seconds >= to)
                    break;
                events.push_back({subject, seconds, rRow.pLabel});
            }
    }
    std::ranges::stable_sort(events, {}, &FootEvent::Seconds);
    return events;
}

} // namespace Simulation

#include "Simulation/CameraRing.h"
#include "Simulation/RecordWalk.h"
#include "Simulation/VWalkSimulator.h"

#include <gtest/gtest.h>

#include <algorithm>
#include <array>
#include <bit>
#include <cmath>
#include <map>
#include <numbers>
#include <set>
#include <string>
#include <vector>

namespace
{

using Simulation::VWalkSimulator;

constexpr std::size_t markerValues = VWalkSimulator::MarkersPerSubject * 3;
constexpr std::size_t analogValues = VWalkSimulator::AnalogOutputs * VWalkSimulator::AnalogSamplesPerFrame;

/// Everything of one frame, as bits, so that missing samples compare equal.
std::vector<std::uint32_t> FrameBits(const VWalkSimulator& i_rSimulator, std::int64_t i_Frame)
{
    std::vector<std::uint32_t> bits;
    const auto append = [&bits](const std::vector<float>& i_rValues)
    {
        for (const float value : i_rValues)
            bits.push_back(std::bit_cast<std::uint32_t>(value));
    };
    for (std::uint32_t subject = 0; subject < i_rSimulator.GetOptions().Subjects; ++subject)
    {
        std::vector<float> markers(markerValues);
        i_rSimulator.ReadMarkers(i_Frame, subject, markers);
        append(markers);
        std::vector<float> segments(VWalkSimulator::SegmentNames().size() * 6);
        i_rSimulator.ReadSegments(i_Frame, subject, segments);
        append(segments);
    }
    std::vector<float> analog(analogValues);
    i_rSimulator.ReadAnalog(i_Frame, analog);
    append(analog);
    return bits;
}

TEST(WalkSimulator, AFrameDependsOnTheOptionsAndItsNumberAlone)
{
    const VWalkSimulator forward({2, 7});
    const VWalkSimulator backward({2, 7});
    const VWalkSimulator other({2, 8});
    std::vector<std::int64_t> frames{-500, 0, 1, 239, 240, 1000, 10'000'000};
    std::map<std::int64_t, std::vector<std::uint32_t>> bits;
    for (const std::int64_t frame : frames)
        bits[frame] = FrameBits(forward, frame);
    std::ranges::reverse(frames);
    for (const std::int64_t frame : frames)
    {
        EXPECT_EQ(FrameBits(backward, frame), bits[frame]) << frame;
        EXPECT_NE(FrameBits(other, frame), bits[frame]) << frame;
    }
}

TEST(WalkSimulator, TheFirstSubjectIsTheSameHoweverManyWalk)
{
    const VWalkSimulator one({1, 3});
    const VWalkSimulator four({4, 3});
    std::vector<float> alone(markerValues), together(markerValues);
    one.ReadMarkers(77, 0, alone);
    four.ReadMarkers(77, 0, together);
    EXPECT_TRUE(std::ranges::equal(alone, together,
                                   [](float i_A, float i_B)
                                   { return std::bit_cast<std::uint32_t>(i_A) == std::bit_cast<std::uint32_t>(i_B); }));
}

struct Gap
{
    std::int64_t Frames = 0;
    bool bWhole = false; ///< seen before and after
};

std::vector<Gap> GapsOf(const std::vector<float>& i_rX)
{
    std::vector<Gap> gaps;
    for (std::size_t i = 0; i < i_rX.size(); ++i)
        if (std::isnan(i_rX[i]))
        {
            const std::size_t first = i;
            while (i < i_rX.size() && std::isnan(i_rX[i]))
                ++i;
            gaps.push_back({static_cast<std::int64_t>(i - first), first > 0 && i < i_rX.size()});
        }
    return gaps;
}

TEST(WalkSimulator, MarkersMoveLikeABodyAndAreLostInShortBursts)
{
    constexpr std::int64_t frames = 60 * 120;
    constexpr double fastest = 9000.0 / 120.0; // millimetres a frame: a foot in mid swing goes about 4.5 m/s
    const VWalkSimulator simulator({2, 1});
    std::size_t missing = 0, gapCount = 0;
    for (std::uint32_t subject = 0; subject < 2; ++subject)
    {
        std::vector<std::vector<float>> x(VWalkSimulator::MarkersPerSubject);
        std::vector<float> now(markerValues), before(markerValues);
        for (std::int64_t frame = 0; frame < frames; ++frame)
        {
            simulator.ReadMarkers(frame, subject, now);
            for (std::size_t marker = 0; marker < x.size(); ++marker)
            {
                const float* pNow = &now[marker * 3];
                const float* pBefore = &before[marker * 3];
                x[marker].push_back(pNow[0]);
                if (std::isnan(pNow[0]))
                {
                    EXPECT_TRUE(std::isnan(pNow[1]) && std::isnan(pNow[2]));
                    continue;
                }
                EXPECT_GT(pNow[2], -20.0f) << "below the floor: " << VWalkSimulator::MarkerNames()[marker];
                EXPECT_LT(pNow[2], 2100.0f);
                if (frame > 0 && !std::isnan(pBefore[0]))
                {
                    const double step = std::hypot(pNow[0] - pBefore[0], pNow[1] - pBefore[1], pNow[2] - pBefore[2]);
                    EXPECT_LT(step, fastest) << VWalkSimulator::MarkerNames()[marker] << " at " << frame;
                }
            }
            std::swap(now, before);
        }
        for (const auto& rX : x)
            for (const Gap& rGap : GapsOf(rX))
            {
                EXPECT_LE(rGap.Frames, 60);
                if (rGap.bWhole)
                {
                    EXPECT_GE(rGap.Frames, 3);
                }
                missing += static_cast<std::size_t>(rGap.Frames);
                ++gapCount;
            }
    }
    const double share = static_cast<double>(missing) / static_cast<double>(2 * 53 * frames);
    EXPECT_GT(share, 0.005);
    EXPECT_LT(share, 0.08);
    EXPECT_GT(gapCount, 200u);
}

TEST(WalkSimulator, EveryMarkerOfOneSideHasItsTwin)
{
    const auto& names = VWalkSimulator::MarkerNames();
    const std::set<std::string> unique(names.begin(), names.end());
    ASSERT_EQ(names.size(), VWalkSimulator::MarkersPerSubject);
    EXPECT_EQ(unique.size(), names.size());
    std::size_t left = 0, right = 0;
    for (const std::string& rName : names)
        if (rName[0] == 'L')
        {
            ++left;
            EXPECT_TRUE(unique.contains("R" + rName.substr(1))) << rName;
        }
        else if (rName[0] == 'R')
            ++right;
    EXPECT_EQ(left, right);
    EXPECT_EQ(left, 25u);
    EXPECT_EQ(VWalkSimulator::SegmentNames().front(), "Pelvis");
}

TEST(WalkSimulator, SegmentsTurnThroughPiAndThePositionsStaySmooth)
{
    const VWalkSimulator simulator({2, 1});
    const std::size_t segments = VWalkSimulator::SegmentNames().size();
    std::vector<float> now(segments * 6), before(segments * 6);
    std::array<int, 2> wraps{};
    for (std::uint32_t subject = 0; subject < 2; ++subject)
        for (std::int64_t frame = 0; frame < 3600; ++frame)
        {
            simulator.ReadSegments(frame, subject, now);
            for (std::size_t segment = 0; segment < segments; ++segment)
            {
                const float* p = &now[segment * 6];
                ASSERT_LE(std::hypot(p[0], p[1], p[2]), std::numbers::pi + 1e-5);
                const float* pOld = &before[segment * 6];
                if (frame > 0)
                {
                    ASSERT_LT(std::hypot(p[3] - pOld[3], p[4] - pOld[4], p[5] - pOld[5]), 75.0);
                }
            }
            if (frame > 0 && std::abs(now[2] - before[2]) > 4.0f)
                ++wraps[subject];
            std::swap(now, before);
        }
    EXPECT_GE(wraps[0], 2);
    EXPECT_GE(wraps[1], 2);
}

TEST(WalkSimulator, AnalogFollowsTheFeet)
{
    const VWalkSimulator simulator({1, 5});
    const auto recording = Simulation::RecordWalk(simulator, 1234, 600);
    std::map<std::string, const Recordings::RecordedChannel*> channels;
    for (const auto& rChannel : recording.Channels)
        channels[rChannel.Name] = &rChannel;
    ASSERT_EQ(recording.Channels.size(), 53u + 16u);

    for (const auto& rChannel : recording.Channels)
    {
        EXPECT_EQ(rChannel.RowCount(), rChannel.Kind == Recordings::EChannelKind::Analog ? 6000u : 600u);
        EXPECT_FALSE(rChannel.Units.empty()) << rChannel.Name;
        if (rChannel.Kind == Recordings::EChannelKind::Analog)
        {
            const auto [low, high] = std::ranges::minmax(rChannel.Samples);
            EXPECT_GT(high - low, rChannel.Units == "V" ? 0.2f : 20.0f) << rChannel.Name;
        }
    }

    // The left plate bears weight from a left heel strike to the left toe-off and nothing after it.
    const auto& rForce = *channels.at("Fz1");
    const auto forceAt = [&rForce](double i_Seconds)
    {
        return rForce.Samples[static_cast<std::size_t>(i_Seconds * rForce.Rate)];
    };
    std::map<std::string, int> counts;
    for (const auto& rEvent : recording.Events)
    {
        EXPECT_EQ(rEvent.Subject, "Walker1");
        ++counts[rEvent.Label];
        if (rEvent.Seconds > 4.8)
            continue;
        if (rEvent.Label == "LHS")
        {
            EXPECT_GT(forceAt(rEvent.Seconds + 0.15), 300.0f) << rEvent.Seconds;
        }
        if (rEvent.Label == "LTO")
        {
            EXPECT_LT(std::abs(forceAt(rEvent.Seconds + 0.15)), 5.0f) << rEvent.Seconds;
        }
    }
    for (const char* pLabel : {"LHS", "RHS", "LTO", "RTO"})
    {
        EXPECT_GE(counts[pLabel], 4) << pLabel;
        EXPECT_LE(counts[pLabel], 6) << pLabel;
    }
}

TEST(CameraRing, CamerasLookAtTheMiddleAndStandUpright)
{
    // A vector turned about the pose's axis by its angle.
    const auto turn = [](const std::array<float, 6>& i_rPose, const std::array<double, 3>& i_rVector)
    {
        const double x = i_rPose[0], y = i_rPose[1], z = i_rPose[2];
        const double angle = std::sqrt(x * x + y * y + z * z);
        const std::array<double, 3> axis{x / angle, y / angle, z / angle};
        double along = 0.0;
        for (std::size_t i = 0; i < 3; ++i)
            along += axis[i] * i_rVector[i];
        std::array<double, 3> turned{};
        for (std::size_t i = 0; i < 3; ++i)
        {
            const std::size_t j = (i + 1) % 3, k = (i + 2) % 3;
            turned[i] = i_rVector[i] * std::cos(angle) + axis[i] * along * (1.0 - std::cos(angle)) +
                        (axis[j] * i_rVector[k] - axis[k] * i_rVector[j]) * std::sin(angle);
        }
        EXPECT_LE(angle, std::numbers::pi + 1e-6);
        return turned;
    };
    std::set<std::array<float, 6>> poses;
    for (std::uint32_t camera = 0; camera < Simulation::CameraCount; ++camera)
    {
        const auto pose = Simulation::CameraPoseOf(camera);
        poses.insert(pose);
        const auto view = turn(pose, {0.0, 0.0, -1.0});
        const double distance = std::hypot(pose[3], pose[4], pose[5] - 1000.0);
        const std::array<double, 3> hit{pose[3] + distance * view[0], pose[4] + distance * view[1],
                                        pose[5] + distance * view[2]};
        EXPECT_LT(std::hypot(hit[0], hit[1], hit[2] - 1000.0), 0.1) << camera;
        EXPECT_NEAR(turn(pose, {1.0, 0.0, 0.0})[2], 0.0, 1e-6) << camera;
        EXPECT_GT(turn(pose, {0.0, 1.0, 0.0})[2], 0.9) << camera;
    }
    EXPECT_EQ(poses.size(), Simulation::CameraCount);
}

} // namespace

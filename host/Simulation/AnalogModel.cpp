#include "Simulation/AnalogModel.h"

#include "Simulation/GaitCurves.h"
#include "Simulation/Noise.h"

#include <array>

namespace Simulation
{

namespace
{

constexpr std::array<AnalogRow, 16> analogTable{{
    {"Fx1", "N"},
    {"Fy1", "N"},
    {"Fz1", "N"},
    {"Mx1", "Nmm"},
    {"My1", "Nmm"},
    {"Mz1", "Nmm"},
    {"Fx2", "N"},
    {"Fy2", "N"},
    {"Fz2", "N"},
    {"Mx2", "Nmm"},
    {"My2", "Nmm"},
    {"Mz2", "Nmm"},
    {"LTA", "V"},
    {"LGA", "V"},
    {"RTA", "V"},
    {"RGA", "V"},
}};

/// i_Side is 1 for the left foot and -1 for the right one.
void Plate(const WalkerStyle& i_rStyle, double i_Phase, double i_Side, std::span<double, 6> o_Values)
{
    constexpr double gravity = 9.81;
    const double weight = i_rStyle.MassKilograms * gravity;
    const FootLoad load = FootLoadAt(i_Phase);
    const double along = -90.0 + 200.0 * load.Progress; // millimetres from the plate's centre
    const double across = i_Side * (12.0 - 8.0 * load.Progress);
    const double force[3] = {weight * load.ForeAft, -i_Side * weight * load.Sideways, weight * load.Vertical};
    o_Values[0] = force[0];
    o_Values[1] = force[1];
    o_Values[2] = force[2];
    o_Values[3] = across * force[2];
    o_Values[4] = -along * force[2];
    o_Values[5] = along * force[1] - across * force[0];
}

/// Tibialis lifts the foot in swing and lowers it after the strike; gastrocnemius pushes off.
std::array<double, 2> Muscles(double i_Phase)
{
    const double tibialis = 0.8 * MuscleBurst(i_Phase, 0.03, 0.05) + 0.5 * MuscleBurst(i_Phase, 0.70, 0.07);
    const double gastrocnemius = 0.9 * MuscleBurst(i_Phase, 0.42, 0.09);
    return {tibialis, gastrocnemius};
}

} // namespace

std::span<const AnalogRow> GetAnalogTable()
{
    return analogTable;
}

void AnalogAt(const WalkerStyle& i_rStyle, std::uint64_t i_Seed, std::int64_t i_Sample, double i_SamplesPerSecond,
              std::span<float> o_Values)
{
    const double left = i_rStyle.LeftPhase(static_cast<double>(i_Sample) / i_SamplesPerSecond);
    std::array<double, 12> plates{};
    Plate(i_rStyle, left, 1.0, std::span<double, 6>(plates.data(), 6));
    Plate(i_rStyle, left + 0.5, -1.0, std::span<double, 6>(plates.data() + 6, 6));

    constexpr double forceNoise = 0.6;   // N
    constexpr double momentNoise = 60.0; // Nmm
    for (std::size_t i = 0; i < plates.size(); ++i)
    {
        const double noise = i % 6 < 3 ? forceNoise : momentNoise;
        o_Values[i] = static_cast<float>(plates[i] + noise * Bell(Word(i_Seed, i, i_Sample)));
    }

    constexpr double rest = 0.006; // V
    constexpr double effort = 0.45;
    std::size_t output = plates.size();
    for (const double phase : {left, left + 0.5})
        for (const double activity : Muscles(phase))
        {
            const double amplitude = rest + effort * activity;
            o_Values[output] = static_cast<float>(amplitude * Bell(Word(i_Seed, output, i_Sample)));
            ++output;
        }
}

} // namespace Simulation

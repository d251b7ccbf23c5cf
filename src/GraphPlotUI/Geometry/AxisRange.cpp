#include "GraphPlotUI/Geometry/AxisRange.h"

#include "TQL/Log.h"

#include <array>
#include <cmath>
#include <limits>
#include <utility>

namespace GraphPlotUI
{

namespace
{

constexpr double MinimumGapInPixels = 10.0;
constexpr double FadeFactor = 10.0;

struct LadderStep
{
    double MinorMultiplier;
    std::int32_t Subdivisions;
};

// From a power of 100 down: the power itself, then divided by 5, by 4 and by 5.
constexpr std::array<double, 3> LadderDivisors{5.0, 4.0, 5.0};
constexpr std::array<LadderStep, 4> LadderSteps{{{5.0, 4}, {5.0, 5}, {4.0, 5}, {5.0, 4}}};

// How far minor lines have faded at a ladder step i_Step when the next one up is i_Minor.
double MinorFade(double i_Step, double i_Minor, double i_Gap)
{
    const double rest = i_Step / i_Minor * i_Gap;
    return (i_Step - rest) / (i_Gap - rest);
}

bool HasTwoMajors(const AxisRange& i_rRange, double i_Major)
{
    const double inverse = 1.0 / i_Major;
    const double first = std::ceil(i_rRange.Minimum * inverse) * i_Major;
    const double last = std::floor(i_rRange.Maximum * inverse) * i_Major;
    return last - first >= std::numeric_limits<double>::epsilon() && first >= i_rRange.Minimum &&
           last <= i_rRange.Maximum;
}

} // namespace

double AxisRange::Length() const noexcept
{
    return std::abs(Maximum - Minimum);
}

double AxisRange::UnitsPerPixel() const noexcept
{
    return PixelLength < 1 ? 0.0 : Length() / PixelLength;
}

double AxisRange::PixelsPerUnit() const noexcept
{
    return Maximum == Minimum ? 0.0 : PixelLength / Length();
}

double AxisRange::ValueToPixels(double i_Value) const noexcept
{
    return (i_Value - Minimum) * PixelsPerUnit();
}

double AxisRange::PixelsToValue(double i_Pixels) const noexcept
{
    return UnitsPerPixel() * i_Pixels + Minimum;
}

void AxisRange::SetRange(double i_Minimum, double i_Maximum) noexcept
{
    Minimum = i_Minimum;
    Maximum = i_Maximum;
}

void AxisRange::SetPixelLength(std::int32_t i_PixelLength) noexcept
{
    PixelLength = i_PixelLength;
}

bool FindDivisions(const AxisRange& i_rRange, double& o_rMajor, double& o_rMinor, std::int32_t& o_rSubdivisions,
                   double& o_rMinorFade)
{
    const double unitsPerPixel = i_rRange.UnitsPerPixel();
    if (!(unitsPerPixel > 0.0) || !std::isfinite(unitsPerPixel * MinimumGapInPixels))
        return false;

    const double gap = MinimumGapInPixels * unitsPerPixel;
    int exponent = static_cast<int>(std::ceil(std::log10(gap)));
    if (exponent % 2 != 0)
        ++exponent;
    double step = std::pow(10.0, exponent);
    std::size_t index = 0;
    while (step > gap && index < LadderDivisors.size())
        step /= LadderDivisors[index++];
    if (index >= LadderSteps.size())
    {
        TQL::Log::Format(TQL::Log::GetCategory("GraphPlot"), TQL::ELogSeverity::Error,
                         {"Failed to find divisions for min gap %1%", {"GraphPlotUI/AxisRange", 190}}, gap);
        return false;
    }

    o_rSubdivisions = LadderSteps[index].Subdivisions;
    o_rMinor = LadderSteps[index].MinorMultiplier * step;
    o_rMajor = o_rSubdivisions * o_rMinor;
    o_rMinorFade = MinorFade(step, o_rMinor, gap);
    return true;
}

void DivideRange(const AxisRange& i_rRange, EDivisionMode i_Mode, const DivisionCallback& i_rCallback, double& o_rMajor,
                 double& o_rMinor, double& o_rMinorFade)
{
    std::int32_t subdivisions = 0;
    if (!FindDivisions(i_rRange, o_rMajor, o_rMinor, subdivisions, o_rMinorFade))
        return;

    const double gap = MinimumGapInPixels * i_rRange.UnitsPerPixel();
    std::int32_t majorDivisor = 5;
    std::int32_t minorDivisor = 4;
    for (int round = 0; round < 2 && !HasTwoMajors(i_rRange, o_rMajor); ++round)
    {
        if (subdivisions != majorDivisor)
            std::swap(majorDivisor, minorDivisor);
        o_rMajor *= 1.0 / majorDivisor;
        o_rMinor /= minorDivisor;
        subdivisions = minorDivisor;
        o_rMinorFade = MinorFade(o_rMinor * (1.0 / majorDivisor), o_rMinor, gap);
    }

    const bool bMinors = i_Mode != EDivisionMode::MajorOnly && o_rMinor >= gap;
    const double step = bMinors ? o_rMinor : o_rMajor;
    const int period = bMinors ? subdivisions : 1;
    const double limit = i_rRange.Maximum + 2.0 * o_rMajor;
    double value = i_rRange.Minimum - std::fmod(i_rRange.Minimum, o_rMajor) - o_rMajor;
    for (int count = 0; value <= limit; ++count)
    {
        i_rCallback(static_cast<float>(value), count % period == 0);
        const double next = value + step;
        if (!(next > value)) // a range so far from zero that the step is lost in rounding
            return;
        value = next;
    }
}

void PanOffset(const AxisRange& i_rRange, bool i_bLive, bool i_bRelative, double i_Offset, double i_Major,
               double& o_rFirstTick, QVector3D& o_rTranslation)
{
    const double minimum = i_rRange.Minimum;
    const double first = minimum + i_Offset - i_Major - std::fmod(i_bRelative ? minimum : minimum + i_Offset, i_Major);
    o_rFirstTick = first - i_Offset;
    o_rTranslation = QVector3D(static_cast<float>(i_bLive ? first - i_Offset : first), 0.0f, 0.0f);
}

float MinorAlpha(double i_MinorFade) noexcept
{
    return static_cast<float>(std::exp(FadeFactor * i_MinorFade - FadeFactor));
}

} // namespace GraphPlotUI

#pragma once

#include <QtGui/QVector3D>

#include <cstdint>
#include <functional>

namespace GraphPlotUI
{

/// A range of values laid over a length of pixels: what both axes and the grid of a subplot are divided by.
/// A plain value; no operation fails.
struct AxisRange
{
    double Minimum = 0.0;
    double Maximum = 1.0;
    std::int32_t PixelLength = 1;

    double Length() const noexcept;        ///< abs(Maximum - Minimum)
    double UnitsPerPixel() const noexcept; ///< 0 when the pixel length is below 1
    double PixelsPerUnit() const noexcept; ///< 0 when the range is empty
    double ValueToPixels(double i_Value) const noexcept;
    double PixelsToValue(double i_Pixels) const noexcept;
    void SetRange(double i_Minimum, double i_Maximum) noexcept;
    void SetPixelLength(std::int32_t i_PixelLength) noexcept;
};

/// 1 asks for major divisions only, any other value for both kinds.
enum class EDivisionMode : std::uint32_t
{
    MajorOnly = 1,
    MajorAndMinor = 2
};

/// Gets the divisions in increasing order.
using DivisionCallback = std::function<void(float i_Value, bool i_bIsMajor)>;

/// Round-numbered distances between divisions, minor ones at least about ten pixels apart. o_rSubdivisions is the count
/// of minor divisions in a major one. o_rMinorFade runs from 1, minor divisions far apart, to 0, ten pixels apart.
/// False, with the outputs left alone, when the range or its pixel length is empty or not finite.
[[nodiscard]] bool FindDivisions(const AxisRange& i_rRange, double& o_rMajor, double& o_rMinor,
                                 std::int32_t& o_rSubdivisions, double& o_rMinorFade);

/// Calls back for each division from one or two majors below the range to two majors above it, so that a pan of up to
/// one major shows no edge. Tries to get at least two majors inside the range. Calls nothing and leaves the outputs
/// alone when the range cannot be divided.
void DivideRange(const AxisRange& i_rRange, EDivisionMode i_Mode, const DivisionCallback& i_rCallback, double& o_rMajor,
                 double& o_rMinor, double& o_rMinorFade);

/// The shift that keeps divisions laid out from zero on multiples of i_Major while the axis moves. i_Offset is the
/// latest frame of a live context and 0 otherwise. o_rFirstTick is the first major division on the axis' own scale,
/// without the offset; o_rTranslation is in axis units along x.
void PanOffset(const AxisRange& i_rRange, bool i_bLive, bool i_bRelative, double i_Offset, double i_Major,
               double& o_rFirstTick, QVector3D& o_rTranslation);

/// Opacity of minor divisions for a fade of FindDivisions.
float MinorAlpha(double i_MinorFade) noexcept;

} // namespace GraphPlotUI

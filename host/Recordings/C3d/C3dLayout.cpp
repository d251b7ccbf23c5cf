#include "Recordings/C3d/C3dLayout.h"

#include "Recordings/C3d/C3dFrameCount.h"

#include <algorithm>
#include <cmath>
#include <cstdint>
#include <cstdlib>
#include <optional>

namespace Recordings
{

namespace
{

constexpr double LowestRate = 0.1;
constexpr double HighestRate = 1e6;
constexpr double AssumedRate = 100.0;

bool IsRate(double i_Rate)
{
    return i_Rate >= LowestRate && i_Rate <= HighestRate;
}

std::size_t CountOf(std::optional<double> i_Value, std::size_t i_Default)
{
    return i_Value && *i_Value >= 0.0 && *i_Value <= 65535.0 ? static_cast<std::size_t>(*i_Value) : i_Default;
}

void FindRate(const C3dHeader& i_rHeader, const VC3dParameters& i_rParameters, C3dLayout& o_rLayout,
              std::vector<std::string>& o_rWarnings)
{
    o_rLayout.Rate = i_rParameters.Number("POINT", "RATE").value_or(0.0);
    if (IsRate(o_rLayout.Rate))
        return;
    o_rLayout.Rate = static_cast<double>(i_rHeader.Rate);
    if (IsRate(o_rLayout.Rate))
        return;
    o_rLayout.Rate = AssumedRate;
    o_rWarnings.push_back("The file gives no usable frame rate; 100 frames a second are assumed.");
}

bool FindScale(const C3dHeader& i_rHeader, const VC3dParameters& i_rParameters, C3dLayout& o_rLayout)
{
    double scale = i_rParameters.Number("POINT", "SCALE").value_or(0.0);
    if (scale == 0.0 || !std::isfinite(scale))
        scale = static_cast<double>(i_rHeader.Scale);
    o_rLayout.bReal = scale < 0.0;
    o_rLayout.PointScale = std::abs(scale);
    return scale != 0.0 && std::isfinite(scale);
}

C3dLayout ShapeOfHeader(const C3dHeader& i_rHeader, C3dLayout i_Layout)
{
    i_Layout.Points = i_rHeader.Points;
    i_Layout.AnalogSamplesPerFrame = i_rHeader.AnalogSamplesPerFrame;
    const std::size_t perFrame = i_rHeader.AnalogPerFrame;
    i_Layout.AnalogChannels = i_rHeader.AnalogSamplesPerFrame == 0 ? 0 : perFrame / i_rHeader.AnalogSamplesPerFrame;
    return i_Layout;
}

C3dLayout ShapeOfParameters(const VC3dParameters& i_rParameters, C3dLayout i_HeaderShape)
{
    C3dLayout shape = i_HeaderShape;
    shape.Points = CountOf(i_rParameters.Number("POINT", "USED", EWordKind::Unsigned), i_HeaderShape.Points);
    shape.AnalogChannels =
        CountOf(i_rParameters.Number("ANALOG", "USED", EWordKind::Unsigned), i_HeaderShape.AnalogChannels);
    const double analogRate = i_rParameters.Number("ANALOG", "RATE").value_or(0.0);
    if (shape.AnalogSamplesPerFrame == 0 && IsRate(analogRate))
        shape.AnalogSamplesPerFrame = CountOf(std::round(analogRate / shape.Rate), 0);
    return shape;
}

// Of header and parameters, the one whose frames fill the file; the parameters when that decides nothing.
C3dLayout ChooseShape(const C3dLayout& i_rParameters, const C3dLayout& i_rHeader, std::uint64_t i_Frames,
                      std::size_t i_DataBytes, std::vector<std::string>& o_rWarnings)
{
    const std::size_t byParameters = i_rParameters.FrameBytes();
    const std::size_t byHeader = i_rHeader.FrameBytes();
    if (i_rParameters.Points == i_rHeader.Points && byParameters == byHeader)
        return i_rParameters;
    const auto fits = [&](std::size_t i_FrameBytes)
    {
        return i_FrameBytes > 0 && i_DataBytes / i_FrameBytes >= i_Frames;
    };
    const bool bHeader = fits(byHeader) && (!fits(byParameters) || byHeader > byParameters);
    o_rWarnings.push_back(
        std::string("Header and parameters disagree on the number of points or analog channels; the ") +
        (bHeader ? "header" : "parameters") + " fit the file and are followed.");
    return bHeader ? i_rHeader : i_rParameters;
}

// Of the answers that the file gives, the first that its size allows; the first of all when none is.
void ChooseFrames(const std::vector<C3dFrameSpan>& i_rSpans, std::size_t i_DataBytes, C3dLayout& o_rLayout,
                  std::vector<std::string>& o_rWarnings)
{
    const std::size_t room = i_DataBytes / o_rLayout.FrameBytes();
    const auto fits = [room](const C3dFrameSpan& i_rSpan)
    {
        return i_rSpan.Count <= room;
    };
    auto chosen = std::find_if(i_rSpans.begin(), i_rSpans.end(), fits);
    if (chosen == i_rSpans.end())
        chosen = i_rSpans.begin();
    else if (chosen != i_rSpans.begin())
        o_rWarnings.push_back("The file says that it holds " + std::to_string(i_rSpans.front().Count) +
                              " frames and, in another place, " + std::to_string(chosen->Count) +
                              "; the second fits its size and is followed.");
    o_rLayout.FirstFrame = chosen->First;
    o_rLayout.DeclaredFrames = static_cast<std::size_t>(chosen->Count);
    o_rLayout.Frames = std::min(o_rLayout.DeclaredFrames, room);
    if (o_rLayout.Frames > 0 && o_rLayout.Frames < o_rLayout.DeclaredFrames)
        o_rWarnings.push_back("The file ends after frame " + std::to_string(o_rLayout.Frames) + " of " +
                              std::to_string(o_rLayout.DeclaredFrames) +
                              "; the rest of the recording is missing. Copy it again from where it came.");
}

std::size_t FindDataOffset(const C3dHeader& i_rHeader, const VC3dParameters& i_rParameters)
{
    if (i_rHeader.DataOffset > i_rHeader.ParameterOffset)
        return i_rHeader.DataOffset;
    const std::size_t block = CountOf(i_rParameters.Number("POINT", "DATA_START", EWordKind::Unsigned), 0);
    const std::size_t offset = block == 0 ? 0 : (block - 1) * C3dBlockBytes;
    return offset > i_rHeader.ParameterOffset ? offset : 0;
}

} // namespace

TQL::IResult FindC3dLayout(std::size_t i_FileBytes, const C3dHeader& i_rHeader, const VC3dParameters& i_rParameters,
                           C3dLayout& o_rLayout, std::vector<std::string>& o_rWarnings, std::string& o_rError)
{
    const auto refuse = [&](TQL::IResult i_Result, const char* i_pSentence)
    {
        o_rError = i_pSentence;
        return i_Result;
    };
    C3dLayout layout;
    layout.DataOffset = FindDataOffset(i_rHeader, i_rParameters);
    if (layout.DataOffset == 0)
        return refuse(TQL::Result::InvalidFormat, "neither header nor parameters say where the samples begin. "
                                                  "Export the file again from the program that made it.");
    if (!FindScale(i_rHeader, i_rParameters, layout))
        return refuse(TQL::Result::InvalidFormat, "neither header nor parameters give the scale of the points. "
                                                  "Export the file again from the program that made it.");
    FindRate(i_rHeader, i_rParameters, layout, o_rWarnings);
    const std::vector<C3dFrameSpan> spans = C3dFrameSpans(i_rHeader, i_rParameters);
    if (spans.empty())
        return refuse(TQL::Result::InvalidFormat, "the file holds no frames. Choose another recording.");

    const std::size_t dataBytes = i_FileBytes - std::min(i_FileBytes, layout.DataOffset);
    const C3dLayout headerShape = ShapeOfHeader(i_rHeader, layout);
    layout = ChooseShape(ShapeOfParameters(i_rParameters, headerShape), headerShape, spans.front().Count, dataBytes,
                         o_rWarnings);
    if (layout.FrameBytes() == 0)
        return refuse(TQL::Result::InvalidFormat,
                      "the file holds neither points nor analog channels. Choose another recording.");
    ChooseFrames(spans, dataBytes, layout, o_rWarnings);
    if (layout.Frames == 0)
        return refuse(TQL::Result::EndOfData,
                      "the file ends before its first frame is complete. Copy it again from where it came.");
    o_rLayout = layout;
    return TQL::Result::Ok;
}

} // namespace Recordings

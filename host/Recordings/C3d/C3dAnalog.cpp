#include "Recordings/C3d/C3dSamples.h"

#include "Recordings/Text/C3dText.h"

#include <algorithm>
#include <cmath>
#include <cstdint>
#include <utility>

namespace Recordings
{

namespace
{

// Whether integers of the analog section, and the offsets with them, count from 0 to 65535. Files that do not say so
// tell it by a 16-bit converter whose zero is the middle of that range.
bool IsUnsigned(const VC3dParameters& i_rParameters, std::size_t i_Channels)
{
    const std::string format = C3dCapitals(i_rParameters.Text("ANALOG", "FORMAT"));
    if (!format.empty())
        return format.starts_with("UNSIGNED");
    if (i_rParameters.Number("ANALOG", "BITS").value_or(0.0) != 16.0)
        return false;
    const auto offsets = i_rParameters.Numbers("ANALOG", "OFFSET", i_Channels, EWordKind::Unsigned);
    return std::any_of(offsets.begin(), offsets.end(),
                       [](double i_Offset) { return i_Offset == 32767.0 || i_Offset == 32768.0; });
}

std::vector<C3dCalibration> ReadCalibrations(const VC3dParameters& i_rParameters, std::size_t i_Channels,
                                             EWordKind i_Integers, std::vector<std::string>& o_rWarnings)
{
    const double general = i_rParameters.Number("ANALOG", "GEN_SCALE").value_or(1.0);
    const std::vector<double> scales = i_rParameters.Numbers("ANALOG", "SCALE", i_Channels);
    const std::vector<double> offsets = i_rParameters.Numbers("ANALOG", "OFFSET", i_Channels, i_Integers);
    if (scales.size() < i_Channels)
        o_rWarnings.push_back("The file gives a scale for " + std::to_string(scales.size()) + " of " +
                              std::to_string(i_Channels) + " analog channels; the others are shown as stored.");
    std::vector<C3dCalibration> calibrations(i_Channels);
    for (std::size_t i = 0; i < i_Channels; ++i)
    {
        calibrations[i].Scale = (i < scales.size() ? scales[i] : 1.0) * general;
        calibrations[i].Offset = i < offsets.size() ? offsets[i] : 0.0;
    }
    return calibrations;
}

RecordedChannel MakeAnalog(std::string i_Label, const C3dLayout& i_rLayout, const VRecording& i_rRecording)
{
    const auto perFrame = static_cast<std::int64_t>(i_rLayout.AnalogSamplesPerFrame);
    RecordedChannel channel;
    channel.Kind = EChannelKind::Analog;
    channel.Name = std::move(i_Label);
    channel.ComponentNames = {""};
    channel.Rate = i_rLayout.Rate * static_cast<double>(perFrame);
    channel.SamplePeriod =
        i_rRecording.FramePeriod % perFrame == 0 ? i_rRecording.FramePeriod / perFrame : PeriodOfRate(channel.Rate);
    channel.FirstTick = i_rRecording.Range.First;
    channel.Samples.reserve(i_rLayout.Frames * i_rLayout.AnalogSamplesPerFrame);
    return channel;
}

void AddChannels(const C3dSource& i_rSource, VRecording& io_rRecording)
{
    const std::size_t count = i_rSource.Layout.AnalogChannels;
    const std::vector<std::string> units = i_rSource.Parameters.Texts("ANALOG", "UNITS", count);
    std::vector<std::string> labels =
        UniqueLabels(i_rSource.Parameters.Texts("ANALOG", "LABELS", count), count, "Analog");
    for (std::size_t i = 0; i < count; ++i)
    {
        io_rRecording.Channels.push_back(MakeAnalog(std::move(labels[i]), i_rSource.Layout, io_rRecording));
        io_rRecording.Channels.back().Units = i < units.size() ? units[i] : std::string();
    }
}

} // namespace

C3dAnalogRules AddC3dAnalog(const C3dSource& i_rSource, VRecording& io_rRecording)
{
    const std::size_t count = i_rSource.Layout.AnalogChannels;
    if (count == 0 || i_rSource.Layout.AnalogSamplesPerFrame == 0)
        return {};
    AddChannels(i_rSource, io_rRecording);
    const EWordKind integers = IsUnsigned(i_rSource.Parameters, count) ? EWordKind::Unsigned : EWordKind::Signed;
    return {i_rSource.Layout.bReal ? EWordKind::Real : integers,
            ReadCalibrations(i_rSource.Parameters, count, integers, io_rRecording.Warnings)};
}

void ReadC3dAnalog(const C3dSource& i_rSource, const C3dAnalogRules& i_rRules, const C3dFrames& i_rFrames,
                   std::span<RecordedChannel> io_Channels, std::vector<float>& io_rScratch)
{
    const C3dLayout& rLayout = i_rSource.Layout;
    const std::size_t samples = i_rFrames.Count * rLayout.AnalogSamplesPerFrame;
    const WordGrid grid{i_rFrames.Count, rLayout.FrameBytes(), rLayout.AnalogSamplesPerFrame,
                        rLayout.AnalogChannels * rLayout.WordBytes()};
    io_rScratch.resize(std::max(io_rScratch.size(), samples));
    const std::span<float> values(io_rScratch.data(), samples);
    const std::byte* pChannel = i_rSource.File.data() + rLayout.DataOffset + i_rFrames.First * rLayout.FrameBytes() +
                                rLayout.Points * 4 * rLayout.WordBytes();
    const C3dCalibration* pCalibration = i_rRules.Calibrations.data();
    for (RecordedChannel& rChannel : io_Channels)
    {
        i_rSource.Header.Decoder.Decode(i_rRules.Kind, pChannel, grid, values.data());
        const C3dCalibration calibration = *pCalibration++;
        for (float& rValue : values)
            rValue = static_cast<float>((static_cast<double>(rValue) - calibration.Offset) * calibration.Scale);
        rChannel.Samples.insert(rChannel.Samples.end(), values.begin(), values.end());
        pChannel += rLayout.WordBytes();
    }
}

} // namespace Recordings

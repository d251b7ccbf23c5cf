#include "Recordings/C3d/C3dQuantities.h"
#include "Recordings/C3d/C3dSamples.h"

#include "Recordings/Text/C3dText.h"

#include <algorithm>
#include <cstddef>
#include <limits>
#include <map>
#include <string>
#include <utility>
#include <vector>

namespace Recordings
{

namespace
{

constexpr std::size_t WordsPerPoint = 4;
constexpr std::size_t ComponentsPerPoint = 3;

// The fourth word holds the camera mask in its high byte and the residual in the low one, also where it is stored as a
// real; the sign bit of the two together says that the point is invalid.
bool IsMissing(float i_FourthWord)
{
    if (i_FourthWord < 0.0f)
        return true;
    return i_FourthWord >= 32768.0f && i_FourthWord < 65536.0f;
}

void ConvertPoint(const float* i_pWords, double i_Scale, float* o_pSample)
{
    if (IsMissing(i_pWords[3]))
    {
        std::fill_n(o_pSample, ComponentsPerPoint, std::numeric_limits<float>::quiet_NaN());
        return;
    }
    for (std::size_t i = 0; i < ComponentsPerPoint; ++i)
        o_pSample[i] = static_cast<float>(static_cast<double>(i_pWords[i]) * i_Scale);
}

/// The quantity of each label that stands in a list of model outputs.
std::map<std::string, const C3dQuantity*> FindOutputs(const C3dSource& i_rSource)
{
    std::map<std::string, const C3dQuantity*> outputs;
    for (const C3dQuantity& rQuantity : C3dQuantities)
        for (std::string& rLabel : i_rSource.Parameters.Texts("POINT", rQuantity.List, i_rSource.Layout.Points))
            if (!rLabel.empty())
                outputs.emplace(std::move(rLabel), &rQuantity);
    return outputs;
}

/// Makes a model output of a marker.
void SetQuantity(const C3dSource& i_rSource, const C3dQuantity& i_rQuantity, RecordedChannel& io_rChannel)
{
    io_rChannel.Kind = EChannelKind::ModelOutput;
    io_rChannel.Quantity = i_rQuantity.Name;
    io_rChannel.Units = i_rSource.Parameters.Text("POINT", i_rQuantity.UnitName);
    if (io_rChannel.Units.empty())
        io_rChannel.Units = i_rQuantity.Unit;
}

RecordedChannel MakeMarker(std::string i_Label, const C3dLayout& i_rLayout, const VRecording& i_rRecording)
{
    RecordedChannel channel;
    channel.Kind = EChannelKind::Marker;
    channel.Subject = SubjectOfLabel(i_Label);
    channel.Name = std::move(i_Label);
    channel.ComponentNames = {"X", "Y", "Z"};
    channel.Rate = i_rLayout.Rate;
    channel.SamplePeriod = i_rRecording.FramePeriod;
    channel.FirstTick = i_rRecording.Range.First;
    channel.Samples.reserve(i_rLayout.Frames * ComponentsPerPoint);
    return channel;
}

} // namespace

void AddC3dPoints(const C3dSource& i_rSource, VRecording& io_rRecording)
{
    const C3dLayout& rLayout = i_rSource.Layout;
    const std::string units = i_rSource.Parameters.Text("POINT", "UNITS");
    const std::vector<std::string> labels = i_rSource.Parameters.Texts("POINT", "LABELS", rLayout.Points);
    const std::map<std::string, const C3dQuantity*> outputs = FindOutputs(i_rSource);
    std::vector<std::string> names = UniqueLabels(labels, rLayout.Points, "Point");
    for (std::size_t i = 0; i < names.size(); ++i)
    {
        RecordedChannel& rChannel =
            io_rRecording.Channels.emplace_back(MakeMarker(std::move(names[i]), rLayout, io_rRecording));
        rChannel.Units = units;
        if (const auto output = i < labels.size() ? outputs.find(labels[i]) : outputs.end(); output != outputs.end())
            SetQuantity(i_rSource, *output->second, rChannel);
    }
}

void ReadC3dPoints(const C3dSource& i_rSource, const C3dFrames& i_rFrames, std::span<RecordedChannel> io_Channels,
                   std::vector<float>& io_rScratch)
{
    const C3dLayout& rLayout = i_rSource.Layout;
    const EWordKind kind = rLayout.bReal ? EWordKind::Real : EWordKind::Signed;
    const double scale = rLayout.bReal ? 1.0 : rLayout.PointScale;
    const WordGrid grid{i_rFrames.Count, rLayout.FrameBytes(), WordsPerPoint, rLayout.WordBytes()};
    io_rScratch.resize(std::max(io_rScratch.size(), i_rFrames.Count * WordsPerPoint));
    const std::byte* pPoint = i_rSource.File.data() + rLayout.DataOffset + i_rFrames.First * rLayout.FrameBytes();
    for (RecordedChannel& rChannel : io_Channels)
    {
        i_rSource.Header.Decoder.Decode(kind, pPoint, grid, io_rScratch.data());
        // In place: a sample never overtakes the words that follow.
        for (std::size_t i = 0; i < i_rFrames.Count; ++i)
            ConvertPoint(io_rScratch.data() + i * WordsPerPoint, scale, io_rScratch.data() + i * ComponentsPerPoint);
        const auto first = io_rScratch.begin();
        rChannel.Samples.insert(rChannel.Samples.end(), first,
                                first + static_cast<std::ptrdiff_t>(i_rFrames.Count * ComponentsPerPoint));
        pPoint += WordsPerPoint * rLayout.WordBytes();
    }
}

} // namespace Recordings

#include "Recordings/C3d/C3dWriter.h"

#include "Recordings/C3d/C3dHead.h"
#include "Recordings/C3d/C3dHeader.h"
#include "Recordings/C3d/C3dParameterWriter.h"
#include "Recordings/C3d/C3dQuantities.h"
#include "Recordings/C3d/C3dWritePlan.h"
#include "Recordings/Common/FileMessage.h"
#include "Recordings/Common/VFileReplacement.h"

#include <algorithm>
#include <cmath>
#include <cstddef>
#include <cstdint>
#include <optional>
#include <span>
#include <string>
#include <vector>

namespace Recordings
{

namespace
{

constexpr std::size_t WriteBytes = 1 << 20; // frames are handed to the file in pieces of about this size

template <typename Get>
std::vector<std::string> Collect(const std::vector<const RecordedChannel*>& i_rChannels, Get i_Get)
{
    std::vector<std::string> texts;
    for (const RecordedChannel* pChannel : i_rChannels)
        texts.push_back(i_Get(*pChannel));
    return texts;
}

std::string NameOf(const RecordedChannel& i_rChannel)
{
    return i_rChannel.Name;
}

std::string UnitsOf(const RecordedChannel& i_rChannel)
{
    return i_rChannel.Units;
}

std::uint16_t CutToWord(std::uint64_t i_Value)
{
    return static_cast<std::uint16_t>(std::min<std::uint64_t>(i_Value, LargestC3dWord));
}

// The list of the points that are of a quantity, and their unit.
void AddOutputs(const C3dWritePlan& i_rPlan, const C3dQuantity& i_rQuantity, VC3dParameterWriter& o_rWriter)
{
    const RecordedChannel* pFirst = i_rPlan.FirstOf(i_rQuantity.Name);
    if (pFirst == nullptr)
        return;
    std::vector<std::string> labels;
    for (const RecordedChannel* pPoint : i_rPlan.Points)
        if (pPoint->Quantity == i_rQuantity.Name)
            labels.push_back(pPoint->Name);
    o_rWriter.AddTexts(i_rQuantity.List, labels);
    o_rWriter.AddText(i_rQuantity.UnitName, pFirst->Units);
}

void AddPointGroup(const C3dWritePlan& i_rPlan, std::uint16_t i_DataBlock, VC3dParameterWriter& o_rWriter)
{
    o_rWriter.BeginGroup("POINT");
    o_rWriter.AddInteger("USED", CutToWord(i_rPlan.Points.size()));
    o_rWriter.AddReal("SCALE", -1.0f);
    o_rWriter.AddReal("RATE", static_cast<float>(i_rPlan.Rate));
    o_rWriter.AddInteger("DATA_START", i_DataBlock);
    o_rWriter.AddInteger("FRAMES", CutToWord(i_rPlan.Frames));
    if (i_rPlan.IsLong())
        o_rWriter.AddReal("LONG_FRAMES", static_cast<float>(i_rPlan.Frames));
    if (i_rPlan.Points.empty())
        return;
    if (const RecordedChannel* pMarker = i_rPlan.FirstOf(""))
        o_rWriter.AddText("UNITS", pMarker->Units);
    o_rWriter.AddTexts("LABELS", Collect(i_rPlan.Points, NameOf));
    for (const C3dQuantity& rQuantity : C3dQuantities)
        AddOutputs(i_rPlan, rQuantity, o_rWriter);
}

void AddAnalogGroup(const C3dWritePlan& i_rPlan, VC3dParameterWriter& o_rWriter)
{
    const std::size_t count = i_rPlan.Analog.size();
    o_rWriter.BeginGroup("ANALOG");
    o_rWriter.AddInteger("USED", CutToWord(count));
    o_rWriter.AddReal("RATE", static_cast<float>(i_rPlan.Rate * static_cast<double>(i_rPlan.AnalogSamplesPerFrame)));
    o_rWriter.AddReal("GEN_SCALE", 1.0f);
    o_rWriter.AddText("FORMAT", "SIGNED");
    o_rWriter.AddReals("SCALE", std::vector<float>(count, 1.0f));
    o_rWriter.AddIntegers("OFFSET", std::vector<std::uint16_t>(count, 0));
    o_rWriter.AddTexts("UNITS", Collect(i_rPlan.Analog, UnitsOf));
    o_rWriter.AddTexts("LABELS", Collect(i_rPlan.Analog, NameOf));
}

void AddTrialGroup(const C3dWritePlan& i_rPlan, VC3dParameterWriter& o_rWriter)
{
    const auto words = [](std::uint64_t i_Frame)
    {
        return std::vector<std::uint16_t>{static_cast<std::uint16_t>(i_Frame & LargestC3dWord),
                                          static_cast<std::uint16_t>(i_Frame >> 16)};
    };
    o_rWriter.BeginGroup("TRIAL");
    o_rWriter.AddIntegers("ACTUAL_START_FIELD", words(i_rPlan.FirstFrame));
    o_rWriter.AddIntegers("ACTUAL_END_FIELD", words(i_rPlan.LastFrame()));
}

void AddEventGroup(const std::vector<RecordedEvent>& i_rEvents, VC3dParameterWriter& o_rWriter)
{
    std::vector<std::string> contexts;
    std::vector<std::string> labels;
    std::vector<std::string> subjects;
    std::vector<float> times;
    for (const RecordedEvent& rEvent : i_rEvents)
    {
        contexts.push_back(rEvent.Context);
        labels.push_back(rEvent.Label);
        subjects.push_back(rEvent.Subject);
        const double minutes = std::floor(rEvent.Seconds / 60.0);
        times.push_back(static_cast<float>(minutes));
        times.push_back(static_cast<float>(rEvent.Seconds - minutes * 60.0));
    }
    o_rWriter.BeginGroup("EVENT");
    o_rWriter.AddInteger("USED", CutToWord(i_rEvents.size()));
    o_rWriter.AddTexts("CONTEXTS", contexts);
    o_rWriter.AddTexts("LABELS", labels);
    o_rWriter.AddTexts("SUBJECTS", subjects);
    o_rWriter.AddReals("TIMES", times, 2);
}

} // namespace

std::optional<std::vector<std::byte>> MakeC3dParameters(const std::vector<RecordedEvent>& i_rEvents,
                                                        const C3dWritePlan& i_rPlan, std::uint16_t i_DataBlock)
{
    VC3dParameterWriter writer;
    AddPointGroup(i_rPlan, i_DataBlock, writer);
    AddAnalogGroup(i_rPlan, writer);
    if (i_rPlan.IsLong())
        AddTrialGroup(i_rPlan, writer);
    if (!i_rEvents.empty())
        AddEventGroup(i_rEvents, writer);
    return writer.Finish();
}

std::vector<std::byte> MakeC3dHeader(const C3dWritePlan& i_rPlan, std::uint16_t i_DataBlock)
{
    std::vector<std::byte> header{static_cast<std::byte>(FirstC3dParameterBlock), std::byte{0x50}};
    AppendC3dWord(CutToWord(i_rPlan.Points.size()), header);
    AppendC3dWord(CutToWord(i_rPlan.Analog.size() * i_rPlan.AnalogSamplesPerFrame), header);
    AppendC3dWord(CutToWord(i_rPlan.FirstFrame), header);
    AppendC3dWord(CutToWord(i_rPlan.LastFrame()), header);
    AppendC3dWord(0, header); // longest gap that was filled
    AppendC3dReal(-1.0f, header);
    AppendC3dWord(i_DataBlock, header);
    AppendC3dWord(CutToWord(i_rPlan.AnalogSamplesPerFrame), header);
    AppendC3dReal(static_cast<float>(i_rPlan.Rate), header);
    header.resize(C3dBlockBytes);
    return header;
}

void AppendC3dPoint(std::span<const float> i_Position, std::vector<std::byte>& o_rBytes)
{
    const bool bMissing =
        std::all_of(i_Position.begin(), i_Position.end(), [](float i_Value) { return std::isnan(i_Value); });
    for (const float value : i_Position)
        AppendC3dReal(bMissing ? 0.0f : value, o_rBytes);
    AppendC3dReal(bMissing ? -1.0f : 0.0f, o_rBytes);
}

namespace
{

void AppendFrame(const C3dWritePlan& i_rPlan, std::size_t i_Frame, std::vector<std::byte>& o_rBytes)
{
    for (const RecordedChannel* pPoint : i_rPlan.Points)
        AppendC3dPoint(std::span(pPoint->Samples).subspan(i_Frame * 3, 3), o_rBytes);
    for (std::size_t sample = 0; sample < i_rPlan.AnalogSamplesPerFrame; ++sample)
        for (const RecordedChannel* pAnalog : i_rPlan.Analog)
            AppendC3dReal(pAnalog->Samples[i_Frame * i_rPlan.AnalogSamplesPerFrame + sample], o_rBytes);
}

TQL::IResult WriteFile(const VRecording& i_rRecording, const C3dWritePlan& i_rPlan,
                       const std::filesystem::path& i_rPath, std::string& o_rError)
{
    // The parameters name the block behind them; they are as long whatever number stands there.
    auto parameters = MakeC3dParameters(i_rRecording.Events, i_rPlan, 0);
    if (!parameters)
    {
        o_rError =
            FileMessage(i_rPath, "the names and events are more than a C3D file can hold. Choose fewer channels.");
        return TQL::Result::NotSupported;
    }
    const auto dataBlock = static_cast<std::uint16_t>(FirstC3dParameterBlock + parameters->size() / C3dBlockBytes);
    parameters = MakeC3dParameters(i_rRecording.Events, i_rPlan, dataBlock);
    std::vector<std::byte> bytes = MakeC3dHeader(i_rPlan, dataBlock);
    bytes.insert(bytes.end(), parameters->begin(), parameters->end());

    VFileReplacement file(i_rPath);
    if (const TQL::IResult result = file.Open(o_rError); result.IsError())
        return result;
    for (std::size_t frame = 0; frame < i_rPlan.Frames; ++frame)
    {
        AppendFrame(i_rPlan, frame, bytes);
        if (bytes.size() < WriteBytes)
            continue;
        if (const TQL::IResult result = file.Write(bytes, o_rError); result.IsError())
            return result;
        bytes.clear();
    }
    if (const TQL::IResult result = file.Write(bytes, o_rError); result.IsError())
        return result;
    return file.Commit(o_rError);
}

} // namespace

TQL::IResult WriteC3d(const VRecording& i_rRecording, const std::filesystem::path& i_rPath, std::string& o_rError)
{
    const C3dWritePlan plan = PlanC3d(i_rRecording);
    if (const char* pObstacle = FindC3dObstacle(i_rRecording, plan))
    {
        o_rError = FileMessage(i_rPath, pObstacle);
        return TQL::Result::InvalidArgument;
    }
    const TQL::IResult result = WriteFile(i_rRecording, plan, i_rPath, o_rError);
    if (result.IsError() || plan.LeftOut == 0)
        return result;
    o_rError = FileMessage(
        i_rPath, std::to_string(plan.LeftOut) +
                     " channels are left out: a C3D file holds only markers, model outputs and analog channels.");
    return TQL::Result::OkButPartial;
}

} // namespace Recordings

#include "Recordings/C3d/C3dSamples.h"

#include "Recordings/Text/C3dText.h"

#include <algorithm>
#include <cmath>
#include <cstddef>
#include <cstdint>
#include <iterator>
#include <span>
#include <string>
#include <utility>
#include <vector>

namespace Recordings
{

namespace
{

constexpr std::uint16_t EventKey = 12345; // marks a header with labels of four characters
constexpr std::size_t MaximumHeaderEvents = 18;
constexpr std::size_t MaximumGroupEvents = 65535;
constexpr std::size_t KeyPlace = 298; // bytes from the start of the file
constexpr std::size_t CountPlace = 300;
constexpr std::size_t TimesPlace = 304;
constexpr std::size_t FlagsPlace = 376;
constexpr std::size_t LabelsPlace = 396;
constexpr std::size_t LabelBytes = 4;
constexpr double SameTime = 1e-3; // seconds

std::vector<RecordedEvent> ReadGroupEvents(const VC3dParameters& i_rParameters)
{
    const std::vector<double> times = i_rParameters.Numbers("EVENT", "TIMES", 2 * MaximumGroupEvents);
    const double used = i_rParameters.Number("EVENT", "USED", EWordKind::Unsigned).value_or(0.0);
    const std::size_t count = std::min(times.size() / 2, static_cast<std::size_t>(std::clamp(used, 0.0, 65535.0)));
    const auto labels = i_rParameters.Texts("EVENT", "LABELS", count);
    const auto contexts = i_rParameters.Texts("EVENT", "CONTEXTS", count);
    const auto subjects = i_rParameters.Texts("EVENT", "SUBJECTS", count);
    const auto textAt = [](const std::vector<std::string>& i_rTexts, std::size_t i_Index)
    {
        return i_Index < i_rTexts.size() ? i_rTexts[i_Index] : std::string();
    };
    std::vector<RecordedEvent> events;
    for (std::size_t i = 0; i < count; ++i)
    {
        RecordedEvent event;
        event.Subject = textAt(subjects, i);
        event.Label = textAt(labels, i);
        event.Context = textAt(contexts, i);
        event.Seconds = times[2 * i] * 60.0 + times[2 * i + 1]; // minutes, seconds
        events.push_back(std::move(event));
    }
    return events;
}

std::vector<RecordedEvent> ReadHeaderEvents(std::span<const std::byte> i_File, const VByteDecoder& i_rDecoder)
{
    std::vector<RecordedEvent> events;
    if (i_rDecoder.Word(i_File.subspan(KeyPlace)) != EventKey)
        return events;
    const std::size_t count = std::min<std::size_t>(i_rDecoder.Word(i_File.subspan(CountPlace)), MaximumHeaderEvents);
    for (std::size_t i = 0; i < count; ++i)
    {
        RecordedEvent event;
        event.Label = C3dText(i_File.subspan(LabelsPlace + i * LabelBytes, LabelBytes));
        event.Seconds = static_cast<double>(i_rDecoder.Real(i_File.subspan(TimesPlace + i * 4)));
        event.bOn = i_File[FlagsPlace + i] != std::byte{0};
        events.push_back(std::move(event));
    }
    return events;
}

// Writers that fill both places cut the label in the header to its four characters.
bool IsAmong(const RecordedEvent& i_rHeaderEvent, const std::vector<RecordedEvent>& i_rEvents)
{
    return std::any_of(i_rEvents.begin(), i_rEvents.end(),
                       [&](const RecordedEvent& i_rEvent)
                       {
                           return i_rEvent.Label.starts_with(i_rHeaderEvent.Label) &&
                                  std::abs(i_rEvent.Seconds - i_rHeaderEvent.Seconds) < SameTime;
                       });
}

} // namespace

void AddC3dEvents(const C3dSource& i_rSource, VRecording& io_rRecording)
{
    std::vector<RecordedEvent> events = ReadGroupEvents(i_rSource.Parameters);
    std::vector<RecordedEvent> headerEvents = ReadHeaderEvents(i_rSource.File, i_rSource.Header.Decoder);
    const std::vector<RecordedEvent> groupEvents = events;
    for (RecordedEvent& rEvent : headerEvents)
        if (!IsAmong(rEvent, groupEvents))
            events.push_back(std::move(rEvent));
    const std::size_t lost =
        std::erase_if(events, [](const RecordedEvent& i_rEvent) { return !std::isfinite(i_rEvent.Seconds); });
    if (lost > 0)
        io_rRecording.Warnings.push_back(std::to_string(lost) + " of the events have no usable time and are left out.");
    io_rRecording.Events.insert(io_rRecording.Events.end(), std::make_move_iterator(events.begin()),
                                std::make_move_iterator(events.end()));
}

} // namespace Recordings

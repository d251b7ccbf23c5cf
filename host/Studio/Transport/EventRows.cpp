#include "Studio/Transport/EventRows.h"

#include "Recordings/Common/FrameNumbers.h"
#include "Recordings/Common/VRecording.h"

#include <algorithm>
#include <cmath>

namespace Studio
{

std::vector<EventRow> ListEvents(const Recordings::VRecording& i_rRecording)
{
    const std::int64_t period = i_rRecording.FramePeriod;
    std::vector<EventRow> rows;
    if (period <= 0)
        return rows;
    const double framesPerSecond = static_cast<double>(TQL::DefaultTickRate) / static_cast<double>(period);
    const double first = static_cast<double>(TQL::FloorDivide(i_rRecording.Range.First, period));
    const double end = static_cast<double>(TQL::FloorDivide(i_rRecording.Range.Last, period));
    for (const Recordings::RecordedEvent& rEvent : i_rRecording.Events)
    {
        const double frame = std::round(rEvent.Seconds * framesPerSecond);
        // Written so that a time that is no number is left out, too.
        if (!rEvent.bOn || !(frame >= first && frame < end))
            continue;
        EventRow row;
        row.Tick = static_cast<std::int64_t>(frame) * period;
        row.Frame = Recordings::FrameAt(row.Tick, period);
        row.Text = QString::fromStdString(rEvent.Label);
        if (!rEvent.Context.empty() && rEvent.Context != "General")
            row.Text += QStringLiteral(", ") + QString::fromStdString(rEvent.Context);
        row.Subject = QString::fromStdString(rEvent.Subject);
        rows.push_back(std::move(row));
    }
    std::ranges::stable_sort(rows, {}, &EventRow::Frame);
    return rows;
}

} // namespace Studio

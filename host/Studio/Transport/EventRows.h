#pragma once

#include <QtCore/QString>

#include <cstdint>
#include <vector>

namespace Recordings
{
struct VRecording;
}

namespace Studio
{

/// One event of a recording as the operator sees it, at the motion frame nearest to it.
struct EventRow
{
    std::int64_t Frame = 0; ///< its number in the file
    std::int64_t Tick = 0;  ///< of that frame
    QString Text;           ///< "Foot Strike, Left"
    QString Subject;

    friend bool operator==(const EventRow&, const EventRow&) = default;
};

/// The events that lie on a frame of the recording and are switched on, by time.
std::vector<EventRow> ListEvents(const Recordings::VRecording& i_rRecording);

} // namespace Studio

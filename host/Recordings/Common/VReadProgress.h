#pragma once

#include "TQL/IResult.h"

#include <atomic>
#include <cstddef>
#include <functional>
#include <string>
#include <utility>

namespace Recordings
{

/// How a reader tells how far it is, and hears that nobody waits for its file any more. One object for each file that
/// is read; a reader gets a pointer to it, null where nobody listens, and calls TellProgress whenever it has done a
/// piece: it costs next to nothing, so a row or a block of frames is a good piece. The thread that reads.
class VReadProgress
{
public:
    /// Gets the share of the file that is done, from 0 to 1, never less than before. False: stop reading.
    using Listener = std::function<bool(double i_Fraction)>;

    /// i_pStop outlives this object; once it is true the reader stops at its next piece, however slowly it goes on.
    explicit VReadProgress(Listener i_Listener, const std::atomic<bool>* i_pStop = nullptr)
        : m_Listener(std::move(i_Listener)), m_pStop(i_pStop)
    {
    }

    /// Tells that i_Done of i_Total are done, in any unit: bytes, rows, frames. False when the reader shall stop, and
    /// from then on. The listener is asked at most Steps + 1 times for a file.
    [[nodiscard]] bool Tell(std::size_t i_Done, std::size_t i_Total);

    const std::atomic<bool>* StopFlag() const { return m_pStop; } ///< may be null

    static constexpr std::size_t Steps = 256;

private:
    Listener m_Listener;
    const std::atomic<bool>* m_pStop;
    std::size_t m_Next = 0; ///< the step at which the listener is asked again
    bool m_bStopped = false;
};

/// The same for a reader that may have no listener: then it always goes on.
[[nodiscard]] inline bool TellProgress(VReadProgress* i_pProgress, std::size_t i_Done, std::size_t i_Total)
{
    return !i_pProgress || i_pProgress->Tell(i_Done, i_Total);
}

/// What a reader returns when it was told to stop: Canceled, with its sentence. What it had read is dropped.
[[nodiscard]] TQL::IResult StoppedReading(std::string& o_rError);

} // namespace Recordings

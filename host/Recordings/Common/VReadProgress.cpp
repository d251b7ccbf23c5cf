#include "Recordings/Common/VReadProgress.h"

#include <algorithm>

namespace Recordings
{

bool VReadProgress::Tell(std::size_t i_Done, std::size_t i_Total)
{
    m_bStopped = m_bStopped || (m_pStop && m_pStop->load(std::memory_order_relaxed));
    const double fraction =
        i_Total == 0 ? 1.0 : std::min(1.0, static_cast<double>(i_Done) / static_cast<double>(i_Total));
    const auto step = static_cast<std::size_t>(fraction * static_cast<double>(Steps));
    if (m_bStopped || step < m_Next)
        return !m_bStopped;
    m_Next = step + 1;
    m_bStopped = m_Listener && !m_Listener(fraction);
    return !m_bStopped;
}

TQL::IResult StoppedReading(std::string& o_rError)
{
    o_rError = "reading was cancelled.";
    return TQL::Result::Canceled;
}

} // namespace Recordings

#pragma once

#include "NotificationSystem/VMultiCallbackPostal.h"
#include "TQL/Log.h"

#include <cstddef>
#include <cstdio>
#include <deque>
#include <memory>
#include <mutex>
#include <string>
#include <vector>

namespace Services
{

/// One line of the log as a person reads it: "error GraphPlot: text".
std::string FormatLogLine(const TQL::LogMessage& i_rMessage);

/// The host's receiver of the global log: writes each message to a stream and keeps the newest lines for a panel.
/// Receives while it lives. Any thread.
class VGlobalLogSink
{
public:
    struct Line
    {
        TQL::ELogSeverity Severity;
        std::string Text;
    };

    /// Keeps the newest i_LineLimit lines. LinesChanged is raised through i_pPostalService, null raises nothing. A null
    /// stream writes nothing.
    VGlobalLogSink(std::size_t i_LineLimit, std::shared_ptr<TQL::IPostalService> i_pPostalService,
                   std::FILE* i_pStream = stderr);

    std::vector<Line> Lines() const; ///< oldest first

    /// There are new lines. Raised on the postal service, once for a burst.
    std::shared_ptr<TQL::IChangeSignal> LinesChanged() const;

private:
    class State;
    std::shared_ptr<State> m_pState;
    std::shared_ptr<void> m_pReceiver;
};

} // namespace Services

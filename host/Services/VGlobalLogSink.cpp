#include "Services/VGlobalLogSink.h"

#include "Services/Postal/VDeferredSignal.h"

#include <optional>

namespace Services
{
namespace
{

const char* SeverityText(TQL::ELogSeverity i_Severity)
{
    switch (i_Severity)
    {
    case TQL::ELogSeverity::Error:
        return "error";
    case TQL::ELogSeverity::Warning:
        return "warning";
    case TQL::ELogSeverity::Information:
        return "info";
    case TQL::ELogSeverity::Detail:
        return "detail";
    }
    return "?";
}

} // namespace

std::string FormatLogLine(const TQL::LogMessage& i_rMessage)
{
    std::string line = SeverityText(i_rMessage.Severity);
    line.append(" ").append(i_rMessage.Category).append(": ").append(i_rMessage.Text);
    return line;
}

class VGlobalLogSink::State
{
public:
    State(std::size_t i_LineLimit, const std::shared_ptr<TQL::IPostalService>& i_rpPostalService, std::FILE* i_pStream)
        : m_LineLimit(i_LineLimit)
        , m_bRaises(i_rpPostalService != nullptr)
        , m_LinesSignal(i_rpPostalService)
        , m_pStream(i_pStream)
    {
    }

    /// The log calls one receiver at a time, so the stream needs no lock of its own.
    void Receive(const TQL::LogMessage& i_rMessage)
    {
        std::string text = FormatLogLine(i_rMessage);
        if (m_pStream)
            std::fprintf(m_pStream, "%s\n", text.c_str());
        {
            const std::lock_guard lock(m_Mutex);
            m_Lines.push_back({i_rMessage.Severity, std::move(text)});
            while (m_Lines.size() > m_LineLimit)
                m_Lines.pop_front();
        }
        if (m_bRaises)
            m_LinesSignal.RaiseLater();
    }

    std::vector<Line> Lines() const
    {
        const std::lock_guard lock(m_Mutex);
        return {m_Lines.begin(), m_Lines.end()};
    }

    const std::shared_ptr<NotificationSystem::VChangeSignal>& LinesChanged() const { return m_LinesSignal.Signal(); }

private:
    const std::size_t m_LineLimit;
    const bool m_bRaises;
    const VDeferredSignal m_LinesSignal;
    std::FILE* const m_pStream;
    mutable std::mutex m_Mutex;
    std::deque<Line> m_Lines; // guarded by m_Mutex
};

VGlobalLogSink::VGlobalLogSink(std::size_t i_LineLimit, std::shared_ptr<TQL::IPostalService> i_pPostalService,
                               std::FILE* i_pStream)
    : m_pState(std::make_shared<State>(i_LineLimit, i_pPostalService, i_pStream))
    , m_pReceiver(
          TQL::Log::AddSink([pState = m_pState](const TQL::LogMessage& i_rMessage) { pState->Receive(i_rMessage); }))
{
}

std::vector<VGlobalLogSink::Line> VGlobalLogSink::Lines() const
{
    return m_pState->Lines();
}

std::shared_ptr<TQL::IChangeSignal> VGlobalLogSink::LinesChanged() const
{
    return m_pState->LinesChanged();
}

} // namespace Services

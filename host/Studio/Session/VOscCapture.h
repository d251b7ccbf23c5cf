#pragma once

#include "Streaming/VOscInput.h"
#include "TQL/IPostalService.h"
#include "TQL/IResult.h"

#include <cstdint>
#include <functional>
#include <memory>
#include <string>

namespace Channels
{
class VLiveContext;
class VSubTypeTable;
} // namespace Channels

namespace Studio
{

/// Live input over Open Sound Control as the session has it: what its thread does is told on the UI thread, and nothing
/// any more once this is destroyed. What was left out goes to the log. Owned by the session; UI thread.
class VOscCapture
{
public:
    /// Gets the live context: when there is one, and again when channels were added to it. UI thread, never inside a
    /// call of this class.
    using Show = std::function<void(const std::shared_ptr<Channels::VLiveContext>& i_rpContext)>;

    /// Gets a sentence for the operator: data were left out. Not more often than every half minute; the log has all. UI
    /// thread.
    using Warn = std::function<void(const std::string& i_rText)>;

    VOscCapture(const Streaming::VOscInput::Options& i_rOptions, std::shared_ptr<Channels::VSubTypeTable> i_pSubTypes,
                std::shared_ptr<TQL::IPostalService> i_pUi, Show i_Show, Warn i_Warn);
    ~VOscCapture();
    VOscCapture(const VOscCapture&) = delete;
    VOscCapture& operator=(const VOscCapture&) = delete;

    /// On failure o_rError is one line that says what to do.
    [[nodiscard]] TQL::IResult Start(std::string& o_rError) { return m_pInput->Start(o_rError); }

    void SetPaused(bool i_bPaused) { m_pInput->SetPaused(i_bPaused); }
    bool IsPaused() const { return m_pInput->IsPaused(); }
    std::uint16_t Port() const { return m_pInput->Port(); }
    std::uint64_t MessageCount() const { return m_pInput->MessageCount(); }

private:
    struct Shared; ///< with the jobs that are posted

    const std::shared_ptr<Shared> m_pShared;
    std::unique_ptr<Streaming::VOscInput> m_pInput; // goes first: its thread uses the other
};

} // namespace Studio

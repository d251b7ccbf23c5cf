#pragma once

#include "GraphPlotSystem/Texts/IChannelComponentControls.h"
#include "NotificationSystem/VMultiCallbackPostal.h"

#include <memory>
#include <mutex>

namespace TQL
{
class IChannelTextProvider;
}

namespace GraphPlotUI
{

/// Remembers which components of which channel subtype the operator has switched off, for the life of a window and in
/// its saved state. Asks the text provider how many components a subtype has, never with its own mutex held. Held by
/// the graph plot system; written on the UI thread, read on any.
class VChannelComponentControls : public TQL::IChannelComponentControls
{
public:
    VChannelComponentControls(std::shared_ptr<TQL::IChannelTextProvider> i_pTextProvider,
                              std::shared_ptr<TQL::IPostalService> i_pUiPostalService);

    bool IsComponentEnabled(std::uint64_t i_SubType, std::uint64_t i_Component) const override;
    TQL::IResult SetComponentEnabled(std::uint64_t i_SubType, std::uint64_t i_Component, bool i_bEnabled) override;
    TQL::IResult SetChannelComponentsEnabled(std::uint64_t i_SubType, bool i_bEnabled) override;
    TQL::VDisabledComponents GetDisabledComponents(std::uint64_t i_SubType) const override;
    void GetEnabledComponents(std::uint64_t i_SubType, std::vector<std::uint64_t>& o_rComponents) const override;
    TQL::DisabledComponentsTable GetDisabledTable() const override;
    void FilterTraces(std::vector<TQL::ITraceId>& io_rTraces) const override;
    void SetDisabledTable(TQL::DisabledComponentsTable i_Table) override;
    std::shared_ptr<TQL::IChangeSignal> Changed() const override { return m_pChanged; }

private:
    /// The entry of a subtype, made, with the given line in the log, when there is none.
    TQL::VDisabledComponents& EnsureEntryLocked(std::uint64_t i_SubType, const char* i_pLogFormat);
    bool IsEnabledLocked(std::uint64_t i_SubType, std::uint64_t i_Component) const;

    const std::shared_ptr<TQL::IChannelTextProvider> m_pTextProvider;
    const std::shared_ptr<NotificationSystem::VChangeSignal> m_pChanged;
    mutable std::mutex m_Mutex;
    TQL::DisabledComponentsTable m_Disabled; // guarded by m_Mutex; entries that became empty stay
};

} // namespace GraphPlotUI

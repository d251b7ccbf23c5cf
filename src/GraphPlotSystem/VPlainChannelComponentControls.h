#pragma once

#include "GraphPlotSystem/IChannelComponentControls.h"
#include "NotificationSystem/VMultiCallbackPostal.h"

#include <mutex>
#include <set>
#include <utility>

namespace TQL
{
class IChannelTextProvider;
}

namespace GraphPlotUI
{

/// Component switches kept in memory: every component is on unless it was switched off. Held by the graph plot system
/// of a window that has no component list of its own. The subtype 0 stands for "unknown" and cannot be switched.
class VPlainChannelComponentControls : public TQL::IChannelComponentControls
{
public:
    VPlainChannelComponentControls(std::shared_ptr<TQL::IChannelTextProvider> i_pTextProvider,
                                   std::shared_ptr<TQL::IPostalService> i_pUiPostalService);

    bool IsComponentEnabled(std::uint64_t i_SubType, std::uint64_t i_Component) const override;
    void SetComponentEnabled(std::uint64_t i_SubType, std::uint64_t i_Component, bool i_bEnabled) override;
    void GetEnabledComponents(std::uint64_t i_SubType, std::vector<std::uint64_t>& o_rComponents) const override;
    std::shared_ptr<TQL::IChangeSignal> Changed() const override { return m_pChanged; }

private:
    const std::shared_ptr<TQL::IChannelTextProvider> m_pTextProvider;
    const std::shared_ptr<NotificationSystem::VChangeSignal> m_pChanged;
    mutable std::mutex m_Mutex;
    std::set<std::pair<std::uint64_t, std::uint64_t>> m_Disabled; // guarded by m_Mutex; (subtype, component)
};

} // namespace GraphPlotUI

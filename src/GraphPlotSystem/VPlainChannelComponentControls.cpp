#include "GraphPlotSystem/VPlainChannelComponentControls.h"

#include "GraphPlotSystem/IChannelTextProvider.h"

namespace GraphPlotUI
{

VPlainChannelComponentControls::VPlainChannelComponentControls(
    std::shared_ptr<TQL::IChannelTextProvider> i_pTextProvider, std::shared_ptr<TQL::IPostalService> i_pUiPostalService)
    : m_pTextProvider(std::move(i_pTextProvider))
    , m_pChanged(std::make_shared<NotificationSystem::VChangeSignal>(std::move(i_pUiPostalService)))
{
}

bool VPlainChannelComponentControls::IsComponentEnabled(std::uint64_t i_SubType, std::uint64_t i_Component) const
{
    const std::lock_guard lock(m_Mutex);
    return !m_Disabled.contains({i_SubType, i_Component});
}

void VPlainChannelComponentControls::SetComponentEnabled(std::uint64_t i_SubType, std::uint64_t i_Component,
                                                         bool i_bEnabled)
{
    if (i_SubType == 0)
        return;
    bool bChanged = false;
    {
        const std::lock_guard lock(m_Mutex);
        bChanged = i_bEnabled ? m_Disabled.erase({i_SubType, i_Component}) != 0
                              : m_Disabled.insert({i_SubType, i_Component}).second;
    }
    if (bChanged)
        m_pChanged->Invoke();
}

void VPlainChannelComponentControls::GetEnabledComponents(std::uint64_t i_SubType,
                                                          std::vector<std::uint64_t>& o_rComponents) const
{
    const std::uint64_t count = m_pTextProvider->GetComponentCount(i_SubType);
    o_rComponents.clear();
    const std::lock_guard lock(m_Mutex);
    for (std::uint64_t component = 0; component < count; ++component)
        if (!m_Disabled.contains({i_SubType, component}))
            o_rComponents.push_back(component);
}

} // namespace GraphPlotUI

#include "GraphPlotSystem/Texts/VChannelComponentControls.h"

#include "GraphPlotSystem/Texts/IChannelTextProvider.h"
#include "TQL/ITraceId.h"
#include "TQL/Log.h"

#include <algorithm>
#include <utility>

namespace GraphPlotUI
{
namespace
{

constexpr std::size_t s_FirstBuckets = 8;

} // namespace

VChannelComponentControls::VChannelComponentControls(std::shared_ptr<TQL::IChannelTextProvider> i_pTextProvider,
                                                     std::shared_ptr<TQL::IPostalService> i_pUiPostalService)
    : m_pTextProvider(std::move(i_pTextProvider))
    , m_pChanged(std::make_shared<NotificationSystem::VChangeSignal>(std::move(i_pUiPostalService)))
    , m_Disabled(s_FirstBuckets)
{
}

TQL::VDisabledComponents& VChannelComponentControls::EnsureEntryLocked(std::uint64_t i_SubType,
                                                                       const char* i_pLogFormat)
{
    const auto found = m_Disabled.find(i_SubType);
    if (found != m_Disabled.end())
        return found->second;
    TQL::Log::Format(TQL::Log::GetCategory("GraphPlot"), TQL::ELogSeverity::Detail, i_pLogFormat, i_SubType);
    return m_Disabled.try_emplace(i_SubType, s_FirstBuckets).first->second;
}

bool VChannelComponentControls::IsEnabledLocked(std::uint64_t i_SubType, std::uint64_t i_Component) const
{
    const auto found = m_Disabled.find(i_SubType);
    return found == m_Disabled.end() || !found->second.contains(i_Component);
}

bool VChannelComponentControls::IsComponentEnabled(std::uint64_t i_SubType, std::uint64_t i_Component) const
{
    const std::lock_guard lock(m_Mutex);
    return IsEnabledLocked(i_SubType, i_Component);
}

TQL::IResult VChannelComponentControls::SetComponentEnabled(std::uint64_t i_SubType, std::uint64_t i_Component,
                                                            bool i_bEnabled)
{
    if (i_SubType == 0)
        return TQL::Result::InvalidId;
    bool bChanged = false;
    {
        const std::lock_guard lock(m_Mutex);
        TQL::VDisabledComponents& rEntry =
            EnsureEntryLocked(i_SubType, "SetComponentEnabled: creating disabled components for channel subtype %1%");
        bChanged = i_bEnabled ? rEntry.erase(i_Component) != 0 : rEntry.insert(i_Component).second;
    }
    if (bChanged)
        m_pChanged->Invoke();
    return TQL::Result::Ok;
}

TQL::IResult VChannelComponentControls::SetChannelComponentsEnabled(std::uint64_t i_SubType, bool i_bEnabled)
{
    if (i_SubType == 0)
        return TQL::Result::InvalidId;
    TQL::VDisabledComponents disabled(s_FirstBuckets);
    for (std::uint64_t count = i_bEnabled ? 0 : m_pTextProvider->GetComponentCount(i_SubType), i = 0; i < count; ++i)
        disabled.insert(i);
    bool bChanged = false;
    {
        const std::lock_guard lock(m_Mutex);
        TQL::VDisabledComponents& rEntry = EnsureEntryLocked(
            i_SubType, "SetChannelComponentsEnabled: creating disabled components for channel subtype %1%");
        bChanged = rEntry != disabled;
        rEntry = std::move(disabled);
    }
    if (bChanged)
        m_pChanged->Invoke();
    return TQL::Result::Ok;
}

TQL::VDisabledComponents VChannelComponentControls::GetDisabledComponents(std::uint64_t i_SubType) const
{
    const std::lock_guard lock(m_Mutex);
    const auto found = m_Disabled.find(i_SubType);
    return found == m_Disabled.end() ? TQL::VDisabledComponents() : found->second;
}

void VChannelComponentControls::GetEnabledComponents(std::uint64_t i_SubType,
                                                     std::vector<std::uint64_t>& o_rComponents) const
{
    const std::uint64_t count = m_pTextProvider->GetComponentCount(i_SubType);
    o_rComponents.clear();
    const std::lock_guard lock(m_Mutex);
    for (std::uint64_t component = 0; component < count; ++component)
        if (IsEnabledLocked(i_SubType, component))
            o_rComponents.push_back(component);
}

TQL::DisabledComponentsTable VChannelComponentControls::GetDisabledTable() const
{
    const std::lock_guard lock(m_Mutex);
    return m_Disabled;
}

void VChannelComponentControls::FilterTraces(std::vector<TQL::ITraceId>& io_rTraces) const
{
    std::vector<std::uint64_t> subTypes;
    subTypes.reserve(io_rTraces.size());
    for (const TQL::ITraceId& rTrace : io_rTraces)
        subTypes.push_back(m_pTextProvider->GetSubTypeId(rTrace.Channel()));
    const std::lock_guard lock(m_Mutex);
    std::size_t kept = 0;
    for (std::size_t i = 0; i < io_rTraces.size(); ++i)
        if (IsEnabledLocked(subTypes[i], io_rTraces[i].Component()))
            std::swap(io_rTraces[kept++], io_rTraces[i]);
    io_rTraces.resize(kept);
}

void VChannelComponentControls::SetDisabledTable(TQL::DisabledComponentsTable i_Table)
{
    {
        const std::lock_guard lock(m_Mutex);
        if (m_Disabled == i_Table)
            return;
        m_Disabled = std::move(i_Table);
    }
    m_pChanged->Invoke();
}

} // namespace GraphPlotUI

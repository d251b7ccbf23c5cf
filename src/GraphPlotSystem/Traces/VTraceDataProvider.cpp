#include "GraphPlotSystem/Traces/VTraceDataProvider.h"

#include "ChannelSystem/IChannelBlock.h"
#include "CoreGraphics/Texture2D.h"

#include <utility>

namespace GraphPlotUI
{

using TQL::IChannelInstanceId;
using TQL::ITraceId;

VTraceDataProvider::VTraceDataProvider(std::shared_ptr<TQL::IPostalService> i_pUiPostalService)
    : m_pDataChanged(std::make_shared<NotificationSystem::VChangeSignal>(i_pUiPostalService))
    , m_pValueRangeChanged(std::make_shared<NotificationSystem::VChangeSignal>(i_pUiPostalService))
    , m_pColoursChanged(std::make_shared<NotificationSystem::VChangeSignal>(i_pUiPostalService))
    , m_pInspectionChanged(std::make_shared<NotificationSystem::VChangeSignal>(std::move(i_pUiPostalService)))
{
}

VTraceDataProvider::~VTraceDataProvider() = default;

void VTraceDataProvider::GetTicksPerFrame(std::int64_t& o_rTicks) const
{
    const std::lock_guard lock(m_Mutex);
    o_rTicks = m_TicksPerFrame;
}

std::int64_t VTraceDataProvider::GetLatestFrameIndex() const
{
    const std::lock_guard lock(m_Mutex);
    return m_LatestFrame;
}

void VTraceDataProvider::SetTicksPerFrame(std::int64_t i_Ticks)
{
    const std::lock_guard lock(m_Mutex);
    if (std::exchange(m_TicksPerFrame, i_Ticks) != i_Ticks)
        ++m_Revision;
}

void VTraceDataProvider::SetLatestFrame(std::int64_t i_Frame)
{
    const std::lock_guard lock(m_Mutex);
    if (std::exchange(m_LatestFrame, i_Frame) != i_Frame)
        ++m_Revision;
}

void VTraceDataProvider::UpdateTrace(const IChannelInstanceId& i_rChannel, const ChannelSystem::IChannelBlock& i_rBlock,
                                     const TQL::TickRange& i_rRequested, const TQL::TickRange& i_rLimit,
                                     std::uint8_t i_Level)
{
    ValueChange change;
    {
        const std::lock_guard lock(m_Mutex);
        TraceRecord& rRecord = m_Records[i_rChannel];
        if (rRecord.bDeleted)
            return;
        TQL::TickRange available;
        i_rBlock.GetRange(available);
        change = UpdateValueTable(m_Values[i_rChannel], i_rChannel, i_rBlock, available);
        const RingExtent extent = rRecord.Ring.Extent;
        const RingSource source = rRecord.Ring.Source;
        UpdateRing(rRecord.Ring, m_Scratch, i_rBlock, available, i_rRequested, i_rLimit, i_Level);
        if (extent != rRecord.Ring.Extent || source != rRecord.Ring.Source)
            ++m_Revision;
    }
    if (change.bComponentAdded)
        m_pDataChanged->Invoke();
    else if (change.bRangeChanged)
        m_pValueRangeChanged->Invoke();
}

void VTraceDataProvider::ForgetChannelLocked(const IChannelInstanceId& i_rChannel)
{
    ++m_Revision;
    m_Colours.Release(i_rChannel);
    const auto [first, last] = m_Inspectors.equal_range(i_rChannel);
    m_Inspectors.erase(first, last);
    if (const auto found = m_Records.find(i_rChannel); found != m_Records.end())
        found->second.bDeleted = true;
}

void VTraceDataProvider::RemoveTraces(const ChannelPredicate& i_rPredicate)
{
    bool bRemoved = false;
    {
        const std::lock_guard lock(m_Mutex);
        for (auto it = m_Values.begin(); it != m_Values.end();)
        {
            if (!i_rPredicate(it->first))
            {
                ++it;
                continue;
            }
            ForgetChannelLocked(it->first);
            it = m_Values.erase(it);
            bRemoved = true;
        }
    }
    if (!bRemoved)
        return;
    m_pDataChanged->Invoke();
    m_pColoursChanged->Invoke();
    m_pInspectionChanged->Invoke();
}

void VTraceDataProvider::RemoveTrace(const IChannelInstanceId& i_rChannel)
{
    {
        const std::lock_guard lock(m_Mutex);
        const auto found = m_Values.find(i_rChannel);
        if (found == m_Values.end())
            return;
        ForgetChannelLocked(i_rChannel);
        m_Values.erase(found);
    }
    m_pDataChanged->Invoke();
    m_pColoursChanged->Invoke();
    m_pInspectionChanged->Invoke();
}

void VTraceDataProvider::Clear()
{
    {
        const std::lock_guard lock(m_Mutex);
        for (auto& [rChannel, rRecord] : m_Records)
            rRecord.bDeleted = true;
        ++m_Revision;
        m_Values.clear();
        m_Colours.Reset();
        m_Inspectors.clear();
    }
    m_pDataChanged->Invoke();
    m_pColoursChanged->Invoke();
    m_pInspectionChanged->Invoke();
}

void VTraceDataProvider::GetTraces(std::vector<ITraceId>& o_rTraces) const
{
    const std::lock_guard lock(m_Mutex);
    o_rTraces.clear();
    for (const auto& [rChannel, rTable] : m_Values)
        for (std::size_t c = 0; c < rTable.Components.size(); ++c)
            o_rTraces.emplace_back(rChannel, static_cast<std::uint8_t>(c));
}

std::size_t VTraceDataProvider::GetTraceCount() const
{
    const std::lock_guard lock(m_Mutex);
    std::size_t count = 0;
    for (const auto& [rChannel, rTable] : m_Values)
        count += rTable.Components.size();
    return count;
}

void VTraceDataProvider::GetValueRange(ValueRange& o_rRange, std::span<const ITraceId> i_Traces) const
{
    TraceValueRange sum;
    {
        const std::lock_guard lock(m_Mutex);
        for (const ITraceId& rTrace : i_Traces)
            if (const auto found = m_Values.find(rTrace.Channel());
                found != m_Values.end() && rTrace.Component() < found->second.Components.size())
                CombineRanges(sum, found->second.Components[rTrace.Component()]);
    }
    o_rRange = PadRange(sum);
}

std::shared_ptr<TQL::IChangeSignal> VTraceDataProvider::DataChanged() const
{
    return m_pDataChanged;
}

std::shared_ptr<TQL::IChangeSignal> VTraceDataProvider::ValueRangeChanged() const
{
    return m_pValueRangeChanged;
}

std::shared_ptr<TQL::IChangeSignal> VTraceDataProvider::ColoursChanged() const
{
    return m_pColoursChanged;
}

std::shared_ptr<TQL::IChangeSignal> VTraceDataProvider::InspectionChanged() const
{
    return m_pInspectionChanged;
}

} // namespace GraphPlotUI

// What the models of the user interface ask for: colours, and the inspection of traces.
#include "GraphPlotSystem/Traces/VTraceDataProvider.h"

#include "GraphPlotSystem/Traces/TraceTimeRules.h"

#include <algorithm>
#include <cmath>

namespace GraphPlotUI
{

using TQL::IChannelInstanceId;
using TQL::IResult;
using TQL::ITraceId;
namespace Result = TQL::Result;

void VTraceDataProvider::SetPalette(std::span<const Colour4f> i_Colours)
{
    {
        const std::lock_guard lock(m_Mutex);
        if (!m_Colours.SetPalette(i_Colours))
            return;
        ++m_Revision;
    }
    m_pColoursChanged->Invoke();
}

void VTraceDataProvider::ResetColours()
{
    {
        const std::lock_guard lock(m_Mutex);
        m_Colours.Reset();
        ++m_Revision;
    }
    m_pColoursChanged->Invoke();
}

void VTraceDataProvider::AssignChannelColour(IResult& o_rResult, const ITraceId& i_rTrace,
                                             std::uint32_t i_ComponentCount)
{
    {
        const std::lock_guard lock(m_Mutex);
        o_rResult = m_Colours.AssignChannel(i_rTrace, i_ComponentCount);
        if (o_rResult == Result::Ok)
            ++m_Revision;
    }
    if (o_rResult == Result::Ok)
        m_pColoursChanged->Invoke();
}

void VTraceDataProvider::AssignTraceColour(IResult& o_rResult, const ITraceId& i_rTrace)
{
    AssignChannelColour(o_rResult, i_rTrace, 0);
}

void VTraceDataProvider::GetTraceColour(Colour4f& o_rColour, const ITraceId& i_rTrace) const
{
    const std::lock_guard lock(m_Mutex);
    o_rColour = m_Colours.Find(i_rTrace);
}

void VTraceDataProvider::SetInspectedTraces(IResult& o_rResult, std::span<const ITraceId> i_Traces)
{
    const std::lock_guard lock(m_Mutex);
    m_Inspected.clear();
    m_Inspected.insert(i_Traces.begin(), i_Traces.end());
    o_rResult = Result::Ok;
}

void VTraceDataProvider::RemoveInspectedTraces(IResult& o_rResult, std::span<const ITraceId> i_Traces)
{
    const std::lock_guard lock(m_Mutex);
    for (const ITraceId& rTrace : i_Traces)
        m_Inspected.erase(rTrace);
    o_rResult = Result::Ok;
}

void VTraceDataProvider::ClearInspectedTraces()
{
    const std::lock_guard lock(m_Mutex);
    m_Inspected.clear();
}

void VTraceDataProvider::SetInspectionTime(double i_Frames)
{
    if (std::isnan(i_Frames))
        return;
    const std::lock_guard lock(m_Mutex);
    m_InspectionOffset = SaturatedFramesToTicks(i_Frames, m_TicksPerFrame);
}

void VTraceDataProvider::GetInspectionValues(IResult& o_rResult, std::span<const ITraceId> i_Traces,
                                             std::span<TraceInspectionValues> o_Values, float& o_rProgress)
{
    o_rResult = i_Traces.size() == o_Values.size() ? Result::Ok : Result::InvalidArgument;
    if (o_rResult.IsError())
        return;
    o_rProgress = 1.0f;
    const std::lock_guard lock(m_Mutex);
    for (std::size_t i = 0; i < i_Traces.size(); ++i)
    {
        const auto found = m_Inspectors.find(i_Traces[i]);
        if (found == m_Inspectors.end())
        {
            o_Values[i].bValid = false;
            continue;
        }
        o_rProgress = std::min(o_rProgress, static_cast<float>(found->second.Progress()));
        o_Values[i] = found->second.Values();
    }
}

void VTraceDataProvider::InspectTrace(const IChannelInstanceId& i_rChannel,
                                      const ChannelSystem::IChannelBlock& i_rBlock, std::int64_t i_BaseTick,
                                      std::int64_t i_WindowSamples)
{
    bool bChanged = false;
    {
        const std::lock_guard lock(m_Mutex);
        const std::int64_t tick = m_InspectionOffset + i_BaseTick;
        const auto [first, last] = m_Inspected.equal_range(i_rChannel);
        for (auto it = first; it != last; ++it)
        {
            VTraceInspector& rInspector = m_Inspectors[*it];
            const std::uint32_t component = it->Component();
            bChanged = rInspector.UpdateValue(i_rBlock, component, tick, m_InspectionScratch) || bChanged;
            bChanged = rInspector.UpdateWindow(i_rBlock, component, i_WindowSamples, m_InspectionScratch) || bChanged;
        }
    }
    if (bChanged)
        m_pInspectionChanged->Invoke();
}

} // namespace GraphPlotUI

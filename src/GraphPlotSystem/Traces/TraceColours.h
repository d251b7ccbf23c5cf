#pragma once

#include "GraphPlotSystem/Traces/TraceRenderInfo.h"
#include "TQL/IResult.h"
#include "TQL/ITraceId.h"

#include <cstddef>
#include <cstdint>
#include <set>
#include <span>
#include <unordered_map>
#include <vector>

namespace GraphPlotUI
{

/// Which trace has which colour of the palette. A new trace gets the first colour that no other has; the components of
/// one channel may share one. Owned by the trace data provider, used under its mutex.
class TraceColours
{
public:
    static constexpr Colour4f Unassigned = {0.5f, 0.5f, 0.5f, 1.0f};

    TraceColours();

    /// A palette that differs takes all colours away. True when it did.
    bool SetPalette(std::span<const Colour4f> i_Colours);

    /// Takes all colours away.
    void Reset();

    /// The first free colour, for the trace and for those of components 1 to i_ComponentCount - 1 of its channel that
    /// have none. OkButNoEffect when the trace has a colour, NotAvailable when none is free.
    TQL::IResult AssignChannel(const TQL::ITraceId& i_rTrace, std::uint32_t i_ComponentCount);
    TQL::IResult Assign(const TQL::ITraceId& i_rTrace) { return AssignChannel(i_rTrace, 0); }

    /// Frees the colours of every component of the channel. True when there was one.
    bool Release(const TQL::IChannelInstanceId& i_rChannel);

    /// Unassigned for a trace without a colour.
    Colour4f Find(const TQL::ITraceId& i_rTrace) const;

    /// Moves with every change of what Find gives. Never 0.
    std::uint64_t Generation() const { return m_Generation; }

private:
    std::vector<Colour4f> m_Palette;
    std::set<std::size_t> m_Free;
    std::unordered_map<TQL::ITraceId, std::size_t, TQL::TraceIdHash> m_Assigned;
    std::uint64_t m_Generation = 1;
};

} // namespace GraphPlotUI

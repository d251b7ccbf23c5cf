#pragma once

#include "GraphPlotSystem/Traces/TraceRenderInfo.h"
#include "TQL/IChannelInstanceId.h"
#include "TQL/IResult.h"
#include "TQL/ITraceId.h"

#include <cstdint>
#include <span>

namespace CoreGraphics
{
class RenderContext;
}

namespace TQL
{

/// The plotted data of one window as the renderer and the models see them. Thread-safe. The operations that take a
/// RenderContext run on the render thread with its OpenGL context current.
class ITraceDataProvider
{
public:
    virtual void GetTicksPerFrame(std::int64_t& o_rTicks) const = 0;
    virtual std::int64_t GetLatestFrameIndex() const = 0;

    /// Counts every change of what a frame shows: rows, colours, the clock, traces that wait for their release. A frame
    /// whose UpdateTextures comes after this shows at least what was counted.
    virtual std::uint64_t GetRevision() const = 0;

    /// Once a frame, before anything draws: uploads the rows that changed and releases what was removed.
    virtual void UpdateTextures(CoreGraphics::RenderContext& i_rContext) = 0;

    /// Destroys all texture objects while their context is current; the next UpdateTextures uploads everything anew.
    virtual void ReleaseTextures() = 0;

    /// NotFound without a record for the channel, NotAvailable for one that waits for its release.
    virtual void BindTraceTexture(IResult& o_rResult, const IChannelInstanceId& i_rChannel,
                                  CoreGraphics::RenderContext& i_rContext, unsigned i_TextureUnit) = 0;
    virtual void GetTraceRenderInfo(IResult& o_rResult, const IChannelInstanceId& i_rChannel,
                                    GraphPlotUI::TraceRenderInfo& o_rInfo) const = 0;

    /// A palette that differs from the present one takes all colours away.
    virtual void SetPalette(std::span<const GraphPlotUI::Colour4f> i_Colours) = 0;

    /// The smallest free colour, for the trace and for components 1 to i_ComponentCount - 1 of its channel.
    /// OkButNoEffect when the trace has a colour, NotAvailable when none is free.
    virtual void AssignChannelColour(IResult& o_rResult, const ITraceId& i_rTrace, std::uint32_t i_ComponentCount) = 0;
    virtual void AssignTraceColour(IResult& o_rResult, const ITraceId& i_rTrace) = 0;
    virtual void GetTraceColour(GraphPlotUI::Colour4f& o_rColour, const ITraceId& i_rTrace) const = 0;
    virtual void ResetColours() = 0;

    virtual ~ITraceDataProvider() = default;
};

} // namespace TQL

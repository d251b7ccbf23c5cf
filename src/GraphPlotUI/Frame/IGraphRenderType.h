#pragma once

#include <cstdint>
#include <functional>
#include <memory>

namespace CoreGraphics
{
class RenderContext;
class Resources;
} // namespace CoreGraphics

namespace GraphPlotUI
{

/// Something that draws into the framebuffer of a graph window, a subplot or an axis, as the renderer sees it. Owned by
/// the QML scene.
class IGraphRenderType
{
public:
    using DestroyedCallback = std::function<void(IGraphRenderType*)>;

    virtual ~IGraphRenderType() = default;

    /// Stored, and called with this object when it is destroyed; an empty function forgets the former. GUI thread.
    virtual void SetDestroyedCallback(DestroyedCallback i_Callback) = 0;

    /// Counts every change of this object that Render shows. GUI thread.
    virtual std::uint64_t GetRevision() const = 0;

    /// The three below: render thread, OpenGL context current. Initialise comes once, before the first Render.
    virtual bool IsInitialised() const = 0;
    virtual void Initialise(std::shared_ptr<CoreGraphics::Resources> i_pResources) = 0;
    virtual void Render(CoreGraphics::RenderContext& i_rContext) = 0;
};

} // namespace GraphPlotUI

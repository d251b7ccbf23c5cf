#pragma once

#include "GraphPlotUI/Frame/IGraphRenderType.h"

#include <QtCore/QPointer>
#include <QtQuick/QQuickFramebufferObject>

#include <cstdint>
#include <vector>

namespace GraphPlotUI
{

class VGraphPlotContext;

/// The item (QML type GraphPlotFBO) through whose framebuffer all graphs of a window are drawn. Knows the render types
/// of the scene in the order of their registration; does not own them. GUI thread; the renderer uses it only while the
/// GUI thread waits. Its `updateIfChanged` asks for a frame, it does not ask by itself.
class VGraphPlotFBO : public QQuickFramebufferObject
{
    Q_OBJECT
    Q_PROPERTY(QObject* graphPlotContext READ GetGraphPlotContextObject WRITE SetGraphPlotContext NOTIFY
                   graphPlotContextChanged)

public:
    explicit VGraphPlotFBO(QQuickItem* i_pParent = nullptr);
    ~VGraphPlotFBO() override;

    Renderer* createRenderer() const override;

    QObject* GetGraphPlotContextObject() const;
    /// Null and the present value are ignored; an object of another class leaves the item without a context.
    void SetGraphPlotContext(QObject* i_pContext);

    /// Adds a VBaseGraphRenderType until it is destroyed. Ignored for any other object and for one already there.
    Q_INVOKABLE void registerRenderType(QObject* i_pRenderType);

    /// Asks for a frame where one would show something else than the last that was begun, and where it would be seen:
    /// none while the item or its window is hidden, or the window minimised. A change stays one until a frame has begun
    /// that shows it, so that none is lost however often this is called in between.
    Q_INVOKABLE void updateIfChanged();

    /// A frame begins with what the item and its provider hold now. By the renderer.
    void NoteFrame() { m_Shown = FindContents(); }

    VGraphPlotContext* GetGraphPlotContext() const;
    const std::vector<IGraphRenderType*>& GetRenderTypes() const { return m_RenderTypes; }
    /// Counts every change of the list of render types.
    std::uint64_t GetGeneration() const { return m_Generation; }

Q_SIGNALS:
    void graphPlotContextChanged();

protected:
    QSGNode* updatePaintNode(QSGNode* i_pNode, UpdatePaintNodeData* i_pData) override;

private:
    /// What a frame depends on, beside the size of the item, for which Qt Quick asks by itself. Nothing at first.
    struct Contents
    {
        const VGraphPlotContext* pContext = nullptr;
        std::uint64_t Generation = 0;
        std::uint64_t RenderTypes = 0; ///< the sum of their revisions
        std::uint64_t Data = 0;        ///< revision of the provider

        friend bool operator==(const Contents&, const Contents&) = default;
    };

    Contents FindContents() const;
    bool IsSeen() const;
    void RemoveRenderType(IGraphRenderType* i_pRenderType);

    bool m_bMultisample = false;
    QPointer<VGraphPlotContext> m_pContext;
    IGraphRenderType::DestroyedCallback m_RemovalFunction;
    std::vector<IGraphRenderType*> m_RenderTypes;
    std::uint64_t m_Generation = 0;
    Contents m_Shown; ///< by the last frame that was begun
};

} // namespace GraphPlotUI

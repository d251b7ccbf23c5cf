#pragma once

#include "GraphPlotUI/Frame/IGraphRenderType.h"

#include <QtCore/QRectF>
#include <QtGui/QMatrix4x4>
#include <QtQuick/QQuickItem>

#include <memory>

namespace TQL
{
class ITraceDataProvider;
}

namespace GraphPlotUI
{

/// Base of everything that draws into a GraphPlotFBO: a QML item without scene graph content of its own, which draws in
/// the renderer's pass, clipped by its own viewport. Owned by the QML scene; properties on the GUI thread, Render and
/// Initialise on the render thread. Render must not emit signals or change properties: it posts them with
/// QMetaObject::invokeMethod and Qt::QueuedConnection.
class VBaseGraphRenderType : public QQuickItem, public IGraphRenderType
{
    Q_OBJECT
    Q_PROPERTY(QRectF screenRect READ GetScreenRect WRITE SetScreenRect NOTIFY ScreenRectChanged)
    Q_PROPERTY(
        double devicePixelRatio READ GetDevicePixelRatio WRITE SetDevicePixelRatio NOTIFY DevicePixelRatioChanged)
    Q_PROPERTY(bool liveContext READ IsLiveContext WRITE SetLiveContext NOTIFY LiveContextChanged)
    Q_PROPERTY(bool relativeTimeDisplay READ IsRelativeTimeDisplay WRITE SetRelativeTimeDisplay NOTIFY
                   RelativeTimeDisplayChanged)

public:
    explicit VBaseGraphRenderType(QQuickItem* i_pParent = nullptr);
    ~VBaseGraphRenderType() override;

    void SetDestroyedCallback(DestroyedCallback i_Callback) override;
    std::uint64_t GetRevision() const override { return m_Revision; }
    bool IsInitialised() const override { return m_bInitialised; }
    /// Sets the flag. A class that draws overrides it, makes its OpenGL objects and calls this one.
    void Initialise(std::shared_ptr<CoreGraphics::Resources> i_pResources) override;

    /// Where this item stands, in item units relative to the GraphPlotFBO, y down. A width or height of 1 or less or
    /// above 2147483647 is ignored.
    const QRectF& GetScreenRect() const { return m_ScreenRect; }
    void SetScreenRect(const QRectF& i_rRect);

    /// Framebuffer pixels per item unit.
    double GetDevicePixelRatio() const { return m_DevicePixelRatio; }
    void SetDevicePixelRatio(double i_Ratio);

    bool IsLiveContext() const { return m_bLiveContext; }
    void SetLiveContext(bool i_bLive);
    bool IsRelativeTimeDisplay() const { return m_bRelativeTimeDisplay; }
    void SetRelativeTimeDisplay(bool i_bRelative);

    void SetTraceDataProvider(std::weak_ptr<TQL::ITraceDataProvider> i_pProvider);

    /// The screen rectangle in framebuffer pixels. 1 x 1 until a rectangle was set.
    const QRectF& GetScaledRect() const { return m_ScaledRect; }

Q_SIGNALS:
    void ScreenRectChanged();
    void DevicePixelRatioChanged();
    void LiveContextChanged();
    void RelativeTimeDisplayChanged();
    void VisibleChanged();

protected:
    /// To be called with every change that Render shows: without it, no frame is drawn.
    void MarkChanged() { ++m_Revision; }
    /// Maps (0, 0) to the lower left and (scaled width, scaled height) to the upper right corner of the scaled
    /// rectangle as it is seen: values grow upwards, while viewports count downwards as items do.
    const QMatrix4x4& GetProjection() const { return m_Projection; }
    /// The scaled rectangle rounded to whole framebuffer pixels, ready for RenderContext::SetViewport.
    QRect GetViewport() const { return m_ScaledRect.toRect(); }
    /// Null without a provider. Hold it for one frame only.
    std::shared_ptr<TQL::ITraceDataProvider> LockTraceDataProvider() const { return m_pTraceDataProvider.lock(); }

private:
    void UpdateScaledRect();

    QRectF m_ScreenRect{0.0, 0.0, 0.0, 0.0};
    QRectF m_ScaledRect{0.0, 0.0, 1.0, 1.0};
    QMatrix4x4 m_Projection;
    double m_DevicePixelRatio = 1.0;
    std::uint64_t m_Revision = 0;
    bool m_bInitialised = false;
    bool m_bLiveContext = true;
    bool m_bRelativeTimeDisplay = true;
    std::weak_ptr<TQL::ITraceDataProvider> m_pTraceDataProvider;
    DestroyedCallback m_DestroyedCallback;
};

} // namespace GraphPlotUI

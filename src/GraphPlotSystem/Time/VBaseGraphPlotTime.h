#pragma once

#include "NotificationSystem/VMultiCallbackPostal.h"
#include "TQL/IPostalService.h"
#include "TQL/ITick.h"
#include "TQL/NearlyEqual.h"

#include <QtCore/QObject>
#include <QtCore/QPointF>

#include <cstdint>
#include <memory>
#include <mutex>
#include <optional>
#include <set>
#include <string>

namespace GraphPlotUI
{

/// Where the session stands: live or review, the current and the latest frame, the range of frames and the period of a
/// frame. QML sees it as "contextGraphPlotTime". In live, frames are counted back from the latest one, so that the
/// current time stays near 0 and the session range ends at 0. Lives on the UI thread; the getters may be called from
/// any thread. Signals are emitted on the UI thread with no lock held.
class VBaseGraphPlotTime : public QObject
{
    Q_OBJECT
    Q_PROPERTY(bool isLive READ IsLive NOTIFY ModeChanged)
    Q_PROPERTY(bool isReview READ IsReview NOTIFY ModeChanged)
    Q_PROPERTY(qlonglong currentTime READ GetCurrentTime WRITE SetCurrentTime NOTIFY CurrentTimeChanged)
    Q_PROPERTY(qlonglong latestFrameIndex READ GetLatestFrameIndex NOTIFY LatestFrameIndexChanged)
    Q_PROPERTY(QPointF sessionTimeRange READ GetSessionTimeRange NOTIFY SessionTimeRangeChanged)

public:
    explicit VBaseGraphPlotTime(std::shared_ptr<TQL::IPostalService> i_pUiPostalService, QObject* i_pParent = nullptr);

    bool IsLive() const;
    bool IsReview() const;
    qlonglong GetCurrentTime() const;      ///< frames
    qlonglong GetLatestFrameIndex() const; ///< frames from the start of the session, also in live
    QPointF GetSessionTimeRange() const;   ///< frames; x first, y last
    std::int64_t GetFramePeriod() const;   ///< ticks

    /// Raised when the frame period changes. The default postal service is that of the user interface.
    std::shared_ptr<TQL::IChangeSignal> FramePeriodChanged() const { return m_pFramePeriodChanged; }

    virtual void SetActive(bool i_bActive) = 0;

    /// Whether a time source of the host bears the name.
    virtual bool HasSource(const std::string& i_rName) const = 0;

    /// The names of the time sources that the plotted channels come from; an empty set has no preference.
    virtual void SetPreferredSources(const std::set<std::string>& i_rNames) = 0;

    /// The range that a fitted time axis of a review shows, counted in frames; none leaves it to the caller.
    virtual std::optional<TQL::TickRange> GetFitRange() const { return std::nullopt; }

    /// Asks the host to go to a frame; currentTime follows when it has. No effect in live.
    virtual void SetCurrentTime(qlonglong i_Frame) = 0;

Q_SIGNALS:
    void ModeChanged();
    void CurrentTimeChanged();
    void LatestFrameIndexChanged();
    void SessionTimeRangeChanged();

protected:
    struct Values
    {
        bool bLive = false;
        bool bReview = false;
        std::int64_t CurrentTime = 0;
        std::int64_t LatestFrame = 0;
        std::int64_t FramePeriod = TQL::DefaultFramePeriod;
        TQL::FrameRange SessionRange{0.0, 0.0};
    };

    Values GetValues() const;

    /// Stores what differs (the session range by the nearly-equal rule) and then tells of it. UI thread.
    void SetValues(const Values& i_rValues);

    const std::shared_ptr<TQL::IPostalService>& UiPostalService() const { return m_pUiPostalService; }

private:
    const std::shared_ptr<TQL::IPostalService> m_pUiPostalService;
    mutable std::mutex m_Mutex;
    Values m_Values; // guarded by m_Mutex
    const std::shared_ptr<NotificationSystem::VChangeSignal> m_pFramePeriodChanged;
};

} // namespace GraphPlotUI

#pragma once

#include "GraphPlotSystem/Traces/TraceRenderInfo.h"
#include "NotificationSystem/VSubscriptions.h"
#include "TQL/ITraceId.h"

#include <QtCore/QAbstractListModel>
#include <QtCore/QString>

#include <functional>
#include <memory>
#include <utility>
#include <vector>

class QTimer;

namespace TQL
{

class IChannelTextProvider;
class IPostalService;
class ITraceDataStorage;

namespace TraceModelRoles
{

Q_NAMESPACE

enum ETraceModelRoles
{
    TraceId = 256,          ///< TQL::ITraceId
    TraceDisplayName,       ///< text
    TraceColour,            ///< QColor
    TraceValue,             ///< float at the inspected time, maybe NaN; nothing while the trace was never inspected
    TraceMean,              ///< the same for the mean over the default time range
    TraceStandardDeviation, ///< and for the standard deviation
    TraceUnits              ///< rich text
};
Q_ENUM_NS(ETraceModelRoles)

} // namespace TraceModelRoles

} // namespace TQL

namespace GraphPlotUI
{

/// The traces of one subplot, one a row: name, colour, units, and while inspection is on the value at the inspected
/// time with mean and standard deviation. Reads the numbers at most about four times a second, however often the
/// provider tells of new ones. Held by its subplot; UI thread.
class VTraceModel : public QAbstractListModel
{
    Q_OBJECT
    Q_PROPERTY(float inspectionProgress READ GetInspectionProgress NOTIFY InspectionProgressChanged)

public:
    using TraceList = std::vector<std::pair<TQL::ITraceId, QString>>; ///< with display names
    using Clock = std::function<double()>;                            ///< seconds, monotonic

    /// An empty clock stands for the steady one of the system.
    VTraceModel(std::shared_ptr<TQL::IPostalService> i_pUiPostalService,
                std::shared_ptr<TQL::ITraceDataStorage> i_pProvider,
                std::shared_ptr<TQL::IChannelTextProvider> i_pTextProvider, QObject* i_pParent, Clock i_Clock = {});
    ~VTraceModel() override;

    void SetTraces(const TraceList& i_rTraces);
    const std::vector<TQL::ITraceId>& GetTraceIds() const { return m_TraceIds; }
    const std::vector<QString>& GetDisplayNames() const { return m_DisplayNames; }

    int rowCount(const QModelIndex& i_rParent = {}) const override;
    QVariant data(const QModelIndex& i_rIndex, int i_Role) const override;
    QHash<int, QByteArray> roleNames() const override;
    bool insertRows(int i_Row, int i_Count, const QModelIndex& i_rParent = {}) override;
    bool removeRows(int i_Row, int i_Count, const QModelIndex& i_rParent = {}) override;

    float GetInspectionProgress() const { return m_InspectionProgress; } ///< 0..1: how much of the windows was read
    bool IsInspectionEnabled() const { return m_InspectionHandle != 0; }

    /// Only the traces of one model of a window are inspected at a time: those of the one that asked last.
    Q_INVOKABLE void setInspectionEnabled(bool i_bEnabled);
    Q_INVOKABLE void setInspectionTime(double i_ContextFrameNumber);

Q_SIGNALS:
    void InspectionProgressChanged();

private:
    void OnColoursChanged();
    void Refresh();
    void EndInspectionSubscription();

    const std::shared_ptr<TQL::IPostalService> m_pUiPostalService;
    const std::shared_ptr<TQL::ITraceDataStorage> m_pProvider;
    const std::shared_ptr<TQL::IChannelTextProvider> m_pTextProvider;
    const Clock m_Clock;
    std::vector<TQL::ITraceId> m_TraceIds;
    std::vector<QString> m_DisplayNames;
    std::vector<TraceInspectionValues> m_Values;
    float m_InspectionProgress = 1.0f;
    double m_LastRefresh = 0.0;           ///< seconds of the clock
    QTimer* const m_pRefreshTimer;        ///< a child of this object
    std::uint64_t m_InspectionHandle = 0; ///< 0 for none
    NotificationSystem::VSubscriptions m_Subscriptions;
};

} // namespace GraphPlotUI

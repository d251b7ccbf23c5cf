#pragma once

#include "GraphPlotSystem/IGraphPlotPreferences.h"
#include "NotificationSystem/VSubscriptions.h"
#include "TQL/IPostalService.h"
#include "TQL/ITraceId.h"

#include <QtCore/QAbstractListModel>
#include <QtCore/QPointF>
#include <QtCore/QVariant>

#include <vector>

namespace TQL
{
class IChannelTextProvider;
class ITraceDataStorage;
} // namespace TQL

namespace GraphPlotUI
{

/// One row a subplot, one subplot for each component of each channel subtype, its value range always fitted to the
/// traces in it, one colour a channel out of the set that the operator prefers. Stands where the subplot manager, its
/// model and the key will stand. UI thread.
class VPlainSubplotModel : public QAbstractListModel
{
    Q_OBJECT

public:
    enum ERole
    {
        TraceIdsRole = 256, ///< list of TQL::ITraceId
        LabelRole,
        UnitsRole,
        YAxisRangeRole, ///< QPointF: minimum, maximum
        LegendRole      ///< list of maps with "name" and "colour"
    };

    VPlainSubplotModel(std::shared_ptr<TQL::IPostalService> i_pUiPostalService,
                       std::shared_ptr<TQL::ITraceDataStorage> i_pStorage,
                       std::shared_ptr<TQL::IChannelTextProvider> i_pTextProvider,
                       std::shared_ptr<IGraphPlotPreferences> i_pPreferences, QObject* i_pParent);
    ~VPlainSubplotModel() override;

    int rowCount(const QModelIndex& i_rParent = {}) const override;
    QVariant data(const QModelIndex& i_rIndex, int i_Role) const override;
    QHash<int, QByteArray> roleNames() const override;

private:
    struct Subplot
    {
        std::uint64_t SubType = 0;
        std::uint8_t Component = 0;
        std::vector<TQL::ITraceId> Traces;
        QPointF Range{0.0, 1.0};
    };
    using SubplotList = std::vector<Subplot>;

    void SubscribeColourSet(std::shared_ptr<TQL::IPostalService> i_pUiPostalService);
    void OnColourSetPreference();
    void RefreshTraces();
    void RefreshRanges();
    SubplotList GroupTraces() const;
    QPointF RangeOf(const Subplot& i_rSubplot) const;
    QVariantList LegendOf(const Subplot& i_rSubplot) const;

    const std::shared_ptr<TQL::ITraceDataStorage> m_pStorage;
    const std::shared_ptr<TQL::IChannelTextProvider> m_pTextProvider;
    const std::shared_ptr<IGraphPlotPreferences> m_pPreferences;
    IGraphPlotPreferences::Token m_ColourSetToken = 0; ///< 0 for none
    std::int32_t m_ColourSet = 0;
    NotificationSystem::VSubscriptions m_Subscriptions;
    SubplotList m_Subplots; // ordered by subtype's display name, then subtype, then component
};

} // namespace GraphPlotUI

#pragma once

#include "GraphPlotSystem/Common/IGraphPlotOverlay.h"
#include "TQL/ITraceId.h"

#include <QtCore/QString>

#include <cstdint>
#include <memory>
#include <utility>
#include <vector>

namespace GraphPlotUI
{

class VActiveChannelModelFiltered;
class VTraceModel;

/// One subplot: its texts, the traces in it, and the models that list them. Made by the subplot manager, held by the
/// subplot model as a row. The two models may be held by several of these, one after the other, so that a view that
/// shows them stays while the subplot is the same. UI thread.
struct VSubplotData
{
    VSubplotData() = default;
    VSubplotData(std::uint64_t i_Id, QString i_Label, const QString& i_rUnits)
        : Id(i_Id)
        , YAxisLabel(std::move(i_Label))
        , YAxisUnits(i_rUnits.isEmpty() ? QString() : QLatin1Char('(') + i_rUnits + QLatin1Char(')'))
    {
    }

    std::uint64_t Id = 0;
    QString YAxisLabel;
    QString YAxisUnits; ///< in brackets; rich text
    QString YAxisToolTip;
    std::vector<TQL::ITraceId> Traces;
    std::vector<TQL::IGraphPlotOverlay> Overlays;
    std::shared_ptr<VTraceModel> pTraceModel;
    std::shared_ptr<VActiveChannelModelFiltered> pChannelModel;
};

} // namespace GraphPlotUI

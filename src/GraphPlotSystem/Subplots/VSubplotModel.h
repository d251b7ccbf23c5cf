#pragma once

#include "GraphPlotSystem/Subplots/SubplotState.h"
#include "GraphPlotSystem/Traces/TraceRenderInfo.h"

#include <QtCore/QAbstractListModel>

#include <cstdint>
#include <map>
#include <memory>
#include <vector>

namespace TQL
{

class ITraceDataStorage;

namespace SubplotModelRoles
{

Q_NAMESPACE

enum ESubplotModelRoles
{
    SubplotYAxisLabel = 256, ///< text
    SubplotYAxisUnits,       ///< rich text in brackets; empty for none
    SubplotYAxisToolTip,     ///< rich text
    SubplotYAxisRange,       ///< QPointF: minimum, maximum; can be written, also as a ValueRange
    SubplotChannelModel,     ///< QObject*: the active channels that have a trace in the subplot
    SubplotTraces,           ///< list of TQL::ITraceId
    SubplotTraceModel,       ///< QObject*: a VTraceModel
    SubplotOverlays          ///< std::vector of TQL::IGraphPlotOverlay
};
Q_ENUM_NS(ESubplotModelRoles)

} // namespace SubplotModelRoles

} // namespace TQL

namespace GraphPlotUI
{

struct VSubplotData;

/// The subplots of one window, from top to bottom, and the value range of each. Ranges are kept by subplot id for the
/// life of the window, one set by hand and one fitted to the data, so that a subplot that comes back has its own again.
/// A subplot that stays keeps its row through every update, and with it the view that shows it. A child of the subplot
/// manager; UI thread.
class VSubplotModel : public QAbstractListModel
{
    Q_OBJECT
    Q_PROPERTY(bool lockYAxes READ GetLockYAxes WRITE SetLockYAxes NOTIFY LockYAxesChanged)
    Q_PROPERTY(bool fitYAxes READ GetFitYAxes WRITE SetFitYAxes NOTIFY FitYAxesChanged)
    Q_PROPERTY(int subplotCount READ GetSubplotCount NOTIFY SubplotCountChanged)

public:
    using SubplotPointer = std::shared_ptr<VSubplotData>;
    using SubplotMap = std::map<std::uint64_t, SubplotPointer>; ///< by subplot id

    VSubplotModel(std::shared_ptr<TQL::ITraceDataStorage> i_pStorage, QObject* i_pParent);
    ~VSubplotModel() override;

    /// The subplots to show, from top to bottom: those of the ids that i_rSubplots holds.
    void Update(const SubplotMap& i_rSubplots, const std::vector<std::uint64_t>& i_rOrder);

    /// Fits the ranges to the data, when axes shall be fitted and are not locked.
    void Refresh();

    void LoadState(const SubplotState& i_rState); ///< the ranges, lock and fit of it
    void SaveState(SubplotState& o_rState) const;

    SubplotMap GetSubplots() const;

    int rowCount(const QModelIndex& i_rParent = {}) const override;
    QVariant data(const QModelIndex& i_rIndex, int i_Role) const override;
    bool setData(const QModelIndex& i_rIndex, const QVariant& i_rValue, int i_Role) override;
    QHash<int, QByteArray> roleNames() const override;
    bool insertRows(int i_Row, int i_Count, const QModelIndex& i_rParent = {}) override;
    bool removeRows(int i_Row, int i_Count, const QModelIndex& i_rParent = {}) override;

    bool GetLockYAxes() const { return m_bLockYAxes; }
    void SetLockYAxes(bool i_bLock);
    bool GetFitYAxes() const { return m_bFitYAxes; }
    void SetFitYAxes(bool i_bFit);
    int GetSubplotCount() const { return rowCount(); }

    /// Sets the range that is on show to that of the data. False for a row that is none.
    Q_INVOKABLE bool resetYAxisRange(int i_Row);
    Q_INVOKABLE void resetAllYAxisRanges();

Q_SIGNALS:
    void LockYAxesChanged();
    void FitYAxesChanged();
    void SubplotCountChanged();

private:
    struct Ranges
    {
        ValueRange Manual;
        ValueRange Fit;
    };

    static Ranges RangesOf(const SubplotConfiguration& i_rConfiguration);
    static SubplotConfiguration ConfigurationOf(const Ranges& i_rRanges);
    VSubplotData& At(int i_Row) const { return *m_Rows[static_cast<std::size_t>(i_Row)]; }
    Ranges FindRanges(std::uint64_t i_Id) const;
    bool RemoveMovedRows(const std::vector<std::uint64_t>& i_rOrder);
    void InsertRow(int i_Row, SubplotPointer i_pSubplot);
    void UpdateRow(int i_Row, const VSubplotData& i_rSubplot);
    bool IsRefreshing() const { return m_bFitYAxes && !m_bLockYAxes; }
    void FitRow(int i_Row);
    void EmitRangesChanged();
    void AssignUnnamedRanges();

    const std::shared_ptr<TQL::ITraceDataStorage> m_pStorage;
    std::vector<SubplotPointer> m_Rows;
    bool m_bLockYAxes = false;
    bool m_bFitYAxes = true;
    std::map<std::uint64_t, Ranges> m_Ranges;          // by subplot id
    std::vector<SubplotConfiguration> m_UnnamedRanges; // of a state without ids, until there are rows for them
};

} // namespace GraphPlotUI

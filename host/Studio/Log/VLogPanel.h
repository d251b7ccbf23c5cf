#pragma once

#include <QtCore/QSortFilterProxyModel>
#include <QtWidgets/QWidget>

class QComboBox;
class QTreeView;

namespace Studio
{

class VLogModel;

/// Lets through the rows of the log up to a severity.
class VSeverityFilter : public QSortFilterProxyModel
{
    Q_OBJECT

public:
    using QSortFilterProxyModel::QSortFilterProxyModel;

    void SetMostDetail(int i_Severity); ///< a TQL::ELogSeverity; what is less severe is hidden

protected:
    bool filterAcceptsRow(int i_Row, const QModelIndex& i_rParent) const override;

private:
    int m_MostDetail = 6;
};

/// The log: what severity is shown, copy and clear. Follows the newest message while the end is in view. The model
/// outlives it. UI thread.
class VLogPanel : public QWidget
{
    Q_OBJECT

public:
    explicit VLogPanel(VLogModel& i_rModel, QWidget* i_pParent = nullptr);

    /// Shows warnings and errors only.
    void ShowProblems();

private:
    QWidget* MakeHead();
    void BuildView();
    void Copy() const; ///< the selected lines, or all that are shown

    VLogModel& m_rModel;
    VSeverityFilter* m_pShown = nullptr;
    QComboBox* m_pSeverity = nullptr;
    QTreeView* m_pView = nullptr;
    bool m_bAtEnd = true; ///< before new rows came
};

} // namespace Studio

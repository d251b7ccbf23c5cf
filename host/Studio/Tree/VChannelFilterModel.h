#pragma once

#include <QtCore/QSortFilterProxyModel>
#include <QtCore/QStringList>

namespace Studio
{

class VChannelTreeModel;

/// The tree of channels with only those that a search finds, and the branches above them. A branch stands for what is
/// shown of it: ticking it ticks nothing that is hidden. Owned by the panel; the tree model outlives it. UI thread.
class VChannelFilterModel : public QSortFilterProxyModel
{
    Q_OBJECT

public:
    explicit VChannelFilterModel(VChannelTreeModel& i_rTree, QObject* i_pParent = nullptr);

    void SetSearch(const QString& i_rText);
    bool IsSearching() const { return !m_Words.isEmpty(); }

    /// The shown channels at and below some rows, each once. The rows come once; the invalid index stands for all.
    QModelIndexList LeavesBelow(const QModelIndexList& i_rIndexes) const;

    QModelIndexList AllLeaves() const { return LeavesBelow({QModelIndex()}); } ///< that are shown

    /// Ticks or clears all shown channels at and below some rows, as one change.
    void Tick(const QModelIndexList& i_rIndexes, bool i_bTicked);

    /// Ticks them, or clears them when all are ticked already.
    void Toggle(const QModelIndexList& i_rIndexes);

    QVariant data(const QModelIndex& i_rIndex, int i_Role) const override;
    bool setData(const QModelIndex& i_rIndex, const QVariant& i_rValue, int i_Role) override;

protected:
    bool filterAcceptsRow(int i_Row, const QModelIndex& i_rParent) const override;

private:
    void AddLeaves(const QModelIndex& i_rIndex, QModelIndexList& o_rLeaves) const;
    int CheckStateOf(const QModelIndexList& i_rLeaves) const;

    VChannelTreeModel& m_rTree;
    QStringList m_Words;
};

} // namespace Studio

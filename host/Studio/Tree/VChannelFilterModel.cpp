#include "Studio/Tree/VChannelFilterModel.h"

#include "Studio/Tree/ChannelSearch.h"
#include "Studio/Tree/VChannelTreeModel.h"

#include <QtCore/QSet>

#include <algorithm>

namespace Studio
{

VChannelFilterModel::VChannelFilterModel(VChannelTreeModel& i_rTree, QObject* i_pParent)
    : QSortFilterProxyModel(i_pParent), m_rTree(i_rTree)
{
    setRecursiveFilteringEnabled(true);
    setSourceModel(&i_rTree);
}

void VChannelFilterModel::SetSearch(const QString& i_rText)
{
    const QStringList words = SearchWords(i_rText);
    if (words == m_Words)
        return;
    m_Words = words;
    invalidateFilter();
}

bool VChannelFilterModel::filterAcceptsRow(int i_Row, const QModelIndex& i_rParent) const
{
    if (m_Words.isEmpty())
        return true;
    // Branches are there because of what is below them.
    const ChannelSearchText* pText = m_rTree.SearchTextOf(m_rTree.index(i_Row, 0, i_rParent));
    return pText && MatchesSearch(*pText, m_Words);
}

void VChannelFilterModel::AddLeaves(const QModelIndex& i_rIndex, QModelIndexList& o_rLeaves) const
{
    const int rows = rowCount(i_rIndex);
    if (rows == 0 && i_rIndex.isValid())
        o_rLeaves.append(i_rIndex);
    for (int row = 0; row < rows; ++row)
        AddLeaves(index(row, 0, i_rIndex), o_rLeaves);
}

QModelIndexList VChannelFilterModel::LeavesBelow(const QModelIndexList& i_rIndexes) const
{
    const QSet<QModelIndex> all(i_rIndexes.begin(), i_rIndexes.end());
    const auto isBelowAnother = [&all](const QModelIndex& i_rIndex)
    {
        for (QModelIndex up = i_rIndex.parent(); up.isValid(); up = up.parent())
            if (all.contains(up))
                return true;
        return false;
    };
    QModelIndexList leaves;
    for (const QModelIndex& rIndex : i_rIndexes)
        if (!isBelowAnother(rIndex))
            AddLeaves(rIndex, leaves);
    return leaves;
}

void VChannelFilterModel::Tick(const QModelIndexList& i_rIndexes, bool i_bTicked)
{
    QModelIndexList leaves;
    for (const QModelIndex& rLeaf : LeavesBelow(i_rIndexes))
        leaves.append(mapToSource(rLeaf));
    m_rTree.TickLeaves(leaves, i_bTicked);
}

void VChannelFilterModel::Toggle(const QModelIndexList& i_rIndexes)
{
    const QModelIndexList leaves = LeavesBelow(i_rIndexes);
    Tick(leaves, CheckStateOf(leaves) != Qt::Checked);
}

int VChannelFilterModel::CheckStateOf(const QModelIndexList& i_rLeaves) const
{
    const auto ticked = std::ranges::count_if(i_rLeaves, [](const QModelIndex& i_rLeaf)
                                              { return i_rLeaf.data(Qt::CheckStateRole).toInt() == Qt::Checked; });
    if (ticked == 0)
        return Qt::Unchecked;
    return ticked == i_rLeaves.size() ? Qt::Checked : Qt::PartiallyChecked;
}

QVariant VChannelFilterModel::data(const QModelIndex& i_rIndex, int i_Role) const
{
    if (i_Role != Qt::CheckStateRole || m_Words.isEmpty() || !hasChildren(i_rIndex))
        return QSortFilterProxyModel::data(i_rIndex, i_Role);
    return CheckStateOf(LeavesBelow({i_rIndex}));
}

bool VChannelFilterModel::setData(const QModelIndex& i_rIndex, const QVariant& i_rValue, int i_Role)
{
    if (!i_rIndex.isValid() || i_Role != Qt::CheckStateRole)
        return false;
    Tick({i_rIndex}, i_rValue.toInt() != Qt::Unchecked);
    return true;
}

} // namespace Studio

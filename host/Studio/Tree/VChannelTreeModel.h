#pragma once

#include "Studio/Tree/ChannelTreeLeaf.h"

#include <QtCore/QAbstractItemModel>

#include <cstddef>
#include <vector>

namespace Studio
{

/// The channels of one context as a tree with tick boxes. A branch is ticked when everything below it is, and ticking a
/// branch ticks everything below. Ticked leaves are kept in the order in which they were ticked. UI thread.
class VChannelTreeModel : public QAbstractItemModel
{
    Q_OBJECT

public:
    explicit VChannelTreeModel(QObject* i_pParent = nullptr);
    ~VChannelTreeModel() override;

    /// Replaces the tree. Leaves with the same item stay ticked. Leaves of equal branches need not stand together.
    void SetLeaves(const std::vector<ChannelTreeLeaf>& i_rLeaves);

    /// Ticks exactly the leaves of these items, in this order; items that the tree does not hold are passed over. Does
    /// not emit TickedChanged.
    void SetTicked(const std::vector<TQL::SelectionItem>& i_rItems);

    std::vector<TQL::SelectionItem> Ticked() const;

    /// Ticks or clears some leaves, emitting TickedChanged once, unless all are so already.
    void TickLeaves(const QModelIndexList& i_rLeaves, bool i_bTicked);

    /// What a search looks at in a leaf; null for a branch.
    const ChannelSearchText* SearchTextOf(const QModelIndex& i_rIndex) const;

    int LeafCount() const { return m_Nodes.front().Leaves; }

    /// The leaf that comes first in the tree; an item of kind None when there is none.
    TQL::SelectionItem FirstItem() const;

    QModelIndex index(int i_Row, int i_Column, const QModelIndex& i_rParent = {}) const override;
    QModelIndex parent(const QModelIndex& i_rIndex) const override;
    int rowCount(const QModelIndex& i_rParent = {}) const override;
    int columnCount(const QModelIndex& i_rParent = {}) const override;
    QVariant data(const QModelIndex& i_rIndex, int i_Role) const override;
    bool setData(const QModelIndex& i_rIndex, const QVariant& i_rValue, int i_Role) override;
    Qt::ItemFlags flags(const QModelIndex& i_rIndex) const override;

Q_SIGNALS:
    /// The operator has ticked or cleared something.
    void TickedChanged();

private:
    struct Node
    {
        QString Text;
        std::size_t Parent = 0;
        int Row = 0;
        std::vector<std::size_t> Children;
        TQL::SelectionItem Item; ///< kind None for a branch
        ChannelSearchText Search;
        int Leaves = 0; ///< below and including this node
        int TickedLeaves = 0;
    };

    bool IsLeaf(std::size_t i_Node) const { return m_Nodes[i_Node].Item.Kind != TQL::ESelectionKind::None; }
    std::size_t NodeOf(const QModelIndex& i_rIndex) const;
    QModelIndex IndexOf(std::size_t i_Node) const;
    std::size_t AddNode(std::size_t i_Parent, const QString& i_rText);
    std::size_t BranchFor(const QStringList& i_rBranches);
    void Tick(std::size_t i_Leaf, bool i_bTicked);
    void TickBelow(std::size_t i_Node, bool i_bTicked);
    void AnnounceAll(std::size_t i_Parent);

    std::vector<Node> m_Nodes;               ///< the first is the invisible root
    std::vector<std::size_t> m_TickedLeaves; ///< in the order of ticking
};

} // namespace Studio

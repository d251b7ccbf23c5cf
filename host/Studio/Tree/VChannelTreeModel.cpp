#include "Studio/Tree/VChannelTreeModel.h"

#include <algorithm>
#include <map>
#include <tuple>

namespace Studio
{

namespace
{

using ItemKey = std::tuple<TQL::ESelectionKind, std::uint64_t, std::uint64_t, std::string>;

ItemKey KeyOf(const TQL::SelectionItem& i_rItem)
{
    return {i_rItem.Kind, i_rItem.First, i_rItem.Second, i_rItem.Text};
}

/// "Walker1:LFHD: X, Y, Z in mm".
QString ToolTipOf(const ChannelSearchText& i_rText)
{
    QString text = i_rText.Name;
    if (!i_rText.Components.isEmpty())
        text += QStringLiteral(": ") + i_rText.Components.join(QStringLiteral(", "));
    if (!i_rText.Units.isEmpty())
        text += VChannelTreeModel::tr(" in %1").arg(i_rText.Units.join(QStringLiteral(", ")));
    return text;
}

} // namespace

VChannelTreeModel::VChannelTreeModel(QObject* i_pParent) : QAbstractItemModel(i_pParent), m_Nodes(1) {}

VChannelTreeModel::~VChannelTreeModel() = default;

std::size_t VChannelTreeModel::NodeOf(const QModelIndex& i_rIndex) const
{
    return i_rIndex.isValid() ? static_cast<std::size_t>(i_rIndex.internalId()) : 0;
}

QModelIndex VChannelTreeModel::IndexOf(std::size_t i_Node) const
{
    return i_Node == 0 ? QModelIndex() : createIndex(m_Nodes[i_Node].Row, 0, static_cast<quintptr>(i_Node));
}

std::size_t VChannelTreeModel::AddNode(std::size_t i_Parent, const QString& i_rText)
{
    const std::size_t node = m_Nodes.size();
    Node added;
    added.Text = i_rText;
    added.Parent = i_Parent;
    added.Row = static_cast<int>(m_Nodes[i_Parent].Children.size());
    m_Nodes.push_back(std::move(added));
    m_Nodes[i_Parent].Children.push_back(node);
    return node;
}

std::size_t VChannelTreeModel::BranchFor(const QStringList& i_rBranches)
{
    std::size_t node = 0;
    for (const QString& rText : i_rBranches)
    {
        const auto& rChildren = m_Nodes[node].Children;
        // Newest first: leaves of one branch mostly come in a row.
        const auto found =
            std::find_if(rChildren.rbegin(), rChildren.rend(),
                         [&](std::size_t i_Child) { return !IsLeaf(i_Child) && m_Nodes[i_Child].Text == rText; });
        node = found != rChildren.rend() ? *found : AddNode(node, rText);
    }
    return node;
}

void VChannelTreeModel::SetLeaves(const std::vector<ChannelTreeLeaf>& i_rLeaves)
{
    const std::vector<TQL::SelectionItem> ticked = Ticked();
    beginResetModel();
    m_Nodes.assign(1, Node());
    m_TickedLeaves.clear();
    for (const ChannelTreeLeaf& rLeaf : i_rLeaves)
    {
        const std::size_t leaf = AddNode(BranchFor(rLeaf.Branches), rLeaf.Text);
        m_Nodes[leaf].Item = rLeaf.Item;
        m_Nodes[leaf].Search = rLeaf.Search;
        for (std::size_t node = leaf;; node = m_Nodes[node].Parent)
        {
            ++m_Nodes[node].Leaves;
            if (node == 0)
                break;
        }
    }
    endResetModel();
    SetTicked(ticked);
}

void VChannelTreeModel::SetTicked(const std::vector<TQL::SelectionItem>& i_rItems)
{
    if (i_rItems == Ticked())
        return;
    std::map<ItemKey, std::size_t> leaves;
    for (std::size_t node = 1; node < m_Nodes.size(); ++node)
        if (IsLeaf(node))
            leaves.emplace(KeyOf(m_Nodes[node].Item), node);
    while (!m_TickedLeaves.empty())
        Tick(m_TickedLeaves.back(), false);
    for (const TQL::SelectionItem& rItem : i_rItems)
        if (const auto found = leaves.find(KeyOf(rItem)); found != leaves.end())
            Tick(found->second, true);
    AnnounceAll(0);
}

std::vector<TQL::SelectionItem> VChannelTreeModel::Ticked() const
{
    std::vector<TQL::SelectionItem> items;
    items.reserve(m_TickedLeaves.size());
    for (const std::size_t leaf : m_TickedLeaves)
        items.push_back(m_Nodes[leaf].Item);
    return items;
}

TQL::SelectionItem VChannelTreeModel::FirstItem() const
{
    std::size_t node = 0;
    while (!m_Nodes[node].Children.empty())
        node = m_Nodes[node].Children.front();
    return m_Nodes[node].Item;
}

void VChannelTreeModel::Tick(std::size_t i_Leaf, bool i_bTicked)
{
    if ((m_Nodes[i_Leaf].TickedLeaves != 0) == i_bTicked)
        return;
    for (std::size_t node = i_Leaf;; node = m_Nodes[node].Parent)
    {
        m_Nodes[node].TickedLeaves += i_bTicked ? 1 : -1;
        if (node == 0)
            break;
    }
    if (i_bTicked)
        m_TickedLeaves.push_back(i_Leaf);
    else
        std::erase(m_TickedLeaves, i_Leaf);
}

void VChannelTreeModel::TickLeaves(const QModelIndexList& i_rLeaves, bool i_bTicked)
{
    bool bChanged = false;
    for (const QModelIndex& rLeaf : i_rLeaves)
    {
        const std::size_t leaf = NodeOf(rLeaf);
        if (!IsLeaf(leaf) || (m_Nodes[leaf].TickedLeaves != 0) == i_bTicked)
            continue;
        Tick(leaf, i_bTicked);
        bChanged = true;
    }
    if (!bChanged)
        return;
    AnnounceAll(0);
    Q_EMIT TickedChanged();
}

const ChannelSearchText* VChannelTreeModel::SearchTextOf(const QModelIndex& i_rIndex) const
{
    const std::size_t node = NodeOf(i_rIndex);
    return IsLeaf(node) ? &m_Nodes[node].Search : nullptr;
}

void VChannelTreeModel::TickBelow(std::size_t i_Node, bool i_bTicked)
{
    if (IsLeaf(i_Node))
        Tick(i_Node, i_bTicked);
    for (const std::size_t child : m_Nodes[i_Node].Children)
        TickBelow(child, i_bTicked);
}

void VChannelTreeModel::AnnounceAll(std::size_t i_Parent)
{
    const auto& rChildren = m_Nodes[i_Parent].Children;
    if (rChildren.empty())
        return;
    Q_EMIT dataChanged(IndexOf(rChildren.front()), IndexOf(rChildren.back()), {Qt::CheckStateRole});
    for (const std::size_t child : rChildren)
        AnnounceAll(child);
}

QModelIndex VChannelTreeModel::index(int i_Row, int i_Column, const QModelIndex& i_rParent) const
{
    if (!hasIndex(i_Row, i_Column, i_rParent))
        return {};
    return IndexOf(m_Nodes[NodeOf(i_rParent)].Children[static_cast<std::size_t>(i_Row)]);
}

QModelIndex VChannelTreeModel::parent(const QModelIndex& i_rIndex) const
{
    return i_rIndex.isValid() ? IndexOf(m_Nodes[NodeOf(i_rIndex)].Parent) : QModelIndex();
}

int VChannelTreeModel::rowCount(const QModelIndex& i_rParent) const
{
    return i_rParent.column() > 0 ? 0 : static_cast<int>(m_Nodes[NodeOf(i_rParent)].Children.size());
}

int VChannelTreeModel::columnCount(const QModelIndex&) const
{
    return 1;
}

QVariant VChannelTreeModel::data(const QModelIndex& i_rIndex, int i_Role) const
{
    if (!i_rIndex.isValid())
        return {};
    const Node& rNode = m_Nodes[NodeOf(i_rIndex)];
    if (i_Role == Qt::DisplayRole)
        return rNode.Text;
    if (i_Role == Qt::ToolTipRole)
        return ToolTipOf(rNode.Search);
    if (i_Role != Qt::CheckStateRole)
        return {};
    if (rNode.TickedLeaves == 0)
        return static_cast<int>(Qt::Unchecked);
    return static_cast<int>(rNode.TickedLeaves == rNode.Leaves ? Qt::Checked : Qt::PartiallyChecked);
}

bool VChannelTreeModel::setData(const QModelIndex& i_rIndex, const QVariant& i_rValue, int i_Role)
{
    if (!i_rIndex.isValid() || i_Role != Qt::CheckStateRole)
        return false;
    const std::size_t node = NodeOf(i_rIndex);
    TickBelow(node, i_rValue.toInt() != Qt::Unchecked);
    AnnounceAll(node);
    for (QModelIndex up = i_rIndex; up.isValid(); up = up.parent())
        Q_EMIT dataChanged(up, up, {Qt::CheckStateRole});
    Q_EMIT TickedChanged();
    return true;
}

Qt::ItemFlags VChannelTreeModel::flags(const QModelIndex& i_rIndex) const
{
    if (!i_rIndex.isValid())
        return Qt::NoItemFlags;
    const Qt::ItemFlags common = Qt::ItemIsEnabled | Qt::ItemIsSelectable | Qt::ItemIsUserCheckable;
    return IsLeaf(NodeOf(i_rIndex)) ? common | Qt::ItemNeverHasChildren : common;
}

} // namespace Studio

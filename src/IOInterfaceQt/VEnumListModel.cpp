#include "IOInterfaceQt/VEnumListModel.h"

#include <algorithm>
#include <utility>

namespace TQL::IO
{

VEnumListModel::VEnumListModel(std::vector<Row> i_Rows, QObject* i_pParent)
    : QAbstractListModel(i_pParent), m_Rows(std::move(i_Rows))
{
}

int VEnumListModel::rowCount(const QModelIndex& i_rParent) const
{
    return i_rParent.isValid() ? 0 : static_cast<int>(m_Rows.size());
}

QVariant VEnumListModel::data(const QModelIndex& i_rIndex, int i_Role) const
{
    if (!i_rIndex.isValid() || i_rIndex.row() >= rowCount())
        return {};
    const Row& rRow = m_Rows[static_cast<std::size_t>(i_rIndex.row())];
    switch (i_Role)
    {
    case Qt::DisplayRole:
    case EKeyRole:
        return rRow.Key;
    case EValueRole:
        return rRow.Value;
    case EDetailsRole:
        return rRow.Details;
    default:
        return {};
    }
}

QHash<int, QByteArray> VEnumListModel::roleNames() const
{
    return {{EKeyRole, "key"}, {EValueRole, "value"}, {EDetailsRole, "details"}};
}

int VEnumListModel::findFirstValueIndex(const QVariant& i_rValue) const
{
    const auto found = std::ranges::find(m_Rows, i_rValue, &Row::Value);
    return found == m_Rows.end() ? -1 : static_cast<int>(found - m_Rows.begin());
}

} // namespace TQL::IO

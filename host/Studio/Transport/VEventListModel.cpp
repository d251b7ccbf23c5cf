#include "Studio/Transport/VEventListModel.h"

#include "Studio/Common/TimeText.h"

#include <QtGui/QFont>

#include <algorithm>
#include <utility>

namespace Studio
{

VEventListModel::VEventListModel(QObject* i_pParent) : QAbstractTableModel(i_pParent) {}

void VEventListModel::SetEvents(std::vector<EventRow> i_Events)
{
    beginResetModel();
    m_Events = std::move(i_Events);
    m_Current = -1;
    endResetModel();
}

void VEventListModel::SetCurrentFrame(std::int64_t i_Frame)
{
    const auto next = std::ranges::upper_bound(m_Events, i_Frame, {}, &EventRow::Frame);
    const int current = static_cast<int>(next - m_Events.begin()) - 1;
    if (current == m_Current)
        return;
    const int former = std::exchange(m_Current, current);
    for (const int row : {former, current})
        if (row >= 0)
            Q_EMIT dataChanged(index(row, 0), index(row, columnCount() - 1), {Qt::FontRole});
}

int VEventListModel::rowCount(const QModelIndex& i_rParent) const
{
    return i_rParent.isValid() ? 0 : static_cast<int>(m_Events.size());
}

int VEventListModel::columnCount(const QModelIndex& i_rParent) const
{
    return i_rParent.isValid() ? 0 : 3;
}

QVariant VEventListModel::data(const QModelIndex& i_rIndex, int i_Role) const
{
    if (!i_rIndex.isValid())
        return {};
    if (i_Role == Qt::FontRole && i_rIndex.row() == m_Current)
    {
        QFont font;
        font.setBold(true);
        return font;
    }
    const EventRow& rEvent = m_Events[static_cast<std::size_t>(i_rIndex.row())];
    if (i_Role == Qt::ToolTipRole)
        return tr("Frame %1").arg(rEvent.Frame);
    if (i_Role != Qt::DisplayRole)
        return {};
    if (i_rIndex.column() == 0)
        return QString::fromStdString(FormatTime(rEvent.Tick));
    return i_rIndex.column() == 1 ? rEvent.Text : rEvent.Subject;
}

QVariant VEventListModel::headerData(int i_Section, Qt::Orientation i_Orientation, int i_Role) const
{
    if (i_Orientation != Qt::Horizontal || i_Role != Qt::DisplayRole)
        return {};
    const QString titles[] = {tr("Time"), tr("Event"), tr("Subject")};
    return i_Section >= 0 && i_Section < 3 ? titles[i_Section] : QVariant();
}

} // namespace Studio

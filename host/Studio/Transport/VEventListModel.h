#pragma once

#include "Studio/Transport/EventRows.h"

#include <QtCore/QAbstractTableModel>

#include <vector>

namespace Studio
{

/// The events of a recording as a table: time, event, subject. The last one that has been reached is bold. Owned by the
/// list; UI thread.
class VEventListModel : public QAbstractTableModel
{
    Q_OBJECT

public:
    explicit VEventListModel(QObject* i_pParent = nullptr);

    void SetEvents(std::vector<EventRow> i_Events); ///< sorted by frame
    void SetCurrentFrame(std::int64_t i_Frame);

    std::int64_t FrameOf(int i_Row) const { return m_Events[static_cast<std::size_t>(i_Row)].Frame; }
    int CurrentRow() const { return m_Current; } ///< -1 before the first event

    int rowCount(const QModelIndex& i_rParent = {}) const override;
    int columnCount(const QModelIndex& i_rParent = {}) const override;
    QVariant data(const QModelIndex& i_rIndex, int i_Role) const override;
    QVariant headerData(int i_Section, Qt::Orientation i_Orientation, int i_Role) const override;

private:
    std::vector<EventRow> m_Events;
    int m_Current = -1;
};

} // namespace Studio

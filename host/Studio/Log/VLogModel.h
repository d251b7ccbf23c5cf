#pragma once

#ifndef Q_MOC_RUN // which stumbles over what this includes of the standard library
#include "TQL/Log.h"
#endif

#include <QtCore/QAbstractTableModel>
#include <QtCore/QDateTime>
#include <QtCore/QString>

#include <cstddef>
#include <deque>
#include <memory>

namespace Studio
{

/// One message of the log as it is shown.
struct LogEntry
{
    QDateTime Time;
    TQL::ELogSeverity Severity = TQL::ELogSeverity::Information;
    QString Category;
    QString Text;
};

/// The newest messages of the log as a table: time, severity, where from, message. It receives while it lives, from any
/// thread, and takes messages over on the UI thread, a burst of them at once. Made and used on the UI thread.
class VLogModel : public QAbstractTableModel
{
    Q_OBJECT

public:
    static constexpr std::size_t UsualLimit = 5000; ///< messages
    static constexpr int SeverityRole = Qt::UserRole;

    explicit VLogModel(std::size_t i_Limit = UsualLimit, QObject* i_pParent = nullptr);
    ~VLogModel() override;

    void Clear();

    /// "12:00:01.250 warning Studio: text".
    QString LineOf(int i_Row) const;

    int rowCount(const QModelIndex& i_rParent = {}) const override;
    int columnCount(const QModelIndex& i_rParent = {}) const override;
    QVariant data(const QModelIndex& i_rIndex, int i_Role) const override;
    QVariant headerData(int i_Section, Qt::Orientation i_Orientation, int i_Role) const override;

private:
    class Inbox;

    void Take();
    void DropOldest(std::size_t i_Count);

    const std::size_t m_Limit;
    std::deque<LogEntry> m_Entries;
    const std::shared_ptr<Inbox> m_pInbox;
    std::shared_ptr<void> m_pReceiver; ///< of the log
};

} // namespace Studio

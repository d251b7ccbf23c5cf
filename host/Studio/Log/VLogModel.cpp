#include "Studio/Log/VLogModel.h"

#include <QtCore/QMetaObject>

#include <algorithm>
#include <iterator>
#include <mutex>
#include <utility>

namespace Studio
{

namespace
{

QString SeverityText(TQL::ELogSeverity i_Severity)
{
    switch (i_Severity)
    {
    case TQL::ELogSeverity::Error:
        return VLogModel::tr("error");
    case TQL::ELogSeverity::Warning:
        return VLogModel::tr("warning");
    case TQL::ELogSeverity::Information:
        return VLogModel::tr("info");
    case TQL::ELogSeverity::Detail:
        break;
    }
    return VLogModel::tr("detail");
}

QString TextOf(std::string_view i_Text)
{
    return QString::fromUtf8(i_Text.data(), static_cast<qsizetype>(i_Text.size()));
}

QString TimeOf(const LogEntry& i_rEntry)
{
    return i_rEntry.Time.toString(QStringLiteral("hh:mm:ss.zzz"));
}

} // namespace

/// Where messages wait for the UI thread: the newest ones, when more come than are taken.
class VLogModel::Inbox
{
public:
    Inbox(VLogModel& i_rModel, std::size_t i_Limit) : m_pModel(&i_rModel), m_Limit(i_Limit) {}

    void Put(const TQL::LogMessage& i_rMessage)
    {
        const std::lock_guard lock(m_Mutex);
        if (!m_pModel)
            return;
        if (m_Waiting.empty())
            QMetaObject::invokeMethod(m_pModel, &VLogModel::Take, Qt::QueuedConnection);
        m_Waiting.push_back(
            {QDateTime::currentDateTime(), i_rMessage.Severity, TextOf(i_rMessage.Category), TextOf(i_rMessage.Text)});
        if (m_Waiting.size() > m_Limit)
            m_Waiting.pop_front();
    }

    std::deque<LogEntry> TakeAll()
    {
        const std::lock_guard lock(m_Mutex);
        return std::exchange(m_Waiting, {});
    }

    /// The model goes: nothing is posted to it any more.
    void Close()
    {
        const std::lock_guard lock(m_Mutex);
        m_pModel = nullptr;
    }

private:
    std::mutex m_Mutex;
    VLogModel* m_pModel; // guarded by m_Mutex
    const std::size_t m_Limit;
    std::deque<LogEntry> m_Waiting; // guarded by m_Mutex
};

VLogModel::VLogModel(std::size_t i_Limit, QObject* i_pParent)
    : QAbstractTableModel(i_pParent)
    , m_Limit(i_Limit)
    , m_pInbox(std::make_shared<Inbox>(*this, i_Limit))
    , m_pReceiver(
          TQL::Log::AddSink([pInbox = m_pInbox](const TQL::LogMessage& i_rMessage) { pInbox->Put(i_rMessage); }))
{
}

VLogModel::~VLogModel()
{
    m_pReceiver.reset();
    m_pInbox->Close();
}

void VLogModel::Take()
{
    std::deque<LogEntry> entries = m_pInbox->TakeAll();
    if (entries.empty())
        return;
    const std::size_t total = m_Entries.size() + entries.size();
    DropOldest(std::min(m_Entries.size(), total > m_Limit ? total - m_Limit : 0));
    const int first = rowCount();
    beginInsertRows({}, first, first + static_cast<int>(entries.size()) - 1);
    std::ranges::move(entries, std::back_inserter(m_Entries));
    endInsertRows();
}

void VLogModel::DropOldest(std::size_t i_Count)
{
    if (i_Count == 0)
        return;
    beginRemoveRows({}, 0, static_cast<int>(i_Count) - 1);
    m_Entries.erase(m_Entries.begin(), m_Entries.begin() + static_cast<std::ptrdiff_t>(i_Count));
    endRemoveRows();
}

void VLogModel::Clear()
{
    DropOldest(m_Entries.size());
}

QString VLogModel::LineOf(int i_Row) const
{
    const LogEntry& rEntry = m_Entries[static_cast<std::size_t>(i_Row)];
    return QStringLiteral("%1 %2 %3: %4")
        .arg(TimeOf(rEntry), SeverityText(rEntry.Severity), rEntry.Category, rEntry.Text);
}

int VLogModel::rowCount(const QModelIndex& i_rParent) const
{
    return i_rParent.isValid() ? 0 : static_cast<int>(m_Entries.size());
}

int VLogModel::columnCount(const QModelIndex& i_rParent) const
{
    return i_rParent.isValid() ? 0 : 4;
}

QVariant VLogModel::data(const QModelIndex& i_rIndex, int i_Role) const
{
    if (!i_rIndex.isValid())
        return {};
    const LogEntry& rEntry = m_Entries[static_cast<std::size_t>(i_rIndex.row())];
    if (i_Role == SeverityRole)
        return static_cast<int>(rEntry.Severity);
    if (i_Role == Qt::ToolTipRole)
        return rEntry.Text;
    if (i_Role != Qt::DisplayRole)
        return {};
    switch (i_rIndex.column())
    {
    case 0:
        return TimeOf(rEntry);
    case 1:
        return SeverityText(rEntry.Severity);
    case 2:
        return rEntry.Category;
    default:
        return rEntry.Text;
    }
}

QVariant VLogModel::headerData(int i_Section, Qt::Orientation i_Orientation, int i_Role) const
{
    if (i_Orientation != Qt::Horizontal || i_Role != Qt::DisplayRole)
        return {};
    const QString titles[] = {tr("Time"), tr("Severity"), tr("From"), tr("Message")};
    return i_Section >= 0 && i_Section < 4 ? titles[i_Section] : QVariant();
}

} // namespace Studio

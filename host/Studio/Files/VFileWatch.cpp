#include "Studio/Files/VFileWatch.h"

#include "Studio/Common/Paths.h"

#include <QtCore/QStringList>

#include <system_error>

namespace Studio
{

namespace
{

QString TextOf(const std::filesystem::path& i_rPath)
{
    return QString::fromStdString(TextFromPath(i_rPath));
}

} // namespace

VFileWatch::VFileWatch(std::chrono::milliseconds i_Settle, QObject* i_pParent) : QObject(i_pParent)
{
    m_Settle.setInterval(i_Settle);
    m_Settle.setSingleShot(true);
    connect(&m_Settle, &QTimer::timeout, this, &VFileWatch::Look);
    connect(&m_Watcher, &QFileSystemWatcher::fileChanged, this, &VFileWatch::Stir);
    connect(&m_Watcher, &QFileSystemWatcher::directoryChanged, this, &VFileWatch::Stir);
}

void VFileWatch::Watch(const std::filesystem::path& i_rPath)
{
    if (m_Files.insert_or_assign(i_rPath, VFileSettling(StampOf(i_rPath))).second)
        m_Folders.insert(i_rPath.parent_path());
    Attach(i_rPath);
}

void VFileWatch::Unwatch(const std::filesystem::path& i_rPath)
{
    if (m_Files.erase(i_rPath) == 0)
        return;
    m_Watcher.removePath(TextOf(i_rPath));
    const auto folder = i_rPath.parent_path();
    m_Folders.erase(m_Folders.find(folder));
    if (!m_Folders.contains(folder))
        m_Watcher.removePath(TextOf(folder));
}

/// A file that was replaced or removed has left the watcher; its folder tells when there is one again.
void VFileWatch::Attach(const std::filesystem::path& i_rPath)
{
    const QString file = TextOf(i_rPath);
    const QString folder = TextOf(i_rPath.parent_path());
    std::error_code error;
    if (!m_Watcher.files().contains(file) && std::filesystem::exists(i_rPath, error))
        m_Watcher.addPath(file);
    if (!m_Watcher.directories().contains(folder))
        m_Watcher.addPath(folder);
}

/// Something happened, maybe to another file of a folder: from now on the files are looked at until they stand still.
void VFileWatch::Stir()
{
    if (m_Settle.isActive())
        return;
    Look();
    m_Settle.start(); // also where a first look saw nothing move: it may have come too early
}

void VFileWatch::Look()
{
    QStringList changed;
    bool bMoving = false;
    for (auto& [path, rFile] : m_Files)
    {
        Attach(path);
        const auto look = rFile.Look(StampOf(path));
        bMoving = bMoving || look == VFileSettling::ELook::Moving;
        if (look == VFileSettling::ELook::Changed)
            changed.append(TextOf(path));
    }
    if (bMoving)
        m_Settle.start();
    for (const QString& rPath : changed) // last: whoever hears of it may watch other files
        Q_EMIT FileChanged(rPath);
}

} // namespace Studio

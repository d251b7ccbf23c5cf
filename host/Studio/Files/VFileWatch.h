#pragma once

#include "Studio/Files/FileSettling.h"

#include <QtCore/QFileSystemWatcher>
#include <QtCore/QObject>
#include <QtCore/QString>
#include <QtCore/QTimer>

#include <chrono>
#include <filesystem>
#include <map>
#include <set>

namespace Studio
{

/// Tells when a file was written again: once for each change, when its size and its time have stood still for a while,
/// so not while another program is still writing. A file that is replaced by another of its name is followed, one that
/// is missing is waited for. Changes that keep size and time are not seen. Owned by a window; UI thread.
class VFileWatch : public QObject
{
    Q_OBJECT

public:
    /// i_Settle: how long a file has to stand still.
    explicit VFileWatch(std::chrono::milliseconds i_Settle = std::chrono::milliseconds(500),
                        QObject* i_pParent = nullptr);

    /// The file as it is now is the one that is known. Again for a file that is watched already: known anew. The path
    /// is absolute.
    void Watch(const std::filesystem::path& i_rPath);
    void Unwatch(const std::filesystem::path& i_rPath);

Q_SIGNALS:
    void FileChanged(const QString& i_rPath); ///< as it was given to Watch

private:
    void Attach(const std::filesystem::path& i_rPath);
    void Stir();
    void Look();

    QFileSystemWatcher m_Watcher;
    QTimer m_Settle;
    std::map<std::filesystem::path, VFileSettling> m_Files;
    std::multiset<std::filesystem::path> m_Folders; ///< of each of them
};

} // namespace Studio

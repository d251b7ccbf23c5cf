#pragma once

#include <QtCore/QObject>

#include <cstddef>
#include <filesystem>
#include <functional>
#include <span>
#include <vector>

namespace Studio
{

/// The recordings opened last, newest first, kept between runs in a file of the operator's folder. Several studios may
/// run: the file is read again before each change, so none forgets what the other opened. A list that cannot be written
/// is kept for this run. Owned by a window; UI thread.
class VRecentFiles : public QObject
{
    Q_OBJECT

public:
    static constexpr std::size_t Most = 12;

    struct Entry
    {
        std::filesystem::path Path; ///< absolute
        bool bMissing = false;      ///< there is no such file now
    };

    /// i_File is where the list is kept; it and its folder need not exist. Empty: for this run only.
    explicit VRecentFiles(std::filesystem::path i_File, QObject* i_pParent = nullptr);

    /// As it stands now, with a look at each file.
    std::vector<Entry> List() const;

    void Add(const std::filesystem::path& i_rPath) { Add(std::span(&i_rPath, 1)); } ///< to the front, once
    void Add(std::span<const std::filesystem::path> i_Paths);                       ///< the last one is the newest
    void Remove(const std::filesystem::path& i_rPath);
    void RemoveMissing();

Q_SIGNALS:
    void Changed();

private:
    void Change(const std::function<void(std::vector<std::filesystem::path>&)>& i_rChange);
    void Load();
    void Save();

    const std::filesystem::path m_File;
    std::vector<std::filesystem::path> m_Paths;
    bool m_bUnsaved = false; ///< the last change could not be written
};

} // namespace Studio

#pragma once

#include "Studio/Files/VFileWatch.h"
#include "Studio/Files/VRecentFiles.h"
#include "Studio/Files/VRecordingLoader.h"

#include <QtCore/QObject>
#include <QtCore/QString>

#include <filesystem>
#include <map>
#include <set>
#include <string>
#include <vector>

namespace Studio
{

class VStudioSession;

/// The files that a window has open: reads them, remembers them among the recent ones, watches them and reads them
/// again on request. Knows no widgets. Owned by the main window; the session outlives it. UI thread.
class VOpenFiles : public QObject
{
    Q_OBJECT

public:
    explicit VOpenFiles(VStudioSession& i_rSession, QObject* i_pParent = nullptr);
    ~VOpenFiles() override;

    VRecordingLoader& Loader() { return m_Loader; }
    VRecentFiles& Recent() { return m_Recent; }

    /// Gives the loader's number of the file; the loader's signals tell how it goes on.
    int Open(const std::filesystem::path& i_rPath);

    /// Reads the file of a context again. Nothing happens for a context without a file.
    void Reload(const QString& i_rContextName);

    /// Closes a recording, if that is what the context is. Its file is forgotten where no other context is of it.
    void Close(const QString& i_rContextName);

Q_SIGNALS:
    /// The file of a context was written again by somebody else since it was read.
    void ChangedOnDisk(const QString& i_rContextName, const QString& i_rFileName);
    /// What ChangedOnDisk said holds no more: the file is being read again, or the recording was closed.
    void ChangeTaken(const QString& i_rContextName);

private:
    void End(int i_Number, const QString& i_rContextName);
    void Remember();
    void OfferChange(const std::filesystem::path& i_rPath);
    std::set<std::string> ContextsOf(const std::filesystem::path& i_rPath) const;
    bool IsBeingRead(const std::filesystem::path& i_rPath) const { return m_BeingRead.contains(i_rPath); }

    VStudioSession& m_rSession;
    VRecentFiles m_Recent;
    VFileWatch m_Watch;
    std::vector<std::filesystem::path> m_ToRemember;    ///< read, and not among the recent ones yet
    std::map<int, std::filesystem::path> m_Reading;     ///< by number
    std::multiset<std::filesystem::path> m_BeingRead;   ///< the same
    std::set<std::filesystem::path> m_ChangedMeanwhile; ///< while they were read
    VRecordingLoader m_Loader;                          ///< the first to go
};

} // namespace Studio

#pragma once

#include "Recordings/Common/ReadOptions.h"
#include "Recordings/Common/VReadProgress.h"
#include "Recordings/Common/VRecording.h"
#include "TQL/IResult.h"

#include <QtCore/QObject>
#include <QtCore/QString>
#include <QtCore/QTimer>

#include <filesystem>
#include <functional>
#include <map>
#include <memory>
#include <string>

namespace Studio
{

class VStudioSession;

/// Reads recordings on a thread of its own, one file after the other, and hands each to the session on the UI thread.
/// Every number that Open or Reload gave ends with exactly one of Finished, Failed and Cancelled, unless the loader is
/// destroyed before: then the file that is being read is dropped at its next piece, and nothing is handed over any
/// more. Of however many files, only a few are handed over in one turn of the UI thread. Owned by a window; the session
/// outlives it. All calls and signals on the UI thread.
class VRecordingLoader : public QObject
{
    Q_OBJECT

public:
    /// Reads a file; called on the loader's thread, with a progress in the options. The error is one line that names
    /// the file.
    using Read = std::function<TQL::IResult(const std::filesystem::path& i_rPath, Recordings::VRecording& o_rRecording,
                                            std::string& o_rError, const Recordings::ReadOptions& i_rOptions)>;
    /// Takes what was read from a file, in place of the context of that name unless it is empty; gives the name of the
    /// context, empty when that context is gone. UI thread.
    using Take = std::function<std::string(Recordings::VRecording i_Recording, const std::filesystem::path& i_rPath,
                                           const std::string& i_rContextName)>;

    explicit VRecordingLoader(VStudioSession& i_rSession, QObject* i_pParent = nullptr);
    VRecordingLoader(Read i_Read, Take i_Take, QObject* i_pParent = nullptr);
    ~VRecordingLoader() override;

    /// Queues a file that becomes a context of its own. Gives its number, above 0; Started is emitted before.
    int Open(const std::filesystem::path& i_rPath);

    /// Queues a file that takes the place of what a context holds.
    int Reload(const std::filesystem::path& i_rPath, const std::string& i_rContextName);

    /// Whether files with uneven times that are queued from now on are resampled to an even rate. Off at first.
    void SetResampling(bool i_bOn) { m_bResampling = i_bOn; }

    /// Drops a file that is queued or being read; an unknown number, or one that has ended, does nothing.
    void Cancel(int i_Number);
    void CancelAll();

    int LastNumber() const { return m_LastNumber; } ///< of the file that was queued last; 0 for none

    bool IsIdle() const { return m_Jobs.empty(); } ///< nothing is queued or being read

Q_SIGNALS:
    void Started(int i_Number, const QString& i_rFileName); ///< stands in the queue
    void Progressed(int i_Number, double i_Fraction);       ///< 0 to 1, never less than before
    void Finished(int i_Number, const QString& i_rContextName);
    void Failed(int i_Number, const QString& i_rMessage); ///< one line
    void Cancelled(int i_Number);

private:
    class Worker;
    struct Job;

    int Enqueue(const std::filesystem::path& i_rPath, const std::string& i_rContextName);
    void DeliverNext();
    void Deliver(const std::shared_ptr<Job>& i_rpJob);
    void ShowProgress(const std::shared_ptr<Job>& i_rpJob);

    Take m_Take;
    int m_LastNumber = 0;
    bool m_bResampling = false;
    std::map<int, std::shared_ptr<Job>> m_Jobs; ///< those that have not ended, by number
    QTimer m_Deliveries;                        ///< runs while the worker has outcomes to hand over
    std::unique_ptr<Worker> m_pWorker;
};

} // namespace Studio

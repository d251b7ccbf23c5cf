#include "Studio/Files/VRecordingLoader.h"

#include "Recordings/Common/FileMessage.h"
#include "Recordings/OpenRecording.h"
#include "Studio/Common/Paths.h"
#include "Studio/Session/VStudioSession.h"

#include <QtCore/QElapsedTimer>
#include <QtCore/QMetaObject>

#include <atomic>
#include <condition_variable>
#include <deque>
#include <exception>
#include <mutex>
#include <thread>
#include <utility>
#include <vector>

namespace Studio
{

namespace
{

// What is handed over in one turn of the UI thread.
constexpr int mostInATurn = 32;    // files
constexpr qint64 longestTurn = 20; // ms

} // namespace

/// One file. The worker writes the outcome before it lays the job down; from then on it belongs to the UI thread.
struct VRecordingLoader::Job
{
    int Number = 0;
    std::filesystem::path Path;
    std::string ContextName; ///< to be replaced; empty for a new one

    std::atomic<bool> bDropped{false};
    bool bResample = false;
    std::atomic<double> Fraction{0.0};
    std::atomic<bool> bProgressPosted{false}; ///< a notice of progress is on its way

    TQL::IResult Result;
    Recordings::VRecording Recording;
    std::string Error;
};

/// The thread and its queue.
class VRecordingLoader::Worker
{
public:
    Worker(VRecordingLoader& i_rLoader, Read i_Read) : m_rLoader(i_rLoader), m_Read(std::move(i_Read))
    {
        m_Thread = std::thread([this] { Work(); });
    }

    ~Worker()
    {
        {
            const std::lock_guard lock(m_Mutex);
            m_bStopping = true;
        }
        m_Wake.notify_one();
        m_Thread.join();
    }

    void Add(std::shared_ptr<Job> i_pJob)
    {
        {
            const std::lock_guard lock(m_Mutex);
            m_Queue.push_back(std::move(i_pJob));
        }
        m_Wake.notify_one();
    }

    /// The file that was done first; null when none is left.
    std::shared_ptr<Job> TakeDone()
    {
        const std::lock_guard lock(m_Mutex);
        if (m_Done.empty())
            return nullptr;
        auto pJob = std::move(m_Done.front());
        m_Done.pop_front();
        return pJob;
    }

private:
    void Work()
    {
        std::unique_lock lock(m_Mutex);
        for (;;)
        {
            m_Wake.wait(lock, [this] { return m_bStopping || !m_Queue.empty(); });
            if (m_bStopping)
                return;
            auto pJob = std::move(m_Queue.front());
            m_Queue.pop_front();
            lock.unlock();
            if (!pJob->bDropped)
                Run(std::move(pJob));
            lock.lock();
        }
    }

    void Run(std::shared_ptr<Job> i_pJob)
    {
        Recordings::VReadProgress progress([&](double i_Fraction) { return Tell(i_pJob, i_Fraction); },
                                           &i_pJob->bDropped);
        try
        {
            i_pJob->Result = m_Read(i_pJob->Path, i_pJob->Recording, i_pJob->Error, {i_pJob->bResample, &progress});
        }
        catch (const std::exception& rException) // memory, above all; the studio goes on
        {
            i_pJob->Recording = {};
            i_pJob->Result = TQL::Result::FailedWithException;
            i_pJob->Error =
                Recordings::FileMessage(i_pJob->Path, std::string("reading failed: ") + rException.what() + ".");
        }
        if (!i_pJob->bDropped)
            LayDown(std::move(i_pJob));
    }

    /// The UI thread is told of the first one that waits, and takes them one by one. A notice for each would keep it
    /// from painting and from the operator until the last file.
    void LayDown(std::shared_ptr<Job> i_pJob)
    {
        bool bFirst = false;
        {
            const std::lock_guard lock(m_Mutex);
            bFirst = m_Done.empty();
            m_Done.push_back(std::move(i_pJob));
        }
        if (bFirst)
            QMetaObject::invokeMethod(
                &m_rLoader, [&rLoader = m_rLoader] { rLoader.m_Deliveries.start(); }, Qt::QueuedConnection);
    }

    /// However often a reader tells its progress, the UI thread never has more than one notice to take.
    bool Tell(const std::shared_ptr<Job>& i_rpJob, double i_Fraction)
    {
        i_rpJob->Fraction = i_Fraction;
        if (!i_rpJob->bProgressPosted.exchange(true))
            QMetaObject::invokeMethod(
                &m_rLoader, [&rLoader = m_rLoader, pJob = i_rpJob] { rLoader.ShowProgress(pJob); },
                Qt::QueuedConnection);
        return true;
    }

    VRecordingLoader& m_rLoader;
    const Read m_Read;
    std::mutex m_Mutex;
    bool m_bStopping = false; // guarded by m_Mutex
    std::condition_variable m_Wake;
    std::deque<std::shared_ptr<Job>> m_Queue; // guarded by m_Mutex
    std::deque<std::shared_ptr<Job>> m_Done;  // guarded by m_Mutex
    std::thread m_Thread;
};

VRecordingLoader::VRecordingLoader(VStudioSession& i_rSession, QObject* i_pParent)
    : VRecordingLoader([](const std::filesystem::path& i_rPath, Recordings::VRecording& o_rRecording,
                          std::string& o_rError, const Recordings::ReadOptions& i_rOptions)
                       { return Recordings::OpenRecording(i_rPath, o_rRecording, o_rError, i_rOptions); },
                       [&i_rSession](Recordings::VRecording i_Recording, const std::filesystem::path& i_rPath,
                                     const std::string& i_rContextName)
                       {
                           if (i_rContextName.empty())
                               return i_rSession.AddRecording(std::move(i_Recording), i_rPath);
                           return i_rSession.ReplaceRecording(i_rContextName, std::move(i_Recording)) ? i_rContextName
                                                                                                      : std::string();
                       },
                       i_pParent)
{
}

VRecordingLoader::VRecordingLoader(Read i_Read, Take i_Take, QObject* i_pParent)
    : QObject(i_pParent), m_Take(std::move(i_Take)), m_pWorker(std::make_unique<Worker>(*this, std::move(i_Read)))
{
    connect(&m_Deliveries, &QTimer::timeout, this, &VRecordingLoader::DeliverNext); // at once, after all other events
}

/// The thread ends first: what it posted until then dies with this object.
VRecordingLoader::~VRecordingLoader()
{
    for (const auto& [number, pJob] : m_Jobs)
        pJob->bDropped = true;
    m_pWorker.reset();
}

int VRecordingLoader::Open(const std::filesystem::path& i_rPath)
{
    return Enqueue(i_rPath, {});
}

int VRecordingLoader::Reload(const std::filesystem::path& i_rPath, const std::string& i_rContextName)
{
    return Enqueue(i_rPath, i_rContextName);
}

int VRecordingLoader::Enqueue(const std::filesystem::path& i_rPath, const std::string& i_rContextName)
{
    auto pJob = std::make_shared<Job>();
    const int number = pJob->Number = ++m_LastNumber;
    pJob->Path = i_rPath;
    pJob->bResample = m_bResampling;
    pJob->ContextName = i_rContextName;
    m_Jobs.emplace(number, pJob);
    Q_EMIT Started(number, QString::fromStdString(TextFromPath(i_rPath.filename())));
    m_pWorker->Add(std::move(pJob));
    return number;
}

void VRecordingLoader::Cancel(int i_Number)
{
    const auto job = m_Jobs.find(i_Number);
    if (job == m_Jobs.end())
        return;
    job->second->bDropped = true; // the thread hears it at its next piece; nobody waits for that
    m_Jobs.erase(job);
    Q_EMIT Cancelled(i_Number);
}

void VRecordingLoader::CancelAll()
{
    std::vector<int> numbers;
    for (const auto& [number, pJob] : m_Jobs)
        numbers.push_back(number);
    // The newest first, so that none begins because the one before it went.
    for (const int number : std::vector<int>(numbers.rbegin(), numbers.rend()))
        Cancel(number);
}

/// A few in one turn, for a turn may paint whole plots.
void VRecordingLoader::DeliverNext()
{
    QElapsedTimer turn;
    turn.start();
    for (int i = 0; i < mostInATurn && turn.elapsed() < longestTurn; ++i)
    {
        const auto pJob = m_pWorker->TakeDone();
        if (!pJob)
            return m_Deliveries.stop();
        Deliver(pJob);
    }
}

void VRecordingLoader::Deliver(const std::shared_ptr<Job>& i_rpJob)
{
    const int number = i_rpJob->Number;
    if (m_Jobs.erase(number) == 0)
        return; // cancelled
    if (i_rpJob->Result.IsError())
    {
        Q_EMIT Failed(number, QString::fromStdString(i_rpJob->Error));
        return;
    }
    const std::string name = m_Take(std::move(i_rpJob->Recording), i_rpJob->Path, i_rpJob->ContextName);
    if (name.empty())
        Q_EMIT Failed(number, QString::fromStdString(Recordings::FileMessage(
                                  i_rpJob->Path, "the recording that it was to replace has been closed.")));
    else
        Q_EMIT Finished(number, QString::fromStdString(name));
}

void VRecordingLoader::ShowProgress(const std::shared_ptr<Job>& i_rpJob)
{
    i_rpJob->bProgressPosted = false;
    if (m_Jobs.contains(i_rpJob->Number))
        Q_EMIT Progressed(i_rpJob->Number, i_rpJob->Fraction);
}

} // namespace Studio

#include "Studio/Files/VOpenFiles.h"

#include "Channels/Contexts/VChannelContext.h"
#include "Channels/VChannelService.h"
#include "Studio/Common/Paths.h"
#include "Studio/Session/VStudioSession.h"

#include <system_error>
#include <utility>

namespace Studio
{

namespace
{

std::filesystem::path RecentFilesPath(const VStudioSession& i_rSession)
{
    return i_rSession.SettingsFolder().empty() ? std::filesystem::path()
                                               : i_rSession.SettingsFolder() / "recent-files.json";
}

std::filesystem::path Whole(const std::filesystem::path& i_rPath)
{
    std::error_code error;
    const auto path = std::filesystem::absolute(i_rPath, error);
    return (error ? i_rPath : path).lexically_normal();
}

} // namespace

VOpenFiles::VOpenFiles(VStudioSession& i_rSession, QObject* i_pParent)
    : QObject(i_pParent), m_rSession(i_rSession), m_Recent(RecentFilesPath(i_rSession)), m_Loader(i_rSession)
{
    connect(&m_Watch, &VFileWatch::FileChanged, this,
            [this](const QString& i_rPath) { OfferChange(PathFromText(i_rPath.toStdString())); });
    connect(&m_Loader, &VRecordingLoader::Finished, this, &VOpenFiles::End);
    connect(&m_Loader, &VRecordingLoader::Failed, this, [this](int i_Number) { End(i_Number, {}); });
    connect(&m_Loader, &VRecordingLoader::Cancelled, this, [this](int i_Number) { End(i_Number, {}); });
}

VOpenFiles::~VOpenFiles()
{
    m_Recent.Add(m_ToRemember);
}

int VOpenFiles::Open(const std::filesystem::path& i_rPath)
{
    const auto path = Whole(i_rPath);
    m_Watch.Watch(path); // before it is read: what is written while it is read shall not be missed
    const int number = m_Loader.Open(path);
    m_Reading.emplace(number, path);
    m_BeingRead.insert(path);
    return number;
}

void VOpenFiles::Reload(const QString& i_rContextName)
{
    const auto path = m_rSession.FileOf(i_rContextName.toStdString());
    if (path.empty())
        return;
    m_Watch.Watch(path);
    m_Reading.emplace(m_Loader.Reload(path, i_rContextName.toStdString()), path);
    m_BeingRead.insert(path);
    Q_EMIT ChangeTaken(i_rContextName);
}

void VOpenFiles::Close(const QString& i_rContextName)
{
    const auto path = m_rSession.FileOf(i_rContextName.toStdString());
    if (!m_rSession.CloseRecording(i_rContextName.toStdString()))
        return;
    Q_EMIT ChangeTaken(i_rContextName);
    if (!IsBeingRead(path) && ContextsOf(path).empty())
        m_Watch.Unwatch(path);
}

void VOpenFiles::End(int i_Number, const QString& i_rContextName)
{
    const auto reading = m_Reading.find(i_Number);
    if (reading == m_Reading.end())
        return;
    const std::filesystem::path path = reading->second;
    m_Reading.erase(reading);
    m_BeingRead.erase(m_BeingRead.find(path));
    if (!i_rContextName.isEmpty())
        m_ToRemember.push_back(path);
    Remember();
    if (IsBeingRead(path))
        return;
    if (i_rContextName.isEmpty() && ContextsOf(path).empty())
        m_Watch.Unwatch(path);
    else if (m_ChangedMeanwhile.erase(path) != 0)
        OfferChange(path);
}

/// The list of recent files is a file: it is written once for all that were opened together.
void VOpenFiles::Remember()
{
    if (m_Loader.IsIdle())
        m_Recent.Add(std::exchange(m_ToRemember, {}));
}

void VOpenFiles::OfferChange(const std::filesystem::path& i_rPath)
{
    if (IsBeingRead(i_rPath))
    {
        m_ChangedMeanwhile.insert(i_rPath);
        return;
    }
    const QString file = QString::fromStdString(TextFromPath(i_rPath.filename()));
    for (const std::string& rName : ContextsOf(i_rPath))
        Q_EMIT ChangedOnDisk(QString::fromStdString(rName), file);
}

std::set<std::string> VOpenFiles::ContextsOf(const std::filesystem::path& i_rPath) const
{
    std::set<std::string> names;
    for (const auto& rpContext : m_rSession.Channels().GetContexts())
        if (m_rSession.FileOf(rpContext->GetName()) == i_rPath)
            names.insert(rpContext->GetName());
    return names;
}

} // namespace Studio

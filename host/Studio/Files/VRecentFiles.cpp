#include "Studio/Files/VRecentFiles.h"

#include "Studio/Common/Paths.h"
#include "TQL/Log.h"

#include <QtCore/QDir>
#include <QtCore/QFile>
#include <QtCore/QFileInfo>
#include <QtCore/QJsonArray>
#include <QtCore/QJsonDocument>
#include <QtCore/QSaveFile>

#include <algorithm>
#include <system_error>
#include <utility>

namespace Studio
{

namespace
{

QString TextOf(const std::filesystem::path& i_rPath)
{
    return QString::fromStdString(TextFromPath(i_rPath));
}

/// The one form under which a file stands in the list.
std::filesystem::path Normal(const std::filesystem::path& i_rPath)
{
    std::error_code error;
    const std::filesystem::path whole = std::filesystem::absolute(i_rPath, error);
    return (error ? i_rPath : whole).lexically_normal();
}

bool IsMissing(const std::filesystem::path& i_rPath)
{
    std::error_code error;
    return !std::filesystem::is_regular_file(i_rPath, error);
}

} // namespace

VRecentFiles::VRecentFiles(std::filesystem::path i_File, QObject* i_pParent)
    : QObject(i_pParent), m_File(std::move(i_File))
{
    Load();
}

std::vector<VRecentFiles::Entry> VRecentFiles::List() const
{
    std::vector<Entry> entries;
    for (const std::filesystem::path& rPath : m_Paths)
        entries.push_back({rPath, IsMissing(rPath)});
    return entries;
}

void VRecentFiles::Add(std::span<const std::filesystem::path> i_Paths)
{
    Change(
        [&](std::vector<std::filesystem::path>& io_rPaths)
        {
            for (const std::filesystem::path& rPath : i_Paths)
            {
                const std::filesystem::path path = Normal(rPath);
                std::erase(io_rPaths, path);
                io_rPaths.insert(io_rPaths.begin(), path);
                io_rPaths.resize(std::min(io_rPaths.size(), Most));
            }
        });
}

void VRecentFiles::Remove(const std::filesystem::path& i_rPath)
{
    Change([&](std::vector<std::filesystem::path>& io_rPaths) { std::erase(io_rPaths, Normal(i_rPath)); });
}

void VRecentFiles::RemoveMissing()
{
    Change([](std::vector<std::filesystem::path>& io_rPaths) { std::erase_if(io_rPaths, IsMissing); });
}

void VRecentFiles::Change(const std::function<void(std::vector<std::filesystem::path>&)>& i_rChange)
{
    const auto before = m_Paths;
    if (!m_bUnsaved) // else the file knows less than this object
        Load();
    const auto found = m_Paths;
    i_rChange(m_Paths);
    if (m_Paths != found || m_bUnsaved)
        Save();
    if (m_Paths != before)
        Q_EMIT Changed();
}

void VRecentFiles::Load()
{
    QFile file(TextOf(m_File));
    if (m_File.empty() || !file.open(QIODevice::ReadOnly))
        return;
    m_Paths.clear();
    for (const auto& rValue : QJsonDocument::fromJson(file.readAll()).array())
        if (const auto path = PathFromText(rValue.toString().toStdString());
            !path.empty() && m_Paths.size() < Most && std::ranges::find(m_Paths, path) == m_Paths.end())
            m_Paths.push_back(path);
}

void VRecentFiles::Save()
{
    if (m_File.empty())
        return;
    QJsonArray rows;
    for (const std::filesystem::path& rPath : m_Paths)
        rows.append(TextOf(rPath));
    QDir().mkpath(QFileInfo(TextOf(m_File)).path());
    QSaveFile file(TextOf(m_File));
    const QByteArray bytes = QJsonDocument(rows).toJson();
    const bool bSaved = file.open(QIODevice::WriteOnly) && file.write(bytes) == bytes.size() && file.commit();
    if (!bSaved && !m_bUnsaved) // told once
        TQL::Log::Format(TQL::Log::GetCategory("Studio"), TQL::ELogSeverity::Warning,
                         "The list of recent files cannot be kept in %1%: %2%", TextFromPath(m_File),
                         file.errorString().toStdString());
    m_bUnsaved = !bSaved;
}

} // namespace Studio

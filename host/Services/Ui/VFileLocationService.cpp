#include "Services/Ui/VFileLocationService.h"

#include <QtCore/QDir>
#include <QtCore/QStandardPaths>

namespace Services
{

VFileLocationService::VFileLocationService(std::string i_BaseDirectory, ThreadCheckPointer i_pCheck)
    : m_BaseDirectory(i_BaseDirectory.empty()
                          ? QStandardPaths::writableLocation(QStandardPaths::AppDataLocation).toStdString()
                          : std::move(i_BaseDirectory))
    , m_pCheck(std::move(i_pCheck))
{
}

std::string VFileLocationService::GetExtension(int i_Kind) const
{
    CheckThread(m_pCheck, "IFileLocationService::GetExtension");
    return i_Kind == KindGraphFile ? ".graphplot" : "";
}

std::vector<std::string> VFileLocationService::GetUserDirectories(int i_Kind) const
{
    CheckThread(m_pCheck, "IFileLocationService::GetUserDirectories");
    if (i_Kind != KindGraphFile)
        return {};
    const QString folder = QDir(QString::fromStdString(m_BaseDirectory)).filePath(QStringLiteral("Graphs"));
    QDir().mkpath(folder); // one that cannot be made shows at the first save, with the reason
    return {QDir::cleanPath(folder).toStdString()};
}

} // namespace Services

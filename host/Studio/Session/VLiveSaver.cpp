#include "Studio/Session/VLiveSaver.h"

#include "Channels/Contexts/VChannelContext.h"
#include "Streaming/SaveLive.h"
#include "Studio/Common/Paths.h"

#include <QtCore/QMetaObject>

#include <exception>
#include <string>
#include <utility>
#include <vector>

namespace Studio
{

VLiveSaver::VLiveSaver(QObject* i_pParent) : QObject(i_pParent) {}

VLiveSaver::~VLiveSaver()
{
    if (m_Thread.joinable())
        m_Thread.join();
}

bool VLiveSaver::Save(std::shared_ptr<const Channels::VChannelContext> i_pContext, const std::filesystem::path& i_rPath)
{
    if (IsSaving() || !i_pContext)
        return false;
    m_Thread = std::thread(
        [this, pContext = std::move(i_pContext), path = i_rPath]
        {
            std::vector<std::string> remarks;
            std::string error;
            try
            {
                if (Streaming::SaveAsC3d(*pContext, path, remarks, error).IsSuccess())
                    error.clear();
            }
            catch (const std::exception&) // out of memory, most likely
            {
                error = TextFromPath(path) + ": there is not enough memory to save so much; save sooner";
            }
            QStringList texts;
            for (const std::string& rRemark : remarks)
                texts.append(QString::fromStdString(rRemark));
            QMetaObject::invokeMethod(
                this,
                [=, this] { Finish(QString::fromStdString(TextFromPath(path)), texts, QString::fromStdString(error)); },
                Qt::QueuedConnection);
        });
    return true;
}

void VLiveSaver::Finish(const QString& i_rPath, const QStringList& i_rRemarks, const QString& i_rError)
{
    m_Thread.join();
    if (i_rError.isEmpty())
        Q_EMIT Saved(i_rPath, i_rRemarks);
    else
        Q_EMIT Failed(i_rError);
}

} // namespace Studio

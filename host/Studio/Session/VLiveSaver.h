#pragma once

#include <QtCore/QObject>
#include <QtCore/QString>
#include <QtCore/QStringList>

#include <filesystem>
#include <memory>
#include <thread>

namespace Channels
{
class VChannelContext;
}

namespace Studio
{

/// Writes what a live context has kept as a C3D file on a thread of its own, one file at a time, while the capture goes
/// on. Destroying it waits until the file that is being written is done. Owned by the window; UI thread.
class VLiveSaver : public QObject
{
    Q_OBJECT

public:
    explicit VLiveSaver(QObject* i_pParent = nullptr);
    ~VLiveSaver() override;

    /// False when a file is being written already. Else Saved or Failed follows.
    bool Save(std::shared_ptr<const Channels::VChannelContext> i_pContext, const std::filesystem::path& i_rPath);

    bool IsSaving() const { return m_Thread.joinable(); }

Q_SIGNALS:
    /// The remarks say what the file could not hold as it was.
    void Saved(const QString& i_rPath, const QStringList& i_rRemarks);
    void Failed(const QString& i_rMessage); ///< one line

private:
    void Finish(const QString& i_rPath, const QStringList& i_rRemarks, const QString& i_rError);

    std::thread m_Thread;
};

} // namespace Studio

#include "Studio/Session/VLiveActions.h"

#include "Channels/VChannelService.h"
#include "Studio/Common/Paths.h"
#include "Studio/Session/ContextNames.h"
#include "Studio/Session/VLiveSaver.h"
#include "Studio/Session/VOscDialog.h"
#include "Studio/Session/VStudioSession.h"
#include "TQL/Log.h"

#include <QtCore/QEventLoop>
#include <QtCore/QScopedValueRollback>
#include <QtCore/QTimer>
#include <QtGui/QAction>
#include <QtGui/QKeySequence>
#include <QtWidgets/QFileDialog>
#include <QtWidgets/QMenu>
#include <QtWidgets/QMessageBox>

#include <chrono>
#include <utility>

namespace Studio
{

namespace
{

constexpr double replaySpeeds[] = {1.0, 2.0, 4.0, 8.0};

QAction* Name(QAction* i_pAction, const char* i_pName)
{
    i_pAction->setObjectName(QString::fromLatin1(i_pName));
    return i_pAction;
}

} // namespace

VLiveActions::VLiveActions(VStudioSession& i_rSession, QMenu& i_rMenu, QWidget& i_rWindow,
                           std::function<void(const std::string&)> i_Tell)
    : QObject(&i_rWindow)
    , m_rSession(i_rSession)
    , m_rWindow(i_rWindow)
    , m_Tell(std::move(i_Tell))
    , m_pSaver(new VLiveSaver(this))
{
    Name(i_rMenu.addAction(tr("Listen for &OSC messages…"), this, &VLiveActions::AskAndListen), "liveListen");
    AddReplayMenu(i_rMenu);
    m_pStop = Name(i_rMenu.addAction(tr("S&top live input"), this, [this] { m_rSession.StopLive(); }), "liveStop");
    i_rMenu.addSeparator();
    m_pSave = Name(i_rMenu.addAction(tr("&Save live data as C3D…"), QKeySequence(Qt::CTRL | Qt::SHIFT | Qt::Key_S),
                                     this, &VLiveActions::AskAndSave),
                   "liveSave");
    connect(&i_rMenu, &QMenu::aboutToShow, this, &VLiveActions::Refresh);
    connect(m_pSaver, &VLiveSaver::Saved, this, &VLiveActions::TellSaved);
    connect(m_pSaver, &VLiveSaver::Failed, this,
            [this](const QString& i_rMessage)
            {
                m_pSaving.reset();
                m_Tell("Not saved: " + i_rMessage.toStdString());
            });
    auto* pMark = new QTimer(this);
    connect(pMark, &QTimer::timeout, this, &VLiveActions::MarkUnsaved);
    pMark->start(std::chrono::milliseconds(500));
    m_rSession.SetAskBeforeLoss([this] { return AskBeforeLoss(); });
    m_rSession.SetLiveWarning([this](const std::string& i_rText) { m_Tell("Live input: " + i_rText); });
}

VLiveActions::~VLiveActions()
{
    m_rSession.SetLiveWarning({});
    m_rSession.SetAskBeforeLoss({});
}

void VLiveActions::AddReplayMenu(QMenu& i_rMenu)
{
    m_pReplay = i_rMenu.addMenu(tr("&Replay the recording as live"));
    m_pReplay->setObjectName(QStringLiteral("liveReplay"));
    for (const double speed : replaySpeeds)
    {
        const QString number = QString::number(speed);
        QAction* pAction = m_pReplay->addAction(tr("&%1 ×").arg(number), this, [this, speed] { Replay(speed); });
        pAction->setObjectName(QStringLiteral("liveReplay") + number);
    }
    m_pReplay->addSeparator();
    m_pLoop = Name(m_pReplay->addAction(tr("Again and a&gain")), "liveLoop");
    m_pLoop->setCheckable(true);
}

void VLiveActions::Refresh()
{
    m_pReplay->setEnabled(m_rSession.CanReplay(m_rSession.CurrentContextName()));
    m_pStop->setEnabled(m_rSession.IsLive());
    m_pSave->setEnabled(!m_pSaver->IsSaving() && m_rSession.Channels().FindContext(LiveContextName) != nullptr);
}

void VLiveActions::AskAndListen()
{
    VOscDialog dialog(&m_rWindow);
    if (dialog.exec() == QDialog::Accepted && m_rSession.MayLoseLive())
        Listen(dialog.Options());
}

void VLiveActions::Listen(const Streaming::VOscInput::Options& i_rOptions)
{
    std::string error;
    if (m_rSession.StartOsc(i_rOptions, error).IsError())
        return m_Tell("Not listening: " + error);
    m_rSession.ShowContext(LiveContextName);
}

void VLiveActions::Replay(double i_Speed)
{
    if (!m_rSession.MayLoseLive())
        return;
    std::string error;
    if (m_rSession.StartReplay(m_rSession.CurrentContextName(), i_Speed, m_pLoop->isChecked(), error).IsError())
        return m_Tell("Not replayed: " + error);
    m_rSession.ShowContext(LiveContextName);
}

void VLiveActions::AskAndSave()
{
    Refresh();
    if (!m_pSave->isEnabled())
    {
        m_pSave->setEnabled(true); // so that its key answers the next time
        return m_Tell(m_pSaver->IsSaving() ? "Live data are being saved already" : "There are no live data to save");
    }
    if (const auto path = AskPath(); !path.empty())
        SaveTo(path);
}

std::filesystem::path VLiveActions::AskPath()
{
    QString path = QFileDialog::getSaveFileName(&m_rWindow, tr("Save live data"), QStringLiteral("live.c3d"),
                                                tr("C3D files (*.c3d)"));
    if (!path.isEmpty() && !path.endsWith(QStringLiteral(".c3d"), Qt::CaseInsensitive))
        path += QStringLiteral(".c3d");
    return PathFromText(path.toStdString());
}

void VLiveActions::SaveTo(const std::filesystem::path& i_rPath)
{
    const auto pContext = m_rSession.Channels().FindContext(LiveContextName);
    const std::int64_t until = pContext ? pContext->GetTickRange().Last : 0; // what comes from now on may miss it
    if (!m_pSaver->Save(pContext, i_rPath))
        return m_Tell("There are no live data to save");
    m_pSaving = pContext;
    m_SavingUntil = until;
}

bool VLiveActions::AskBeforeLoss()
{
    if (m_bAsking) // a window can be told to close while it asks
        return false;
    const QScopedValueRollback asking(m_bAsking, true);
    QMessageBox box(QMessageBox::Warning, tr("Unsaved live data"),
                    tr("The live data are in no file yet. Save them before they are gone?"),
                    QMessageBox::Save | QMessageBox::Discard | QMessageBox::Cancel, &m_rWindow);
    box.setObjectName(QStringLiteral("liveUnsaved"));
    box.setDefaultButton(QMessageBox::Save);
    const int answer = box.exec();
    return answer == QMessageBox::Discard || (answer == QMessageBox::Save && SaveAndWait());
}

bool VLiveActions::SaveAndWait()
{
    const std::filesystem::path path = AskPath();
    if (path.empty())
        return false;
    m_rSession.StopLive(); // what came after the file was made would be lost
    const auto wait = [this]
    {
        QEventLoop loop;
        connect(m_pSaver, &VLiveSaver::Saved, &loop, &QEventLoop::quit);
        connect(m_pSaver, &VLiveSaver::Failed, &loop, &QEventLoop::quit);
        if (m_pSaver->IsSaving())
            loop.exec(QEventLoop::ExcludeUserInputEvents);
    };
    wait(); // for one that was begun before
    SaveTo(path);
    wait();
    return !m_rSession.HasUnsavedLive();
}

void VLiveActions::MarkUnsaved()
{
    if (m_rWindow.windowTitle().contains(QStringLiteral("[*]")))
        m_rWindow.setWindowModified(m_rSession.HasUnsavedLive());
}

void VLiveActions::TellSaved(const QString& i_rPath, const QStringList& i_rRemarks)
{
    m_rSession.NoteSaved(std::exchange(m_pSaving, nullptr), m_SavingUntil);
    MarkUnsaved();
    m_Tell("Saved live data as " + i_rPath.toStdString());
    for (const QString& rRemark : i_rRemarks)
        TQL::Log::Format(TQL::Log::GetCategory("Live"), TQL::ELogSeverity::Warning, "%1%: %2%", i_rPath.toStdString(),
                         rRemark.toStdString());
    if (i_rRemarks.isEmpty())
        return;
    auto* pBox =
        new QMessageBox(QMessageBox::Information, tr("Save live data"),
                        tr("A C3D file cannot hold everything as it was captured."), QMessageBox::Ok, &m_rWindow);
    pBox->setObjectName(QStringLiteral("liveRemarks"));
    pBox->setInformativeText(QStringLiteral("• ") + i_rRemarks.join(QStringLiteral("\n• ")));
    pBox->setAttribute(Qt::WA_DeleteOnClose);
    pBox->setModal(false); // the capture goes on
    pBox->show();
}

} // namespace Studio

#include "Studio/Files/VFileActions.h"

#include "Channels/Contexts/VRecordedContext.h"
#include "Channels/VChannelService.h"
#include "Recordings/FileFormats.h"
#include "Studio/Common/Paths.h"
#include "Studio/Common/PlainLabels.h"
#include "Studio/Common/VMainActions.h"
#include "Studio/Files/VOpenFiles.h"
#include "Studio/Log/VNoticeBar.h"
#include "Studio/Session/ContextNames.h"
#include "Studio/Session/VStudioSession.h"
#include "TQL/Log.h"

#include <QtCore/QCoreApplication>
#include <QtGui/QAction>
#include <QtWidgets/QFileDialog>
#include <QtWidgets/QMenu>

#include <algorithm>
#include <utility>
#include <vector>

namespace Studio
{

namespace
{

constexpr std::uint32_t simulatedSubjects = 2;
const QString refusedTopic = QStringLiteral("refusedFiles");
const QString warnedTopic = QStringLiteral("filesWithWarnings");

} // namespace

VFileActions::VFileActions(VStudioSession& i_rSession, VMainActions& i_rActions, VOpenFiles& i_rFiles,
                           VNoticeBar& i_rNotices, QWidget& i_rWindow)
    : QObject(&i_rWindow), m_rSession(i_rSession), m_rFiles(i_rFiles), m_rNotices(i_rNotices), m_rWindow(i_rWindow)
{
    connect(i_rActions.Get(EAction::OpenFile), &QAction::triggered, this, &VFileActions::ChooseFiles);
    connect(i_rActions.Get(EAction::Resample), &QAction::toggled, this,
            [this](bool i_bOn) { m_rFiles.Loader().SetResampling(i_bOn); });
    connect(i_rActions.Get(EAction::OpenSample), &QAction::triggered, this, &VFileActions::OpenSample);
    connect(i_rActions.Get(EAction::CloseFile), &QAction::triggered, this,
            [this]
            {
                ForgetNotices();
                m_rFiles.Close(QString::fromStdString(m_rSession.CurrentContextName()));
            });
    connect(i_rActions.Get(EAction::StartSimulation), &QAction::triggered, this, &VFileActions::StartSimulation);
    connect(i_rActions.Get(EAction::Quit), &QAction::triggered, &i_rWindow, &QWidget::close);
    VRecordingLoader& rLoader = m_rFiles.Loader();
    connect(&rLoader, &VRecordingLoader::Finished, this,
            [this](int, const QString& i_rContextName) { TakeOpened(i_rContextName); });
    connect(&rLoader, &VRecordingLoader::Failed, this,
            [this](int, const QString& i_rMessage) { TellRefused(i_rMessage); });
    // After the last file of a batch nothing waits to be shown any more.
    const auto settle = [this, &rLoader]
    {
        m_bShowNext = m_bShowNext && !rLoader.IsIdle();
    };
    connect(&rLoader, &VRecordingLoader::Failed, this, settle);
    connect(&rLoader, &VRecordingLoader::Cancelled, this, settle);
}

void VFileActions::AddRecentMenu(VMainActions& i_rActions)
{
    QMenu* pFiles = i_rActions.Menu(EMenu::File);
    auto* pRecent = new QMenu(tr("Open &recent"), pFiles);
    pRecent->setObjectName(QStringLiteral("recentFiles"));
    pFiles->insertMenu(i_rActions.Get(EAction::OpenSample), pRecent);
    connect(pRecent, &QMenu::aboutToShow, this, [this, pRecent] { FillRecentMenu(*pRecent); });
}

void VFileActions::FillRecentMenu(QMenu& o_rMenu)
{
    o_rMenu.clear();
    const auto entries = m_rFiles.Recent().List();
    int number = 0;
    for (const VRecentFiles::Entry& rEntry : entries)
    {
        QString path = WithoutMnemonics(QString::fromStdString(TextFromPath(rEntry.Path)));
        if (rEntry.bMissing)
            path = tr("%1 (missing)").arg(path);
        // The first nine have a key.
        const QString text = ++number < 10 ? QStringLiteral("&%1  ").arg(number) + path : path;
        QAction* pAction = o_rMenu.addAction(text, this, [this, file = rEntry.Path] { Open(file); });
        pAction->setEnabled(!rEntry.bMissing);
    }
    o_rMenu.addSeparator();
    QAction* pClean =
        o_rMenu.addAction(tr("&Forget missing files"), this, [this] { m_rFiles.Recent().RemoveMissing(); });
    pClean->setEnabled(std::ranges::any_of(entries, &VRecentFiles::Entry::bMissing));
}

void VFileActions::ChooseFiles()
{
    const QStringList texts = QFileDialog::getOpenFileNames(
        &m_rWindow, tr("Open recordings"), QString(),
        tr("Motion files (%1);;All files (*)").arg(QString::fromStdString(Recordings::ListFilePatterns())));
    std::vector<std::filesystem::path> paths;
    for (const QString& rText : texts)
        paths.push_back(PathFromText(rText.toStdString()));
    Open(paths);
}

void VFileActions::Open(std::span<const std::filesystem::path> i_Paths)
{
    if (!i_Paths.empty() && m_rFiles.Loader().IsIdle())
        ForgetNotices();
    m_bShowNext = m_bShowNext || !i_Paths.empty();
    for (const auto& rPath : i_Paths)
        m_rFiles.Open(rPath);
}

void VFileActions::OpenSample()
{
    const auto sample = FindSample(PathFromText(QCoreApplication::applicationDirPath().toStdString()));
    if (sample.empty())
        m_rNotices.Add(tr("The sample recording is missing: samples/walk.c3d"));
    else
        Open(sample);
}

void VFileActions::StartSimulation()
{
    if (!m_rSession.MayLoseLive())
        return;
    m_rSession.StartLive(simulatedSubjects);
    m_rSession.ShowContext(LiveContextName);
}

void VFileActions::TakeOpened(const QString& i_rContextName)
{
    const std::string name = i_rContextName.toStdString();
    if (std::exchange(m_bShowNext, false))
        m_rSession.ShowContext(name);
    const auto pContext =
        std::dynamic_pointer_cast<Channels::VRecordedContext>(m_rSession.Channels().FindContext(name));
    if (pContext && !pContext->GetRecording()->Warnings.empty())
        TellWarnings(QString::fromStdString(TextFromPath(m_rSession.FileOf(name).filename())),
                     static_cast<int>(pContext->GetRecording()->Warnings.size()));
}

void VFileActions::TellWarnings(const QString& i_rFile, int i_Count)
{
    const QString warnings = i_Count == 1 ? tr("a warning") : tr("%1 warnings").arg(i_Count);
    const QString opened = ++m_Warned == 1 ? tr("%1 was opened with %2").arg(i_rFile, warnings)
                                           : tr("%1 files were opened with warnings").arg(m_Warned);
    m_rNotices.Set(warnedTopic, tr("%1: something had to be guessed or repaired.").arg(opened), tr("Show in the lo&g"),
                   [this] { Q_EMIT ProblemsRequested(); });
}

/// One line for them all, and each in the log.
void VFileActions::TellRefused(const QString& i_rMessage)
{
    TQL::Log::Write(TQL::Log::GetCategory("Studio"), TQL::ELogSeverity::Error, i_rMessage.toStdString());
    const QString text =
        ++m_Refused == 1
            ? i_rMessage
            : tr("%1 files could not be opened. The last one: %2").arg(QString::number(m_Refused), i_rMessage);
    m_rNotices.Set(refusedTopic, text, tr("Show in the lo&g"), [this] { Q_EMIT ProblemsRequested(); });
}

/// What was told of the files before is history.
void VFileActions::ForgetNotices()
{
    m_Refused = 0;
    m_Warned = 0;
    m_rNotices.Clear(refusedTopic);
    m_rNotices.Clear(warnedTopic);
}

} // namespace Studio

#include "Studio/Session/VStudioSession.h"

#include "ChannelSystemSelection/VChannelSelectionManager.h"
#include "Channels/Common/ChannelTypes.h"
#include "Channels/Contexts/ContextThings.h"
#include "Channels/Contexts/VRecordedContext.h"
#include "Channels/VChannelService.h"
#include "OrvanePluginInterface/ITimeController.h"
#include "Recordings/OpenRecording.h"
#include "Services/Common/VHostSubscriptions.h"
#include "Services/Selection/VSelectionSource.h"
#include "Services/Time/VContextTimeFeed.h"
#include "Services/Time/VTimeController.h"
#include "Services/Time/VTimeSource.h"
#include "Services/VPluginHost.h"
#include "Studio/Common/Paths.h"
#include "Studio/Session/ContextNames.h"
#include "Studio/Session/VLiveCapture.h"
#include "Studio/Session/VOscCapture.h"
#include "TQL/Log.h"

#include <QtCore/QStandardPaths>

#include <iterator>
#include <system_error>

namespace Studio
{

namespace
{

constexpr const char* contentKind = "Graph Plots";

/// A session that checks leaves the operator's own folder alone.
std::filesystem::path FindSettingsFolder(const VStudioSession::Options& i_rOptions)
{
    if (!i_rOptions.UserDirectory.empty())
        return PathFromText(i_rOptions.UserDirectory);
    if (i_rOptions.bCheck)
        return {};
    return PathFromText(QStandardPaths::writableLocation(QStandardPaths::AppConfigLocation).toStdString());
}

/// What a reader had to guess, or found worth a remark, goes to the log.
void LogWarnings(const Recordings::VRecording& i_rRecording, const std::filesystem::path& i_rPath)
{
    const auto log = [&i_rPath](TQL::ELogSeverity i_Severity, const std::vector<std::string>& i_rSentences)
    {
        for (const std::string& rSentence : i_rSentences)
            TQL::Log::Format(TQL::Log::GetCategory("Studio"), i_Severity, "%1%: %2%", TextFromPath(i_rPath.filename()),
                             rSentence);
    };
    log(TQL::ELogSeverity::Warning, i_rRecording.Warnings);
    log(TQL::ELogSeverity::Information, i_rRecording.Remarks);
}

/// What the selection means in channels, for all types of this host. The manager subscribes to the selection by itself,
/// so the ledger is told that this subscriber is no plug-in's.
std::shared_ptr<TQL::IChannelSelectionManager> MakeSelectionManager(Services::VHostServices& i_rHost)
{
    auto pManager = TQL::MakeShared<ChannelSystemSelection::VChannelSelectionManager>(i_rHost.Selection());
    i_rHost.Ledger()->Add(i_rHost.Selection()->Changed().get());
    for (const Channels::ChannelType& rType : Channels::GetChannelTypeTable())
        pManager->RegisterChannelType(rType.Name, rType.Kind, static_cast<std::uint32_t>(rType.Flags));
    return pManager;
}

} // namespace

VStudioSession::VStudioSession(const Options& i_rOptions) : m_SettingsFolder(FindSettingsFolder(i_rOptions))
{
    Services::HostOptions options;
    options.bChecking = i_rOptions.bCheck;
    options.UserDirectory = i_rOptions.UserDirectory;
    m_pHost = std::make_unique<Services::VHostServices>(options);
    m_pChannels = std::make_shared<Channels::VChannelService>();
    m_pChannels->SetSelectionManager(MakeSelectionManager(*m_pHost));
    m_pHost->SetChannelService(m_pChannels);
    TellSelection();
    m_pPlugin = std::make_unique<Services::VPluginHost>(*m_pHost);
}

/// What the selection has to know of the context that is shown.
void VStudioSession::TellSelection()
{
    m_pHost->Selection()->SetRootSegments(
        [this](std::uint64_t i_Subject)
        {
            const auto pContext = CurrentContext();
            return pContext ? Channels::RootSegmentOf(*pContext, i_Subject) : 0;
        });
    m_pHost->Selection()->SetDevices(
        [this]
        {
            const auto pContext = CurrentContext();
            return pContext ? Channels::DevicesOf(*pContext) : std::vector<TQL::SelectionItem>();
        });
}

VStudioSession::~VStudioSession()
{
    Close();
}

TQL::IResult VStudioSession::OpenFile(const std::filesystem::path& i_rPath, std::string& o_rContextName,
                                      std::string& o_rError)
{
    Recordings::VRecording recording;
    if (const TQL::IResult result = Recordings::OpenRecording(i_rPath, recording, o_rError); result.IsError())
        return result;
    o_rContextName = AddRecording(std::move(recording), i_rPath);
    return TQL::Result::Ok;
}

std::string VStudioSession::AddRecording(Recordings::VRecording i_Recording, const std::filesystem::path& i_rPath)
{
    LogWarnings(i_Recording, i_rPath);
    const std::string name = MakeContextName(i_Recording.Name, [this](const std::string& i_rName)
                                             { return m_pChannels->FindContext(i_rName) != nullptr; });
    AddContext(
        std::make_shared<Channels::VRecordedContext>(
            name, m_pChannels->GetSubTypes(), std::make_shared<const Recordings::VRecording>(std::move(i_Recording))),
        OrvanePluginInterface::ETimeMode::Review);
    if (!i_rPath.empty())
        m_Files[name] = i_rPath;
    return name;
}

bool VStudioSession::ReplaceRecording(const std::string& i_rContextName, Recordings::VRecording i_Recording)
{
    const auto pBefore =
        std::dynamic_pointer_cast<Channels::VRecordedContext>(m_pChannels->FindContext(i_rContextName));
    if (!pBefore)
        return false;
    LogWarnings(i_Recording, FileOf(i_rContextName));
    const auto pTime = m_pHost->TimeController()->FindSource(i_rContextName);
    AddContext(std::make_shared<Channels::VRecordedContext>(
                   i_rContextName, m_pChannels->GetSubTypes(),
                   std::make_shared<const Recordings::VRecording>(std::move(i_Recording)), pBefore.get()),
               OrvanePluginInterface::ETimeMode::Review);
    if (pTime)
        m_pHost->TimeController()->FindSource(i_rContextName)->SetCurrentTick(pTime->CurrentTick());
    return true;
}

bool VStudioSession::CloseRecording(const std::string& i_rContextName)
{
    if (!CanReplay(i_rContextName))
        return false;
    if (CurrentContextName() == i_rContextName)
    {
        const auto names = m_pHost->TimeController()->GetSourceMap()->GetNames();
        auto next = names.upper_bound(i_rContextName);
        if (next == names.end() && names.size() > 1)
            next = std::prev(names.end(), 2);
        ShowContext(next == names.end() ? std::string() : *next);
    }
    m_TimeFeeds.erase(i_rContextName);
    m_Files.erase(i_rContextName);
    m_pHost->TimeController()->RemoveSource(i_rContextName);
    return m_pChannels->RemoveContext(i_rContextName).IsSuccess();
}

std::filesystem::path VStudioSession::FileOf(const std::string& i_rContextName) const
{
    const auto file = m_Files.find(i_rContextName);
    return file == m_Files.end() ? std::filesystem::path() : file->second;
}

void VStudioSession::AddContext(const std::shared_ptr<Channels::VChannelContext>& i_rpContext, int i_TimeMode)
{
    const std::string& rName = i_rpContext->GetName();
    m_TimeFeeds.erase(rName);
    // The context first: whoever hears of the new time source looks for the context of its name.
    m_pChannels->AddContext(i_rpContext);
    const auto pSource = m_pHost->TimeController()->AddSource(rName, i_TimeMode);
    m_TimeFeeds[rName] = std::make_unique<Services::VContextTimeFeed>(i_rpContext, pSource, m_pHost->Ledger());
}

bool VStudioSession::ShowContext(const std::string& i_rName)
{
    return m_pHost->TimeController()->SetCurrentSource(i_rName);
}

std::string VStudioSession::CurrentContextName() const
{
    std::string name;
    m_pHost->TimeController()->GetCurrentSourceName(name);
    return name;
}

std::shared_ptr<Channels::VChannelContext> VStudioSession::CurrentContext() const
{
    return m_pChannels->FindContext(CurrentContextName());
}

TQL::IResult VStudioSession::LoadModule(const std::filesystem::path& i_rPath, std::string& o_rError)
{
    std::error_code error;
    if (!std::filesystem::exists(i_rPath, error))
    {
        o_rError =
            "module not found: " + TextFromPath(i_rPath) + "; build the target graphplots, or give --module PATH";
        return TQL::Result::FileNotFound;
    }
    return m_pPlugin->Load(i_rPath, o_rError);
}

TQL::IResult VStudioSession::OpenContent(const QPointer<QWidget>& i_rpFrame, QPointer<QWidget>& o_rpContent,
                                         std::string& o_rError)
{
    if (!m_pPlugin->ContentNames().contains(contentKind))
    {
        o_rError = "the module offers no window of the kind \"Graph Plots\"; load another with --module PATH";
        return TQL::Result::NotFound;
    }
    o_rpContent = m_pPlugin->OpenContent(contentKind, i_rpFrame);
    if (o_rpContent)
        return TQL::Result::Ok;
    o_rError = "the module could not make a Graph Plots window; the log says why";
    return TQL::Result::Failed;
}

void VStudioSession::Close()
{
    StopLive();
    if (!m_pPlugin->IsLoaded())
        return;
    if (const TQL::IResult result = m_pPlugin->Unload(); result != TQL::Result::Ok)
        TQL::Log::Format(TQL::Log::GetCategory("Studio"), TQL::ELogSeverity::Warning,
                         "The module was not unloaded cleanly: %1%", result.Description());
}

} // namespace Studio

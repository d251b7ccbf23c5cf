#include "Studio/VStudioSession.h"

#include "ChannelSystemSelection/VChannelSelectionManager.h"
#include "Channels/ChannelTypes.h"
#include "Channels/VChannelService.h"
#include "Channels/VLiveContext.h"
#include "Channels/VRecordedContext.h"
#include "OrvanePluginInterface/ITimeController.h"
#include "Recordings/OpenRecording.h"
#include "Services/VContextTimeFeed.h"
#include "Services/VHostSubscriptions.h"
#include "Services/VPluginHost.h"
#include "Services/VSelectionSource.h"
#include "Services/VTimeController.h"
#include "Studio/ContextNames.h"
#include "Studio/Paths.h"
#include "Studio/VLiveCapture.h"
#include "Studio/VSimulatedFeed.h"
#include "TQL/Log.h"

#include <set>
#include <system_error>

namespace Studio
{

namespace
{

constexpr const char* contentKind = "Graph Plots";

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

VStudioSession::VStudioSession(const Options& i_rOptions)
{
    Services::HostOptions options;
    options.bChecking = i_rOptions.bCheck;
    options.UserDirectory = i_rOptions.UserDirectory;
    m_pHost = std::make_unique<Services::VHostServices>(options);
    m_pChannels = std::make_shared<Channels::VChannelService>();
    m_pChannels->SetSelectionManager(MakeSelectionManager(*m_pHost));
    m_pHost->SetChannelService(m_pChannels);
    m_pPlugin = std::make_unique<Services::VPluginHost>(*m_pHost);
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
    for (const std::string& rWarning : recording.Warnings)
        TQL::Log::Format(TQL::Log::GetCategory("Studio"), TQL::ELogSeverity::Warning, "Studio/VStudioSession", __LINE__,
                         "%1%: %2%", TextFromPath(i_rPath.filename()), rWarning);
    o_rContextName = AddRecording(std::move(recording));
    return TQL::Result::Ok;
}

std::string VStudioSession::AddRecording(Recordings::VRecording i_Recording)
{
    std::set<std::string> taken;
    for (const auto& rpContext : m_pChannels->GetContexts())
        taken.insert(rpContext->GetName());
    const std::string name = MakeContextName(i_Recording.Name, taken);
    AddContext(
        std::make_shared<Channels::VRecordedContext>(
            name, m_pChannels->GetSubTypes(), std::make_shared<const Recordings::VRecording>(std::move(i_Recording))),
        OrvanePluginInterface::ETimeMode::Review);
    return name;
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

void VStudioSession::StartLive(std::uint32_t i_Subjects, std::int64_t i_HistoryFrames)
{
    StopLive();
    const auto pContext = std::make_shared<Channels::VLiveContext>(LiveContextName, m_pChannels->GetSubTypes(),
                                                                   Channels::VLiveContext::Options());
    Simulation::VWalkSimulator::Options options;
    options.Subjects = i_Subjects;
    const auto pFeed = std::make_shared<VSimulatedFeed>(options, pContext);
    if (i_HistoryFrames > 0)
        if (const TQL::IResult result = pFeed->Produce(0, i_HistoryFrames); result.IsError())
            TQL::Log::Format(TQL::Log::GetCategory("Studio"), TQL::ELogSeverity::Error, "Studio/VStudioSession",
                             __LINE__, "The live capture has no history: %1%", result.Description());
    AddContext(pContext, OrvanePluginInterface::ETimeMode::Live);
    m_pCapture = std::make_unique<VLiveCapture>([pFeed](std::int64_t i_First, std::int64_t i_Count)
                                                { return pFeed->Produce(i_First, i_Count); },
                                                Simulation::VWalkSimulator::FrameRate, i_HistoryFrames);
}

void VStudioSession::StopLive()
{
    m_pCapture.reset();
}

void VStudioSession::SetLivePaused(bool i_bPaused)
{
    if (m_pCapture)
        m_pCapture->SetPaused(i_bPaused);
}

bool VStudioSession::IsLivePaused() const
{
    return m_pCapture && m_pCapture->IsPaused();
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
        TQL::Log::Format(TQL::Log::GetCategory("Studio"), TQL::ELogSeverity::Warning, "Studio/VStudioSession", __LINE__,
                         "The module was not unloaded cleanly: %1%", result.Description());
}

} // namespace Studio

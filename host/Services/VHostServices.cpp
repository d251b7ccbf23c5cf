#include "Services/VHostServices.h"

#include "ChannelSystem/IChannelContext.h"
#include "ChannelSystem/IChannelSelectionManager.h"
#include "CoreGraphics/Resources.h"
#include "Services/Checking/VCheckedChannelService.h"
#include "Services/Checking/VCheckedPostalService.h"
#include "Services/Checking/VSubscriptionAudit.h"
#include "Services/Common/VFaultList.h"
#include "Services/Common/VHostSubscriptions.h"
#include "Services/Postal/VUiPostalService.h"
#include "Services/Postal/VWorkerPostalService.h"
#include "Services/Selection/VChannelTypeRegistry.h"
#include "Services/Selection/VSelectionSource.h"
#include "Services/Time/VPlaybackDriver.h"
#include "Services/Time/VTimeController.h"
#include "Services/Time/VTimeControllerRegistry.h"
#include "Services/Ui/VContentRegistry.h"
#include "Services/Ui/VFileLocationService.h"
#include "Services/Ui/VQmlEngineHost.h"
#include "Services/Ui/VQuickWidgetPersistence.h"
#include "Services/VChannelMigrationService.h"
#include "Services/VHostProfile.h"
#include "Services/VPreferencesStore.h"
#include "Services/VServiceLoans.h"
#include "TQL/Log.h"

#include <QtCore/QCoreApplication>
#include <QtCore/QDir>
#include <QtCore/QEvent>
#include <QtCore/QStandardPaths>

#include <algorithm>
#include <iterator>
#include <stdexcept>

namespace Services
{

using namespace OrvanePluginInterface;

namespace
{

/// A host that checks leaves the operator's own file alone.
std::string PreferencesPath(const HostOptions& i_rOptions)
{
    if (i_rOptions.UserDirectory.empty() && i_rOptions.bChecking)
        return {};
    const QString folder = i_rOptions.UserDirectory.empty()
                               ? QStandardPaths::writableLocation(QStandardPaths::AppConfigLocation)
                               : QString::fromStdString(i_rOptions.UserDirectory);
    return QDir(folder).filePath(QStringLiteral("preferences.json")).toStdString();
}

} // namespace

/// In the order of making; the postal services go last.
struct VHostServices::Parts
{
    explicit Parts(const HostOptions& i_rOptions)
        : pFaults(std::make_shared<VFaultList>(i_rOptions.bChecking))
        , pCheck(i_rOptions.bChecking ? std::make_shared<const VThreadCheck>(pFaults) : nullptr)
        , pWorker(std::make_shared<VWorkerPostalService>(i_rOptions.WorkerThreads))
        , pPreferences(TQL::MakeShared<VPreferencesStore>(PreferencesPath(i_rOptions), pUi))
        , pFileLocations(std::make_shared<VFileLocationService>(i_rOptions.UserDirectory, pCheck))
        , pTimeController(std::make_shared<VTimeController>(pUi, pCheck))
        , pPlaybackDriver(std::make_unique<VPlaybackDriver>(pTimeController, pUi))
        , pTimeRegistry(std::make_shared<VTimeControllerRegistry>(pCheck))
        , pSelection(std::make_shared<VSelectionSource>(pCheck))
        , pTypes(std::make_shared<VChannelTypeRegistry>(pCheck))
        , pProfile(std::make_shared<VHostProfile>(i_rOptions.ProfileWord, pCheck))
        , pContents(std::make_shared<VContentRegistry>(pCheck))
        , pEngineHost(std::make_shared<VQmlEngineHost>(pCheck))
        , pResources(std::make_shared<CoreGraphics::Resources>(i_rOptions.bDevelopmentBuild))
        , pPersistence(std::make_shared<VQuickWidgetPersistence>(pCheck))
        , Loans(i_rOptions.bChecking)
    {
        pTimeRegistry->Add(VTimeControllerRegistry::DefaultName, pTimeController);
        pTypes->SetSelection(pSelection);
        if (!i_rOptions.bChecking)
            return;
        pGivenUi = std::make_shared<VCheckedPostalService>(pUi);
        pGivenWorker = std::make_shared<VCheckedAsioPostalService>(pWorker);
    }

    /// What a getter does.
    template <typename TGiven, typename TService>
    void Give(const HostOperation& i_rGetter, const std::shared_ptr<TService>& i_rpService,
              std::shared_ptr<TGiven>& o_rpService)
    {
        CheckThread(pCheck, i_rGetter);
        o_rpService = Loans.Lend(i_rGetter.pName, i_rpService);
    }

    const std::shared_ptr<VFaultList> pFaults;
    const ThreadCheckPointer pCheck;                                          ///< null without checking
    const std::shared_ptr<VUseLedger> pUses = std::make_shared<VUseLedger>(); ///< of the channels
    const std::shared_ptr<VHostSubscriptionLedger> pLedger = std::make_shared<VHostSubscriptionLedger>();
    const std::shared_ptr<VUiPostalService> pUi = std::make_shared<VUiPostalService>();
    const std::shared_ptr<VWorkerPostalService> pWorker;
    const std::shared_ptr<VPreferencesStore> pPreferences;
    const std::shared_ptr<VFileLocationService> pFileLocations;
    const std::shared_ptr<VTimeController> pTimeController;
    const std::unique_ptr<VPlaybackDriver> pPlaybackDriver;
    const std::shared_ptr<VTimeControllerRegistry> pTimeRegistry;
    const std::shared_ptr<VSelectionSource> pSelection;
    const std::shared_ptr<VChannelTypeRegistry> pTypes;
    const std::shared_ptr<VHostProfile> pProfile;
    const std::shared_ptr<VContentRegistry> pContents;
    const std::shared_ptr<VQmlEngineHost> pEngineHost;
    const std::shared_ptr<CoreGraphics::Resources> pResources;
    const std::shared_ptr<VQuickWidgetPersistence> pPersistence;
    std::shared_ptr<ChannelSystem::IChannelService> pChannels;
    std::shared_ptr<VChannelMigrationService> pMigration; ///< null without channels

    // What plug-ins get: checked when checking.
    std::shared_ptr<TQL::IPostalService> pGivenUi = pUi;
    std::shared_ptr<TQL::IAsioPostalService> pGivenWorker = pWorker;
    std::shared_ptr<ChannelSystem::IChannelService> pGivenChannels;
    VServiceLoans Loans;
};

VHostServices::VHostServices(HostOptions i_Options)
    : m_Options(std::move(i_Options)), m_pParts(std::make_unique<Parts>(m_Options))
{
}

VHostServices::~VHostServices()
{
    // Jobs that wait hold the services that they wait in, so the queues are emptied before the pointers are let go.
    if (!m_pParts->pWorker->Drain(std::chrono::milliseconds(500)))
        TQL::Log::Write(TQL::Log::GetCategory("Host"), TQL::ELogSeverity::Warning,
                        "The worker pool was stopped while it still had work");
    m_pParts->pWorker->Stop();
    m_pParts->pUi->Drain();
    m_pParts->pUi->Close();
}

void VHostServices::SetChannelService(std::shared_ptr<ChannelSystem::IChannelService> i_pService)
{
    m_pParts->pChannels = i_pService;
    std::shared_ptr<VCheckedChannels> pChecked;
    if (i_pService && m_Options.bChecking)
    {
        pChecked = std::make_shared<VCheckedChannels>(m_pParts->pUses, m_pParts->pFaults);
        i_pService = std::make_shared<VCheckedChannelService>(std::move(i_pService), m_pParts->pCheck, pChecked);
    }
    m_pParts->pMigration =
        m_pParts->pChannels
            ? std::make_shared<VChannelMigrationService>(m_pParts->pChannels, std::move(pChecked), m_pParts->pCheck)
            : nullptr;
    m_pParts->pTypes->SetChannelService(i_pService);
    m_pParts->pGivenChannels = std::move(i_pService);
}

void VHostServices::GetFileLocationService(std::shared_ptr<IFileLocationService>& o_rpService)
{
    m_pParts->Give("IHostCoreServices::GetFileLocationService", m_pParts->pFileLocations, o_rpService);
}

void VHostServices::GetPreferencesStore(std::shared_ptr<TQL::IStore>& o_rpStore)
{
    m_pParts->Give("IHostCoreServices::GetPreferencesStore", m_pParts->pPreferences->GetStore(), o_rpStore);
}

void VHostServices::GetFourthFactoryService(std::shared_ptr<TQL::IChannelTypeRegistry>& o_rpService)
{
    m_pParts->Give("IHostCoreServices::GetFourthFactoryService", m_pParts->pTypes, o_rpService);
}

void VHostServices::GetFifthFactoryService(std::shared_ptr<IChannelMigrationService>& o_rpService)
{
    m_pParts->Give("IHostCoreServices::GetFifthFactoryService", m_pParts->pMigration, o_rpService);
}

void VHostServices::GetSixthFactoryService(std::shared_ptr<TQL::ISelectionSource>& o_rpService)
{
    m_pParts->Give("IHostCoreServices::GetSixthFactoryService", m_pParts->pSelection, o_rpService);
}

void VHostServices::GetUiPostalService(std::shared_ptr<TQL::IPostalService>& o_rpService)
{
    m_pParts->Give("IHostCoreServices::GetUiPostalService", m_pParts->pGivenUi, o_rpService);
}

void VHostServices::GetWorkerPostalService(std::shared_ptr<TQL::IAsioPostalService>& o_rpService)
{
    m_pParts->Give("IHostCoreServices::GetWorkerPostalService", m_pParts->pGivenWorker, o_rpService);
}

void VHostServices::GetTimeControllerRegistry(std::shared_ptr<ITimeControllerRegistry>& o_rpService)
{
    m_pParts->Give("IHostCoreServices::GetTimeControllerRegistry", m_pParts->pTimeRegistry, o_rpService);
}

void VHostServices::GetHostProfile(std::shared_ptr<IHostProfile>& o_rpService)
{
    m_pParts->Give("IHostCoreServices::GetHostProfile", m_pParts->pProfile, o_rpService);
}

bool VHostServices::HasChannelBrowser()
{
    CheckThread(m_pParts->pCheck, "IHostCoreServices::HasChannelBrowser");
    return m_Options.bHasChannelBrowser;
}

void VHostServices::GetChannelService(std::shared_ptr<ChannelSystem::IChannelService>& o_rpService)
{
    m_pParts->Give("IHostCoreServices::GetChannelService", m_pParts->pGivenChannels, o_rpService);
    if (!o_rpService)
        throw std::runtime_error("the host has no channel service");
}

bool VHostServices::IsDevelopmentBuild()
{
    CheckThread(m_pParts->pCheck, "IHostUiServices::IsDevelopmentBuild");
    return m_Options.bDevelopmentBuild;
}

void VHostServices::GetQmlEngineHost(std::shared_ptr<IQmlEngineHost>& o_rpService)
{
    m_pParts->Give("IHostUiServices::GetQmlEngineHost", m_pParts->pEngineHost, o_rpService);
}

void VHostServices::GetContentRegistry(std::shared_ptr<IWorkspaceContentRegistry>& o_rpService)
{
    m_pParts->Give("IHostUiServices::GetContentRegistry", m_pParts->pContents, o_rpService);
}

void VHostServices::GetResources(std::shared_ptr<CoreGraphics::Resources>& o_rpService)
{
    m_pParts->Give("IHostUiServices::GetResources", m_pParts->pResources, o_rpService);
}

void VHostServices::GetQuickWidgetPersistence(std::shared_ptr<IQuickWidgetPersistence>& o_rpService)
{
    m_pParts->Give("IHostUiServices::GetQuickWidgetPersistence", m_pParts->pPersistence, o_rpService);
}

void VHostServices::GetLastFactoryService(std::shared_ptr<IOpaqueService>& o_rpService)
{
    CheckThread(m_pParts->pCheck, "IHostUiServices::GetLastFactoryService");
    o_rpService = nullptr;
}

const std::shared_ptr<VUiPostalService>& VHostServices::Ui() const
{
    return m_pParts->pUi;
}

const std::shared_ptr<VWorkerPostalService>& VHostServices::Worker() const
{
    return m_pParts->pWorker;
}

const std::shared_ptr<VTimeController>& VHostServices::TimeController() const
{
    return m_pParts->pTimeController;
}

const std::shared_ptr<VSelectionSource>& VHostServices::Selection() const
{
    return m_pParts->pSelection;
}

const std::shared_ptr<VContentRegistry>& VHostServices::Contents() const
{
    return m_pParts->pContents;
}

const std::shared_ptr<VQmlEngineHost>& VHostServices::EngineHost() const
{
    return m_pParts->pEngineHost;
}

const std::shared_ptr<CoreGraphics::Resources>& VHostServices::Graphics() const
{
    return m_pParts->pResources;
}

const std::shared_ptr<TQL::IStore>& VHostServices::Preferences() const
{
    return m_pParts->pPreferences->GetStore();
}

const std::shared_ptr<ChannelSystem::IChannelService>& VHostServices::Channels() const
{
    return m_pParts->pChannels;
}

const std::shared_ptr<VHostSubscriptionLedger>& VHostServices::Ledger() const
{
    return m_pParts->pLedger;
}

const std::shared_ptr<VFaultList>& VHostServices::FaultList() const
{
    return m_pParts->pFaults;
}

std::vector<std::string> VHostServices::Faults() const
{
    return m_pParts->pFaults->Faults();
}

void VHostServices::WatchSignals(VSubscriptionAudit& o_rAudit) const
{
    const VTimeController& rController = *m_pParts->pTimeController;
    o_rAudit.Watch("ITimeController::SourceListChanged", rController.SourceListChanged());
    o_rAudit.Watch("ITimeController::CurrentSourceChanged", rController.CurrentSourceChanged());
    o_rAudit.Watch("ISelectionSource::Changed", m_pParts->pSelection->Changed());
    o_rAudit.Watch("IChannelTypeRegistry::TypeListChanged", m_pParts->pTypes->TypeListChanged());
    const auto& rpChannels = m_pParts->pChannels;
    if (rpChannels)
    {
        o_rAudit.Watch("IChannelService::ContextListChanged", rpChannels->ContextListChanged());
        o_rAudit.Watch("IChannelService::TypeListChanged", rpChannels->TypeListChanged());
        if (const auto pManager = rpChannels->GetSelectionManager())
            o_rAudit.Watch("IChannelSelectionManager::SelectionChanged", pManager->SelectionChanged());
    }
    rController.GetSourceMap()->ForEach(
        [&](const std::string& i_rName, const std::shared_ptr<ITimeSource>& i_rpSource)
        {
            o_rAudit.Watch("ITimeSource::StateChanged of \"" + i_rName + "\"", i_rpSource->StateChanged());
            o_rAudit.Watch("ITimeSource::SecondStateChanged of \"" + i_rName + "\"", i_rpSource->SecondStateChanged());
            if (const auto pContext = rpChannels ? rpChannels->GetContextByName(i_rName) : nullptr)
                o_rAudit.Watch("IChannelContext::RangeChanged of \"" + i_rName + "\"", pContext->RangeChanged());
        });
}

std::vector<std::string> VHostServices::FindInUse() const
{
    std::vector<std::string> texts = m_pParts->pUses->InUse();
    std::ranges::move(m_pParts->Loans.StillHeld(), std::back_inserter(texts));
    return texts;
}

bool VHostServices::DrainPosts(std::chrono::milliseconds i_Patience)
{
    // Each kind of queue may feed the others, so rounds are made until one finds nothing to run.
    constexpr int roundLimit = 100;
    VUiPostalService& rUi = *m_pParts->pUi;
    for (int round = 0; round < roundLimit; ++round)
    {
        if (!m_pParts->pWorker->Drain(i_Patience))
            return false;
        const std::uint64_t before = rUi.JobsRun();
        rUi.Drain();
        QCoreApplication::sendPostedEvents();
        QCoreApplication::sendPostedEvents(nullptr, QEvent::DeferredDelete);
        if (rUi.JobsRun() == before && rUi.Pending() == 0)
            return m_pParts->pWorker->Drain(i_Patience);
    }
    return false;
}

} // namespace Services

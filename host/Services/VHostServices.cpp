#include "Services/VHostServices.h"

#include "ChannelSystem/IChannelContext.h"
#include "CoreGraphics/Resources.h"
#include "Services/VChannelTypeRegistry.h"
#include "Services/VCheckedChannelService.h"
#include "Services/VContentRegistry.h"
#include "Services/VFaultList.h"
#include "Services/VFileLocationService.h"
#include "Services/VHostProfile.h"
#include "Services/VHostSubscriptions.h"
#include "Services/VPlaybackDriver.h"
#include "Services/VQmlEngineHost.h"
#include "Services/VQuickWidgetPersistence.h"
#include "Services/VSelectionSource.h"
#include "Services/VSubscriptionAudit.h"
#include "Services/VTimeController.h"
#include "Services/VTimeControllerRegistry.h"
#include "Services/VUiPostalService.h"
#include "Services/VWorkerPostalService.h"
#include "TQL/Log.h"

#include <QtCore/QCoreApplication>
#include <QtCore/QEvent>

#include <stdexcept>

namespace Services
{

using namespace OrvanePluginInterface;

/// In the order of making; the postal services go last.
struct VHostServices::Parts
{
    explicit Parts(const HostOptions& i_rOptions)
        : pFaults(std::make_shared<VFaultList>(i_rOptions.bChecking))
        , pCheck(std::make_shared<const VThreadCheck>(pFaults))
        , pWorker(std::make_shared<VWorkerPostalService>(i_rOptions.WorkerThreads))
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
    {
        pTimeRegistry->Add(VTimeControllerRegistry::DefaultName, pTimeController);
    }

    const std::shared_ptr<VFaultList> pFaults;
    const ThreadCheckPointer pCheck;
    const std::shared_ptr<VHostSubscriptionLedger> pLedger = std::make_shared<VHostSubscriptionLedger>();
    const std::shared_ptr<VUiPostalService> pUi = std::make_shared<VUiPostalService>();
    const std::shared_ptr<VWorkerPostalService> pWorker;
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
    std::shared_ptr<ChannelSystem::IChannelService> pGivenChannels; ///< what plug-ins get: checked when checking
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
                        "The worker pool was stopped while it still had work", "Services/VHostServices", __LINE__);
    m_pParts->pWorker->Stop();
    m_pParts->pUi->Drain();
    m_pParts->pUi->Close();
}

void VHostServices::Check(const char* i_pOperation) const
{
    m_pParts->pCheck->CheckUiThread(i_pOperation);
}

void VHostServices::SetChannelService(std::shared_ptr<ChannelSystem::IChannelService> i_pService)
{
    m_pParts->pChannels = i_pService;
    if (i_pService && m_Options.bChecking)
        i_pService = std::make_shared<VCheckedChannelService>(std::move(i_pService), m_pParts->pCheck);
    m_pParts->pGivenChannels = std::move(i_pService);
}

void VHostServices::GetFileLocationService(std::shared_ptr<IFileLocationService>& o_rpService)
{
    Check("IHostCoreServices::GetFileLocationService");
    o_rpService = m_pParts->pFileLocations;
}

void VHostServices::GetPreferencesStore(std::shared_ptr<TQL::IStore>& o_rpStore)
{
    Check("IHostCoreServices::GetPreferencesStore");
    o_rpStore = nullptr;
}

void VHostServices::GetFourthFactoryService(std::shared_ptr<TQL::IChannelTypeRegistry>& o_rpService)
{
    Check("IHostCoreServices::GetFourthFactoryService");
    o_rpService = m_pParts->pTypes;
}

void VHostServices::GetFifthFactoryService(std::shared_ptr<IChannelMigrationService>& o_rpService)
{
    Check("IHostCoreServices::GetFifthFactoryService");
    o_rpService = nullptr;
}

void VHostServices::GetSixthFactoryService(std::shared_ptr<TQL::ISelectionSource>& o_rpService)
{
    Check("IHostCoreServices::GetSixthFactoryService");
    o_rpService = m_pParts->pSelection;
}

void VHostServices::GetUiPostalService(std::shared_ptr<TQL::IPostalService>& o_rpService)
{
    Check("IHostCoreServices::GetUiPostalService");
    o_rpService = m_pParts->pUi;
}

void VHostServices::GetWorkerPostalService(std::shared_ptr<TQL::IAsioPostalService>& o_rpService)
{
    Check("IHostCoreServices::GetWorkerPostalService");
    o_rpService = m_pParts->pWorker;
}

void VHostServices::GetTimeControllerRegistry(std::shared_ptr<ITimeControllerRegistry>& o_rpService)
{
    Check("IHostCoreServices::GetTimeControllerRegistry");
    o_rpService = m_pParts->pTimeRegistry;
}

void VHostServices::GetHostProfile(std::shared_ptr<IHostProfile>& o_rpService)
{
    Check("IHostCoreServices::GetHostProfile");
    o_rpService = m_pParts->pProfile;
}

bool VHostServices::HasChannelBrowser()
{
    Check("IHostCoreServices::HasChannelBrowser");
    return m_Options.bHasChannelBrowser;
}

void VHostServices::GetChannelService(std::shared_ptr<ChannelSystem::IChannelService>& o_rpService)
{
    Check("IHostCoreServices::GetChannelService");
    if (!m_pParts->pGivenChannels)
        throw std::runtime_error("the host has no channel service");
    o_rpService = m_pParts->pGivenChannels;
}

bool VHostServices::IsDevelopmentBuild()
{
    Check("IHostUiServices::IsDevelopmentBuild");
    return m_Options.bDevelopmentBuild;
}

void VHostServices::GetQmlEngineHost(std::shared_ptr<IQmlEngineHost>& o_rpService)
{
    Check("IHostUiServices::GetQmlEngineHost");
    o_rpService = m_pParts->pEngineHost;
}

void VHostServices::GetContentRegistry(std::shared_ptr<IWorkspaceContentRegistry>& o_rpService)
{
    Check("IHostUiServices::GetContentRegistry");
    o_rpService = m_pParts->pContents;
}

void VHostServices::GetResources(std::shared_ptr<CoreGraphics::Resources>& o_rpService)
{
    Check("IHostUiServices::GetResources");
    o_rpService = m_pParts->pResources;
}

void VHostServices::GetQuickWidgetPersistence(std::shared_ptr<IQuickWidgetPersistence>& o_rpService)
{
    Check("IHostUiServices::GetQuickWidgetPersistence");
    o_rpService = m_pParts->pPersistence;
}

void VHostServices::GetLastFactoryService(std::shared_ptr<IOpaqueService>& o_rpService)
{
    Check("IHostUiServices::GetLastFactoryService");
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

bool VHostServices::DrainPosts()
{
    // Each kind of queue may feed the others, so rounds are made until one finds nothing to run.
    constexpr int roundLimit = 100;
    VUiPostalService& rUi = *m_pParts->pUi;
    for (int round = 0; round < roundLimit; ++round)
    {
        if (!m_pParts->pWorker->Drain())
            return false;
        const std::uint64_t before = rUi.JobsRun();
        rUi.Drain();
        QCoreApplication::sendPostedEvents();
        QCoreApplication::sendPostedEvents(nullptr, QEvent::DeferredDelete);
        if (rUi.JobsRun() == before && rUi.Pending() == 0)
            return m_pParts->pWorker->Drain();
    }
    return false;
}

} // namespace Services

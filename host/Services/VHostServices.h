#pragma once

#include "OrvanePluginInterface/IHostCoreServices.h"
#include "OrvanePluginInterface/IHostUiServices.h"
#include "Services/Common/VThreadCheck.h"

#include <chrono>
#include <cstddef>
#include <cstdint>
#include <memory>
#include <string>
#include <vector>

namespace Services
{

class VChannelTypeRegistry;
class VContentRegistry;
class VFaultList;
class VHostSubscriptionLedger;
class VPlaybackDriver;
class VQmlEngineHost;
class VSelectionSource;
class VSubscriptionAudit;
class VTimeController;
class VUiPostalService;
class VWorkerPostalService;

/// What a host program chooses.
struct HostOptions
{
    bool bChecking = false;         ///< strict: what plug-ins call, hold and leave is watched
    bool bDevelopmentBuild = false; ///< import paths and shader folders of a build tree are honoured
    bool bHasChannelBrowser = false;
    std::uint64_t ProfileWord = 0;
    std::size_t WorkerThreads = 2;
    std::chrono::milliseconds Patience{5000}; ///< how long jobs of a plug-in that has ended may go on
    std::string UserDirectory; ///< UTF-8; empty: the desktop's folders, where a host that checks saves no preferences
};

/// Everything that a plug-in can ask of the host, made and owned here; the channel service comes from outside. Made on
/// the UI thread after the application object and destroyed before it, after the plug-ins are unloaded and the windows
/// closed. Each getter gives the same object every time.
class VHostServices : public OrvanePluginInterface::IHostCoreServices, public OrvanePluginInterface::IHostUiServices
{
public:
    explicit VHostServices(HostOptions i_Options = {});
    ~VHostServices() override;
    VHostServices(const VHostServices&) = delete;
    VHostServices& operator=(const VHostServices&) = delete;

    /// Before a plug-in is loaded.
    void SetChannelService(std::shared_ptr<ChannelSystem::IChannelService> i_pService);

    void GetFileLocationService(std::shared_ptr<OrvanePluginInterface::IFileLocationService>& o_rpService) override;
    void GetPreferencesStore(std::shared_ptr<TQL::IStore>& o_rpStore) override;
    void GetFourthFactoryService(std::shared_ptr<TQL::IChannelTypeRegistry>& o_rpService) override;
    void GetFifthFactoryService(std::shared_ptr<OrvanePluginInterface::IChannelMigrationService>& o_rpService)
        override; ///< null before there is a channel service
    void GetSixthFactoryService(std::shared_ptr<TQL::ISelectionSource>& o_rpService) override;
    void GetUiPostalService(std::shared_ptr<TQL::IPostalService>& o_rpService) override;
    void GetWorkerPostalService(std::shared_ptr<TQL::IAsioPostalService>& o_rpService) override;
    void
    GetTimeControllerRegistry(std::shared_ptr<OrvanePluginInterface::ITimeControllerRegistry>& o_rpService) override;
    void GetHostProfile(std::shared_ptr<OrvanePluginInterface::IHostProfile>& o_rpService) override;
    bool HasChannelBrowser() override;
    void
    GetChannelService(std::shared_ptr<ChannelSystem::IChannelService>& o_rpService) override; ///< throws without one

    bool IsDevelopmentBuild() override;
    void GetQmlEngineHost(std::shared_ptr<OrvanePluginInterface::IQmlEngineHost>& o_rpService) override;
    void GetContentRegistry(std::shared_ptr<OrvanePluginInterface::IWorkspaceContentRegistry>& o_rpService) override;
    void GetResources(std::shared_ptr<CoreGraphics::Resources>& o_rpService) override;
    void
    GetQuickWidgetPersistence(std::shared_ptr<OrvanePluginInterface::IQuickWidgetPersistence>& o_rpService) override;
    void GetLastFactoryService(std::shared_ptr<OrvanePluginInterface::IOpaqueService>& o_rpService) override; ///< null

    // The same objects as the host itself knows them.
    const std::shared_ptr<VUiPostalService>& Ui() const;
    const std::shared_ptr<VWorkerPostalService>& Worker() const;
    const std::shared_ptr<VTimeController>& TimeController() const; ///< the one named "default"
    const std::shared_ptr<VSelectionSource>& Selection() const;
    const std::shared_ptr<VContentRegistry>& Contents() const;
    const std::shared_ptr<VQmlEngineHost>& EngineHost() const;
    const std::shared_ptr<CoreGraphics::Resources>& Graphics() const;
    const std::shared_ptr<TQL::IStore>& Preferences() const;
    const std::shared_ptr<ChannelSystem::IChannelService>& Channels() const; ///< null until it is set
    const std::shared_ptr<VHostSubscriptionLedger>& Ledger() const;          ///< for VHostSubscriptions
    const std::shared_ptr<VFaultList>& FaultList() const;

    /// What the strict host found wrong so far; empty when it does not check.
    std::vector<std::string> Faults() const;

    /// Watches every signal that a plug-in can reach through these services.
    void WatchSignals(VSubscriptionAudit& o_rAudit) const;

    /// One sentence for each kind of thing that a plug-in has taken and not given back: channels and what they give,
    /// leases, services. Empty when the host does not check.
    std::vector<std::string> FindInUse() const;

    /// Runs everything that waits: posted jobs of both services, queued calls and deferred deletions of Qt. False when
    /// the worker pool or the UI service does not come to rest in the time given. UI thread.
    [[nodiscard]] bool DrainPosts(std::chrono::milliseconds i_Patience);

    const HostOptions& Options() const { return m_Options; }

private:
    struct Parts;

    const HostOptions m_Options;
    const std::unique_ptr<Parts> m_pParts;
};

} // namespace Services

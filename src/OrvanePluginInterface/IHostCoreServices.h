#pragma once

#include <cstdint>
#include <memory>
#include <string>
#include <string_view>
#include <vector>

namespace TQL
{
class IAsioPostalService;
class IChannel;
class IChannelTypeRegistry;
class IPostalService;
class ISelectionSource;
class IStore;
} // namespace TQL

namespace ChannelSystem
{
class IChannelService;
}

namespace OrvanePluginInterface
{

class IChannelMigrationService;
class IFileLocationService;
class ITimeControllerRegistry;

/// An object that only travels through.
class IOpaqueService
{
public:
    virtual ~IOpaqueService() = default;
};

/// What kind of host this is. UI thread.
class IHostProfile
{
public:
    virtual std::uint64_t GetProfileWord() const = 0;
    virtual void GetProfileService(std::shared_ptr<IOpaqueService>& o_rpService) const = 0; ///< may give null
    virtual ~IHostProfile() = default;
};

/// Where files of a kind live. UI thread.
class IFileLocationService
{
public:
    static constexpr int KindGraphFile = 16;

    virtual std::string GetExtension(int i_Kind) const = 0;
    virtual std::vector<std::string> GetUserDirectories(int i_Kind) const = 0; ///< UTF-8
    virtual ~IFileLocationService() = default;
};

/// The host's services without a user interface. UI thread. A getter that cannot deliver throws; one whose service a
/// host may lack says so and gives null.
class IHostCoreServices
{
public:
    virtual void GetFileLocationService(std::shared_ptr<IFileLocationService>& o_rpService) = 0;
    virtual void GetPreferencesStore(std::shared_ptr<TQL::IStore>& o_rpStore) = 0; ///< may give null
    virtual void GetFourthFactoryService(std::shared_ptr<TQL::IChannelTypeRegistry>& o_rpService) = 0;
    virtual void GetFifthFactoryService(std::shared_ptr<IChannelMigrationService>& o_rpService) = 0; ///< may give null
    virtual void GetSixthFactoryService(std::shared_ptr<TQL::ISelectionSource>& o_rpService) = 0;
    virtual void GetUiPostalService(std::shared_ptr<TQL::IPostalService>& o_rpService) = 0;
    virtual void GetWorkerPostalService(std::shared_ptr<TQL::IAsioPostalService>& o_rpService) = 0;
    virtual void GetTimeControllerRegistry(std::shared_ptr<ITimeControllerRegistry>& o_rpService) = 0;
    virtual void GetHostProfile(std::shared_ptr<IHostProfile>& o_rpService) = 0;
    virtual bool HasChannelBrowser() = 0;
    virtual void GetChannelService(std::shared_ptr<ChannelSystem::IChannelService>& o_rpService) = 0;
    virtual ~IHostCoreServices() = default;
};

} // namespace OrvanePluginInterface

#pragma once

#include <algorithm>
#include <array>
#include <cstdint>
#include <string_view>
#include <utility>

namespace Services
{

/// Which threads may call an operation of the host.
enum class EThreads : std::uint8_t
{
    Ui,
    Any
};

/// Which threads may call which operation. Interfaces that any thread may call as a whole have no rows: channels and
/// what they give (outputs, blocks, stores of samples, parameters), contexts, postal services, signals, the preferences
/// store and the log.
inline constexpr auto HostOperations = std::to_array<std::pair<std::string_view, EThreads>>({
    {"IHostCoreServices::GetFileLocationService", EThreads::Ui},
    {"IHostCoreServices::GetPreferencesStore", EThreads::Ui},
    {"IHostCoreServices::GetFourthFactoryService", EThreads::Ui},
    {"IHostCoreServices::GetFifthFactoryService", EThreads::Ui},
    {"IHostCoreServices::GetSixthFactoryService", EThreads::Ui},
    {"IHostCoreServices::GetUiPostalService", EThreads::Ui},
    {"IHostCoreServices::GetWorkerPostalService", EThreads::Ui},
    {"IHostCoreServices::GetTimeControllerRegistry", EThreads::Ui},
    {"IHostCoreServices::GetHostProfile", EThreads::Ui},
    {"IHostCoreServices::HasChannelBrowser", EThreads::Ui},
    {"IHostCoreServices::GetChannelService", EThreads::Ui},
    {"IHostUiServices::IsDevelopmentBuild", EThreads::Ui},
    {"IHostUiServices::GetQmlEngineHost", EThreads::Ui},
    {"IHostUiServices::GetContentRegistry", EThreads::Ui},
    {"IHostUiServices::GetResources", EThreads::Ui},
    {"IHostUiServices::GetQuickWidgetPersistence", EThreads::Ui},
    {"IHostUiServices::GetLastFactoryService", EThreads::Ui},
    {"IHostProfile::GetProfileWord", EThreads::Ui},
    {"IHostProfile::GetProfileService", EThreads::Ui},
    {"IFileLocationService::GetExtension", EThreads::Ui},
    {"IFileLocationService::GetUserDirectories", EThreads::Ui},
    {"IQmlEngineHost::GetEngine", EThreads::Ui},
    {"IQmlEngineHost::SetRootContextProperty", EThreads::Ui},
    {"IWorkspaceContentRegistry::RegisterContent", EThreads::Ui},
    {"IWorkspaceContentRegistry::UnregisterContent", EThreads::Ui},
    {"IQuickWidgetPersistence::ReadProperties", EThreads::Ui},
    {"IQuickWidgetPersistence::WriteProperties", EThreads::Ui},
    {"ITimeControllerRegistry::GetTimeController", EThreads::Ui},
    {"ITimeController::GetSourceMap", EThreads::Ui},
    {"ITimeController::GetCurrentSourceName", EThreads::Ui},
    {"ITimeController::GetCurrentSource", EThreads::Ui},
    {"ITimeController::SeekTo", EThreads::Ui},
    {"ITimeController::SourceListChanged", EThreads::Ui},
    {"ITimeController::CurrentSourceChanged", EThreads::Ui},
    {"ISourceMap::GetNames", EThreads::Ui},
    {"ISourceMap::Find", EThreads::Ui},
    {"ISourceMap::ForEach", EThreads::Ui},
    {"ISourceMap::Changed", EThreads::Ui},
    {"ITimeSource::GetMode", EThreads::Ui},
    {"ITimeSource::GetTimeState", EThreads::Ui},
    {"ITimeSource::StateChanged", EThreads::Ui},
    {"ITimeSource::SecondStateChanged", EThreads::Ui},
    {"IChannelService::GetContextByName", EThreads::Ui},
    {"IChannelService::ContextListChanged", EThreads::Ui},
    {"IChannelService::TypeListChanged", EThreads::Ui},
    {"IChannelService::GetChannelTypes", EThreads::Ui},
    {"IChannelService::GetTypeParameters", EThreads::Ui},
    {"IChannelService::CreateDerivedChannel", EThreads::Ui},
    {"IChannelService::CreateDerivedChannel of \"Cache\"", EThreads::Any},
    {"IChannelService::GetChannel", EThreads::Any},
    {"IChannelService::GetSelectionManager", EThreads::Ui},
    {"IChannelService::GetSubTypeTable", EThreads::Any},
    {"IChannelSelectionManager::GetSelectedChannelIds", EThreads::Ui},
    {"IChannelSelectionManager::GetSelectedTypeCounts", EThreads::Ui},
    {"IChannelSelectionManager::GetSelectedChannelTypes", EThreads::Ui},
    {"IChannelSelectionManager::GetGlobalChannelTypes", EThreads::Ui},
    {"IChannelSelectionManager::SelectionChanged", EThreads::Ui},
    {"IChannelSelectionManager::GetSelectionKind", EThreads::Any},
    {"IChannelSelectionManager::SelectThingsOf", EThreads::Ui},
    {"IChannelSelectionManager::RegisterChannelType", EThreads::Any},
    {"IChannelTypeRegistry::GetTypes", EThreads::Ui},
    {"IChannelTypeRegistry::GetSpecifier", EThreads::Ui},
    {"IChannelTypeRegistry::CreateChannels", EThreads::Ui},
    {"IChannelTypeRegistry::CreateGlobalChannels", EThreads::Ui},
    {"IChannelTypeRegistry::CanComputeMagnitude", EThreads::Ui},
    {"IChannelTypeRegistry::TypeListChanged", EThreads::Ui},
    {"IChannelMigrationService::Migrate", EThreads::Ui},
    {"ISelectionSource::GetSelection", EThreads::Ui},
    {"ISelectionSource::Set", EThreads::Ui},
    {"ISelectionSource::Add", EThreads::Ui},
    {"ISelectionSource::Changed", EThreads::Ui},
    {"ISelectionSource::RootSegment", EThreads::Ui},
    {"ISelectionSource::GetDevices", EThreads::Ui},
});

/// One row of the table, found while compiling: a name that has none does not compile.
struct HostOperation
{
    // Implicit, so that a check reads CheckThread(m_pCheck, "ITimeController::SeekTo").
    consteval HostOperation(const char* i_pName)
        : pName(i_pName)
        , Threads(std::ranges::find(HostOperations, std::string_view(i_pName),
                                    &std::pair<std::string_view, EThreads>::first)
                      ->second)
    {
    }

    const char* pName;
    EThreads Threads;
};

} // namespace Services

#include "GraphPlotUIOrvane/VOrvanePluginGraphPlot.h"

#include "CoreGraphics/Resources.h"
#include "GraphPlotSystem/Common/SharedObject.h"
#include "GraphPlotSystem/Time/VOrvaneGraphPlotTime.h"
#include "GraphPlotUIOrvane/QmlTypes.h"
#include "GraphPlotUIOrvane/VOrvaneGraphPlotWindowContentFactory.h"
#include "OrvanePluginInterface/IHostCoreServices.h"
#include "OrvanePluginInterface/IHostUiServices.h"
#include "OrvanePluginInterface/ITimeController.h"
#include "Store/VStore.h"

namespace GraphPlotUI
{
namespace
{

const std::string& EmptyText()
{
    static const std::string s_Empty;
    return s_Empty;
}

/// The name of the time that is not of one window alone.
const std::string& DefaultTimeName()
{
    static const std::string s_Name = "default";
    return s_Name;
}

template <typename T, typename TServices>
std::shared_ptr<T> Fetch(TServices& i_rServices, void (TServices::*i_pGetter)(std::shared_ptr<T>&))
{
    std::shared_ptr<T> pService;
    (i_rServices.*i_pGetter)(pService);
    return pService;
}

/// Whether the host's profile is one whose operators know objects, not subjects with segments.
bool SaysObject(const std::shared_ptr<OrvanePluginInterface::IHostProfile>& i_rpProfile)
{
    constexpr std::uint64_t wordBit = 1;
    constexpr std::uint64_t otherBits = 1u << 1 | 1u << 2 | 1u << 3 | 1u << 4 | 1u << 5 | 1u << 14;
    const std::uint64_t word = i_rpProfile ? i_rpProfile->GetProfileWord() : 0;
    return (word & (wordBit | otherBits)) == wordBit;
}

} // namespace

using OrvanePluginInterface::IHostCoreServices;
using OrvanePluginInterface::IHostUiServices;

VOrvanePluginGraphPlot::VOrvanePluginGraphPlot() = default;

VOrvanePluginGraphPlot::~VOrvanePluginGraphPlot() = default;

const std::string& VOrvanePluginGraphPlot::QueryText1() const
{
    return EmptyText();
}

const std::string& VOrvanePluginGraphPlot::QueryText2() const
{
    return EmptyText();
}

bool VOrvanePluginGraphPlot::LoadQmlModules(IHostCoreServices&, IHostUiServices& i_rUi)
{
    RegisterResources();
    RegisterGraphPlotTypes();
    const auto pEngineHost = Fetch(i_rUi, &IHostUiServices::GetQmlEngineHost);
    if (QQmlEngine* pEngine = pEngineHost->GetEngine(); pEngine && i_rUi.IsDevelopmentBuild())
        AddDevelopmentPaths(*pEngine);
    // The property must exist, with no value, before any QML is loaded.
    pEngineHost->SetRootContextProperty("rootContextTraceFactory", nullptr);
    return true;
}

bool VOrvanePluginGraphPlot::Initialise(IHostCoreServices& i_rCore, IHostUiServices& i_rUi)
{
    const auto pResources = Fetch(i_rUi, &IHostUiServices::GetResources);
    pResources->AddSearchFolder(SourceFolder("GraphPlotUI").toStdString());

    std::shared_ptr<OrvanePluginInterface::ITimeController> pDefaultTime;
    if (const auto pRegistry = Fetch(i_rCore, &IHostCoreServices::GetTimeControllerRegistry))
        pRegistry->GetTimeController(DefaultTimeName(), pDefaultTime);
    if (pDefaultTime) // each window has the one that it was made with, and works without this
        m_pPlotTime = MakeSharedObject<VOrvaneGraphPlotTime>(Fetch(i_rCore, &IHostCoreServices::GetUiPostalService),
                                                             std::move(pDefaultTime));

    GraphPlotServices services;
    services.pUiPostalService = Fetch(i_rCore, &IHostCoreServices::GetUiPostalService);
    services.pWorkerPostalService = Fetch(i_rCore, &IHostCoreServices::GetWorkerPostalService);
    services.pChannelService = Fetch(i_rCore, &IHostCoreServices::GetChannelService);
    services.pTypeRegistry = Fetch(i_rCore, &IHostCoreServices::GetFourthFactoryService);
    services.pMigrationService = Fetch(i_rCore, &IHostCoreServices::GetFifthFactoryService);
    services.bObjectWord = SaysObject(Fetch(i_rCore, &IHostCoreServices::GetHostProfile));
    services.pPreferencesStore = Fetch(i_rCore, &IHostCoreServices::GetPreferencesStore);
    if (!services.pPreferencesStore) // then they last as long as the module
        services.pPreferencesStore = TQL::MakeShared<Store::VStore>();
    services.pResources = pResources;
    services.pEngineHost = Fetch(i_rUi, &IHostUiServices::GetQmlEngineHost);
    services.bChannelBrowser = i_rCore.HasChannelBrowser();
    Fetch(i_rUi, &IHostUiServices::GetContentRegistry)
        ->RegisterContent(VOrvaneGraphPlotWindowContentFactory::Name(),
                          TQL::MakeShared<VOrvaneGraphPlotWindowContentFactory>(std::move(services)));
    return true;
}

void VOrvanePluginGraphPlot::Shutdown()
{
    m_pPlotTime = nullptr;
}

void VOrvanePluginGraphPlot::UnloadResources()
{
    UnregisterResources();
}

} // namespace GraphPlotUI

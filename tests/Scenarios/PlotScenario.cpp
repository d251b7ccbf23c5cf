#include "Scenarios/PlotScenario.h"

#include "GraphPlotSystem/Channels/VActiveChannelManager.h"
#include "GraphPlotSystem/Channels/VActiveChannelModel.h"
#include "GraphPlotSystem/Channels/VChannelTypeModel.h"
#include "GraphPlotSystem/Common/SharedObject.h"
#include "GraphPlotSystem/Subplots/VKeyModel.h"
#include "GraphPlotSystem/Subplots/VSubplotManager.h"
#include "GraphPlotSystem/Texts/VBaseChannelTextProvider.h"
#include "GraphPlotSystem/Texts/VChannelComponentControls.h"
#include "GraphPlotSystem/Texts/VChannelComponentModel.h"
#include "GraphPlotSystem/Time/VOrvaneGraphPlotTime.h"
#include "GraphPlotSystem/Traces/VTraceDataProvider.h"
#include "GraphPlotSystem/VViewFollower.h"
#include "Scenarios/SmallTake.h"
#include "Services/Selection/VChannelTypeRegistry.h"
#include "Services/Time/VTimeController.h"
#include "Services/VChannelMigrationService.h"

#include <QtCore/QCoreApplication>

#include <algorithm>
#include <iterator>
#include <set>
#include <sstream>

using namespace GraphPlotUI;
namespace ETimeMode = OrvanePluginInterface::ETimeMode;

PlotScenario::PlotScenario()
    : pTypes(std::make_shared<Services::VChannelTypeRegistry>(nullptr))
    , pMigration(std::make_shared<Services::VChannelMigrationService>(pService, nullptr, nullptr))
    , pTime(std::make_shared<Services::VTimeController>(pUi))
{
    for (const Channels::ChannelType& rType : Channels::GetChannelTypeTable())
        pSelectionManager->RegisterChannelType(rType.Name, rType.Kind, static_cast<std::uint32_t>(rType.Flags));
    pService->SetSelectionManager(pSelectionManager);
    pTypes->SetChannelService(pService);
    MakeSystem();
    SettleUi();
}

PlotScenario::~PlotScenario()
{
    if (m_Gl.isValid())
        m_pStorage->ReleaseTextures();
    m_pViewFollower.reset();
    pSystem.reset();
    pUi->RunAll(); // notices for models that are gone
}

void PlotScenario::MakeSystem()
{
    const auto pStorage = std::make_shared<VTraceDataProvider>(pUi);
    m_pStorage = pStorage;
    m_pTexts = std::make_shared<VBaseChannelTextProvider>(pService, pUi);
    m_pControls = std::make_shared<VChannelComponentControls>(m_pTexts, pUi);
    auto pContext = MakeSharedObject<VGraphPlotContext>(nullptr, pStorage);
    const auto pPlotTime = MakeSharedObject<VOrvaneGraphPlotTime>(pUi, pTime);
    GraphPlotModels models;
    models.pComponentControls = m_pControls;
    models.pActiveChannelModel = new VActiveChannelModel(pUi, m_pTexts, pMigration, pContext.get());
    models.pKeyModel =
        new VKeyModel(pUi, m_pTexts, m_pControls, m_pStorage, models.pActiveChannelModel, pContext.get());
    models.pComponentModel = new VChannelComponentModel(pUi, m_pTexts, m_pControls, pContext.get());
    models.pActiveChannelManager =
        MakeSharedObject<VActiveChannelManager>(pUi, pService, pTypes, models.pActiveChannelModel.data(), false, true);
    const auto pTraceManager = MakeSharedObject<VTraceManager>(pUi, pWorkers, pService, pPreferences, m_pTexts,
                                                               m_pControls, pPlotTime, m_pStorage, true, false);
    models.pSubplotManager = MakeSharedObject<VSubplotManager>(
        pUi, models.pActiveChannelModel.data(), m_pTexts, m_pControls, pTraceManager, m_pStorage, pPreferences, true);
    pTraceManager->SetSubplotWidth(400);
    pSystem = TQL::MakeShared<VExtendedGraphPlotSystem>(std::move(pContext), pTraceManager, pPlotTime,
                                                        std::move(models), pUi);
    m_pViewFollower = TQL::MakeShared<VViewFollower>(pUi, pService, pTime, pSystem);
}

void PlotScenario::AddContext(std::shared_ptr<Channels::VChannelContext> i_pContext, int i_TimeMode)
{
    const auto pSource = pTime->AddSource(i_pContext->GetName(), i_TimeMode);
    pSource->SetRange(i_pContext->GetTickRange(), i_pContext->GetFramePeriod());
    pService->AddContext(std::move(i_pContext));
    SettleUi();
}

void PlotScenario::AddRecording(const std::string& i_rContext, std::shared_ptr<Recordings::VRecording> i_pRecording)
{
    const auto pBefore = std::dynamic_pointer_cast<Channels::VRecordedContext>(pService->FindContext(i_rContext));
    AddContext(std::make_shared<Channels::VRecordedContext>(i_rContext, pService->GetSubTypes(),
                                                            std::move(i_pRecording), pBefore.get()),
               ETimeMode::Review);
}

void PlotScenario::AddCapture(const std::string& i_rContext)
{
    AddContext(SmallTake::MakeCapture(i_rContext, pService->GetSubTypes()), ETimeMode::Live);
}

void PlotScenario::RemoveContext(const std::string& i_rContext)
{
    pTime->RemoveSource(i_rContext);
    ASSERT_TRUE(pService->RemoveContext(i_rContext).IsSuccess()) << i_rContext;
    SettleUi();
}

void PlotScenario::Show(const std::string& i_rContext)
{
    m_Shown = i_rContext;
    ASSERT_TRUE(pTime->SetCurrentSource(i_rContext)) << i_rContext;
    SettleUi();
}

std::shared_ptr<TQL::IChannel> PlotScenario::FindSource(const std::string& i_rName) const
{
    if (const auto pContext = pService->FindContext(m_Shown))
        for (const auto& rpChannel : *pContext->GetChannels())
            if (rpChannel->GetDefinition().Name == i_rName)
                return rpChannel;
    ADD_FAILURE() << "there is no channel " << i_rName;
    return nullptr;
}

void PlotScenario::Select(const std::vector<std::string>& i_rNames)
{
    std::vector<TQL::SelectionItem> items;
    for (const std::string& rName : i_rNames)
        if (const auto pChannel = FindSource(rName))
            items.push_back(Channels::SelectionOfChannel(pChannel->GetInstanceId()).value_or(TQL::SelectionItem()));
    SelectThings(items);
}

void PlotScenario::SelectThings(const std::vector<TQL::SelectionItem>& i_rItems)
{
    pSelection->Set(i_rItems);
    SettleUi();
}

void PlotScenario::PickType(const std::string& i_rInternalName)
{
    auto* const pModel = static_cast<VChannelTypeModel*>(Manager().GetSelectedChannelTypeModel());
    ASSERT_EQ(pModel->LoadState(i_rInternalName), TQL::Result::Ok) << i_rInternalName << " is not on offer";
    SettleUi();
}

void PlotScenario::PickGlobalType(const std::string& i_rInternalName)
{
    auto* const pModel = static_cast<VChannelTypeModel*>(Manager().GetGlobalChannelTypeModel());
    ASSERT_EQ(pModel->LoadState(i_rInternalName), TQL::Result::Ok) << i_rInternalName << " is not on offer";
    SettleUi();
}

void PlotScenario::Choose(const std::string& i_rOptions)
{
    std::istringstream stream(i_rOptions);
    const std::set<std::string> words{std::istream_iterator<std::string>(stream), {}};
    const auto find = [&words](const char* i_pWord)
    {
        return words.contains(i_pWord);
    };
    Manager().SetDerivativeOrder(find("d1") ? 1 : find("d2") ? 2 : 0);
    Manager().SetDifferentiateByFrame(find("frame"));
    Manager().SetPlotMagnitude(find("mag"));
    Manager().SetRotationUnits(find("rad") ? 1 : 0);
    Manager().SetLengthUnits(find("cm") ? 1 : find("m") ? 2 : 0);
    const auto format =
        std::ranges::find_if(words, [](const std::string& i_r) { return i_r[0] == 'f' && i_r.size() == 2; });
    Manager().SetRotationFormat(format == words.end() ? 0 : (*format)[1] - '0');
    SettleUi();
}

void PlotScenario::Pin(const std::string& i_rName, bool i_bPinned)
{
    for (int row = 0; row < Rows().rowCount(); ++row)
        if (Rows().index(row).data().toString().toStdString() == i_rName)
        {
            ASSERT_TRUE(
                Rows().setData(Rows().index(row), i_bPinned, TQL::ActiveChannelModelRoles::ActiveChannelPinned));
            SettleUi();
            return;
        }
    FAIL() << "there is no row " << i_rName;
}

void PlotScenario::SwitchComponent(const std::string& i_rChannel, std::uint64_t i_Component, bool i_bEnabled)
{
    for (const auto& rpChannel : Rows().GetChannels())
        if (const TQL::IChannelInstanceId& rId = rpChannel->GetInstanceId();
            m_pTexts->GetChannelDisplayName(rId).toStdString() == i_rChannel)
        {
            ASSERT_EQ(m_pControls->SetComponentEnabled(m_pTexts->GetSubTypeId(rId), i_Component, i_bEnabled),
                      TQL::Result::Ok);
            SettleUi();
            return;
        }
    FAIL() << "there is no row " << i_rChannel;
}

void PlotScenario::SettleUi()
{
    while (pUi->RunAll() != 0)
        QCoreApplication::processEvents(); // what Qt itself has queued
    QCoreApplication::sendPostedEvents(nullptr, QEvent::DeferredDelete);
}

bool PlotScenario::BeginDrawing()
{
    m_Surface.create();
    if (!m_Gl.create() || !m_Gl.makeCurrent(&m_Surface) || m_Gl.isOpenGLES())
        return false;
    m_Renderer.Initialise();
    return true;
}

void PlotScenario::Settle()
{
    SettleUi();
    for (int frame = 0; frame < 3; ++frame)
    {
        m_pStorage->UpdateTextures(m_Renderer);
        boost::asio::io_context& rContext = *pWorkers->GetContext();
        rContext.restart();
        rContext.run_one(); // the wait of the update loop
        rContext.poll();    // and the tick; the next wait has only begun
        SettleUi();
    }
}

GraphPlotState PlotScenario::SaveState()
{
    GraphPlotState state;
    pSystem->BuildState(state);
    return state;
}

TQL::IResult PlotScenario::ApplyState(const GraphPlotState& i_rState)
{
    TQL::IResult result;
    pSystem->ApplyState(result, i_rState);
    SettleUi();
    return result;
}

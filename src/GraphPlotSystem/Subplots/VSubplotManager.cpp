#include "GraphPlotSystem/Subplots/VSubplotManager.h"

#include "GraphPlotSystem/Channels/VActiveChannelModel.h"
#include "GraphPlotSystem/Channels/VActiveChannelModelFiltered.h"
#include "GraphPlotSystem/Subplots/SubplotGroups.h"
#include "GraphPlotSystem/Subplots/VSubplotData.h"
#include "GraphPlotSystem/Subplots/VSubplotModel.h"
#include "GraphPlotSystem/Subplots/VTraceModel.h"
#include "GraphPlotSystem/Texts/IChannelComponentControls.h"
#include "GraphPlotSystem/Texts/IChannelTextProvider.h"
#include "GraphPlotSystem/Traces/ITraceDataStorage.h"
#include "GraphPlotSystem/Traces/TracePalette.h"
#include "GraphPlotSystem/Traces/VTraceManager.h"
#include "IOInterfaceQt/VEnumListModel.h"
#include "NotificationSystem/VDispatchCollapsers.h"
#include "NotificationSystem/WeakCallback.h"

#include <set>
#include <span>
#include <utility>
#include <vector>

namespace GraphPlotUI
{

namespace
{

std::vector<TQL::IO::VEnumListModel::Row> LayoutModeRows()
{
    const auto row = [](const char* i_pText, ESubplotLayoutModes i_Mode)
    {
        return TQL::IO::VEnumListModel::Row{QString::fromLatin1(i_pText), static_cast<int>(i_Mode), {}};
    };
    return {row("Subplot Per Type", ESubplotLayoutModes::SubplotPerTraceType),
            row("Single Plot", ESubplotLayoutModes::SingleSubplot)};
}

/// A model that a view may still show when its last subplot lets go of it: it dies in the event loop, or with its
/// parent.
template <typename T, typename... Args>
std::shared_ptr<T> MakeShownModel(Args&&... i_Args)
{
    T* const pModel = new T(std::forward<Args>(i_Args)...);
    return std::shared_ptr<T>(pModel,
                              [pAlive = QPointer<T>(pModel)](T*)
                              {
                                  if (pAlive)
                                      pAlive->deleteLater();
                              });
}

} // namespace

VSubplotManager::VSubplotManager(std::shared_ptr<TQL::IPostalService> i_pUiPostalService,
                                 VActiveChannelModel* i_pActiveChannelModel,
                                 std::shared_ptr<TQL::IChannelTextProvider> i_pTextProvider,
                                 std::shared_ptr<TQL::IChannelComponentControls> i_pComponentControls,
                                 std::shared_ptr<VTraceManager> i_pTraceManager,
                                 std::shared_ptr<TQL::ITraceDataStorage> i_pStorage,
                                 std::shared_ptr<IGraphPlotPreferences> i_pPreferences, bool i_bShowDataContexts)
    : m_pUiPostalService(std::move(i_pUiPostalService))
    , m_pActiveChannelModel(i_pActiveChannelModel)
    , m_pTextProvider(std::move(i_pTextProvider))
    , m_pComponentControls(std::move(i_pComponentControls))
    , m_pTraceManager(std::move(i_pTraceManager))
    , m_pStorage(std::move(i_pStorage))
    , m_pPreferences(std::move(i_pPreferences))
    , m_pSubplotModel(new VSubplotModel(m_pStorage, this))
    , m_pSubplotLayoutModesModel(new TQL::IO::VEnumListModel(LayoutModeRows(), this))
    , m_bShowDataContexts(i_bShowDataContexts)
{
}

VSubplotManager::~VSubplotManager()
{
    if (m_ColourSetToken != 0)
        (void)m_pPreferences->RemoveCallback(IGraphPlotPreferences::TraceColourSet, m_ColourSetToken);
    if (m_PanZoomToken != 0)
        (void)m_pPreferences->RemoveCallback(IGraphPlotPreferences::ShowPanZoomGraphic, m_PanZoomToken);
}

void VSubplotManager::OnPostCreation()
{
    m_pStorage->SetPalette(GetTracePalette(m_ColourSet));
    // One collapser for all three: traces that come with new texts are shared out once.
    const auto pCollapser = NotificationSystem::MakeCollapserDontPost(m_pUiPostalService);
    for (const auto& rpSignal :
         {m_pStorage->DataChanged(), m_pComponentControls->Changed(), m_pTextProvider->TextChanged()})
        m_Subscriptions.Subscribe<void()>(
            rpSignal, NotificationSystem::MakeWeakCallback(WeakSelf(this), &VSubplotManager::UpdateSubplots),
            pCollapser);
    m_Subscriptions.Subscribe<void()>(m_pStorage->ValueRangeChanged(),
                                      NotificationSystem::MakeWeakFunction(WeakSelf(this), [](VSubplotManager& i_rSelf)
                                                                           { i_rSelf.m_pSubplotModel->Refresh(); }),
                                      NotificationSystem::MakeCollapserDontPost(m_pUiPostalService));
    SubscribePreference(IGraphPlotPreferences::TraceColourSet, m_ColourSetToken,
                        &VSubplotManager::OnColourSetPreference);
    SubscribePreference(IGraphPlotPreferences::ShowPanZoomGraphic, m_PanZoomToken,
                        &VSubplotManager::OnPanZoomPreference);
    OnColourSetPreference();
    OnPanZoomPreference();
    UpdateSubplots();
}

void VSubplotManager::SubscribePreference(int i_Index, IGraphPlotPreferences::Token& o_rToken,
                                          void (VSubplotManager::*i_pMember)())
{
    const TQL::IResult result = m_pPreferences->AddCallback(
        o_rToken, i_Index, NotificationSystem::MakeWeakCallback(WeakSelf(this), i_pMember), m_pUiPostalService);
    if (result.IsError())
        o_rToken = 0; // without notices the preference at the start holds
}

void VSubplotManager::OnColourSetPreference()
{
    IGraphPlotPreferences::Value value;
    const TQL::IResult result = m_pPreferences->GetValue(IGraphPlotPreferences::TraceColourSet, value);
    const auto* const pSet = std::get_if<std::int32_t>(&value);
    if (result.IsError() || !pSet || *pSet == m_ColourSet)
        return;
    m_ColourSet = *pSet;
    m_pStorage->SetPalette(GetTracePalette(m_ColourSet));
    UpdateSubplots();
}

void VSubplotManager::OnPanZoomPreference()
{
    IGraphPlotPreferences::Value value;
    const TQL::IResult result = m_pPreferences->GetValue(IGraphPlotPreferences::ShowPanZoomGraphic, value);
    const bool* const pShow = std::get_if<bool>(&value);
    if (result.IsError() || !pShow || std::exchange(m_bShowPanZoomGraphic, *pShow) == *pShow)
        return;
    Q_EMIT ShowPanZoomGraphicChanged();
}

QObject* VSubplotManager::GetSubplotModelObject() const
{
    return m_pSubplotModel;
}

QObject* VSubplotManager::GetSubplotLayoutModesModel() const
{
    return m_pSubplotLayoutModesModel;
}

void VSubplotManager::SetSubplotLayoutMode(TQL::SubplotLayoutModes::ESubplotLayoutModes i_Mode)
{
    if (std::exchange(m_SubplotLayoutMode, i_Mode) == i_Mode)
        return;
    m_pTraceManager->SetSubplotLayoutMode(i_Mode);
    Q_EMIT SubplotLayoutModeChanged();
    UpdateSubplots();
}

void VSubplotManager::LoadState(const SubplotState& i_rState)
{
    SetSubplotLayoutMode(i_rState.LayoutMode);
    m_pSubplotModel->LoadState(i_rState);
}

void VSubplotManager::SaveState(SubplotState& o_rState) const
{
    o_rState.LayoutMode = m_SubplotLayoutMode;
    m_pSubplotModel->SaveState(o_rState);
}

void VSubplotManager::UpdateSubplots()
{
    const SubplotGrouping grouping = GroupTraces();
    AssignColours(grouping);
    const VSubplotModel::SubplotMap present = m_pSubplotModel->GetSubplots();
    VSubplotModel::SubplotMap subplots;
    for (const std::uint64_t id : grouping.Order)
    {
        const auto found = present.find(id);
        subplots.emplace(id, MakeSubplot(id, grouping.Groups.at(id), found == present.end() ? nullptr : found->second));
    }
    m_pSubplotModel->Update(subplots, grouping.Order);
    m_pSubplotModel->Refresh();
}

SubplotGrouping VSubplotManager::GroupTraces() const
{
    std::vector<TQL::ITraceId> traces;
    m_pStorage->GetTraces(traces);
    m_pTextProvider->Update(std::span<const TQL::ITraceId>(traces));
    if (m_SubplotLayoutMode == ESubplotLayoutModes::SingleSubplot)
        return GroupTracesTogether(traces, *m_pTextProvider, *m_pComponentControls);
    return GroupTracesByType(traces, *m_pTextProvider, *m_pComponentControls, m_bShowDataContexts);
}

void VSubplotManager::AssignColours(const SubplotGrouping& i_rGrouping)
{
    for (const PlacedTrace& rPlaced : i_rGrouping.Placed)
    {
        TQL::IResult result; // a trace beyond the palette is drawn grey, which is no fault
        if (m_SubplotLayoutMode == ESubplotLayoutModes::SingleSubplot)
            m_pStorage->AssignTraceColour(result, rPlaced.Trace);
        else
            m_pStorage->AssignChannelColour(result, rPlaced.Trace, static_cast<std::uint32_t>(rPlaced.ComponentCount));
    }
}

std::shared_ptr<VSubplotData> VSubplotManager::MakeSubplot(std::uint64_t i_Id, const SubplotGroup& i_rGroup,
                                                           const std::shared_ptr<VSubplotData>& i_rpPresent)
{
    auto pSubplot = std::make_shared<VSubplotData>(i_Id, i_rGroup.Label, i_rGroup.Units);
    pSubplot->YAxisToolTip = i_rGroup.ToolTip;
    pSubplot->Traces = i_rGroup.Traces;
    if (i_rpPresent && i_rpPresent->Traces == i_rGroup.Traces)
    {
        pSubplot->pTraceModel = i_rpPresent->pTraceModel;
        pSubplot->pChannelModel = i_rpPresent->pChannelModel;
    }
    else
    {
        MakeModels(*pSubplot);
    }
    if (pSubplot->pTraceModel->GetTraceIds() == i_rGroup.Traces &&
        pSubplot->pTraceModel->GetDisplayNames() == i_rGroup.TraceNames)
        return pSubplot;
    VTraceModel::TraceList traces;
    for (std::size_t i = 0; i < i_rGroup.Traces.size(); ++i)
        traces.emplace_back(i_rGroup.Traces[i], i_rGroup.TraceNames[i]);
    pSubplot->pTraceModel->SetTraces(traces);
    return pSubplot;
}

void VSubplotManager::MakeModels(VSubplotData& io_rSubplot)
{
    io_rSubplot.pTraceModel =
        MakeShownModel<VTraceModel>(m_pUiPostalService, m_pStorage, m_pTextProvider, m_pSubplotModel);
    io_rSubplot.pChannelModel =
        MakeShownModel<VActiveChannelModelFiltered>(m_pActiveChannelModel.data(), m_pSubplotModel);
    std::set<TQL::IChannelInstanceId> channels;
    for (const TQL::ITraceId& rTrace : io_rSubplot.Traces)
        channels.insert(rTrace.Channel());
    io_rSubplot.pChannelModel->SetFilter([accepted = std::move(channels)](const TQL::IChannelInstanceId& i_rId)
                                         { return accepted.contains(i_rId); });
}

} // namespace GraphPlotUI

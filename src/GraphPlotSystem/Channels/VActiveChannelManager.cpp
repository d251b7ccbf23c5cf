#include "GraphPlotSystem/Channels/VActiveChannelManager.h"

#include "ChannelSystem/IChannel.h"
#include "ChannelSystem/IChannelSelectionManager.h"
#include "ChannelSystem/IChannelService.h"
#include "ChannelSystem/IChannelTypeRegistry.h"
#include "ChannelSystemUtils/ChannelParameterAccess.h"
#include "ChannelSystemUtils/ChannelParameterNames.h"
#include "GraphPlotSystem/Channels/ChannelOptionPickers.h"
#include "GraphPlotSystem/Channels/PrimaryChannelType.h"
#include "GraphPlotSystem/Channels/VActiveChannelBuilder.h"
#include "GraphPlotSystem/Channels/VActiveChannelModel.h"
#include "GraphPlotSystem/Channels/VChannelSelectionHelp.h"
#include "GraphPlotSystem/Channels/VChannelTypeModel.h"
#include "GraphPlotSystem/Common/StateResults.h"
#include "IOInterfaceQt/VEnumListModel.h"
#include "NotificationSystem/WeakCallback.h"

#include <utility>

namespace GraphPlotUI
{

VActiveChannelManager::VActiveChannelManager(std::shared_ptr<TQL::IPostalService> i_pUiPostalService,
                                             std::shared_ptr<ChannelSystem::IChannelService> i_pChannelService,
                                             std::shared_ptr<TQL::IChannelTypeRegistry> i_pTypeRegistry,
                                             VActiveChannelModel* i_pActiveChannelModel, bool i_bObjectWord,
                                             bool i_bDeveloperMode)
    : m_pUiPostalService(std::move(i_pUiPostalService))
    , m_pChannelService(std::move(i_pChannelService))
    , m_pTypeRegistry(std::move(i_pTypeRegistry))
    , m_pActiveChannelModel(i_pActiveChannelModel)
    , m_TypeMask(ChannelTypeMask(i_bDeveloperMode))
    , m_pChannelSelectionHelp(new VChannelSelectionHelp(m_pChannelService, m_pTypeRegistry, i_bObjectWord, this))
    , m_pBuilder(TQL::MakeShared<VActiveChannelBuilder>(m_pUiPostalService, m_pChannelService, m_pTypeRegistry,
                                                        i_pActiveChannelModel))
    , m_pSelectedChannelTypeModel(
          new VChannelTypeModel(m_pTypeRegistry, m_pChannelService, i_bDeveloperMode, true, this))
    , m_pGlobalChannelTypeModel(
          new VChannelTypeModel(m_pTypeRegistry, m_pChannelService, i_bDeveloperMode, false, this))
    , m_pRotationFormatModel(new TQL::IO::VEnumListModel(RotationFormatPicker(i_bDeveloperMode), this))
    , m_pRotationUnitsModel(new TQL::IO::VEnumListModel(RotationUnitsPicker(), this))
    , m_pLengthUnitsModel(new TQL::IO::VEnumListModel(LengthUnitsPicker(), this))
{
    connect(m_pSelectedChannelTypeModel, &VChannelTypeModel::currentRowIndexChanged, this,
            &VActiveChannelManager::OnSelectedTypeChanged);
    connect(m_pGlobalChannelTypeModel, &VChannelTypeModel::currentRowIndexChanged, this,
            &VActiveChannelManager::OnGlobalTypeChanged);
    // Queued: the model shall have removed all its rows before one of them is looked for.
    connect(m_pActiveChannelModel, &VActiveChannelModel::channelRemoved, this, &VActiveChannelManager::OnChannelRemoved,
            Qt::QueuedConnection);
    PushOptions();
}

VActiveChannelManager::~VActiveChannelManager()
{
    DropCallbacks();
}

void VActiveChannelManager::SetDataContext(const std::string& i_rName)
{
    if (i_rName == m_ContextName && !m_bCleared)
        return;
    m_ContextName = i_rName;
    m_bCleared = false;
    DropCallbacks();
    if (!m_ContextName.empty())
        RegisterCallbacks();
    // Ahead of the first look at the host: what is found then is for this context.
    m_pBuilder->SetContextName(m_ContextName);
    if (m_ContextName.empty())
        return;
    m_pSelectedChannelTypeModel->Rebuild(m_ContextName);
    m_pGlobalChannelTypeModel->Rebuild(m_ContextName);
    // The types may be the same as before, and what is known of them another.
    OnSelectedTypeChanged();
    OnGlobalTypeChanged();
    OnSelectionChanged(true);
}

void VActiveChannelManager::ClearContext()
{
    DropCallbacks();
    m_pBuilder->Clear();
    m_bCleared = true;
}

void VActiveChannelManager::RegisterCallbacks()
{
    const auto subscribeTypeList = [this](const std::shared_ptr<TQL::IChangeSignal>& i_rpSignal)
    {
        if (!i_rpSignal)
            return;
        for (const auto pHandler :
             {&VActiveChannelManager::OnSelectedTypesListed, &VActiveChannelManager::OnGlobalTypesListed})
            m_TypeListSubscriptions.Subscribe(
                i_rpSignal, NotificationSystem::MakeWeakCallback(WeakSelf(this), pHandler), m_pUiPostalService);
    };
    subscribeTypeList(m_pChannelService->TypeListChanged());
    if (m_pTypeRegistry)
        subscribeTypeList(m_pTypeRegistry->TypeListChanged());
    if (const auto pManager = m_pChannelService->GetSelectionManager())
        m_SelectionSubscriptions.Subscribe(
            pManager->SelectionChanged(),
            NotificationSystem::MakeWeakCallback(WeakSelf(this), &VActiveChannelManager::OnSelectionChanged),
            m_pUiPostalService);
}

void VActiveChannelManager::DropCallbacks()
{
    m_TypeListSubscriptions.Drain();
    m_SelectionSubscriptions.Drain();
}

void VActiveChannelManager::OnSelectedTypesListed()
{
    m_pSelectedChannelTypeModel->Rebuild(m_ContextName);
    // A type that has just appeared may be that of things which are selected already.
    OnSelectedTypeChanged();
    OnSelectionChanged(false);
}

void VActiveChannelManager::OnGlobalTypesListed()
{
    m_pGlobalChannelTypeModel->Rebuild(m_ContextName);
}

void VActiveChannelManager::OnSelectionChanged(bool i_bForce)
{
    if (!IsFollowing())
        return;
    EvaluateSelection();
    m_pBuilder->Refresh(i_bForce);
}

void VActiveChannelManager::EvaluateSelection()
{
    if (!IsFollowing() || !m_bSelectionLinked)
        return;
    EvaluateAutoType();
    m_pSelectedChannelTypeModel->UpdateAvailability();
}

void VActiveChannelManager::EvaluateAutoType()
{
    if (!IsFollowing() || !m_bSelectionLinked || !m_pSelectedChannelTypeModel->IsAuto())
        return;
    std::set<std::string> types;
    if (const auto pManager = m_pChannelService->GetSelectionManager())
        pManager->GetSelectedChannelTypes(m_TypeMask, types);
    m_pSelectedChannelTypeModel->SetAutoChannelType(PrimaryChannelType(types));
}

void VActiveChannelManager::OnSelectedTypeChanged()
{
    if (!IsFollowing())
        return;
    EvaluateAutoType();
    const std::string type = m_pSelectedChannelTypeModel->GetEffectiveType();
    if (type != AutoChannelType)
        m_pBuilder->SetSelectedChannelType(type);
    SetCanComputeSelectionMagnitude(CanComputeMagnitude(type));
}

void VActiveChannelManager::OnGlobalTypeChanged()
{
    if (!IsFollowing())
        return;
    const std::string& rType = m_pGlobalChannelTypeModel->GetPickedType();
    m_pBuilder->SetGlobalChannelType(rType == NoGlobalChannelType ? std::string() : rType);
}

void VActiveChannelManager::OnChannelRemoved(const std::shared_ptr<TQL::IChannel>& i_rpChannel)
{
    const std::string& rType = m_pGlobalChannelTypeModel->GetPickedType();
    if (rType.empty() || rType == NoGlobalChannelType || !m_pActiveChannelModel)
        return; // nothing is picked, or the model died before this notice came
    if (IsMadeOfType(i_rpChannel, rType) && !IsUnpinnedRowMadeOf(rType))
        m_pGlobalChannelTypeModel->SelectNone();
}

bool VActiveChannelManager::IsUnpinnedRowMadeOf(const std::string& i_rType) const
{
    const VActiveChannelModel::ChannelList pinned = m_pActiveChannelModel->GetPinnedChannels();
    const std::set<std::shared_ptr<TQL::IChannel>> pinnedSet(pinned.begin(), pinned.end());
    for (const std::shared_ptr<TQL::IChannel>& rpChannel : m_pActiveChannelModel->GetChannels())
        if (!pinnedSet.contains(rpChannel) && IsMadeOfType(rpChannel, i_rType))
            return true;
    return false;
}

bool VActiveChannelManager::CanComputeMagnitude(const std::string& i_rType) const
{
    if (m_pTypeRegistry)
        return m_pTypeRegistry->CanComputeMagnitude(m_ContextName, i_rType);
    const auto pParameters = i_rType == AutoChannelType ? nullptr : m_pChannelService->GetTypeParameters(i_rType);
    using namespace ChannelSystemUtils;
    return pParameters && ReadBoolParameter(*pParameters, ParameterName::SupportMagnitude).value_or(true);
}

void VActiveChannelManager::SetCanComputeSelectionMagnitude(bool i_bCan)
{
    if (std::exchange(m_bCanComputeSelectionMagnitude, i_bCan) == i_bCan)
        return;
    Q_EMIT CanComputeSelectionMagnitudeChanged();
    PushOptions();
}

void VActiveChannelManager::PushOptions()
{
    m_pBuilder->SetOptions(MakeChannelOptions(m_Choice, m_bCanComputeSelectionMagnitude));
}

template <typename T>
void VActiveChannelManager::SetChoice(T ChannelOptionChoice::*i_pMember, T i_Value,
                                      void (VActiveChannelManager::*i_pSignal)())
{
    if (std::exchange(m_Choice.*i_pMember, i_Value) == i_Value)
        return;
    Q_EMIT(this->*i_pSignal)();
    PushOptions();
}

void VActiveChannelManager::SetRotationFormat(int i_Format)
{
    SetChoice(&ChannelOptionChoice::RotationFormat, i_Format, &VActiveChannelManager::RotationFormatChanged);
}

void VActiveChannelManager::SetRotationUnits(int i_Units)
{
    SetChoice(&ChannelOptionChoice::RotationUnits, i_Units, &VActiveChannelManager::RotationUnitsChanged);
}

void VActiveChannelManager::SetLengthUnits(int i_Units)
{
    SetChoice(&ChannelOptionChoice::LengthUnits, i_Units, &VActiveChannelManager::LengthUnitsChanged);
}

void VActiveChannelManager::SetDerivativeOrder(int i_Order)
{
    if (i_Order >= 0 && i_Order <= 2)
        SetChoice(&ChannelOptionChoice::DerivativeOrder, i_Order, &VActiveChannelManager::DerivativeOrderChanged);
}

void VActiveChannelManager::SetDifferentiateByFrame(bool i_bByFrame)
{
    SetChoice(&ChannelOptionChoice::bDifferentiateByFrame, i_bByFrame, &VActiveChannelManager::DerivativeOrderChanged);
}

void VActiveChannelManager::SetPlotMagnitude(bool i_bPlot)
{
    SetChoice(&ChannelOptionChoice::bPlotMagnitude, i_bPlot, &VActiveChannelManager::PlotMagnitudeChanged);
}

void VActiveChannelManager::SetSelectionLinked(bool i_bLinked)
{
    if (std::exchange(m_bSelectionLinked, i_bLinked) == i_bLinked)
        return;
    Q_EMIT SelectionLinkedChanged();
    m_pBuilder->SetLinked(i_bLinked);
    EvaluateSelection();
}

TQL::IResult VActiveChannelManager::LoadState(const ActiveChannelState& i_rState)
{
    const TQL::IResult selected = m_pSelectedChannelTypeModel->LoadState(i_rState.SelectedChannelType);
    const TQL::IResult global = m_pGlobalChannelTypeModel->LoadState(i_rState.GlobalChannelType);
    SetRotationFormat(i_rState.RotationFormat);
    SetRotationUnits(i_rState.RotationUnits);
    SetLengthUnits(i_rState.LengthUnits);
    SetSelectionLinked(i_rState.bSelectionLinked);
    SetDerivativeOrder(i_rState.DerivativeOrder);
    SetPlotMagnitude(i_rState.bPlotMagnitude);
    OnSelectionChanged(true);
    return WorseResult(selected, global);
}

void VActiveChannelManager::SaveState(ActiveChannelState& io_rState) const
{
    io_rState.SelectedChannelType = m_pSelectedChannelTypeModel->SaveState();
    io_rState.GlobalChannelType = m_pGlobalChannelTypeModel->SaveState();
    io_rState.RotationFormat = m_Choice.RotationFormat;
    io_rState.RotationUnits = m_Choice.RotationUnits;
    io_rState.LengthUnits = m_Choice.LengthUnits;
    io_rState.DerivativeOrder = m_Choice.DerivativeOrder;
    io_rState.bPlotMagnitude = m_Choice.bPlotMagnitude;
    io_rState.bSelectionLinked = m_bSelectionLinked;
}

QObject* VActiveChannelManager::GetSelectedChannelTypeModel() const
{
    return m_pSelectedChannelTypeModel;
}

QObject* VActiveChannelManager::GetGlobalChannelTypeModel() const
{
    return m_pGlobalChannelTypeModel;
}

QObject* VActiveChannelManager::GetRotationFormatModel() const
{
    return m_pRotationFormatModel;
}

QObject* VActiveChannelManager::GetRotationUnitsModel() const
{
    return m_pRotationUnitsModel;
}

QObject* VActiveChannelManager::GetLengthUnitsModel() const
{
    return m_pLengthUnitsModel;
}

QObject* VActiveChannelManager::GetChannelSelectionHelp() const
{
    return m_pChannelSelectionHelp;
}

} // namespace GraphPlotUI

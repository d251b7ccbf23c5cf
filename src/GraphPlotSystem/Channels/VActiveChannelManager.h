#pragma once

#include "GraphPlotSystem/Channels/ActiveChannelState.h"
#include "GraphPlotSystem/Channels/ChannelOptionChoice.h"
#include "NotificationSystem/VSubscriptions.h"
#include "TQL/IResult.h"
#include "TQL/VShared.h"

#include <QtCore/QObject>
#include <QtCore/QPointer>

#include <cstdint>
#include <memory>
#include <string>

namespace ChannelSystem
{
class IChannelService;
}

namespace TQL
{
class IChannel;
class IChannelTypeRegistry;
class IPostalService;
} // namespace TQL

namespace TQL::IO
{
class VEnumListModel;
}

namespace GraphPlotUI
{

class VActiveChannelBuilder;
class VActiveChannelModel;
class VChannelSelectionHelp;
class VChannelTypeModel;

/// What a plot is asked to show, as QML sees it ("contextActiveChannelManager"): the two channel type pickers, formats
/// and units, derivative, magnitude, and whether the host's selection is followed. Keeps the builder in step, which
/// turns these and the selection into the channels of the active channel model. One a graph plot system; made by
/// MakeSharedObject. UI thread; the host's notices come through the UI postal service.
class VActiveChannelManager : public QObject, public TQL::VShared
{
    Q_OBJECT
    Q_PROPERTY(QObject* selectedChannelTypeModel READ GetSelectedChannelTypeModel CONSTANT)
    Q_PROPERTY(QObject* globalChannelTypeModel READ GetGlobalChannelTypeModel CONSTANT)
    Q_PROPERTY(QObject* rotationFormatModel READ GetRotationFormatModel CONSTANT)
    Q_PROPERTY(QObject* rotationUnitsModel READ GetRotationUnitsModel CONSTANT)
    Q_PROPERTY(QObject* lengthUnitsModel READ GetLengthUnitsModel CONSTANT)
    Q_PROPERTY(QObject* channelSelectionHelp READ GetChannelSelectionHelp CONSTANT)
    Q_PROPERTY(int rotationFormat READ GetRotationFormat WRITE SetRotationFormat NOTIFY RotationFormatChanged)
    Q_PROPERTY(int rotationUnits READ GetRotationUnits WRITE SetRotationUnits NOTIFY RotationUnitsChanged)
    Q_PROPERTY(int lengthUnits READ GetLengthUnits WRITE SetLengthUnits NOTIFY LengthUnitsChanged)
    Q_PROPERTY(bool selectionLinked READ IsSelectionLinked WRITE SetSelectionLinked NOTIFY SelectionLinkedChanged)
    Q_PROPERTY(
        bool canComputeSelectionMagnitude READ CanComputeSelectionMagnitude NOTIFY CanComputeSelectionMagnitudeChanged)
    Q_PROPERTY(int derivativeOrder READ GetDerivativeOrder WRITE SetDerivativeOrder NOTIFY DerivativeOrderChanged)
    Q_PROPERTY(bool differentiateByFrame READ GetDifferentiateByFrame WRITE SetDifferentiateByFrame NOTIFY
                   DerivativeOrderChanged)
    Q_PROPERTY(bool plotMagnitude READ GetPlotMagnitude WRITE SetPlotMagnitude NOTIFY PlotMagnitudeChanged)

public:
    /// The registry may be null: then there are no creatable types. The model is not owned.
    VActiveChannelManager(std::shared_ptr<TQL::IPostalService> i_pUiPostalService,
                          std::shared_ptr<ChannelSystem::IChannelService> i_pChannelService,
                          std::shared_ptr<TQL::IChannelTypeRegistry> i_pTypeRegistry,
                          VActiveChannelModel* i_pActiveChannelModel, bool i_bObjectWord, bool i_bDeveloperMode);
    ~VActiveChannelManager() override;

    /// Follows the host in the data context of that name; the empty name stops following.
    void SetDataContext(const std::string& i_rName);
    /// Stops following; the name and the plotted channels stay. What is picked from then on has its effect when a
    /// context is set, be it the same one again.
    void ClearContext();

    /// Applies the fields that are this object's. OkButModified when a channel type is not listed.
    TQL::IResult LoadState(const ActiveChannelState& i_rState);
    /// Fills in the fields that are this object's and leaves the others alone.
    void SaveState(ActiveChannelState& io_rState) const;

    QObject* GetSelectedChannelTypeModel() const;
    QObject* GetGlobalChannelTypeModel() const;
    QObject* GetRotationFormatModel() const;
    QObject* GetRotationUnitsModel() const;
    QObject* GetLengthUnitsModel() const;
    QObject* GetChannelSelectionHelp() const;

    int GetRotationFormat() const { return m_Choice.RotationFormat; }
    void SetRotationFormat(int i_Format); ///< any number: the picker does not list all formats to everybody
    int GetRotationUnits() const { return m_Choice.RotationUnits; }
    void SetRotationUnits(int i_Units);
    int GetLengthUnits() const { return m_Choice.LengthUnits; }
    void SetLengthUnits(int i_Units);
    bool IsSelectionLinked() const { return m_bSelectionLinked; }
    void SetSelectionLinked(bool i_bLinked);
    bool CanComputeSelectionMagnitude() const { return m_bCanComputeSelectionMagnitude; }
    int GetDerivativeOrder() const { return m_Choice.DerivativeOrder; }
    void SetDerivativeOrder(int i_Order); ///< ignores all but 0, 1, 2
    bool GetDifferentiateByFrame() const { return m_Choice.bDifferentiateByFrame; }
    void SetDifferentiateByFrame(bool i_bByFrame);
    bool GetPlotMagnitude() const { return m_Choice.bPlotMagnitude; }
    void SetPlotMagnitude(bool i_bPlot); ///< has an effect while the selected type can give a magnitude

Q_SIGNALS:
    void RotationFormatChanged();
    void RotationUnitsChanged();
    void LengthUnitsChanged();
    void SelectionLinkedChanged();
    void CanComputeSelectionMagnitudeChanged();
    void DerivativeOrderChanged();
    void PlotMagnitudeChanged();

private:
    template <typename T>
    void SetChoice(T ChannelOptionChoice::*i_pMember, T i_Value, void (VActiveChannelManager::*i_pSignal)());
    void PushOptions();
    bool IsFollowing() const { return !m_ContextName.empty() && !m_bCleared; }
    void RegisterCallbacks();
    void DropCallbacks();
    void OnSelectedTypesListed();
    void OnGlobalTypesListed();
    void OnSelectionChanged(bool i_bForce);
    void OnSelectedTypeChanged();
    void OnGlobalTypeChanged();
    void OnChannelRemoved(const std::shared_ptr<TQL::IChannel>& i_rpChannel);
    void EvaluateAutoType();
    void EvaluateSelection();
    void SetCanComputeSelectionMagnitude(bool i_bCan);
    bool CanComputeMagnitude(const std::string& i_rType) const;
    bool IsUnpinnedRowMadeOf(const std::string& i_rType) const;

    const std::shared_ptr<TQL::IPostalService> m_pUiPostalService;
    const std::shared_ptr<ChannelSystem::IChannelService> m_pChannelService;
    const std::shared_ptr<TQL::IChannelTypeRegistry> m_pTypeRegistry; ///< may be null
    const QPointer<VActiveChannelModel> m_pActiveChannelModel;
    const std::uint64_t m_TypeMask;
    VChannelSelectionHelp* const m_pChannelSelectionHelp; ///< a child of this object, as the models below
    const std::shared_ptr<VActiveChannelBuilder> m_pBuilder;
    VChannelTypeModel* const m_pSelectedChannelTypeModel;
    VChannelTypeModel* const m_pGlobalChannelTypeModel;
    TQL::IO::VEnumListModel* const m_pRotationFormatModel;
    TQL::IO::VEnumListModel* const m_pRotationUnitsModel;
    TQL::IO::VEnumListModel* const m_pLengthUnitsModel;
    std::string m_ContextName; ///< empty for none
    ChannelOptionChoice m_Choice;
    bool m_bCleared = false; ///< the name stands, but its host is not followed
    bool m_bSelectionLinked = true;
    bool m_bCanComputeSelectionMagnitude = false;
    NotificationSystem::VSubscriptions m_TypeListSubscriptions;
    NotificationSystem::VSubscriptions m_SelectionSubscriptions;
};

} // namespace GraphPlotUI

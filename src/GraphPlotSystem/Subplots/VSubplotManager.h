#pragma once

#include "GraphPlotSystem/Common/IGraphPlotPreferences.h"
#include "GraphPlotSystem/Subplots/SubplotState.h"
#include "NotificationSystem/VSubscriptions.h"
#include "TQL/VShared.h"

#include <QtCore/QObject>
#include <QtCore/QPointer>

#include <memory>

namespace TQL
{
class IChannelComponentControls;
class IChannelTextProvider;
class IPostalService;
class ITraceDataStorage;
} // namespace TQL

namespace TQL::IO
{
class VEnumListModel;
}

namespace GraphPlotUI
{

struct SubplotGroup;
struct SubplotGrouping;
struct VSubplotData;
class VActiveChannelModel;
class VSubplotModel;
class VTraceManager;

/// Shares the traces of one window out over subplots, and gives each subplot its texts and each trace its colour. Does
/// so anew whenever traces, texts, switched components, the layout mode or the set of colours change; what stays the
/// same keeps its row and its models. QML sees it as "contextSubplotManager". Made by MakeSharedObject, held by the
/// window's graph plot system; UI thread.
class VSubplotManager : public QObject, public TQL::VShared
{
    Q_OBJECT
    Q_PROPERTY(QObject* subplotModel READ GetSubplotModelObject CONSTANT)
    Q_PROPERTY(QObject* subplotLayoutModesModel READ GetSubplotLayoutModesModel CONSTANT)
    Q_PROPERTY(TQL::SubplotLayoutModes::ESubplotLayoutModes subplotLayoutMode READ GetSubplotLayoutMode WRITE
                   SetSubplotLayoutMode NOTIFY SubplotLayoutModeChanged)
    Q_PROPERTY(bool showPanZoomGraphic READ GetShowPanZoomGraphic NOTIFY ShowPanZoomGraphicChanged)

public:
    /// i_bShowDataContexts: whether tool tips tell the data contexts.
    VSubplotManager(std::shared_ptr<TQL::IPostalService> i_pUiPostalService, VActiveChannelModel* i_pActiveChannelModel,
                    std::shared_ptr<TQL::IChannelTextProvider> i_pTextProvider,
                    std::shared_ptr<TQL::IChannelComponentControls> i_pComponentControls,
                    std::shared_ptr<VTraceManager> i_pTraceManager, std::shared_ptr<TQL::ITraceDataStorage> i_pStorage,
                    std::shared_ptr<IGraphPlotPreferences> i_pPreferences, bool i_bShowDataContexts);
    ~VSubplotManager() override;

    VSubplotModel* GetSubplotModel() const { return m_pSubplotModel; }
    QObject* GetSubplotModelObject() const;
    QObject* GetSubplotLayoutModesModel() const;
    ESubplotLayoutModes GetSubplotLayoutMode() const { return m_SubplotLayoutMode; }
    void SetSubplotLayoutMode(TQL::SubplotLayoutModes::ESubplotLayoutModes i_Mode);
    bool GetShowPanZoomGraphic() const { return m_bShowPanZoomGraphic; }

    void LoadState(const SubplotState& i_rState);
    void SaveState(SubplotState& o_rState) const;

Q_SIGNALS:
    void SubplotLayoutModeChanged();
    void ShowPanZoomGraphicChanged();

protected:
    void OnPostCreation() override;

private:
    void SubscribePreference(int i_Index, IGraphPlotPreferences::Token& o_rToken, void (VSubplotManager::*i_pMember)());
    void OnColourSetPreference();
    void OnPanZoomPreference();
    void UpdateSubplots();
    SubplotGrouping GroupTraces() const;
    void AssignColours(const SubplotGrouping& i_rGrouping);
    std::shared_ptr<VSubplotData> MakeSubplot(std::uint64_t i_Id, const SubplotGroup& i_rGroup,
                                              const std::shared_ptr<VSubplotData>& i_rpPresent);
    void MakeModels(VSubplotData& io_rSubplot);

    const std::shared_ptr<TQL::IPostalService> m_pUiPostalService;
    const QPointer<VActiveChannelModel> m_pActiveChannelModel;
    const std::shared_ptr<TQL::IChannelTextProvider> m_pTextProvider;
    const std::shared_ptr<TQL::IChannelComponentControls> m_pComponentControls;
    const std::shared_ptr<VTraceManager> m_pTraceManager;
    const std::shared_ptr<TQL::ITraceDataStorage> m_pStorage;
    const std::shared_ptr<IGraphPlotPreferences> m_pPreferences;
    VSubplotModel* const m_pSubplotModel;                      ///< a child of this object
    TQL::IO::VEnumListModel* const m_pSubplotLayoutModesModel; ///< and so is this
    const bool m_bShowDataContexts;
    ESubplotLayoutModes m_SubplotLayoutMode = ESubplotLayoutModes::SubplotPerTraceType;
    std::int32_t m_ColourSet = 0; ///< an ETraceColourSet
    bool m_bShowPanZoomGraphic = true;
    IGraphPlotPreferences::Token m_ColourSetToken = 0; ///< 0 for none
    IGraphPlotPreferences::Token m_PanZoomToken = 0;   ///< 0 for none
    NotificationSystem::VSubscriptions m_Subscriptions;
};

} // namespace GraphPlotUI

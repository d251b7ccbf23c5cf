#pragma once

#include "GraphPlotSystem/Time/VBaseGraphPlotTime.h"
#include "NotificationSystem/VSubscriptions.h"
#include "OrvanePluginInterface/ITimeController.h"
#include "TQL/VShared.h"

namespace GraphPlotUI
{

/// Plot time bound to one of the host's time sources: the current one, or, while the plotted channels come from others,
/// the first live source. Follows the source only while active. Made by MakeSharedObject, held by the graph plot system
/// of its window; UI thread. The host raises its signals on any thread; they arrive through a collapser.
class VOrvaneGraphPlotTime : public VBaseGraphPlotTime, public TQL::VShared
{
    Q_OBJECT

public:
    VOrvaneGraphPlotTime(std::shared_ptr<TQL::IPostalService> i_pUiPostalService,
                         std::shared_ptr<OrvanePluginInterface::ITimeController> i_pController);
    ~VOrvaneGraphPlotTime() override;

    void SetActive(bool i_bActive) override;
    bool HasSource(const std::string& i_rName) const override;
    void SetPreferredSources(const std::set<std::string>& i_rNames) override;
    void SetCurrentTime(qlonglong i_Frame) override;

protected:
    void OnPostCreation() override;

private:
    void PostRefresh();
    void RefreshSource();
    void Sample();
    std::shared_ptr<OrvanePluginInterface::ITimeSource> ChooseSource() const;

    const std::shared_ptr<OrvanePluginInterface::ITimeController> m_pController;
    const std::shared_ptr<TQL::IPostalService> m_pRefreshCollapser;
    std::shared_ptr<OrvanePluginInterface::ITimeSource> m_pSource; ///< null until one was found
    bool m_bActive = false;
    bool m_bRelative = false; ///< frames are counted back from the latest one
    NotificationSystem::VSubscriptions m_SourceSubscriptions;
    NotificationSystem::VSubscriptions m_ControllerSubscriptions;
    std::set<std::string> m_PreferredSources;
};

} // namespace GraphPlotUI

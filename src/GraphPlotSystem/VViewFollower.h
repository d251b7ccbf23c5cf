#pragma once

#include "GraphPlotSystem/GraphPlotState.h"
#include "NotificationSystem/VSubscriptions.h"
#include "TQL/VShared.h"

#include <memory>
#include <string>

namespace ChannelSystem
{
class IChannelContext;
class IChannelService;
} // namespace ChannelSystem

namespace OrvanePluginInterface
{
class ITimeController;
}

namespace GraphPlotUI
{

class VExtendedGraphPlotSystem;

/// Takes the plot of one window along with the host, between live and review and from one data context to the next. It
/// holds a state for each of the two views; when another view or another context comes into force the state of that
/// view is applied, which ends what the operator had set up in the view before. Made by TQL::MakeShared, owned by the
/// window's content. UI thread. A burst of the host's notices makes one run, with the latest of what they tell.
class VViewFollower : public TQL::VShared
{
public:
    VViewFollower(std::shared_ptr<TQL::IPostalService> i_pUiPostalService,
                  std::shared_ptr<ChannelSystem::IChannelService> i_pChannelService,
                  std::shared_ptr<OrvanePluginInterface::ITimeController> i_pWindowContext,
                  std::shared_ptr<VExtendedGraphPlotSystem> i_pSystem);
    ~VViewFollower() override;

protected:
    void OnPostCreation() override;

private:
    /// What the last completed run was for.
    struct View
    {
        bool bLive = true;
        std::string ContextName;
        std::shared_ptr<ChannelSystem::IChannelContext> pContext;

        friend bool operator==(const View&, const View&) = default;
    };

    void OnViewChanged();
    void ApplyStateOf(const View& i_rView);
    View GetPresentView() const;

    const std::shared_ptr<TQL::IPostalService> m_pUiPostalService;
    const std::shared_ptr<ChannelSystem::IChannelService> m_pChannelService;
    const std::shared_ptr<OrvanePluginInterface::ITimeController> m_pWindowContext;
    const std::shared_ptr<VExtendedGraphPlotSystem> m_pSystem;
    View m_View; // in force; without a context until the first run
    GraphPlotState m_LiveState;
    GraphPlotState m_ReviewState;
    NotificationSystem::VSubscriptions m_Subscriptions;
};

} // namespace GraphPlotUI

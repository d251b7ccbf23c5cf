#pragma once

#include "ChannelSystemSelection/VChannelSelectionManager.h"
#include "Channels/Contexts/VRecordedContext.h"
#include "Channels/VChannelService.h"
#include "CoreGraphics/RenderContext.h"
#include "GraphPlotSystem/Channels/VActiveChannelManager.h"
#include "GraphPlotSystem/Channels/VActiveChannelModel.h"
#include "GraphPlotSystem/FakeHost.h"
#include "GraphPlotSystem/FakePreferences.h"
#include "GraphPlotSystem/GraphPlotState.h"
#include "GraphPlotSystem/Texts/VBaseChannelTextProvider.h"
#include "GraphPlotSystem/VExtendedGraphPlotSystem.h"
#include "Services/Selection/VSelectionSource.h"
#include "support/LogGuard.h"
#include "support/ManualPostalService.h"

#include <QtGui/QOffscreenSurface>
#include <QtGui/QOpenGLContext>

#include <gtest/gtest.h>

#include <memory>
#include <string>
#include <vector>

namespace Services
{
class VChannelMigrationService;
class VChannelTypeRegistry;
class VTimeController;
} // namespace Services

namespace GraphPlotUI
{
class VViewFollower;
}

/// One plot window without its picture, in a host: the real channels, types, selection, migration and time, and all
/// managers and models of the plot, put together as for a window. Only the queue of the user interface, the workers and
/// the renderer are run by the test, within the functions below. What the window shows is read as text.
class PlotScenario : public ::testing::Test
{
protected:
    PlotScenario();
    ~PlotScenario() override;

    // The host.
    /// One of that name is replaced; channels keep their ids.
    void AddRecording(const std::string& i_rContext, std::shared_ptr<Recordings::VRecording> i_pRecording);
    void AddCapture(const std::string& i_rContext);
    void RemoveContext(const std::string& i_rContext);
    /// The host chooses a context, and the window goes there as it does in the program: in the state of that view.
    void Show(const std::string& i_rContext);
    /// Selects what is meant by channels, named as in the file, of the context that is shown.
    void Select(const std::vector<std::string>& i_rNames);
    void SelectThings(const std::vector<TQL::SelectionItem>& i_rItems);
    std::shared_ptr<TQL::IChannel> FindSource(const std::string& i_rName) const;

    // The operator.
    GraphPlotUI::VActiveChannelManager& Manager() const { return *pSystem->GetActiveChannelManager(); }
    GraphPlotUI::VActiveChannelModel& Rows() const { return *pSystem->GetActiveChannelModel(); }
    void PickType(const std::string& i_rInternalName);
    void PickGlobalType(const std::string& i_rInternalName);
    /// The options from their defaults on, as words: d1 d2 frame mag rad cm m, and f4 for rotation format 4.
    void Choose(const std::string& i_rOptions);
    void Pin(const std::string& i_rName, bool i_bPinned = true); ///< the row of that name
    void SwitchComponent(const std::string& i_rChannel, std::uint64_t i_Component, bool i_bEnabled);

    /// False where there is no desktop OpenGL. Settle needs it; to be called once.
    bool BeginDrawing();
    /// Lets everything happen that is under way: three frames of the renderer, each with a tick of the update loop.
    void Settle();
    /// The same for the user interface alone; there are no new traces then.
    void SettleUi();

    // What is seen.
    /// A line a channel: name | components | units, and the units as rich text behind them where they differ.
    std::string Plotted();
    /// A line a channel: the numbers of its block at one frame.
    std::string Values(std::int64_t i_Frame);
    /// A line a subplot, from top to bottom: label, units, then the traces, each with the number of its colour.
    std::string Subplots();
    /// A line a row: channel, component, colour; "*" for a pin, "?" for missing data.
    std::string Key();
    std::string ToolTip(int i_Subplot);
    /// What the channel of that row says is wrong.
    std::string ErrorOf(const std::shared_ptr<TQL::IChannel>& i_rpChannel) const;

    GraphPlotUI::GraphPlotState SaveState();
    TQL::IResult ApplyState(const GraphPlotUI::GraphPlotState& i_rState);

    TestSupport::LogGuard Log;
    const std::shared_ptr<TestSupport::ManualPostalService> pUi = std::make_shared<TestSupport::ManualPostalService>();
    const std::shared_ptr<FakeHost::Workers> pWorkers = std::make_shared<FakeHost::Workers>();
    const std::shared_ptr<FakePreferences> pPreferences = std::make_shared<FakePreferences>();
    const std::shared_ptr<Channels::VChannelService> pService = std::make_shared<Channels::VChannelService>();
    const std::shared_ptr<Services::VSelectionSource> pSelection = std::make_shared<Services::VSelectionSource>();
    const std::shared_ptr<ChannelSystemSelection::VChannelSelectionManager> pSelectionManager =
        TQL::MakeShared<ChannelSystemSelection::VChannelSelectionManager>(pSelection);
    std::shared_ptr<Services::VChannelTypeRegistry> pTypes;
    std::shared_ptr<Services::VChannelMigrationService> pMigration;
    std::shared_ptr<Services::VTimeController> pTime;
    std::shared_ptr<GraphPlotUI::VExtendedGraphPlotSystem> pSystem;

private:
    void MakeSystem();
    void AddContext(std::shared_ptr<Channels::VChannelContext> i_pContext, int i_TimeMode);
    std::string ColourOf(const TQL::ITraceId& i_rTrace) const;

    std::shared_ptr<GraphPlotUI::VBaseChannelTextProvider> m_pTexts;
    std::shared_ptr<TQL::IChannelComponentControls> m_pControls;
    std::shared_ptr<TQL::ITraceDataStorage> m_pStorage;
    std::shared_ptr<GraphPlotUI::VViewFollower> m_pViewFollower;
    std::string m_Shown; ///< name of a context
    QOffscreenSurface m_Surface;
    QOpenGLContext m_Gl;
    CoreGraphics::RenderContext m_Renderer;
};

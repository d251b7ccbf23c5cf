#include "GraphPlotSystem/Channels/VActiveChannelModelFiltered.h"
#include "GraphPlotSystem/Common/SharedObject.h"
#include "GraphPlotSystem/FakeTraceWindow.h"
#include "GraphPlotSystem/SubplotFixture.h"
#include "GraphPlotSystem/Subplots/VSubplotManager.h"
#include "GraphPlotSystem/Subplots/VSubplotModel.h"
#include "GraphPlotSystem/Subplots/VTraceModel.h"
#include "GraphPlotSystem/Traces/VTraceManager.h"
#include "IOInterfaceQt/VEnumListModel.h"

#include <QtCore/QCoreApplication>
#include <QtCore/QEvent>
#include <QtCore/QPointF>

using namespace GraphPlotUI;
using namespace TQL::SubplotModelRoles;

namespace
{

class SubplotManager : public SubplotFixture
{
protected:
    SubplotManager() { Make(false); }

    void Make(bool i_bShowDataContexts, bool i_bWatch = true)
    {
        m_pJournal.reset();
        pManager = MakeSharedObject<VSubplotManager>(pUi, &Channels, pTexts, pControls, m_pTraceManager, pStorage,
                                                     pPreferences, i_bShowDataContexts);
        if (i_bWatch)
            Watch();
        QObject::connect(pManager.get(), &VSubplotManager::SubplotLayoutModeChanged, [this] { ++ModeChanges; });
        QObject::connect(pManager.get(), &VSubplotManager::ShowPanZoomGraphicChanged, [this] { ++PanZoomChanges; });
    }

    void Watch() { m_pJournal = std::make_unique<ModelJournal>(Model()); }
    VSubplotModel& Model() const { return *pManager->GetSubplotModel(); }
    QObject* TraceModelOf(int i_Row) const { return Model().index(i_Row).data(SubplotTraceModel).value<QObject*>(); }
    std::string Signals() { return m_pJournal->Take(); }

    /// One line a subplot: label, units, and each trace with its name and the number of its colour.
    std::string Picture(int i_Set = 0) const
    {
        QString text;
        for (int row = 0; row < Model().rowCount(); ++row)
        {
            const QModelIndex index = Model().index(row);
            text += index.data(SubplotYAxisLabel).toString() + index.data(SubplotYAxisUnits).toString() + ":";
            const auto* const pTraces = static_cast<VTraceModel*>(TraceModelOf(row));
            for (int i = 0; i < pTraces->rowCount(); ++i)
            {
                const TQL::ITraceId& rTrace = pTraces->GetTraceIds()[static_cast<std::size_t>(i)];
                const int colour =
                    ColourOf(rTrace.Channel().TypeName, rTrace.Channel().Text, rTrace.Component(), i_Set);
                text += ' ' + pTraces->index(i).data(TQL::TraceModelRoles::TraceDisplayName).toString() + '#' +
                        QString::number(colour);
            }
            text += '\n';
        }
        return text.toStdString();
    }
    std::string AfterAll(int i_Set = 0)
    {
        pUi->RunAll();
        return Picture(i_Set);
    }

    std::shared_ptr<VSubplotManager> pManager;
    int ModeChanges = 0;
    int PanZoomChanges = 0;

private:
    const std::shared_ptr<FakeHost::Service> m_pService =
        std::make_shared<FakeHost::Service>(std::make_shared<FakeHost::Journal>());
    const std::shared_ptr<VTraceManager> m_pTraceManager = MakeSharedObject<VTraceManager>(
        pUi, std::make_shared<FakeHost::Workers>(), m_pService, pPreferences, pTexts, pControls,
        std::make_shared<FakeTraceWindow::PlotTime>(pUi), pStorage, true, false);
    std::unique_ptr<ModelJournal> m_pJournal;
};

TEST_F(SubplotManager, FollowsTracesAndSwitches)
{
    EXPECT_EQ(AfterAll(), "");
    Plot("Marker", "LASI");
    // One trace a subplot goes by the name of its channel.
    EXPECT_EQ(AfterAll(), "Position : TX(mm): LASI#0\nPosition : TY(mm): LASI#0\nPosition : TZ(mm): LASI#0\n");
    EXPECT_EQ(Signals().substr(0, 30), "insert 0; insert 1; insert 2; ");

    Plot("Emg", "Soleus");
    Plot("Marker", "RASI");
    const QObject* const pTraceModel = TraceModelOf(0);
    EXPECT_EQ(AfterAll(), "Position : TX(mm): LASI#0 RASI#2\nPosition : TY(mm): LASI#0 RASI#2\n"
                          "Position : TZ(mm): LASI#0 RASI#2\nEMG(V): Soleus#1\n");
    EXPECT_NE(TraceModelOf(0), pTraceModel) << "another list of traces";

    const QObject* const pZ = TraceModelOf(2);
    Signals();
    ASSERT_TRUE(pControls->SetComponentEnabled(7, 1, false).IsSuccess());
    EXPECT_EQ(AfterAll(), "Position : TX(mm): LASI#0 RASI#2\nPosition : TZ(mm): LASI#0 RASI#2\nEMG(V): Soleus#1\n");
    EXPECT_EQ(Signals(), "remove 1; ") << "nothing else is told of";
    EXPECT_EQ(TraceModelOf(1), pZ);
    ASSERT_TRUE(pControls->SetComponentEnabled(7, 1, true).IsSuccess());
    pUi->RunAll();
    EXPECT_EQ(Signals(), "insert 1; ") << "with the range that it had";

    Unplot("Marker", "LASI");
    EXPECT_EQ(AfterAll(), "Position : TX(mm): RASI#2\nPosition : TY(mm): RASI#2\nPosition : TZ(mm): RASI#2\n"
                          "EMG(V): Soleus#1\n")
        << "a colour stays with its channel";
    Plot("Marker", "C7");
    EXPECT_EQ(AfterAll().substr(0, 34), "Position : TX(mm): C7#0 RASI#2\nPos") << "the first free colour";
    pStorage->Clear();
    EXPECT_EQ(AfterAll(), "");
    EXPECT_EQ(Model().GetSubplotCount(), 0);
}

TEST_F(SubplotManager, SubplotsHaveTheirChannelsAndToolTips)
{
    Make(true);
    const auto marker = std::make_shared<FakeHost::Channel>(FakeTexts::Id("Marker", "LASI"));
    const auto emg = std::make_shared<FakeHost::Channel>(FakeTexts::Id("Emg", "Soleus"));
    ASSERT_TRUE(Channels.SetChannels({marker, emg}).IsSuccess());
    Plot("Marker", "LASI");
    Plot("Emg", "Soleus");
    pUi->RunAll();
    const QModelIndex last = Model().index(3);
    const auto* const pShare = qobject_cast<QAbstractItemModel*>(last.data(SubplotChannelModel).value<QObject*>());
    ASSERT_TRUE(pShare);
    ASSERT_EQ(pShare->rowCount(), 1);
    EXPECT_EQ(pShare->index(0, 0).data().toString(), "Soleus");
    EXPECT_EQ(last.data(SubplotYAxisToolTip).toString(),
              "<b>Channels:</b><br>Soleus<br><b>Units:</b><br>V<br><b>Data contexts:</b><br>Live");
    // A view may still hold the models of a subplot that goes; they die when it has had its turn.
    const QPointer<QObject> pTraces = TraceModelOf(3);
    Unplot("Emg", "Soleus");
    pUi->RunAll();
    EXPECT_TRUE(pTraces);
    QCoreApplication::sendPostedEvents(nullptr, QEvent::DeferredDelete);
    EXPECT_FALSE(pTraces);
}

TEST_F(SubplotManager, NewTextsReachTheRowsThatStay)
{
    Plot("Marker", "LASI");
    pUi->RunAll();
    const QObject* const pTraces = TraceModelOf(0);
    Signals();
    pTexts->Types["Marker"].Name = "Place";
    pTexts->NotifyTextChanged();
    pTexts->NotifyTextChanged();
    EXPECT_EQ(pUi->Pending(), 1u) << "one update for both notices";
    EXPECT_EQ(AfterAll().substr(0, 25), "Place : TX(mm): LASI#0\nPl");
    EXPECT_EQ(Signals(), "change 0 256; change 1 256; change 2 256; ");
    EXPECT_EQ(TraceModelOf(0), pTraces);
}

TEST_F(SubplotManager, LayoutModesColourInTheirOwnWay)
{
    Plot("Marker", "LASI");
    Plot("Emg", "Soleus");
    pUi->RunAll();
    pManager->SetSubplotLayoutMode(ESubplotLayoutModes::SingleSubplot);
    EXPECT_EQ(Picture(), ": Soleus : #0 LASI : TX#1 LASI : TY#2 LASI : TZ#3\n");
    EXPECT_EQ(Model().index(0).data(SubplotYAxisToolTip).toString(), "");
    EXPECT_EQ(ModeChanges, 1);
    pManager->SetSubplotLayoutMode(ESubplotLayoutModes::SingleSubplot);
    EXPECT_EQ(ModeChanges, 1);
    const QObject* const pTraces = TraceModelOf(0);
    ASSERT_TRUE(pControls->SetComponentEnabled(7, 1, false).IsSuccess());
    EXPECT_EQ(AfterAll(), ": Soleus : #0 LASI : TX#1 LASI : TZ#3\n");
    EXPECT_NE(TraceModelOf(0), pTraces);
    ASSERT_TRUE(pControls->SetChannelComponentsEnabled(7, false).IsSuccess());
    ASSERT_TRUE(pControls->SetChannelComponentsEnabled(9, false).IsSuccess());
    EXPECT_EQ(AfterAll(), "") << "no subplot without a trace";
    ASSERT_TRUE(pManager->setProperty("subplotLayoutMode", 0)) << "as a picker writes it";
    ASSERT_TRUE(pControls->SetChannelComponentsEnabled(7, true).IsSuccess());
    EXPECT_EQ(AfterAll(), "Position : TX(mm): LASI#0\nPosition : TY(mm): LASI#0\nPosition : TZ(mm): LASI#0\n");

    const auto* const pModes = qobject_cast<TQL::IO::VEnumListModel*>(pManager->GetSubplotLayoutModesModel());
    EXPECT_EQ(pModes->Rows().at(1).Key, "Single Plot");
    EXPECT_EQ(pModes->findFirstValueIndex(pManager->property("subplotLayoutMode").toInt()), 0);
}

TEST_F(SubplotManager, FollowsThePreferences)
{
    Plot("Marker", "LASI");
    Plot("Marker", "RASI");
    pUi->RunAll();
    const auto set = [&](int i_Index, const IGraphPlotPreferences::Value& i_rValue)
    {
        ASSERT_TRUE(pPreferences->SetValue(i_Index, i_rValue).IsSuccess());
        pUi->RunAll();
    };
    for (const int colourSet : {1, 2, 0})
    {
        set(IGraphPlotPreferences::TraceColourSet, colourSet);
        EXPECT_EQ(Picture(colourSet).substr(0, 33), "Position : TX(mm): LASI#0 RASI#1\n") << colourSet;
    }
    EXPECT_TRUE(pManager->GetShowPanZoomGraphic());
    set(IGraphPlotPreferences::ShowPanZoomGraphic, false);
    set(IGraphPlotPreferences::ShowPanZoomGraphic, false);
    EXPECT_FALSE(pManager->GetShowPanZoomGraphic());
    EXPECT_EQ(PanZoomChanges, 1);

    set(IGraphPlotPreferences::TraceColourSet, 2);
    Make(false);
    EXPECT_FALSE(pManager->GetShowPanZoomGraphic()) << "as it stands when the window opens";
    EXPECT_EQ(Picture(2).substr(0, 33), "Position : TX(mm): LASI#0 RASI#1\n");
}

TEST_F(SubplotManager, FitsToValuesThatCome)
{
    Plot("Emg", "Soleus", {0, 1});
    pUi->RunAll();
    const auto range = [&]
    {
        return Model().index(0).data(SubplotYAxisRange).toPointF();
    };
    EXPECT_EQ(range(), QPointF(-0.05, 1.05));
    Plot("Emg", "Soleus", {0, 1, 100, 0});
    EXPECT_EQ(range(), QPointF(-0.05, 1.05));
    pUi->RunAll();
    EXPECT_EQ(range(), QPointF(-5, 105));
}

TEST_F(SubplotManager, StateComesBack)
{
    Plot("Emg", "Soleus");
    pUi->RunAll();
    Model().SetFitYAxes(false);
    Model().setData(Model().index(0), QPointF(-7, 7), SubplotYAxisRange);
    SubplotState state;
    pManager->SaveState(state);
    Make(false);
    pManager->LoadState(state);
    EXPECT_EQ(Model().index(0).data(SubplotYAxisRange).toPointF(), QPointF(-7, 7));
    EXPECT_EQ(ModeChanges, 0);
    state.LayoutMode = ESubplotLayoutModes::SingleSubplot;
    pManager->LoadState(state);
    EXPECT_EQ(ModeChanges, 1);
    EXPECT_EQ(Picture(), ": Soleus : #0\n");
}

TEST_F(SubplotManager, ASwitchAmongThousandTracesTouchesNoOtherRow)
{
    Make(false, false);
    for (int type = 0; type < 250; ++type)
    {
        const std::string name = "T" + std::to_string(type);
        pTexts->Types[name] = {static_cast<std::uint64_t>(1000 + type),
                               QString::fromStdString(name),
                               "",
                               {{"a", ""}, {"b", ""}, {"c", ""}, {"d", ""}}};
        Plot(name, "channel " + name);
    }
    pUi->RunAll();
    ASSERT_EQ(Model().rowCount(), 1000);
    Watch();
    ASSERT_TRUE(pControls->SetComponentEnabled(1100, 2, false).IsSuccess());
    pUi->RunAll();
    const std::string signals = Signals();
    EXPECT_EQ(signals.find("remove "), 0u);
    EXPECT_EQ(std::ranges::count(signals, ';'), 1) << signals;
    EXPECT_EQ(Model().rowCount(), 999);
}

TEST_F(SubplotManager, LateNoticesFindNobody)
{
    Plot("Emg", "Soleus");
    ASSERT_TRUE(pPreferences->SetValue(IGraphPlotPreferences::TraceColourSet, 1).IsSuccess());
    EXPECT_NE(pUi->Pending(), 0u);
    pManager.reset();
    for (const int index : {IGraphPlotPreferences::TraceColourSet, IGraphPlotPreferences::ShowPanZoomGraphic})
        EXPECT_EQ(pPreferences->CountCallbacks(index), 0u) << index << ": taken back, not left to the next notice";
    pUi->RunAll();
    EXPECT_EQ(pStorage->DataChanged()->Count(), 0u);
    EXPECT_EQ(pStorage->ColoursChanged()->Count(), 0u);
}

} // namespace

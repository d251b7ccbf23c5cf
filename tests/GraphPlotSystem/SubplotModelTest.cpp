#include "GraphPlotSystem/Channels/VActiveChannelModelFiltered.h"
#include "GraphPlotSystem/SubplotFixture.h"
#include "GraphPlotSystem/Subplots/VSubplotData.h"
#include "GraphPlotSystem/Subplots/VSubplotModel.h"
#include "GraphPlotSystem/Subplots/VTraceModel.h"

#include <QtCore/QPointF>

#include <limits>

using namespace GraphPlotUI;
using namespace TQL::SubplotModelRoles;

namespace
{

class SubplotModel : public SubplotFixture
{
protected:
    SubplotModel()
    {
        QObject::connect(&Model, &VSubplotModel::LockYAxesChanged, [this] { m_Properties += "lock; "; });
        QObject::connect(&Model, &VSubplotModel::FitYAxesChanged, [this] { m_Properties += "fit; "; });
        QObject::connect(&Model, &VSubplotModel::SubplotCountChanged, [this] { m_Properties += "count; "; });
    }

    static std::shared_ptr<VSubplotData> Subplot(std::uint64_t i_Id, const char* i_pTrace = "LASI")
    {
        auto pSubplot = std::make_shared<VSubplotData>(i_Id, QString::number(i_Id), "mm");
        pSubplot->Traces = {TQL::ITraceId(FakeTexts::Id("Marker", i_pTrace), 0)};
        return pSubplot;
    }
    void Show(const std::vector<std::uint64_t>& i_rOrder)
    {
        VSubplotModel::SubplotMap subplots;
        for (const std::uint64_t id : i_rOrder)
            subplots.emplace(id, Subplot(id));
        Model.Update(subplots, i_rOrder);
    }
    std::string Rows() const
    {
        QStringList rows;
        for (int row = 0; row < Model.rowCount(); ++row)
            rows.append(Model.index(row).data(SubplotYAxisLabel).toString());
        return rows.join(' ').toStdString();
    }
    std::string Range(int i_Row = 0) const
    {
        const auto range = Model.index(i_Row).data(SubplotYAxisRange).toPointF();
        return QStringLiteral("%1..%2").arg(range.x()).arg(range.y()).toStdString();
    }
    bool Write(double i_Minimum, double i_Maximum)
    {
        return Model.setData(Model.index(0), QPointF(i_Minimum, i_Maximum), SubplotYAxisRange);
    }
    std::string Properties() { return std::exchange(m_Properties, {}); }

    VSubplotModel Model{pStorage, nullptr};
    ModelJournal Journal{Model};

private:
    std::string m_Properties;
};

TEST_F(SubplotModel, KeepsTheRowsThatStay)
{
    struct Step
    {
        std::vector<std::uint64_t> Order;
        const char* pSignals;
    };
    const Step steps[] = {
        {{}, ""},
        {{1, 2, 3}, "insert 0; insert 1; insert 2; "},
        {{1, 2, 3}, ""},
        {{1, 4, 2, 3}, "insert 1; "},
        {{4, 3}, "remove 2; remove 0; "},
        {{3, 4}, "remove 0; insert 1; "},                    // two that change places: one moves
        {{3, 4, 5, 6, 7}, "insert 2; insert 3; insert 4; "}, //
        {{4, 5, 6, 7, 3}, "remove 0; insert 4; "},           // the first goes to the end: the others stay
        {{7, 4, 8, 5}, "remove 2..4; insert 0; insert 2; "},
        {{}, "remove 0..3; "},
    };
    for (const Step& rStep : steps)
    {
        Show(rStep.Order);
        std::string expected;
        for (const std::uint64_t id : rStep.Order)
            expected += (expected.empty() ? "" : " ") + std::to_string(id);
        EXPECT_EQ(Rows(), expected);
        EXPECT_EQ(Journal.Take(), rStep.pSignals) << expected;
        EXPECT_EQ(Properties(), *rStep.pSignals == 0 ? "" : "count; ");
    }
    Model.Update({{1, Subplot(1)}, {2, Subplot(2)}}, {9, 2});
    EXPECT_EQ(Rows(), "2") << "an id without a subplot, a subplot that is not listed";
}

TEST_F(SubplotModel, TellsWhatChangedInARow)
{
    Model.SetFitYAxes(false);
    Show({1, 2});
    Journal.Take();
    const auto pTraceModel = std::make_shared<VTraceModel>(pUi, pStorage, pTexts, nullptr);
    const auto pChannelModel = std::make_shared<VActiveChannelModelFiltered>(&Channels, nullptr);
    struct Case
    {
        void (*pChange)(VSubplotData&);
        const char* pSignals;
    };
    const Case cases[] = {
        {[](VSubplotData&) {}, ""},
        {[](VSubplotData& o_r) { o_r.YAxisLabel = "new"; }, "change 1 256; "},
        {[](VSubplotData& o_r) { o_r.YAxisUnits = "(m)"; }, "change 1 256 257; "}, // and the label is the old one again
        {[](VSubplotData& o_r) { o_r.YAxisToolTip = "tip"; }, "change 1 257 258; "},
        {[](VSubplotData& o_r) { o_r.Traces.clear(); }, "change 1 258 261; "},
    };
    const auto update = [&](const std::shared_ptr<VSubplotData>& i_rpSecond)
    {
        Model.Update({{1, Subplot(1)}, {2, i_rpSecond}}, {1, 2});
        return Journal.Take();
    };
    for (const Case& rCase : cases)
    {
        const auto pSubplot = Subplot(2);
        rCase.pChange(*pSubplot);
        EXPECT_EQ(update(pSubplot), rCase.pSignals);
    }
    const auto pSubplot = Subplot(2);
    pSubplot->pTraceModel = pTraceModel;
    pSubplot->pChannelModel = pChannelModel;
    EXPECT_EQ(update(pSubplot), "change 1 260 261 262; ");
    EXPECT_EQ(Model.index(1).data(SubplotTraceModel).value<QObject*>(), pTraceModel.get());
    EXPECT_EQ(Model.index(1).data(SubplotChannelModel).value<QObject*>(), pChannelModel.get());
    EXPECT_EQ(Model.index(1).data(SubplotYAxisUnits).toString(), "(mm)");
    EXPECT_EQ(Model.index(1).data(SubplotTraces).toList().at(0).value<TQL::ITraceId>(), pSubplot->Traces[0]);
    EXPECT_TRUE(Model.index(1).data(SubplotOverlays).value<std::vector<TQL::IGraphPlotOverlay>>().empty());
    EXPECT_FALSE(Model.setData(Model.index(1), "x", SubplotYAxisLabel));
    EXPECT_EQ(Model.roleNames().value(SubplotYAxisRange), "subplotYAxisRange");
}

TEST_F(SubplotModel, HandsARunningInspectionToTheModelThatFollows)
{
    const auto show = [&](const char* i_pTrace)
    {
        const auto pSubplot = Subplot(1, i_pTrace);
        pSubplot->pTraceModel = std::make_shared<VTraceModel>(pUi, pStorage, pTexts, nullptr);
        Model.Update({{1, pSubplot}}, {1});
        return pSubplot->pTraceModel;
    };
    const auto pFirst = show("LASI");
    pFirst->setInspectionEnabled(true);
    const auto pSecond = show("RASI");
    EXPECT_FALSE(pFirst->IsInspectionEnabled());
    EXPECT_TRUE(pSecond->IsInspectionEnabled());
    pSecond->setInspectionEnabled(false);
    EXPECT_FALSE(show("LASI")->IsInspectionEnabled());
}

TEST_F(SubplotModel, RangesOfARowAreWrittenAndKept)
{
    Show({1});
    Model.SetFitYAxes(false);
    Journal.Take();
    EXPECT_EQ(Range(), "0..1") << "nothing is known of it";
    EXPECT_TRUE(Write(-5, 5));
    EXPECT_EQ(Journal.Take(), "change 0 259; ");
    EXPECT_TRUE(Write(-5, 5));
    EXPECT_TRUE(Write(std::numeric_limits<double>::quiet_NaN(), 5));
    EXPECT_FALSE(Model.setData(Model.index(0), "a word", SubplotYAxisRange));
    EXPECT_FALSE(Model.setData({}, QPointF(1, 2), SubplotYAxisRange));
    EXPECT_EQ(Journal.Take(), "");
    EXPECT_TRUE(Model.setData(Model.index(0), QVariant::fromValue(ValueRange{-6, 6}), SubplotYAxisRange));
    EXPECT_EQ(Range(), "-6..6");
    EXPECT_TRUE(Write(-5, 5));
    EXPECT_EQ(Range(), "-5..5");
    Show({2});
    EXPECT_EQ(Range(), "0..1");
    Show({1});
    EXPECT_EQ(Range(), "-5..5") << "a subplot that comes back has its range again";
}

TEST_F(SubplotModel, FitsUnlessLocked)
{
    Show({1});
    Plot("Marker", "LASI", {0, 10});
    EXPECT_EQ(Range(), "0..1");
    Journal.Take();
    Model.Refresh();
    EXPECT_EQ(Journal.Take(), "change 0 259; ");
    const std::string fitted = Range();
    ASSERT_TRUE(Model.index(0).data(SubplotYAxisRange).toPointF().y() >= 10.0);

    Model.SetFitYAxes(false);
    EXPECT_EQ(Range(), "0..1") << "the range from before the fit";
    EXPECT_EQ(Journal.Take(), "change 0 259; ");
    Model.Refresh();
    EXPECT_EQ(Range(), "0..1");
    Write(2, 3);
    Model.SetFitYAxes(true);
    EXPECT_EQ(Range(), fitted);
    Model.SetLockYAxes(true);
    Plot("Marker", "LASI", {0, 10, -1000, 1000});
    Model.Refresh();
    EXPECT_EQ(Range(), fitted) << "locked";
    Properties();
    Model.SetLockYAxes(true);
    EXPECT_EQ(Properties(), "");
    Journal.Take();
    Model.SetLockYAxes(false);
    EXPECT_EQ(Properties(), "lock; ");
    EXPECT_EQ(Journal.Take(), "change 0 259; change 0 259; ") << "the fit of the row, then all rows";
    EXPECT_NE(Range(), fitted);
    Model.SetFitYAxes(false);
    EXPECT_EQ(Range(), "2..3");
}

TEST_F(SubplotModel, ResetsByHandEvenWhenLocked)
{
    Plot("Marker", "LASI", {0, 10});
    Show({1, 2});
    Model.SetFitYAxes(false);
    Model.SetLockYAxes(true);
    EXPECT_FALSE(Model.resetYAxisRange(-1) || Model.resetYAxisRange(2));
    EXPECT_TRUE(Model.resetYAxisRange(1));
    EXPECT_EQ(Range(0) + " " + Range(1), "0..1 -0.5..10.5");
    Model.resetAllYAxisRanges();
    EXPECT_EQ(Range(0), Range(1));
}

TEST_F(SubplotModel, StateComesBackById)
{
    Model.SetFitYAxes(false);
    Show({5});
    Write(1, 2);
    Show({7, 6});
    Write(3, 4);
    SubplotState state;
    Model.SaveState(state);
    EXPECT_EQ(state.SubplotIds, (std::vector<std::uint64_t>{7, 6, 5})) << "first those on show";
    const std::vector<SubplotConfiguration> configurations = {{3, 4, 0, 1}, {0, 1, 0, 1}, {1, 2, 0, 1}};
    EXPECT_EQ(state.Configurations, configurations);
    EXPECT_FALSE(state.bFitYAxes);

    Model.LoadState({});
    EXPECT_EQ(Range(), "0..1");
    Model.LoadState(state);
    Show({5});
    EXPECT_EQ(Range(), "1..2");
}

TEST_F(SubplotModel, StateWithoutIdsGoesByPlace)
{
    SubplotState state;
    state.Configurations = {{1, 2, 0, 1}, {3, 4, 0, 1}, {5, 6, 0, 1}};
    state.bFitYAxes = false;
    Model.LoadState(state);
    EXPECT_EQ(Properties(), "count; fit; ");
    EXPECT_EQ(Journal.Take(), "reset; ");
    Show({8, 9});
    EXPECT_EQ(Range(0) + " " + Range(1), "1..2 3..4");
    Model.LoadState({});
    EXPECT_EQ(Range(0), "0..1") << "nothing of it stays";
    EXPECT_TRUE(Model.GetFitYAxes());
    Model.LoadState(state);
    EXPECT_EQ(Range(0) + " " + Range(1), "1..2 3..4");
}

} // namespace

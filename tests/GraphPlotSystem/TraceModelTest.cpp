#include "GraphPlotSystem/SubplotFixture.h"
#include "GraphPlotSystem/Subplots/VTraceModel.h"

#include <QtCore/QTimer>
#include <QtGui/QColor>

using namespace GraphPlotUI;
using namespace TQL::TraceModelRoles;

namespace
{

class TraceModel : public SubplotFixture
{
protected:
    TraceModel()
    {
        for (const float value : {10.0f, 20.0f, 30.0f})
            m_Block.Append({value, value + 1, value + 2});
        QObject::connect(&Model, &VTraceModel::InspectionProgressChanged, [this] { ++Refreshes; });
    }

    static TQL::ITraceId Trace(const char* i_pName, std::uint8_t i_Component = 0)
    {
        return {FakeTexts::Id("Marker", i_pName), i_Component};
    }
    void Inspect(const char* i_pName, std::int64_t i_BaseTick = 0)
    {
        pStorage->InspectTrace(FakeTexts::Id("Marker", i_pName), m_Block, i_BaseTick, 10);
        pUi->RunAll();
    }
    /// "value mean deviation" of a row; "-" for what is not there.
    std::string Numbers(int i_Row) const
    {
        QStringList texts;
        for (const int role : {TraceValue, TraceMean, TraceStandardDeviation})
        {
            const QVariant value = Model.index(i_Row).data(role);
            texts.append(value.isValid() ? QString::number(value.toDouble()) : QStringLiteral("-"));
        }
        return texts.join(' ').toStdString();
    }
    bool IsTimerRunning() const { return Model.findChild<QTimer*>()->isActive(); }
    void EndTimer()
    {
        ASSERT_TRUE(IsTimerRunning());
        Model.findChild<QTimer*>()->stop();
        QMetaObject::invokeMethod(Model.findChild<QTimer*>(), "timeout");
    }

    double Now = 100.0;
    int Refreshes = 0;
    VTraceModel Model{pUi, pStorage, pTexts, nullptr,
                      [this]
                      {
                          return Now;
                      }};
    ModelJournal Journal{Model};
    TestSupport::MemoryBlock m_Block{3, TQL::DefaultFramePeriod};
};

TEST_F(TraceModel, TellsOfItsTraces)
{
    Model.SetTraces({{Trace("LASI", 0), "left"}, {Trace("RASI", 2), "right"}});
    EXPECT_EQ(Journal.Take(), "reset; ");
    const QModelIndex second = Model.index(1);
    EXPECT_EQ(second.data(TraceId).value<TQL::ITraceId>(), Trace("RASI", 2));
    EXPECT_EQ(second.data(TraceDisplayName).toString(), "right");
    EXPECT_EQ(second.data(TraceUnits).toString(), "mm");
    EXPECT_EQ(second.data(TraceColour).value<QColor>(), QColor::fromRgbF(0.5f, 0.5f, 0.5f));
    EXPECT_EQ(Numbers(1), "- - -");
    EXPECT_FALSE(second.data(263).isValid() || second.data(Qt::DisplayRole).isValid());
    EXPECT_EQ(Model.roleNames().value(TraceStandardDeviation), "traceStandardDeviation");

    const Colour4f red[] = {{1, 0, 0, 1}};
    TQL::IResult result;
    pStorage->SetPalette(red);
    pStorage->AssignTraceColour(result, Trace("RASI", 2));
    pUi->RunAll();
    EXPECT_EQ(Journal.Take(), "change 0 258; change 1 258; ") << "once for both changes, row by row";
    EXPECT_EQ(second.data(TraceColour).value<QColor>(), QColor(255, 0, 0));
}

TEST_F(TraceModel, RowsGoAndComeWithAllThatIsInThem)
{
    Model.SetTraces({{Trace("a"), "a"}, {Trace("b"), "b"}, {Trace("c"), "c"}});
    Journal.Take();
    EXPECT_FALSE(Model.removeRows(3, 1) || Model.removeRows(-1, 1) || Model.insertRows(4, 1) ||
                 Model.insertRows(-1, 1));
    EXPECT_TRUE(Model.removeRows(1, 1));
    EXPECT_TRUE(Model.insertRows(2, 2));
    EXPECT_EQ(Journal.Take(), "remove 1; insert 2..3; ");
    EXPECT_EQ(Model.index(1).data(TraceDisplayName).toString(), "c");
    EXPECT_EQ(Model.index(3).data(TraceDisplayName).toString(), "");
    EXPECT_EQ(Model.index(3).data(TraceId).value<TQL::ITraceId>(), TQL::ITraceId());
}

TEST_F(TraceModel, InspectsWhileItIsOn)
{
    Model.SetTraces({{Trace("LASI", 0), "x"}, {Trace("LASI", 2), "z"}, {Trace("lost"), "lost"}});
    Inspect("LASI");
    EXPECT_EQ(Refreshes, 0) << "nothing is inspected yet";
    Model.setInspectionEnabled(true);
    Model.setInspectionEnabled(true);
    Model.setInspectionTime(1.0);
    Journal.Take();
    Inspect("LASI");
    EXPECT_EQ(Refreshes, 1) << "one subscription, however often it is switched on";
    EXPECT_EQ(Journal.Take(), "change 0..2 259 260 261; ");
    EXPECT_EQ(Numbers(0), "20 20 10");
    EXPECT_EQ(Numbers(1), "22 22 10");
    EXPECT_EQ(Numbers(2), "- - -");
    EXPECT_FLOAT_EQ(Model.GetInspectionProgress(), 1.0f);

    Now += 1.0;
    Model.setInspectionEnabled(false);
    EXPECT_EQ(Refreshes, 2) << "at once";
    Model.setInspectionEnabled(false);
    Now += 1.0;
    Model.setInspectionTime(2.0);
    Inspect("LASI");
    EXPECT_EQ(Numbers(0), "20 20 10") << "the last numbers";
    EXPECT_EQ(Refreshes, 2);
    Model.SetTraces({{Trace("LASI", 0), "x"}});
    EXPECT_EQ(Numbers(0), "- - -");
}

TEST_F(TraceModel, RefreshesFourTimesASecondAtMost)
{
    Model.SetTraces({{Trace("LASI"), "x"}});
    Model.setInspectionEnabled(true);
    const auto notice = [&](double i_Seconds, double i_Frame)
    {
        Now += i_Seconds;
        Model.setInspectionTime(i_Frame);
        Inspect("LASI");
    };
    notice(0.0, 0.0);
    EXPECT_EQ(Refreshes, 1);
    notice(0.1, 1.0);
    notice(0.1, 2.0);
    EXPECT_EQ(Refreshes, 1);
    EXPECT_EQ(Numbers(0), "10 20 10");
    Now += 0.3;
    EndTimer();
    EXPECT_EQ(Refreshes, 2);
    EXPECT_EQ(Numbers(0), "30 20 10");
    notice(0.1, 1.0);
    EXPECT_TRUE(IsTimerRunning());
    notice(0.15, 0.0);
    EXPECT_EQ(Refreshes, 3) << "a quarter of a second has passed";
    EXPECT_FALSE(IsTimerRunning());
}

TEST_F(TraceModel, LeavesNothingBehind)
{
    {
        VTraceModel model(pUi, pStorage, pTexts, nullptr);
        model.SetTraces({{Trace("LASI"), "x"}});
        model.setInspectionEnabled(true);
        pStorage->InspectTrace(FakeTexts::Id("Marker", "LASI"), m_Block, 0, 10);
    }
    EXPECT_EQ(pStorage->InspectionChanged()->Count(), 0u);
    EXPECT_EQ(pStorage->ColoursChanged()->Count(), 1u) << "that of the fixture's model";
    pUi->RunAll(); // a notice for the model that is gone
    m_Block.TakeReads();
    pStorage->InspectTrace(FakeTexts::Id("Marker", "LASI"), m_Block, TQL::DefaultFramePeriod, 10);
    EXPECT_EQ(m_Block.TakeReads(), "") << "its traces are inspected no longer";
}

} // namespace

#include "GraphPlotSystem/TraceManagerFixture.h"
#include "IOInterfaceQt/VEnumListModel.h"

#include <QtCore/QMetaMethod>

#include <limits>

using namespace GraphPlotUI;

TEST_F(TraceManager, ANewManagerShowsTenSeconds)
{
    const auto pManager = Make();
    EXPECT_EQ(pManager->GetLiveTimePresetIndex(), 1);
    EXPECT_EQ(pManager->GetDefaultTimeRange(), QPointF(-1200, 0));
    EXPECT_EQ(pManager->GetTimeRange(), QPointF(-1200, 0));
    EXPECT_EQ(pManager->GetDisplayUpdatePeriodMillis(), 20);
    EXPECT_TRUE(pManager->IsLiveContext());
    EXPECT_TRUE(pManager->GetRelativeTimeDisplay());
    EXPECT_FALSE(pManager->GetFitTimeRange());
    EXPECT_TRUE(Make(false)->GetFitTimeRange()) << "without relative time the range follows the data";
    EXPECT_EQ(pJournal->Take(), "") << "and nothing is asked of anybody";

    const auto* pModel = qobject_cast<TQL::IO::VEnumListModel*>(pManager->GetLiveTimePresetsModel());
    ASSERT_TRUE(pModel);
    std::string texts;
    for (const auto& rRow : pModel->Rows())
        texts += rRow.Key.toStdString() + " ";
    EXPECT_EQ(texts, "1s 10s 30s 1m 10m 30m 1h 12h 24h ");
}

// The order in the meta-object is part of the interface.
TEST_F(TraceManager, PropertiesAndSignalsStandInOrder)
{
    const QMetaObject& rMeta = VTraceManager::staticMetaObject;
    std::string table;
    for (int i = rMeta.propertyOffset(); i < rMeta.propertyCount(); ++i)
    {
        const QMetaProperty property = rMeta.property(i);
        table += std::string(property.name()) + (property.isWritable() ? " rw " : " r ") +
                 property.notifySignal().name().toStdString() + "\n";
    }
    EXPECT_EQ(table, "haveTraceData r HaveTraceDataChanged\n"
                     "liveContext r LiveContextChanged\n"
                     "relativeTimeDisplay rw RelativeTimeDisplayChanged\n"
                     "lockTimeRange rw LockTimeRangeChanged\n"
                     "fitTimeRange rw FitTimeRangeChanged\n"
                     "timeRange rw TimeRangeChanged\n"
                     "defaultTimeRange rw DefaultTimeRangeChanged\n"
                     "liveTimePresetsModel r \n"
                     "liveTimePresetIndex rw LiveTimePresetIndexChanged\n"
                     "subplotWidth rw SubplotWidthChanged\n"
                     "gapOpacity rw GapOpacityChanged\n"
                     "contextFramePeriod r ContextFramePeriodChanged\n"
                     "displayUpdatePeriodMillis rw DisplayUpdatePeriodMillisChanged\n");
    std::string methods;
    for (int i = rMeta.methodOffset(); i < rMeta.methodCount(); ++i)
        methods += rMeta.method(i).name().toStdString() + " ";
    EXPECT_EQ(methods, "LiveTimePresetIndexChanged HaveTraceDataChanged LiveContextChanged RelativeTimeDisplayChanged "
                       "LockTimeRangeChanged FitTimeRangeChanged TimeRangeChanged DefaultTimeRangeChanged "
                       "SubplotWidthChanged GapOpacityChanged ContextFramePeriodChanged "
                       "DisplayUpdatePeriodMillisChanged channelExportData forceUpdateXAxis ");
}

TEST_F(TraceManager, RangesThatMeanNothingAreIgnored)
{
    const auto pManager = Make();
    const double infinity = std::numeric_limits<double>::infinity();
    const double notANumber = std::numeric_limits<double>::quiet_NaN();
    for (const QPointF& rBad : {QPointF(5, 5), QPointF(notANumber, 1), QPointF(0, infinity), QPointF(1, 0),
                                QPointF(-1200.0 * (1.0 + 1e-13), 0)})
    {
        pManager->setProperty("timeRange", rBad);
        pManager->setProperty("defaultTimeRange", rBad);
    }
    EXPECT_EQ(Notes(), "");
    EXPECT_EQ(pManager->GetTimeRange(), QPointF(-1200, 0));

    pManager->setProperty("timeRange", QPointF(-216000, 0));
    EXPECT_EQ(Notes(), "TimeRange DisplayUpdatePeriodMillis ");
    EXPECT_EQ(pManager->GetDisplayUpdatePeriodMillis(), 500) << "1800 seconds";
    pManager->setProperty("defaultTimeRange", QPointF(-216000, 0));
    EXPECT_EQ(Notes(), "DefaultTimeRange ");
    EXPECT_EQ(pManager->GetDisplayUpdatePeriodMillis(), 500);
}

TEST_F(TraceManager, APresetSetsTheDefaultRange)
{
    struct Case
    {
        const char* pWhat;
        bool bFit;
        bool bLock;
        bool bForce;
        QPointF TimeRange;
    };
    const Case cases[] = {
        {"the shown range stays", false, false, false, {-1200, 0}},
        {"fit follows", true, false, false, {-3600, 0}},
        {"lock holds fit", true, true, false, {-1200, 0}},
        {"force follows always", false, true, true, {-3600, 0}},
    };
    for (const Case& rCase : cases)
    {
        const auto pManager = Make(true, rCase.bForce);
        pManager->SetFitTimeRange(rCase.bFit);
        pManager->SetLockTimeRange(rCase.bLock);
        pManager->SetLiveTimePresetIndex(2);
        EXPECT_EQ(pManager->GetDefaultTimeRange(), QPointF(-3600, 0)) << rCase.pWhat;
        EXPECT_EQ(pManager->GetTimeRange(), rCase.TimeRange) << rCase.pWhat;
    }
    const auto pManager = Make();
    pManager->SetLiveTimePresetIndex(1);
    EXPECT_EQ(Notes(), "") << "unchanged";
    pManager->SetLiveTimePresetIndex(50);
    EXPECT_EQ(pManager->GetLiveTimePresetIndex(), 50);
    EXPECT_EQ(Notes(), "LiveTimePresetIndex ") << "an index beyond the list leaves the range";
    pManager->SetLiveTimePresetIndex(-5);
    EXPECT_EQ(pManager->GetLiveTimePresetIndex(), 1);
}

TEST_F(TraceManager, FollowsTheCachedRangeInFitMode)
{
    const auto pManager = Make();
    Watch("A", 120); // one second of frames
    const auto tick = [&](std::int64_t i_LatestFrame)
    {
        pTime->SetLatestFrame(i_LatestFrame);
        RunLoopOnce();
    };
    pManager->SetFitTimeRange(true);
    pManager->SetContext("Live");
    tick(119);
    EXPECT_FALSE(pManager->HaveTraceData());
    EXPECT_EQ(pManager->GetTimeRange(), QPointF(-1200, 0)) << "no traces, nothing to fit";

    pStorage->TraceCount = 3;
    Watch("B", 121);
    tick(119);
    EXPECT_TRUE(pManager->HaveTraceData());
    EXPECT_EQ(pManager->GetTimeRange(), QPointF(-360, 0)) << "three seconds are the least";
    pManager->SetLockTimeRange(true);
    pStorage->TraceCount = 0;
    Watch("B", 900);
    tick(119);
    EXPECT_FALSE(pManager->HaveTraceData()) << "a lock does not stop this";
    EXPECT_EQ(pManager->GetTimeRange(), QPointF(-360, 0));
    pStorage->TraceCount = 3;
    pManager->SetLockTimeRange(false);
    EXPECT_EQ(pManager->GetTimeRange(), QPointF(-900, 0)) << "unlocking fits to what is there";
    pManager->SetTimeRange({-50, 0});
    pManager->forceUpdateXAxis();
    EXPECT_EQ(pManager->GetTimeRange(), QPointF(-900, 0));
}

TEST_F(TraceManager, AFittedReviewShowsItsFitRange)
{
    const auto pManager = Make();
    AddRecording("Take", 100, 300);
    pManager->SetContext("Take");
    pManager->SetTimeRange({150, 160});
    pStorage->TraceCount = 1;
    pManager->SetFitTimeRange(true);
    EXPECT_EQ(pManager->GetTimeRange(), QPointF(100, 300)) << "without a fit range the default one";
    pTime->FitRange = TQL::TickRange{120, 180};
    pManager->forceUpdateXAxis();
    EXPECT_EQ(pManager->GetTimeRange(), QPointF(120, 182));
}

TEST_F(TraceManager, TheLayoutModeTakesTheColoursAway)
{
    const auto pManager = Make();
    pManager->SetSubplotLayoutMode(ESubplotLayoutModes::SingleSubplot);
    pManager->SetSubplotLayoutMode(ESubplotLayoutModes::SingleSubplot);
    EXPECT_EQ(pJournal->Take(), "resetColours\n");
    EXPECT_EQ(pManager->GetSubplotLayoutMode(), ESubplotLayoutModes::SingleSubplot);
    EXPECT_EQ(pManager->GetTraceDataStorage(), pStorage);
}

TEST_F(TraceManager, StateGoesOutAndComesBack)
{
    const auto pManager = Make();
    pManager->SetLiveTimePresetIndex(4);
    pManager->SetRelativeTimeDisplay(false);
    pManager->SetLockTimeRange(true);
    pManager->SetTimeRange({-700.5, -3.25});
    pManager->SetGapOpacity(0.125);
    TraceState state;
    pManager->BuildState(state);
    EXPECT_EQ(state, (TraceState{"10m", false, true, false, {-700.5, -3.25}, 0.125}));

    const auto pOther = Make();
    TQL::IResult result = TQL::Result::NotAvailable;
    pOther->ApplyState(result, state);
    EXPECT_EQ(result, TQL::Result::Ok);
    TraceState copy;
    pOther->BuildState(copy);
    EXPECT_EQ(copy, state);
    EXPECT_EQ(pOther->GetDefaultTimeRange(), QPointF(-72000, 0));

    Notes();
    pOther->ApplyState(result, TraceState());
    EXPECT_EQ(Notes(), "LiveTimePresetIndex DefaultTimeRange RelativeTimeDisplay LockTimeRange TimeRange GapOpacity ");
    pOther->BuildState(copy);
    EXPECT_EQ(copy, (TraceState{"10s", true, false, false, {-1200.0, 0.0}, 0.5})) << "the state of a new window";
    pOther->SetLiveTimePresetIndex(99);
    pOther->BuildState(copy);
    EXPECT_EQ(copy.LiveTimePreset, "10s") << "an index that names no preset";
}

TEST_F(TraceManager, AStateLoadKeepsTheCachesOfALiveContext)
{
    const auto pManager = Make();
    Watch("A", 5000);
    pManager->SetContext("Live");
    RunLoopOnce();
    EXPECT_NE(pJournal->Take().find("create Cache of A"), std::string::npos);
    TQL::IResult result;
    pManager->ApplyState(result, TraceState());
    RunLoopOnce();
    const std::string log = pJournal->Take();
    EXPECT_EQ(log.find("create Cache"), std::string::npos) << log;
    EXPECT_NE(log.find("update A "), std::string::npos) << log;

    AddRecording("Take", 0, 100);
    pManager->SetContext("Take");
    pManager->ApplyState(result, TraceState());
    RunLoopOnce();
    EXPECT_EQ(pJournal->Take().find("update A "), std::string::npos) << "a recording starts afresh";
}

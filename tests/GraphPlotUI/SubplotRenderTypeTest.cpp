#include "GraphPlotUI/Axes/VTimeAxisRenderType.h"
#include "GraphPlotUI/Traces/VSubplotRenderType.h"
#include "RingProvider.h"

#include <gtest/gtest.h>

#include <QtCore/QVariantList>
#include <QtTest/QSignalSpy>

#include <limits>

using namespace GraphPlotUI;
using namespace TestGraphPlotUI;

namespace
{

constexpr double Infinity = std::numeric_limits<double>::infinity();
constexpr double NaN = std::numeric_limits<double>::quiet_NaN();

} // namespace

TEST(SubplotRenderTypeTest, Defaults)
{
    const VSubplotRenderType subplot;
    EXPECT_EQ(subplot.GetValueRangeX(), QPointF(0, 1));
    EXPECT_EQ(subplot.GetValueRangeY(), QPointF(0, 1));
    EXPECT_EQ(subplot.GetGapOpacity(), 0.5f);
    EXPECT_EQ(subplot.GetBackgroundColor(), QColor(Qt::black));
    EXPECT_TRUE(subplot.GetDrawMinorGrid() && subplot.GetDrawMajorGrid() && subplot.GetDrawZero());
    EXPECT_FALSE(subplot.GetTraceIds().isValid());
    EXPECT_FALSE(subplot.GetOverlays().isValid());
}

TEST(SubplotRenderTypeTest, EveryChangeOfWhatIsDrawnCounts)
{
    const std::vector<TQL::IGraphPlotOverlay> overlays(1);
    const QVariant trace = QVariant::fromValue(TQL::ITraceId(MakeChannel("a"), 0));
    const std::pair<const char*, QVariant> properties[]{
        {"screenRect", QRectF(1, 2, 30, 40)},
        {"devicePixelRatio", 2.0},
        {"liveContext", false},
        {"relativeTimeDisplay", false},
        {"valueRangeX", QPointF(2, 3)},
        {"valueRangeY", QPointF(2, 3)},
        {"overlays", QVariant::fromValue(overlays)},
        {"traceIds", QVariantList{trace}},
        {"gapOpacity", 0.25f},
        {"backgroundColor", QColor(Qt::red)},
        {"drawMinorGrid", false},
        {"drawMajorGrid", false},
        {"drawZero", false},
        {"visible", false},
    };
    VSubplotRenderType subplot;
    VTimeAxisRenderType axis;
    const auto counts = [](VBaseGraphRenderType& i_rType, const auto& i_rChange)
    {
        const std::uint64_t before = i_rType.GetRevision();
        i_rChange();
        return i_rType.GetRevision() != before;
    };
    for (const auto& [pName, value] : properties)
        EXPECT_TRUE(counts(subplot, [&] { ASSERT_TRUE(subplot.setProperty(pName, value)); })) << pName;
    EXPECT_TRUE(counts(subplot, [&] { subplot.setFocusChannelOrTraceId(trace); }));
    EXPECT_TRUE(counts(axis, [&] { axis.SetValueRange({2, 3}); }));
    EXPECT_TRUE(counts(axis, [&] { axis.SetMajorTickLength(20); }));
    EXPECT_TRUE(counts(axis, [&] { axis.SetTicksOnFarEdge(false); }));
    const QMetaObject* pMeta = subplot.metaObject();
    EXPECT_EQ(static_cast<std::size_t>(pMeta->propertyCount() - QQuickItem::staticMetaObject.propertyCount()),
              std::size(properties) - 1)
        << "a new property belongs into the list";
}

TEST(SubplotRenderTypeTest, RangesRefuseWhatIsNoRange)
{
    struct Case
    {
        QPointF Range;
        bool bX;
        bool bY;
    };
    const Case cases[] = {
        {{2.0, 5.0}, true, true},       {{2.0, 5.0}, false, false}, // unchanged
        {{5.0, 5.0}, false, false},     {{5.0, 2.0}, false, false},           {{NaN, 5.0}, false, false},
        {{2.0, NaN}, false, false},     {{-Infinity, Infinity}, false, true}, // only the values may be infinite
        {{0.0, Infinity}, false, true}, {{2.0, 5.0 + 1e-9}, true, true},      // compared exactly
    };
    VSubplotRenderType subplot;
    QSignalSpy spyX(&subplot, &VSubplotRenderType::ValueRangeXChanged);
    QSignalSpy spyY(&subplot, &VSubplotRenderType::ValueRangeYChanged);
    for (const Case& rCase : cases)
    {
        SCOPED_TRACE(testing::Message() << rCase.Range.x() << ".." << rCase.Range.y());
        spyX.clear();
        spyY.clear();
        subplot.setProperty("valueRangeX", rCase.Range);
        subplot.setProperty("valueRangeY", rCase.Range);
        EXPECT_EQ(spyX.count(), rCase.bX ? 1 : 0);
        EXPECT_EQ(spyY.count(), rCase.bY ? 1 : 0);
        if (rCase.bY)
        {
            EXPECT_EQ(subplot.GetValueRangeY().x(), rCase.Range.x());
            EXPECT_EQ(subplot.GetValueRangeY().y(), rCase.Range.y());
        }
    }
}

TEST(SubplotRenderTypeTest, TraceIdsSkipStrangersAndEmitNothing)
{
    VSubplotRenderType subplot;
    QSignalSpy spy(&subplot, &VSubplotRenderType::TraceIdsChanged);
    const TQL::ITraceId first(MakeChannel("a"), 0);
    const TQL::ITraceId second(MakeChannel("a"), 2);
    subplot.SetTraceIds(QVariantList{QVariant::fromValue(first), QVariant(7), QVariant("a"),
                                     QVariant::fromValue(MakeChannel("a")), QVariant::fromValue(second)});
    EXPECT_EQ(subplot.GetTraces(), (std::vector<TQL::ITraceId>{first, second}));
    subplot.SetTraceIds(QVariant(3));
    EXPECT_TRUE(subplot.GetTraces().empty());
    EXPECT_EQ(spy.count(), 0);
}

TEST(SubplotRenderTypeTest, FocusIsAChannelOrATraceOrNothing)
{
    VSubplotRenderType subplot;
    const auto set = [&](const QVariant& i_rVariant)
    {
        EXPECT_TRUE(QMetaObject::invokeMethod(&subplot, "setFocusChannelOrTraceId", Q_ARG(QVariant, i_rVariant)));
        const TraceFocus& rFocus = subplot.GetFocus();
        return (rFocus.Channel ? "channel " + rFocus.Channel->Text : std::string()) +
               (rFocus.Trace ? "trace " + std::to_string(rFocus.Trace->Component()) : std::string());
    };
    EXPECT_EQ(set(QVariant::fromValue(MakeChannel("a"))), "channel a");
    EXPECT_EQ(set(QVariant::fromValue(TQL::ITraceId(MakeChannel("b"), 4))), "trace 4");
    EXPECT_EQ(set(QVariant::fromValue(MakeChannel("c"))), "channel c");
    EXPECT_EQ(set(QVariant(1)), "");
    EXPECT_EQ(set(QVariant::fromValue(MakeChannel("a"))), "channel a");
    EXPECT_EQ(set(QVariant()), "");
}

TEST(SubplotRenderTypeTest, OtherSettersCompareAndSignal)
{
    VSubplotRenderType subplot;
    QSignalSpy grid(&subplot, &VSubplotRenderType::GridPropertyChanged);
    QSignalSpy opacity(&subplot, &VSubplotRenderType::GapOpacityChanged);
    QSignalSpy background(&subplot, &VSubplotRenderType::BackgroundColorChanged);
    for (const char* pProperty : {"drawMinorGrid", "drawMajorGrid", "drawZero"})
    {
        subplot.setProperty(pProperty, true);
        subplot.setProperty(pProperty, false);
    }
    EXPECT_EQ(grid.count(), 3);
    subplot.setProperty("gapOpacity", 0.5f);
    subplot.setProperty("gapOpacity", 0.25f);
    EXPECT_EQ(opacity.count(), 1);
    subplot.setProperty("backgroundColor", QColor(Qt::black)); // signals also when unchanged
    subplot.setProperty("backgroundColor", QColor(10, 20, 30));
    EXPECT_EQ(background.count(), 2);
    EXPECT_EQ(subplot.GetBackgroundColor(), QColor(10, 20, 30));
}

TEST(SubplotRenderTypeTest, OverlaysSignalAlsoWhenTheyAreNone)
{
    VSubplotRenderType subplot;
    QSignalSpy spy(&subplot, &VSubplotRenderType::OverlaysChanged);
    const std::vector<TQL::IGraphPlotOverlay> overlays(2);
    subplot.SetOverlays(QVariant::fromValue(overlays));
    subplot.SetOverlays(QVariant::fromValue(overlays));
    EXPECT_EQ(spy.count(), 1);
    subplot.SetOverlays(QVariant(5));
    EXPECT_EQ(spy.count(), 2);
    EXPECT_EQ(subplot.GetOverlays(), QVariant(5));
}

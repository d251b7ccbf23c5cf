#include "Channels/Blocks/VSampleBlock.h"
#include "Channels/Samples/VSampleStore.h"
#include "Reference.h"

#include <algorithm>
#include <random>

namespace ChannelsTest
{

namespace
{

using Channels::VSampleBlock;
using Channels::VSampleStore;
using TQL::TickRange;

constexpr std::int64_t Everything = std::numeric_limits<std::int64_t>::min();

/// A store and, beside it, what it should hold.
class Model
{
public:
    Model(std::int64_t i_Period, std::int64_t i_FirstTick, std::uint32_t i_Components)
        : m_Store(i_Period, i_FirstTick, i_Components), m_FirstTick(i_FirstTick)
    {
    }

    VSampleStore& Store() { return m_Store; }
    std::int64_t Rows() const { return static_cast<std::int64_t>(m_Values.size() / m_Store.Components()); }
    std::int64_t FirstTick() const { return m_FirstTick; }
    std::int64_t EndTick() const { return m_FirstTick + Rows() * m_Store.Period(); }

    void Append(const std::vector<float>& i_rValues)
    {
        m_Store.Append(i_rValues);
        m_Values.insert(m_Values.end(), i_rValues.begin(), i_rValues.end());
    }

    void Prepend(const std::vector<float>& i_rValues)
    {
        m_Store.Prepend(i_rValues);
        m_Values.insert(m_Values.begin(), i_rValues.begin(), i_rValues.end());
        m_FirstTick -= static_cast<std::int64_t>(i_rValues.size() / m_Store.Components()) * m_Store.Period();
    }

    void TrimBefore(std::int64_t i_Tick)
    {
        m_Store.TrimBefore(i_Tick);
        const std::int64_t rows =
            std::clamp((i_Tick - m_FirstTick + m_Store.Period() - 1) / m_Store.Period(), std::int64_t{0}, Rows());
        m_Values.erase(m_Values.begin(), m_Values.begin() + rows * m_Store.Components());
        m_FirstTick += rows * m_Store.Period();
    }

    /// The held samples of [i_From, i_To) ticks, one component.
    LodRecord Summary(std::int64_t i_From, std::int64_t i_To, std::size_t i_Component) const
    {
        const std::int64_t period = m_Store.Period();
        const auto row = [&](std::int64_t i_Tick)
        {
            return static_cast<std::size_t>(
                std::clamp((i_Tick - m_FirstTick + period - 1) / period, std::int64_t{0}, Rows()));
        };
        const std::size_t components = m_Store.Components();
        const std::size_t from = row(std::max(i_From, m_FirstTick));
        const std::size_t to = row(std::max(i_To, m_FirstTick));
        if (from >= to)
            return {};
        return SlowSummary(
            std::span(m_Values).subspan(from * components + i_Component, (to - from) * components - i_Component),
            components);
    }

    void ExpectSamples() const
    {
        EXPECT_EQ(m_Store.GetRange(), (TickRange{m_FirstTick, EndTick()}));
        std::vector<float> read(m_Values.size(), -1.0f);
        ASSERT_TRUE(m_Store.ReadSamples(m_Store.GetRange(), read).IsSuccess());
        EXPECT_TRUE(std::equal(read.begin(), read.end(), m_Values.begin(),
                               [](float i_A, float i_B)
                               { return i_A == i_B || (std::isnan(i_A) && std::isnan(i_B)); }));
    }

    /// Reads a level whole, from the bin of the first sample to the last sample, and compares each record.
    void ExpectLevel(std::uint32_t i_Level) const
    {
        const std::int64_t stride = m_Store.Period() << (i_Level + 1);
        const TickRange range{TQL::AlignDown(m_FirstTick, stride, m_Store.GridOffset()), EndTick()};
        const std::size_t components = m_Store.Components();
        const auto bins = Rows() == 0 ? 0 : static_cast<std::size_t>((range.Last - range.First + stride - 1) / stride);
        std::vector<LodRecord> records(bins * components);
        ASSERT_EQ(m_Store.ReadSummary(range, i_Level, records, Everything), records.size()) << "level " << i_Level;
        for (std::size_t bin = 0; bin < bins; ++bin)
            for (std::size_t c = 0; c < components; ++c)
            {
                const std::int64_t first = range.First + static_cast<std::int64_t>(bin) * stride;
                ASSERT_TRUE(IsSame(records[bin * components + c], Summary(first, first + stride, c)))
                    << "level " << i_Level << ", bin " << bin << " of " << bins << ", component " << c;
            }
    }

    void ExpectSummary(std::int64_t i_From, std::int64_t i_To) const
    {
        std::vector<LodRecord> records(m_Store.Components());
        ASSERT_TRUE(m_Store.Summarise({i_From, i_To}, records, Everything).IsSuccess());
        for (std::size_t c = 0; c < records.size(); ++c)
            ASSERT_TRUE(IsSame(records[c], Summary(i_From, i_To, c))) << i_From << " to " << i_To;
    }

private:
    VSampleStore m_Store;
    std::int64_t m_FirstTick;
    std::vector<float> m_Values;
};

} // namespace

TEST(SampleStore, LevelsAndSamplesAgreeWithTheSlowWayWhileRowsComeAndGo)
{
    struct Case
    {
        std::int64_t Period;
        std::int64_t FirstTick;
        std::uint32_t Components;
        int EnableAt; ///< the step before which the summaries are asked for
        bool bTrim;
        bool bPrepend;
    };
    const std::vector<Case> cases{
        {10, 0, 1, 0, false, false},   {10, 0, 3, 0, true, false},      {10, 37, 3, 0, true, true},
        {7, -12345, 6, 0, true, true}, {10, 20470, 2, 15, true, false}, {10, -40960, 9, 8, false, true},
    };
    for (const Case& rCase : cases)
    {
        SCOPED_TRACE(testing::Message() << "period " << rCase.Period << ", components " << rCase.Components);
        std::mt19937 random(rCase.Components);
        Model model(rCase.Period, rCase.FirstTick, rCase.Components);
        for (int step = 0; step < 24; ++step)
        {
            if (step == rCase.EnableAt)
                model.Store().EnableSummaries();
            const std::size_t rows = step % 3 == 0 ? 1 + random() % 2500 : 1 + random() % 9;
            model.Append(RandomSamples(rows * rCase.Components, random()));
            if (rCase.bPrepend && step % 7 == 3)
                model.Prepend(RandomSamples((1 + random() % 1500) * rCase.Components, random()));
            if (rCase.bTrim && step % 4 == 2)
                model.TrimBefore(model.FirstTick() + static_cast<std::int64_t>(random() % 20000));
            model.ExpectSamples();
            for (std::uint32_t level = 0; level < (step >= rCase.EnableAt ? 24u : 1u); ++level)
                model.ExpectLevel(level);
            for (int i = 0; i < 10; ++i)
            {
                const auto span = static_cast<std::uint32_t>(model.EndTick() - model.FirstTick() + 200);
                const std::int64_t from = model.FirstTick() - 100 + static_cast<std::int64_t>(random() % span);
                model.ExpectSummary(from, from + static_cast<std::int64_t>(random() % span));
            }
        }
    }
}

TEST(SampleStore, SharedSamplesReadLikeOwnOnesAndCanGoOn)
{
    const auto pValues = std::make_shared<const std::vector<float>>(RandomSamples(3 * 5001, 5));
    for (const bool bSummariesFirst : {false, true})
    {
        Model model(10, 70, 3);
        if (bSummariesFirst)
            model.Store().EnableSummaries();
        model.Append(*pValues);
        ASSERT_TRUE(model.Store().ReplaceShared(70, pValues, *pValues).IsSuccess());
        EXPECT_EQ(model.Store().ByteCount() == 0, !bSummariesFirst) << "samples are not copied";
        model.Store().EnableSummaries();
        model.ExpectSamples();
        for (std::uint32_t level = 0; level < 24; ++level)
            model.ExpectLevel(level);
        model.Append(RandomSamples(3 * 100, 6));
        model.ExpectSamples();
        for (std::uint32_t level = 0; level < 24; ++level)
            model.ExpectLevel(level);
    }
    EXPECT_EQ(pValues.use_count(), 1);
}

TEST(SampleStore, StridedAndMissingRowsAreTakenOver)
{
    VSampleStore store(10, 0, 2);
    const std::vector<float> wide{1, 2, 90, 91, 3, 4, 92, 93, 5, 6};
    store.Append(wide, 4);
    store.AppendMissing(2);
    std::vector<float> read(10);
    ASSERT_TRUE(store.ReadSamples({0, 50}, read).IsSuccess());
    EXPECT_EQ(std::vector<float>(read.begin(), read.begin() + 6), (std::vector<float>{1, 2, 3, 4, 5, 6}));
    EXPECT_TRUE(std::all_of(read.begin() + 6, read.end(), [](float i_Value) { return std::isnan(i_Value); }));
}

TEST(SampleStore, BadReadsWriteNothing)
{
    VSampleStore store(10, 105, 2);
    store.EnableSummaries();
    store.Append(RandomSamples(2 * 100, 1)); // ticks 105 to 1105
    struct Case
    {
        const char* pName;
        TickRange Range;
        std::size_t Rows;
        bool bGood;
    };
    const std::vector<Case> cases{
        {"everything", {105, 1105}, 100, true},
        {"one row", {1095, 1105}, 1, true},
        {"nothing", {505, 505}, 0, true},
        {"first off the grid", {100, 1105}, 100, false},
        {"last off the grid", {105, 1100}, 99, false},
        {"before the first", {95, 205}, 11, false},
        {"behind the last", {1005, 1115}, 11, false},
        {"span too short", {105, 1105}, 99, false},
        {"span too long", {105, 205}, 11, false},
        {"backwards", {205, 105}, 10, false},
        {"far outside", {-1000005, 1000005}, 10, false},
    };
    const VSampleBlock block(std::shared_ptr<VSampleStore>(std::shared_ptr<void>(), &store), 24);
    for (const Case& rCase : cases)
    {
        std::vector<float> rows(rCase.Rows * 2, -5.0f);
        std::vector<float> one(rCase.Rows, -5.0f);
        const TQL::IResult samples = block.ReadSamples(rCase.Range, rows);
        const TQL::IResult component = block.ReadComponent(rCase.Range, one, 1);
        EXPECT_EQ(samples.Value(), rCase.bGood ? 0u : 0x8000000Fu) << rCase.pName;
        EXPECT_EQ(component.Value(), samples.Value()) << rCase.pName;
        const auto written = [](float i_Value)
        {
            return i_Value != -5.0f;
        };
        EXPECT_EQ(std::ranges::any_of(rows, written), rCase.bGood && rCase.Rows > 0) << rCase.pName;
        EXPECT_EQ(std::ranges::any_of(one, written), rCase.bGood && rCase.Rows > 0) << rCase.pName;
    }
    std::vector<float> one(100, -5.0f);
    EXPECT_EQ(block.ReadComponent({105, 1105}, one, 2), TQL::Result::InvalidArgument);
}

TEST(SampleStore, SummaryReadsTakeBordersAndRefuseTheRest)
{
    VSampleStore store(10, 0, 1);
    store.EnableSummaries();
    std::vector<float> values(1000);
    for (std::size_t i = 0; i < values.size(); ++i)
        values[i] = static_cast<float>(i);
    store.Append(values);
    store.TrimBefore(130); // rows 13 to 999
    struct Case
    {
        const char* pName;
        TickRange Range;
        std::uint32_t Level;
        std::size_t Span;
        std::vector<std::pair<float, float>> Extremes; ///< of each record; empty: refused
    };
    const std::vector<Case> cases{
        {"first bin half gone", {80, 320}, 2, 3, {{13, 15}, {16, 23}, {24, 31}}},
        {"end inside a bin takes the whole bin", {160, 250}, 2, 2, {{16, 23}, {24, 31}}},
        {"last bin half filled", {9920, 10000}, 3, 1, {{992, 999}}},
        {"both borders in one bin", {0, 10000}, 9, 1, {{13, 999}}},
        {"end behind the last sample, in its bin", {9920, 10080}, 3, 1, {{992, 999}}},
        {"two bins before the first", {0, 320}, 2, 4, {}},
        {"a bin behind the last", {9920, 10090}, 3, 2, {}},
        {"off the level's grid", {90, 320}, 2, 3, {}},
        {"off the samples' grid", {85, 320}, 2, 3, {}},
        {"span too short", {80, 320}, 2, 2, {}},
        {"empty range", {160, 160}, 2, 2, {}},
        {"a level that there is not", {0, 10000}, 24, 2, {}},
    };
    for (const Case& rCase : cases)
    {
        std::vector<LodRecord> records(rCase.Span);
        ASSERT_EQ(store.ReadSummary(rCase.Range, rCase.Level, records, Everything), rCase.Extremes.size())
            << rCase.pName;
        for (std::size_t i = 0; i < rCase.Extremes.size(); ++i)
        {
            EXPECT_EQ(records[i].Minimum, rCase.Extremes[i].first) << rCase.pName << ", record " << i;
            EXPECT_EQ(records[i].Maximum, rCase.Extremes[i].second) << rCase.pName << ", record " << i;
        }
    }
    VSampleStore empty(10, 0, 1);
    std::vector<LodRecord> record(1);
    EXPECT_EQ(empty.ReadSummary({0, 20}, 0, record, Everything), 0u);
    EXPECT_TRUE(empty.Summarise({0, 0}, record, Everything).IsSuccess());
    EXPECT_TRUE(IsSame(record[0], LodRecord{}));
    EXPECT_EQ(store.Summarise({0, 100}, {}, Everything), TQL::Result::InvalidArgument);
}

TEST(SampleStore, TokenNamesTheSeries)
{
    VSampleStore store(10, 0, 1);
    VSampleStore other(10, 0, 1);
    const std::uint64_t token = store.AcquireLease(0);
    EXPECT_NE(token, 0u);
    EXPECT_NE(token, other.AcquireLease(0));
    store.Append(RandomSamples(5000, 1));
    store.EnableSummaries();
    store.TrimBefore(20000);
    store.Prepend(RandomSamples(10, 1));
    EXPECT_EQ(store.AcquireLease(30000), token);
    store.ReleaseLease(token);
    EXPECT_EQ(store.ReplaceAll(5, {}), TQL::Result::InvalidArgument) << "another grid";
    EXPECT_EQ(store.GetToken(), token);
    EXPECT_TRUE(store.ReplaceAll(50, std::vector<float>{1.0f, 2.0f}).IsSuccess());
    EXPECT_NE(store.GetToken(), token);
    EXPECT_EQ(store.GetRange(), (TickRange{50, 70}));
}

TEST(SampleStore, TrimmingGivesMemoryBack)
{
    VSampleStore store(1, 0, 3);
    store.EnableSummaries();
    const std::vector<float> rows = RandomSamples(3 * 1000, 1);
    std::size_t most = 0;
    for (std::int64_t i = 0; i < 1000; ++i)
    {
        store.Append(rows);
        store.TrimBefore((i - 9) * 1000); // the newest 10000 rows
        most = std::max(most, store.ByteCount());
    }
    EXPECT_LT(most, std::size_t{10000 + 2048} * 3 * 4 * 4) << "a million rows went through";
    EXPECT_EQ(store.GetRange(), (TickRange{990000, 1000000}));
}

TEST(SampleBlock, OffersLevelsUpToTheLongestThatTicksCanName)
{
    const auto pStore = std::make_shared<VSampleStore>(TQL::DefaultFramePeriod, 0, 3);
    const VSampleBlock block(pStore, 24);
    ASSERT_EQ(block.GetShape().SummaryPeriods.size(), 24u);
    EXPECT_EQ(block.GetShape().SummaryPeriods[0], 2 * TQL::DefaultFramePeriod);
    EXPECT_EQ(block.GetShape().SummaryPeriods[23], TQL::DefaultFramePeriod << 24);
    EXPECT_EQ(block.GetShape().pLayout->ComponentCount, 3u);
    const VSampleBlock slow(std::make_shared<VSampleStore>(std::int64_t{1} << 50, 0, 1), 24);
    ASSERT_FALSE(slow.GetShape().SummaryPeriods.empty());
    EXPECT_GT(slow.GetShape().SummaryPeriods.back(), 0);
}

} // namespace ChannelsTest

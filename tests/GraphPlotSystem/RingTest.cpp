#include "GraphPlotSystem/MemoryBlock.h"
#include "GraphPlotSystem/RingText.h"

#include "GraphPlotSystem/Traces/TraceRingFill.h"

#include <gtest/gtest.h>

#include <functional>
#include <string>
#include <vector>

using GraphPlotUI::LongestStep;
using GraphPlotUI::TraceTexelRing;
using TestSupport::ExtentText;
using TestSupport::Gap;
using TestSupport::MemoryBlock;
using TestSupport::Ramp;
using TestSupport::RingText;
using TestSupport::RowsText;
using TestSupport::TakeDirty;
using TQL::TickRange;

namespace
{

constexpr TickRange Everything = {-1'000'000'000, 1'000'000'000};

/// One for all rings, as in the provider: what it holds from before must not matter.
GraphPlotUI::RingScratch& Scratch()
{
    static GraphPlotUI::RingScratch scratch;
    return scratch;
}

/// Request and limit in sample numbers of the block.
void Update(TraceTexelRing& i_rRing, const MemoryBlock& i_rBlock, TickRange i_Samples, std::uint8_t i_Level = 0)
{
    const TickRange ticks = i_rBlock.Ticks(i_Samples.First, i_Samples.Last);
    UpdateRing(i_rRing, Scratch(), i_rBlock, i_rBlock.Range(), ticks, ticks, i_Level);
}

void UpdateFreely(TraceTexelRing& i_rRing, const MemoryBlock& i_rBlock, TickRange i_Samples, std::uint8_t i_Level = 0)
{
    UpdateRing(i_rRing, Scratch(), i_rBlock, i_rBlock.Range(), i_rBlock.Ticks(i_Samples.First, i_Samples.Last),
               Everything, i_Level);
}

} // namespace

TEST(Ring, RowsOfSamplesCountBackToTheLastData)
{
    const float infinity = std::numeric_limits<float>::infinity();
    struct Case
    {
        const char* pName;
        std::vector<float> Samples;
        const char* pRows;
        std::uint32_t Longest;
    };
    const Case cases[] = {
        {"no gap", {1, 2, 3}, "1/1 2/1 3/1", 1},
        {"gap of three", {1, 2, Gap, Gap, Gap, 6, 7}, "1/1 2/1 -/1 -/2 -/3 6/4 7/1", 4},
        {"longest of two gaps", {1, Gap, Gap, 4, Gap, 6}, "1/1 -/1 -/2 4/3 -/1 6/2", 3},
        {"nothing before the first data", {Gap, Gap, 3, 4}, "-/1 -/2 3/3 4/1", 1},
        {"gap at the end", {1, Gap, Gap}, "1/1 -/1 -/2", 1},
        {"no data", {Gap, Gap, Gap}, "-/1 -/2 -/3", 1},
        {"infinite samples are no data", {1, infinity, 3, -infinity, 5}, "1/1 -/1 3/2 -/1 5/2", 2},
        {"gap over a block of the writer",
         {1, Gap, Gap, Gap, Gap, Gap, Gap, Gap, Gap, Gap, 11, 12, 13, 14, 15, 16, 17},
         "1/1 -/1 -/2 -/3 -/4 -/5 -/6 -/7 -/8 -/9 11/10 12/1 13/1 14/1 15/1 16/1 17/1",
         10},
        {"gap before a block without gaps",
         {1, 2, 3, 4, 5, 6, 7, Gap, 9, 10, 11, 12, 13, 14, 15, 16},
         "1/1 2/1 3/1 4/1 5/1 6/1 7/1 -/1 9/2 10/1 11/1 12/1 13/1 14/1 15/1 16/1",
         2},
    };
    for (const Case& rCase : cases)
    {
        SCOPED_TRACE(rCase.pName);
        MemoryBlock block;
        block.Append(rCase.Samples);
        TraceTexelRing ring;
        Update(ring, block, {block.First(), block.End()});
        EXPECT_EQ(RowsText(ring, 0, 0, ring.Extent.RowCount), rCase.pRows);
        EXPECT_EQ(LongestStep(ring, 0), rCase.Longest);
        EXPECT_EQ(block.Store().Open, 0);
    }
}

TEST(Ring, MissingRowsCarryTheMarksThatTheShadersTest)
{
    MemoryBlock block;
    block.Append({5, Gap});
    TraceTexelRing ring;
    Update(ring, block, {0, 2});
    EXPECT_EQ(ring.At(0, 0).Maximum, 5.0f);
    EXPECT_EQ(ring.At(0, 0).Minimum, 5.0f);
    EXPECT_TRUE(std::isnan(ring.At(1, 0).Value));
    EXPECT_EQ(ring.At(1, 0).Maximum, -std::numeric_limits<float>::infinity());
    EXPECT_EQ(ring.At(1, 0).Minimum, std::numeric_limits<float>::infinity());
}

TEST(Ring, ComponentsCountTheirGapsApart)
{
    MemoryBlock block(2);
    block.Append({1, 10, Gap, 20, 3, Gap, 4, 40});
    TraceTexelRing ring;
    Update(ring, block, {0, 4});
    EXPECT_EQ(RingText(ring), "level 0 ticks [0, 40) valid [0, 30) rows 4 at 0\n"
                              "1/1 -/1 3/2 4/1\n"
                              "10/1 20/1 -/1 40/2\n");
    block.Append({Gap, 50, 6, 60});
    Update(ring, block, {0, 6});
    EXPECT_EQ(RowsText(ring, 0, 3, 6), "4/1 -/1 6/2");
    EXPECT_EQ(RowsText(ring, 1, 3, 6), "40/2 50/1 60/1");
}

TEST(Ring, SummaryRowsStandForTheirSamples)
{
    MemoryBlock block(1, 10, 4, 3);
    block.Append({0, 1, Gap, Gap, 4, Gap, 6});
    TraceTexelRing ring;
    Update(ring, block, {0, 7}, 1);
    EXPECT_EQ(RingText(ring), "level 1 ticks [3, 73) valid [3, 63) rows 4 at 0\n"
                              "0..0.5..1/1 -/1 4..4..4/2 6..6..6/1\n");

    block.TakeReads();
    block.Append({7});
    Update(ring, block, {0, 8}, 1);
    EXPECT_EQ(block.TakeReads(), "summary 0 [6, 8)\n") << "the row that was half filled is read again";
    EXPECT_EQ(RowsText(ring, 0, 2, 4), "4..4..4/2 6..6.5..7/1");

    block.Append({8});
    Update(ring, block, {0, 9}, 1);
    EXPECT_EQ(block.TakeReads(), "summary 0 [8, 9)\n") << "a row that was full is not";
    EXPECT_EQ(RowsText(ring, 0, 3, 5), "6..6.5..7/1 8..8..8/1");
}

TEST(Ring, WrapsAtTheLastTextureRow)
{
    MemoryBlock block;
    block.Append(Ramp(0, 4096));
    TraceTexelRing ring;
    Update(ring, block, {0, 4096});
    EXPECT_EQ(TakeDirty(ring), "[0, 4096)");
    struct Step
    {
        std::int64_t Samples;
        const char* pExtent;
        const char* pDirty;
    };
    const Step steps[] = {
        {1, "level 0 ticks [10, 40970) valid [10, 40950) rows 4096 at 1", "[0, 1)"},
        {4094, "level 0 ticks [40950, 81910) valid [40950, 40950) rows 4096 at 4095", "[1, 4095)"},
        {1, "level 0 ticks [40960, 81920) valid [40960, 40950) rows 4096 at 0", "[4095, 4096)"},
        {2, "level 0 ticks [40980, 81940) valid [40980, 40950) rows 4096 at 2", "[0, 2)"},
    };
    for (const Step& rStep : steps)
    {
        const std::int64_t end = block.End();
        block.Append(Ramp(end, end + rStep.Samples));
        block.TakeReads();
        UpdateFreely(ring, block, {end - 10, block.End()});
        EXPECT_EQ(block.TakeReads(), "samples [" + std::to_string(end) + ", " + std::to_string(block.End()) + ")\n");
        EXPECT_EQ(ExtentText(ring), rStep.pExtent);
        EXPECT_EQ(TakeDirty(ring), rStep.pDirty);
        EXPECT_EQ(ring.At(0, 0).Value, static_cast<float>(block.End() - 4096));
        EXPECT_EQ(ring.At(4095, 0).Value, static_cast<float>(block.End() - 1));
    }
}

TEST(Ring, StartsAnewWhenItsSourceIsAnother)
{
    struct Case
    {
        const char* pName;
        std::function<void(MemoryBlock&)> Change;
        TickRange Samples;
        std::uint8_t Level;
        const char* pReads;
    };
    const Case cases[] = {
        {"nothing changed", [](MemoryBlock&) {}, {0, 8}, 0, ""},
        {"level", [](MemoryBlock&) {}, {0, 8}, 2, "summary 1 [0, 8)\n"},
        {"series replaced",
         [](MemoryBlock& rBlock) { rBlock.Replace(0, Ramp(100, 108)); },
         {0, 8},
         0,
         "samples [0, 8)\n"},
        {"format", [](MemoryBlock& rBlock) { rBlock.SetFormatTag(8); }, {0, 8}, 0, "samples [0, 8)\n"},
        {"far ahead", [](MemoryBlock& rBlock) { rBlock.Append(Ramp(8, 50)); }, {20, 30}, 0, "samples [20, 30)\n"},
        {"touching", [](MemoryBlock& rBlock) { rBlock.Append(Ramp(8, 50)); }, {8, 10}, 0, "samples [8, 10)\n"},
    };
    for (const Case& rCase : cases)
    {
        SCOPED_TRACE(rCase.pName);
        MemoryBlock block;
        block.Append(Ramp(0, 8));
        TraceTexelRing ring;
        Update(ring, block, {0, 8});
        rCase.Change(block);
        block.TakeReads();
        Update(ring, block, rCase.Samples, rCase.Level);
        EXPECT_EQ(block.TakeReads(), rCase.pReads);
        EXPECT_EQ(ring.Extent.FirstTick, block.TickOf(rCase.Samples.First));
        EXPECT_EQ(ring.Extent.EndTick, block.TickOf(rCase.Samples.Last));
        EXPECT_EQ(ring.At(0, 0).Minimum, block.Value(rCase.Samples.First, 0));
        EXPECT_EQ(block.Store().Open, 0);
    }
}

TEST(Ring, PrependedRowsRepairTheDistancesAfterThem)
{
    const auto gaps = [](std::int64_t n)
    {
        return n == 5 || n == 6 || n == 2;
    };
    MemoryBlock block;
    block.Append(Ramp(0, 9, gaps));
    TraceTexelRing ring;
    Update(ring, block, {5, 9});
    EXPECT_EQ(RowsText(ring, 0, 0, 4), "-/1 -/2 7/3 8/1");
    EXPECT_EQ(LongestStep(ring, 0), 1u);
    EXPECT_EQ(TakeDirty(ring), "[0, 16)");
    struct Step
    {
        TickRange Samples;
        const char* pText;
        std::uint32_t Longest;
        const char* pDirty; ///< new rows, and those after them up to the first with data
    };
    const Step steps[] = {
        {{4, 9}, "level 0 ticks [40, 90) valid [70, 80) rows 5 at 15\n4/1 -/1 -/2 7/3 8/1\n", 3, "head [0, 16)"},
        {{3, 9}, "level 0 ticks [30, 90) valid [70, 80) rows 6 at 14\n3/1 4/1 -/1 -/2 7/3 8/1\n", 3, "head [14, 16)"},
        {{2, 9},
         "level 0 ticks [20, 90) valid [70, 80) rows 7 at 13\n-/1 3/2 4/1 -/1 -/2 7/3 8/1\n",
         3,
         "head [13, 15)"},
        {{0, 9},
         "level 0 ticks [0, 90) valid [70, 80) rows 9 at 11\n0/1 1/1 -/1 3/2 4/1 -/1 -/2 7/3 8/1\n",
         3,
         "head [11, 15)"},
    };
    for (const Step& rStep : steps)
    {
        Update(ring, block, rStep.Samples);
        EXPECT_EQ(RingText(ring), rStep.pText);
        EXPECT_EQ(LongestStep(ring, 0), rStep.Longest);
        EXPECT_EQ(TakeDirty(ring), rStep.pDirty);
    }
}

TEST(Ring, PrependsOnTheGridOfItsLevel)
{
    MemoryBlock block;
    block.Append(Ramp(0, 20));
    TraceTexelRing ring;
    Update(ring, block, {9, 16}, 2);
    EXPECT_EQ(RingText(ring), "level 2 ticks [80, 160) valid [80, 120) rows 2 at 0\n8..9.5..11/1 12..13.5..15/1\n");
    block.TakeReads();
    Update(ring, block, {5, 16}, 2);
    EXPECT_EQ(block.TakeReads(), "summary 1 [4, 8)\n");
    EXPECT_EQ(RowsText(ring, 0, 0, 2), "4..5.5..7/1 8..9.5..11/1");
}

TEST(Ring, DropsWhatTheLimitOrTheBlockTakesAway)
{
    struct Case
    {
        const char* pName;
        std::uint8_t Level;
        std::function<void(MemoryBlock&)> Change;
        TickRange Samples;
        const char* pText;
        const char* pReads;
    };
    const Case cases[] = {
        {"limit at both ends",
         0,
         [](MemoryBlock&) {},
         {2, 5},
         "level 0 ticks [20, 50) valid [20, 50) rows 3 at 2\n2/1 3/1 4/1\n",
         ""},
        {"head of the block",
         0,
         [](MemoryBlock& rBlock) { rBlock.TrimHead(5); },
         {0, 7},
         "level 0 ticks [50, 70) valid [50, 60) rows 2 at 5\n5/1 6/1\n",
         ""},
        {"head inside a row",
         1,
         [](MemoryBlock& rBlock) { rBlock.TrimHead(3); },
         {0, 7},
         "level 1 ticks [20, 70) valid [20, 60) rows 3 at 1\n3..3..3/1 4..4.5..5/1 6..6..6/1\n",
         "summary 0 [2, 4)\n"},
        {"limit before a half filled row",
         1,
         [](MemoryBlock&) {},
         {0, 5},
         "level 1 ticks [0, 60) valid [0, 60) rows 3 at 0\n0..0.5..1/1 2..2.5..3/1 4..4.5..5/1\n",
         ""},
        {"end of the block inside a row",
         1,
         [](MemoryBlock& rBlock) { rBlock.TrimEnd(2); },
         {0, 7},
         "level 1 ticks [0, 50) valid [0, 40) rows 3 at 0\n0..0.5..1/1 2..2.5..3/1 4..4..4/1\n",
         "summary 0 [4, 5)\n"},
        {"all but the end, which goes on",
         0,
         [](MemoryBlock& rBlock) { rBlock.Append(Ramp(7, 9)); },
         {7, 9},
         "level 0 ticks [70, 90) valid [70, 80) rows 2 at 7\n7/1 8/1\n",
         "samples [7, 9)\n"},
    };
    for (const Case& rCase : cases)
    {
        SCOPED_TRACE(rCase.pName);
        MemoryBlock block;
        block.Append(Ramp(0, 7));
        TraceTexelRing ring;
        Update(ring, block, {0, 7}, rCase.Level);
        rCase.Change(block);
        block.TakeReads();
        Update(ring, block, rCase.Samples, rCase.Level);
        EXPECT_EQ(RingText(ring), rCase.pText);
        EXPECT_EQ(block.TakeReads(), rCase.pReads);
    }
}

TEST(Ring, RowsCutByTheLimitAreReadAgainWhenItMovesOn)
{
    MemoryBlock block;
    block.Append(Ramp(0, 7));
    TraceTexelRing ring;
    for (const std::int64_t end : {7, 5, 7})
        Update(ring, block, {0, end}, 1);
    EXPECT_EQ(RingText(ring), "level 1 ticks [0, 70) valid [0, 60) rows 4 at 0\n"
                              "0..0.5..1/1 2..2.5..3/1 4..4.5..5/1 6..6..6/1\n");
}

TEST(Ring, AWiderLimitFillsTheFreeRows)
{
    MemoryBlock block;
    block.Append(Ramp(0, 10000, [](std::int64_t n) { return n >= 7000 && n < 7005; }));

    TraceTexelRing ahead;
    UpdateFreely(ahead, block, {5000, 5100});
    EXPECT_EQ(block.TakeReads(), "samples [5000, 5100)\nsamples [5100, 9095)\n");
    UpdateFreely(ahead, block, {5300, 5400});
    EXPECT_EQ(block.TakeReads(), "") << "a small pan finds its rows";

    TraceTexelRing both; // the request begins in a gap: it reaches beyond the data at both ends
    UpdateFreely(both, block, {7000, 7100});
    EXPECT_EQ(block.TakeReads(), "samples [7000, 7100)\nsamples [5007, 7000)\nsamples [7100, 9097)\n");

    TraceTexelRing narrow;
    Update(narrow, block, {5000, 5100});
    EXPECT_EQ(block.TakeReads(), "samples [5000, 5100)\n");
    EXPECT_EQ(block.Store().Acquired, 6) << "where the limit forbids more, no second look is taken";
}

TEST(Ring, MoreThanItsCapacityComesWithTheCallsThatFollow)
{
    struct Step
    {
        TickRange Samples;
        const char* pReads;
        std::int64_t First; ///< samples held
        std::int64_t End;
    };
    struct Case
    {
        const char* pName;
        std::vector<Step> Steps;
    };
    const Case cases[] = {
        {"from nothing",
         {{{0, 5000}, "samples [0, 4096)\n", 0, 4096},
          {{0, 5000}, "samples [4096, 5000)\n", 904, 5000},
          {{0, 5000}, "", 904, 5000},
          {{0, 5001}, "samples [5000, 5001)\n", 905, 5001}}},
        {"with rows before",
         {{{0, 100}, "samples [0, 100)\n", 0, 100},
          {{0, 10000}, "samples [100, 4196)\n", 100, 4196},
          {{0, 10000}, "samples [4196, 8292)\n", 4196, 8292},
          {{0, 10000}, "samples [8292, 10000)\n", 5904, 10000},
          {{0, 10000}, "", 5904, 10000}}},
        {"backwards",
         {{{9000, 9100}, "samples [9000, 9100)\n", 9000, 9100},
          {{0, 9100}, "samples [5004, 9000)\n", 5004, 9100},
          {{3000, 6000}, "samples [3000, 5004)\n", 3000, 6000}}},
        {"backwards from where it began",
         {{{9000, 9100}, "samples [9000, 9100)\n", 9000, 9100}, {{0, 9000}, "samples [4904, 9000)\n", 4904, 9000}}},
    };
    for (const Case& rCase : cases)
    {
        SCOPED_TRACE(rCase.pName);
        MemoryBlock block;
        block.Append(Ramp(0, 12000));
        TraceTexelRing ring;
        for (const Step& rStep : rCase.Steps)
        {
            Update(ring, block, rStep.Samples);
            EXPECT_EQ(block.TakeReads(), rStep.pReads);
            EXPECT_EQ(ring.Extent.FirstTick, block.TickOf(rStep.First));
            EXPECT_EQ(ring.Extent.EndTick, block.TickOf(rStep.End));
            ASSERT_EQ(ring.Extent.RowCount, static_cast<std::uint32_t>(rStep.End - rStep.First));
            for (const std::uint32_t row : {0u, ring.Extent.RowCount / 2, ring.Extent.RowCount - 1})
                EXPECT_EQ(ring.At(row, 0).Value, static_cast<float>(rStep.First + row));
        }
    }
}

TEST(Ring, AFailedReadLeavesItAsItWas)
{
    struct Case
    {
        const char* pName;
        std::function<void(MemoryBlock&)> Change;
        TickRange Ticks;
        std::uint8_t Level;
    };
    const auto fail = [](MemoryBlock& rBlock)
    {
        rBlock.bFail = true;
    };
    const auto replaceAndFail = [](MemoryBlock& rBlock)
    {
        rBlock.Replace(0, Ramp(0, 50));
        rBlock.bFail = true;
    };
    const Case cases[] = {
        {"ahead", fail, {200, 400}, 0},
        {"back", fail, {0, 250}, 0},
        {"elsewhere", fail, {400, 500}, 0},
        {"another level", fail, {100, 300}, 2},
        {"another series", replaceAndFail, {100, 300}, 0},
        {"a level that the block lacks", [](MemoryBlock&) {}, {100, 300}, 5},
        {"off the grid", [](MemoryBlock&) {}, {105, 355}, 0},
        {"nothing there", [](MemoryBlock&) {}, {700, 900}, 0},
        {"empty request", [](MemoryBlock&) {}, {200, 200}, 0},
    };
    for (const Case& rCase : cases)
    {
        SCOPED_TRACE(rCase.pName);
        MemoryBlock block;
        block.Append(Ramp(0, 50));
        TraceTexelRing ring;
        Update(ring, block, {10, 30});
        TakeDirty(ring);
        const std::string before = RingText(ring);
        rCase.Change(block);
        UpdateRing(ring, Scratch(), block, block.Range(), rCase.Ticks, rCase.Ticks, rCase.Level);
        EXPECT_EQ(RingText(ring), before);
        EXPECT_EQ(TakeDirty(ring), "none");
        EXPECT_EQ(block.Store().Open, 0);

        block.bFail = false;
        Update(ring, block, {10, 32});
        EXPECT_EQ(ring.Extent.EndTick, 320) << "and it goes on once reads succeed";
    }
}

TEST(Ring, ALaterPieceThatFailsKeepsWhatWasReadBeforeIt)
{
    MemoryBlock block;
    block.Append(Ramp(0, 2000));
    TraceTexelRing whole;
    Update(whole, block, {0, 2000}, 1);

    TraceTexelRing ring;
    Update(ring, block, {100, 140}); // rows of another level, which the pieces write over
    block.SummaryReadsLeft = 2;
    Update(ring, block, {0, 2000}, 1);
    const std::uint32_t rows = ring.Extent.RowCount;
    EXPECT_GT(rows, 0u);
    EXPECT_LT(rows, whole.Extent.RowCount);
    EXPECT_EQ(RowsText(ring, 0, 0, rows), RowsText(whole, 0, 0, rows));
    EXPECT_EQ(block.Store().Open, 0);

    block.SummaryReadsLeft = -1;
    Update(ring, block, {0, 2000}, 1);
    EXPECT_EQ(RingText(ring), RingText(whole)) << "and it goes on once reads succeed";
}

TEST(Ring, ASteadyLiveWindowUploadsOnlyWhatIsNew)
{
    MemoryBlock block(3);
    block.Append(std::vector<float>(3 * 2000, 1.0f));
    TraceTexelRing ring;
    Update(ring, block, {800, 2000});
    TakeDirty(ring);
    block.TakeReads();
    int whole = 0;
    for (int tick = 0; tick < 3000; ++tick)
    {
        block.Append(std::vector<float>(3 * 3, static_cast<float>(tick)));
        block.TrimHead(3);
        const std::int64_t end = block.End();
        Update(ring, block, {end - 1200, end});
        ASSERT_EQ(block.TakeReads(), "samples [" + std::to_string(end - 3) + ", " + std::to_string(end) + ")\n");
        const std::uint32_t rows = ring.Dirty.End - ring.Dirty.First;
        whole += rows == ring.Size ? 1 : 0;
        ASSERT_TRUE(rows == 3 || rows == ring.Size) << TakeDirty(ring);
        ASSERT_EQ(ring.Extent.RowCount, 1200u);
        TakeDirty(ring);
    }
    EXPECT_LE(whole, 5) << "only where three rows straddle the end of the texture";
}

TEST(Ring, TakesTheRoomThatItsRowsNeed)
{
    struct Case
    {
        std::int64_t Samples;
        std::size_t Rows;
    };
    TraceTexelRing growing;
    for (const Case& rCase : {Case{1, 16}, Case{16, 16}, Case{17, 32}, Case{1000, 1024}, Case{9000, 4096}})
    {
        MemoryBlock block(3);
        block.Append(std::vector<float>(static_cast<std::size_t>(3 * rCase.Samples), 1.0f));
        for (const bool bNew : {true, false})
        {
            TraceTexelRing fresh;
            TraceTexelRing& rRing = bNew ? fresh : growing;
            Update(rRing, block, {0, rCase.Samples});
            EXPECT_EQ(rRing.Texels.size(), 3 * rCase.Rows) << rCase.Samples;
        }
    }
    MemoryBlock narrow;
    narrow.Append({1, 2});
    Update(growing, narrow, {0, 2});
    EXPECT_EQ(growing.Texels.size(), 16u) << "another width starts anew";
}

TEST(Ring, GapsAreForgottenOnceTheyHaveLeft)
{
    MemoryBlock block;
    block.Append(Ramp(0, 100, [](std::int64_t n) { return n >= 20 && n < 25; }));
    TraceTexelRing ring;
    Update(ring, block, {0, 100});
    EXPECT_EQ(LongestStep(ring, 0), 6u);
    Update(ring, block, {25, 100});
    EXPECT_EQ(LongestStep(ring, 0), 6u) << "the row that ends the gap is still held";
    Update(ring, block, {26, 100});
    EXPECT_EQ(LongestStep(ring, 0), 1u);
    block.Append({Gap, 101});
    Update(ring, block, {26, 102});
    EXPECT_EQ(LongestStep(ring, 0), 2u);
}

TEST(Ring, PendingDirtyRowsGrowToHoldBoth)
{
    struct Case
    {
        GraphPlotUI::DirtyRows Pending;
        std::uint32_t First;
        std::uint32_t Count;
        GraphPlotUI::DirtyRows Expected;
    };
    const Case cases[] = {
        {{0, 0}, 7, 0, {0, 0}},       {{0, 0}, 7, 3, {7, 10}},         {{10, 10}, 7, 3, {7, 10}},
        {{2, 4}, 7, 3, {2, 10}},      {{7, 10}, 2, 1, {2, 10}},        {{0, 0}, 4094, 2, {4094, 4096}},
        {{0, 0}, 4094, 3, {0, 4096}}, {{4000, 4096}, 0, 1, {0, 4096}},
    };
    for (const Case& rCase : cases)
    {
        GraphPlotUI::DirtyRows dirty = rCase.Pending;
        GraphPlotUI::MarkDirty(dirty, rCase.First, rCase.Count, 4096);
        EXPECT_EQ(dirty.First, rCase.Expected.First) << rCase.First << " + " << rCase.Count;
        EXPECT_EQ(dirty.End, rCase.Expected.End) << rCase.First << " + " << rCase.Count;
    }
}

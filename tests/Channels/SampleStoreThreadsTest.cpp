#include "Channels/Samples/VSampleStore.h"
#include "Reference.h"

#include <atomic>
#include <thread>

namespace ChannelsTest
{

namespace
{

using Channels::VSampleStore;
using TQL::TickRange;

constexpr std::int64_t Window = 3000; ///< rows kept by the writer

/// Row n holds n and -n, so that every reader knows what it has to find.
void AppendRows(VSampleStore& o_rStore, std::int64_t i_First, std::int64_t i_Count)
{
    std::vector<float> rows;
    for (std::int64_t n = i_First; n < i_First + i_Count; ++n)
    {
        rows.push_back(static_cast<float>(n));
        rows.push_back(static_cast<float>(-n));
    }
    o_rStore.Append(rows);
}

/// What a reader does in one turn; the number of wrong values.
std::size_t CheckOnce(const VSampleStore& i_rStore, std::uint32_t i_Level, bool i_bSummaries)
{
    std::size_t wrong = 0;
    const TickRange range = i_rStore.GetRange();
    std::vector<float> rows(static_cast<std::size_t>(range.Last - range.First) * 2);
    if (i_rStore.ReadSamples(range, rows).IsSuccess()) // else trimmed meanwhile
        for (std::size_t i = 0; i < rows.size() / 2; ++i)
        {
            const auto expected = static_cast<float>(range.First + static_cast<std::int64_t>(i));
            wrong += rows[2 * i] != expected || rows[2 * i + 1] != -expected;
        }
    std::vector<LodRecord> whole(2);
    if (i_rStore.Summarise(range, whole, range.First).IsSuccess() && whole[0].Count != 0)
        wrong += whole[0].Maximum != static_cast<float>(range.Last - 1) || whole[1].Minimum != -whole[0].Maximum;
    if (!i_bSummaries)
        return wrong;
    const std::int64_t stride = std::int64_t{2} << i_Level;
    const TickRange aligned{TQL::AlignDown(range.First, stride), range.Last};
    std::vector<LodRecord> records(static_cast<std::size_t>((aligned.Last - aligned.First + stride - 1) / stride) * 2);
    if (i_rStore.ReadSummary(aligned, i_Level, records, range.First) == 0)
        return wrong;
    for (std::size_t i = 0; i + 4 < records.size(); i += 2) // the last one grows
    {
        const std::int64_t end = aligned.First + (static_cast<std::int64_t>(i / 2) + 1) * stride;
        wrong += records[i].Count != 0 && records[i].Maximum != static_cast<float>(end - 1);
    }
    return wrong;
}

} // namespace

TEST(SampleStoreThreads, ReadersSeeWholeRowsWhileAWriterAppendsAndTrims)
{
    constexpr std::int64_t batches = 1500;
    VSampleStore store(1, 0, 2);
    std::atomic<bool> bDone{false};
    std::atomic<bool> bSummaries{false};
    std::atomic<std::size_t> wrong{0};
    std::atomic<std::size_t> turns{0};
    const auto read = [&](std::uint32_t i_Level)
    {
        do
        {
            wrong += CheckOnce(store, i_Level, bSummaries);
            ++turns;
        } while (!bDone);
    };
    std::vector<std::thread> readers;
    for (const std::uint32_t level : {0u, 2u, 7u})
        readers.emplace_back(read, level);
    std::int64_t end = 0;
    for (std::int64_t batch = 0; batch < batches; ++batch)
    {
        const std::int64_t rows = batch % 10 == 0 ? 700 : 1 + batch % 5;
        AppendRows(store, end, rows);
        end += rows;
        if (batch % 20 == 0)
            store.TrimBefore(end - Window);
    }
    // Asked for by a reader's side, as a plot does that opens in the middle of a capture.
    std::thread opener(
        [&]
        {
            store.EnableSummaries();
            bSummaries = true;
        });
    for (std::int64_t batch = 0; batch < batches; ++batch)
    {
        const std::int64_t rows = batch % 10 == 0 ? 700 : 1 + batch % 5;
        AppendRows(store, end, rows);
        end += rows;
        if (batch % 20 == 0)
            store.TrimBefore(end - Window);
    }
    opener.join();
    bDone = true;
    for (std::thread& rReader : readers)
        rReader.join();
    EXPECT_EQ(wrong, 0u);
    EXPECT_GE(turns, readers.size());
    EXPECT_EQ(store.GetRange().Last, end);
    EXPECT_EQ(CheckOnce(store, 5, true), 0u);
}

TEST(SampleStoreThreads, ReadersSurviveReplacementAndPrepending)
{
    VSampleStore store(1, 0, 2);
    store.EnableSummaries();
    std::atomic<bool> bDone{false};
    std::atomic<std::size_t> wrong{0};
    std::vector<std::thread> readers;
    for (const std::uint32_t level : {0u, 3u})
        readers.emplace_back(
            [&, level]
            {
                while (!bDone)
                {
                    const std::uint64_t before = store.GetToken();
                    const std::size_t found = CheckOnce(store, level, true);
                    // A replacement in the middle mixes two series, which the token tells.
                    wrong += store.GetToken() == before ? found : 0;
                }
            });
    for (int round = 0; round < 100; ++round)
    {
        std::vector<float> rows;
        for (int n = 4000; n < 6000; ++n)
            rows.insert(rows.end(), {static_cast<float>(n), static_cast<float>(-n)});
        ASSERT_TRUE(store.ReplaceAll(4000, rows).IsSuccess());
        for (int first = 3000; first >= 0; first -= 1000)
        {
            rows.clear();
            for (int n = first; n < first + 1000; ++n)
                rows.insert(rows.end(), {static_cast<float>(n), static_cast<float>(-n)});
            store.Prepend(rows);
        }
    }
    bDone = true;
    for (std::thread& rReader : readers)
        rReader.join();
    EXPECT_EQ(wrong, 0u);
}

} // namespace ChannelsTest

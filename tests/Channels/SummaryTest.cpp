#include "Channels/Samples/Summary.h"
#include "Channels/Samples/PackedRecords.h"
#include "Reference.h"

#include <algorithm>
#include <array>
#include <utility>
#include <vector>

namespace ChannelsTest
{

namespace
{

LodRecord Reduce(std::span<const float> i_Samples)
{
    Channels::Accumulator accumulator;
    Channels::Reduce(i_Samples, accumulator);
    return accumulator.Result();
}

} // namespace

TEST(Summary, OneComponentAgreesWithTheSlowWay)
{
    static constexpr float huge = std::numeric_limits<float>::max();
    struct Case
    {
        const char* pName;
        std::vector<float> Samples;
    };
    std::vector<Case> cases{
        {"nothing", {}},
        {"one", {3.5f}},
        {"one missing", {NaN}},
        {"all missing", std::vector<float>(1000, NaN)},
        {"negative only", std::vector<float>(100, -7.0f)},
        {"infinite ones are samples", {1.0f, Infinity, NaN, 2.0f}},
        {"negative infinity", std::vector<float>(40, -Infinity)},
        {"both infinities have no mean", {Infinity, -Infinity, 1.0f}},
        {"missing at the first and last place", {NaN, 1.0f, 2.0f, NaN}},
        {"a sum beyond float", std::vector<float>(512, huge)},
        {"a sum beyond float both ways",
         []
         {
             std::vector<float> samples(512, huge);
             std::fill_n(samples.begin(), 256, -huge);
             return samples;
         }()},
        {"denormal", std::vector<float>(300, std::numeric_limits<float>::denorm_min())},
    };
    for (std::size_t length = 1; length < 70; ++length)
        cases.push_back({"odd lengths", RandomSamples(length, static_cast<std::uint32_t>(length))});
    for (const std::size_t length : {255u, 256u, 257u, 511u, 1023u, 4097u, 100003u})
        cases.push_back({"long", RandomSamples(length, static_cast<std::uint32_t>(length))});
    for (const Case& rCase : cases)
        EXPECT_TRUE(IsSame(Reduce(rCase.Samples), SlowSummary(rCase.Samples)))
            << rCase.pName << ", " << rCase.Samples.size() << " samples";
}

TEST(Summary, MeanStaysRightOverALongRun)
{
    // A float that sums one by one stops growing at 2^24.
    std::vector<float> samples(std::size_t{3} << 23, 1.0f);
    EXPECT_EQ(Reduce(samples).Mean, 1.0f);
    for (std::size_t i = 0; i < samples.size(); i += 2)
        samples[i] = 100000.0f;
    EXPECT_EQ(Reduce(samples).Mean, 50000.5f);
}

TEST(Summary, InterleavedComponentsAgreeWithTheSlowWay)
{
    for (const std::size_t width : {1u, 2u, 3u, 4u, 5u, 6u, 7u, 12u})
        for (const std::size_t rows : {0u, 1u, 3u, 4u, 5u, 15u, 16u, 255u, 256u, 260u, 1001u})
        {
            const std::vector<float> samples = RandomSamples(rows * width, 7);
            std::vector<Channels::Accumulator> all(width);
            Channels::Reduce(samples.data(), rows, width, all);
            for (std::size_t c = 0; c < width; ++c)
            {
                const auto expected = SlowSummary(std::span(samples).subspan(rows == 0 ? 0 : c), width);
                EXPECT_TRUE(IsSame(all[c].Result(), expected)) << width << " wide, " << rows << " rows, " << c;
                Channels::Accumulator one;
                Channels::Reduce(samples.data() + c, rows, width, std::span(&one, 1));
                EXPECT_TRUE(IsSame(one.Result(), expected)) << "alone";
            }
        }
}

TEST(Summary, BucketsCoverEverySampleOnce)
{
    for (const std::size_t length : {1u, 255u, 256u, 257u, 1000u})
    {
        const std::vector<float> samples = RandomSamples(length, 3);
        std::vector<LodRecord> records((length + 255) / 256);
        Channels::ReduceBuckets(samples, 256, records);
        for (std::size_t i = 0; i < records.size(); ++i)
            EXPECT_TRUE(IsSame(records[i], SlowSummary(std::span(samples).subspan(
                                               i * 256, std::min<std::size_t>(256, length - i * 256)))));
        EXPECT_TRUE(IsSame(Channels::Combine(records), SlowSummary(samples)));
    }
    EXPECT_TRUE(IsSame(Channels::Combine({}), LodRecord{}));
}

/// Compares records of i_RowsEach rows with the slow way.
void ExpectRecords(std::span<const LodRecord> i_Records, std::span<const float> i_Rows, std::size_t i_Width,
                   std::size_t i_RowsEach)
{
    for (std::size_t i = 0; i < i_Records.size(); ++i)
    {
        const std::size_t first = i / i_Width * i_RowsEach * i_Width;
        const auto column = i_Rows.subspan(first + i % i_Width, i_RowsEach * i_Width - i % i_Width);
        ASSERT_TRUE(IsSame(i_Records[i], SlowSummary(column, i_Width)))
            << i_Width << " wide, record " << i << " of " << i_RowsEach << " rows";
    }
}

/// The records of one level, with the value behind the last one that their readers may touch.
struct PackedLevel
{
    PackedLevel(std::uint32_t i_Level, std::size_t i_Count)
        : Level(i_Level), Count(i_Count), Records(i_Count + 1), Counts(i_Count * Channels::CountBytesOf(i_Level))
    {
    }
    Channels::PackedRun Run() { return {Records.data(), Counts.data()}; }
    Channels::ConstPackedRun Run() const { return {Records.data(), Counts.data()}; }
    std::vector<LodRecord> Unpacked() const
    {
        std::vector<LodRecord> records(Count);
        Channels::Unpack(Run(), Level, Count, records.data());
        return records;
    }

    std::uint32_t Level;
    std::size_t Count;
    std::vector<Channels::PackedRecord> Records;
    std::vector<std::uint8_t> Counts;
};

TEST(Summary, RecordsOfFewRowsAgreeWithTheSlowWay)
{
    // Every pattern of missing samples among four rows of two components.
    for (unsigned pattern = 0; pattern < 256; ++pattern)
    {
        std::array<float, 8> rows{};
        for (unsigned i = 0; i < rows.size(); ++i)
            rows[i] = (pattern >> i & 1) != 0 ? NaN : static_cast<float>(i) - 3.0f;
        for (const std::size_t rowsEach : {2u, 4u})
        {
            std::vector<LodRecord> records(2 * 4 / rowsEach);
            Channels::SummariseFew(rows.data(), 2, rowsEach, 4 / rowsEach, records.data());
            ExpectRecords(records, rows, 2, rowsEach);
        }
    }
}

TEST(Summary, RecordsForEveryWidthAndOfExtremeValues)
{
    constexpr float huge = std::numeric_limits<float>::max();
    for (std::size_t width = 1; width <= 13; ++width)
    {
        constexpr std::size_t count = 4096; // rows
        std::vector<float> rows = RandomSamples(count * width, static_cast<std::uint32_t>(width));
        std::fill_n(rows.begin(), 4 * width, huge);
        std::fill_n(rows.begin() + static_cast<std::ptrdiff_t>(32 * width), 20 * width, NaN);
        rows[rows.size() - 1] = Infinity;
        for (const std::size_t rowsEach : {2u, 4u, 8u})
        {
            std::vector<LodRecord> records(count / rowsEach * width);
            Channels::SummariseFew(rows.data(), width, rowsEach, count / rowsEach, records.data());
            ExpectRecords(records, rows, width, rowsEach);
        }
        PackedLevel level(3, count / 16 * width);
        Channels::SummariseSixteens(rows.data(), width, count / 16, level.Run());
        ExpectRecords(level.Unpacked(), rows, width, 16);
        while (level.Level < 11)
        {
            PackedLevel next(level.Level + 1, level.Count / 2);
            Channels::CombinePairs(std::as_const(level).Run(), next.Level, width, next.Count / width, next.Run());
            ExpectRecords(next.Unpacked(), rows, width, std::size_t{2} << next.Level);
            level = std::move(next);
        }
    }
}

TEST(Summary, CombiningWeighsByCount)
{
    PackedLevel below(3, 4);
    below.Records = {{1.0f, 1.0f, 1.0f}, {5.0f, 5.0f, 5.0f}, {}, {}, {}};
    below.Counts = {3, 1, 0, 0};
    PackedLevel combined(4, 2);
    Channels::CombinePairs(std::as_const(below).Run(), 4, 1, 2, combined.Run());
    EXPECT_EQ(combined.Unpacked()[0].Mean, 2.0f);
    EXPECT_EQ(combined.Unpacked()[0].Count, 4u);
    EXPECT_TRUE(IsSame(combined.Unpacked()[1], LodRecord{}));
}

} // namespace ChannelsTest

#include "TQL/IResult.h"
#include "TQL/ITick.h"
#include "TQL/ITraceId.h"
#include "TQL/NearlyEqual.h"

#include <gtest/gtest.h>

#include <cmath>
#include <limits>
#include <set>

namespace
{

using TQL::IResult;

TEST(Result, TableHoldsEveryCodeOnce)
{
    const auto table = TQL::GetResultTable();
    std::set<std::uint32_t> values;
    std::set<std::string_view> names;
    for (const TQL::ResultRow& rRow : table)
    {
        values.insert(rRow.Value.Value());
        names.insert(rRow.Name);
        EXPECT_EQ(rRow.Value.Name(), rRow.Name);
        EXPECT_FALSE(rRow.Description.empty());
        if (rRow.Value.Category() != TQL::EResultCategory::Quorl)
        {
            EXPECT_EQ(rRow.Description.substr(0, rRow.Name.size() + 2), std::string(rRow.Name) + ": ");
        }
    }
    EXPECT_EQ(table.size(), 64u);
    EXPECT_EQ(values.size(), 64u);
    EXPECT_EQ(names.size(), 64u);
    EXPECT_EQ(TQL::Result::NotFound.Value(), 0x8000000Au);
    EXPECT_EQ(TQL::Result::InvalidArgument.Value(), 0x8000000Fu);
    EXPECT_EQ(TQL::Result::FileNotFound.Value(), 0x8000002Au);
    EXPECT_EQ(TQL::Result::RPCNotConnected.Value(), 0x80010003u);
    EXPECT_EQ(TQL::Result::HalBundleAlreadyInstalled.Value(), 0x80040007u);
    EXPECT_TRUE(TQL::Result::HalIpAddressChanged.IsSuccess());
    EXPECT_EQ(IResult{0x80001234u}.Description(), "Unknown result code");
}

TEST(Result, CombinesParts)
{
    const IResult a = TQL::Result::NotFound;
    const IResult b = TQL::Result::NotSet;
    const IResult ok = TQL::Result::Ok;
    const IResult noEffect = TQL::Result::OkButNoEffect;
    const IResult partial = TQL::Result::OkButPartial;
    const IResult modified = TQL::Result::OkButModified;
    EXPECT_EQ(TQL::CombineResults({}), ok);
    EXPECT_EQ(TQL::CombineResults({ok, ok}), ok);
    EXPECT_EQ(TQL::CombineResults({ok, noEffect, modified}), noEffect);
    EXPECT_EQ(TQL::CombineResults({a, b}), a);
    EXPECT_EQ(TQL::CombineResults({ok, a, ok, b}), partial);
    EXPECT_EQ(TQL::CombineResults({a, ok}), partial);
}

TEST(Tick, RoundsAndConverts)
{
    constexpr std::int64_t period = TQL::DefaultFramePeriod;
    EXPECT_EQ(TQL::RoundHalfAway(0.49999999999999994), 0);
    EXPECT_EQ(TQL::RoundHalfAway(0.5), 1);
    EXPECT_EQ(TQL::RoundHalfAway(-2.75), -3);
    EXPECT_EQ(TQL::FramesToTicks(120.0, period), TQL::DefaultTickRate);
    EXPECT_EQ(TQL::FramesToTicks(-1.5, period), -period - period / 2);
    EXPECT_EQ(TQL::FramesToTicks(1e9 + 1.0, period), 1'000'000'001 * period) << "whole frames are exact";
    EXPECT_DOUBLE_EQ(TQL::TicksToFrames(-period / 4, period), -0.25);
    const std::int64_t rows[][4] = {{7, 4, 1, 2}, {-7, 4, -2, -1}, {8, 4, 2, 2}, {-8, 4, -2, -2}, {0, 4, 0, 0}};
    for (const auto& [value, step, down, up] : rows)
    {
        EXPECT_EQ(TQL::FloorDivide(value, step), down);
        EXPECT_EQ(TQL::AlignDown(value, step), down * step);
        EXPECT_EQ(TQL::AlignUp(value, step), up * step);
    }
    EXPECT_EQ(TQL::AlignDown(9, 4, 3), 7);
    EXPECT_EQ(TQL::AlignUp(9, 4, 3), 11);
}

TEST(Tick, NearlyEqualIsRelativeUnlessOneIsZero)
{
    EXPECT_TRUE(TQL::NearlyEqual(1e6, 1e6 + 1e-7));
    EXPECT_FALSE(TQL::NearlyEqual(1e6, 1e6 + 1e-5));
    EXPECT_TRUE(TQL::NearlyEqual(0.0, 1e-13));
    EXPECT_FALSE(TQL::NearlyEqual(0.0, 1e-11));
    EXPECT_FALSE(TQL::NearlyEqual(1e-20, 2e-20));
    EXPECT_FALSE(TQL::NearlyEqual(std::numeric_limits<double>::quiet_NaN(), 1.0));
}

TEST(TraceId, EqualityOrderAndHashAgree)
{
    const TQL::IChannelInstanceId live{"Live", "Labelled Reconstructions", 1, 2, "t"};
    TQL::IChannelInstanceId recorded = live;
    recorded.DataContextName = "walk";
    EXPECT_TRUE(live == recorded) << "the same thing in another context";
    EXPECT_FALSE(TQL::IsSameChannel(live, recorded));
    EXPECT_NE(TQL::ITraceId(live, 0), TQL::ITraceId(recorded, 0));
    EXPECT_NE(TQL::ITraceId(live, 0).Hash(), TQL::ITraceId(live, 1).Hash());
    EXPECT_EQ(TQL::ITraceId(live, 1), TQL::ITraceId(live, 1));
    EXPECT_LT(TQL::ITraceId(live, 1), TQL::ITraceId(recorded, 0));
    TQL::IChannelInstanceId swapped = live;
    std::swap(swapped.First, swapped.Second);
    EXPECT_NE(TQL::ITraceId(live, 0).Hash(), TQL::ITraceId(swapped, 0).Hash());
    EXPECT_EQ(TQL::HashText(""), 0u);
}

} // namespace

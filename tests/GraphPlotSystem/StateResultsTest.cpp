#include "GraphPlotSystem/Common/StateResults.h"

#include <gtest/gtest.h>

#include <vector>

namespace
{

using namespace TQL;

TEST(StateResults, Combined)
{
    const IResult a = Result::NotFound;
    const IResult b = Result::InvalidArgument;
    const struct
    {
        std::vector<IResult> Parts;
        IResult Whole;
    } rows[] = {
        {{}, Result::Ok},
        {{Result::Ok, Result::Ok}, Result::Ok},
        {{Result::OkButNoEffect, Result::Ok, Result::Ok}, Result::OkButNoEffect},
        {{Result::Ok, Result::OkButModified, Result::OkButNoEffect}, Result::OkButModified},
        {{Result::Ok, a, Result::Ok, b}, Result::OkButPartial},
        {{a, Result::OkButNoEffect}, Result::OkButPartial},
        {{a, b, a}, a},
    };
    for (const auto& rRow : rows)
        EXPECT_EQ(GraphPlotUI::CombineStateResults(rRow.Parts), rRow.Whole) << rRow.Parts.size();
    EXPECT_EQ(GraphPlotUI::WorseResult(Result::OkButNoEffect, a), a);
    EXPECT_EQ(GraphPlotUI::WorseResult(b, a), b);
    EXPECT_EQ(GraphPlotUI::WorseResult(Result::OkButNoEffect, Result::OkButModified), Result::OkButNoEffect);
    EXPECT_EQ(GraphPlotUI::WorseResult(Result::Ok, Result::OkButModified), Result::OkButModified);
}

} // namespace

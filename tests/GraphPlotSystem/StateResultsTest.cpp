#include "GraphPlotSystem/StateResults.h"

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
}

} // namespace

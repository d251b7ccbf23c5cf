#include "GraphPlotSystem/Common/StateResults.h"

#include <algorithm>

namespace GraphPlotUI
{

TQL::IResult WorseResult(TQL::IResult i_First, TQL::IResult i_Second)
{
    if (i_First.IsError() || (i_Second.IsSuccess() && i_First != TQL::Result::Ok))
        return i_First;
    return i_Second;
}

TQL::IResult CombineStateResults(std::span<const TQL::IResult> i_Results)
{
    const auto failed = [](const TQL::IResult& i_rResult)
    {
        return i_rResult.IsError();
    };
    const auto firstFailure = std::ranges::find_if(i_Results, failed);
    if (firstFailure != i_Results.end())
        return std::ranges::all_of(i_Results, failed) ? *firstFailure : TQL::IResult(TQL::Result::OkButPartial);
    const auto firstOther =
        std::ranges::find_if(i_Results, [](const TQL::IResult& i_rResult) { return i_rResult != TQL::Result::Ok; });
    return firstOther != i_Results.end() ? *firstOther : TQL::IResult(TQL::Result::Ok);
}

} // namespace GraphPlotUI

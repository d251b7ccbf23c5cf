#pragma once

#include "TQL/IResult.h"

#include <span>

namespace GraphPlotUI
{

/// Of two operations one after the other: the first failure, else the first success with a remark.
TQL::IResult WorseResult(TQL::IResult i_First, TQL::IResult i_Second);

/// One result for the parts of a state that were applied one after the other, failed ones included: OkButPartial when
/// some failed and some did not; the first failure when all failed; else the first code other than Ok.
TQL::IResult CombineStateResults(std::span<const TQL::IResult> i_Results);

} // namespace GraphPlotUI

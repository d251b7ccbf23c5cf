#pragma once

#include "TQL/IResult.h"

#include <span>

namespace GraphPlotUI
{

/// One result for the parts of a state that were applied one after the other, failed ones included: OkButPartial when
/// some failed and some did not; the first failure when all failed; else the first code other than Ok.
TQL::IResult CombineStateResults(std::span<const TQL::IResult> i_Results);

} // namespace GraphPlotUI

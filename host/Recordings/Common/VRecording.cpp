#include "Recordings/Common/VRecording.h"

#include <algorithm>
#include <cmath>

namespace Recordings
{

TQL::TickRange RecordedChannel::GetTickRange() const
{
    return {FirstTick, FirstTick + static_cast<std::int64_t>(RowCount()) * SamplePeriod};
}

std::size_t RecordedChannel::MissingCount() const
{
    const std::size_t components = ComponentCount();
    std::size_t missing = 0;
    for (std::size_t row = 0; row < RowCount(); ++row)
    {
        const auto first = Samples.begin() + static_cast<std::ptrdiff_t>(row * components);
        const auto isMissing = [](float i_Value)
        {
            return std::isnan(i_Value);
        };
        missing += std::any_of(first, first + static_cast<std::ptrdiff_t>(components), isMissing) ? 1u : 0u;
    }
    return missing;
}

std::int64_t PeriodOfRate(double i_Rate)
{
    if (!(i_Rate > 0.0) || !std::isfinite(i_Rate))
        return 0;
    return std::max<std::int64_t>(1, std::llround(static_cast<double>(TQL::DefaultTickRate) / i_Rate));
}

} // namespace Recordings

#pragma once

#include "Recordings/Common/VRecording.h"

#include <cmath>
#include <cstddef>
#include <cstdio>
#include <cstdlib>
#include <string>

/// What every reader owes, whatever the bytes: a failure ends the program, which the fuzzer reports.
namespace Fuzz
{

inline void Require(bool i_bTrue, const char* i_pWhat)
{
    if (i_bTrue)
        return;
    std::fprintf(stderr, "%s\n", i_pWhat);
    std::abort();
}

/// What was read holds together and has at most i_MostSamples samples.
inline void CheckRecording(const Recordings::VRecording& i_rRecording, std::size_t i_MostSamples)
{
    std::size_t samples = 0;
    Require(i_rRecording.FramePeriod > 0, "no frame period");
    for (const Recordings::RecordedChannel& rChannel : i_rRecording.Channels)
    {
        Require(rChannel.ComponentCount() > 0 && rChannel.SamplePeriod > 0, "a channel without component or period");
        Require(rChannel.Samples.size() % rChannel.ComponentCount() == 0, "a torn row");
        Require(rChannel.Rate > 0.0 && std::isfinite(rChannel.Rate), "a channel without rate");
        Require(rChannel.GetTickRange().Last >= rChannel.GetTickRange().First, "a range that runs backwards");
        samples += rChannel.Samples.size();
    }
    Require(samples <= i_MostSamples, "more samples than the file can hold");
    for (const std::string& rWarning : i_rRecording.Warnings)
        Require(!rWarning.empty() && rWarning.find('\n') == std::string::npos, "a warning that is not one line");
}

/// What is refused is refused in one sentence.
inline void CheckRefusal(const std::string& i_rError)
{
    Require(!i_rError.empty() && i_rError.find('\n') == std::string::npos, "a refusal that is not one line");
}

} // namespace Fuzz

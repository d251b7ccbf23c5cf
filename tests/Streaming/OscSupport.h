#pragma once

#include "Channels/Common/VSubTypeTable.h"
#include "Channels/Contexts/VLiveContext.h"
#include "Streaming/VOscReceiver.h"

#include <gtest/gtest.h>
#include <lo/lo.h>

#include <chrono>
#include <cmath>
#include <cstdint>
#include <cstdlib>
#include <memory>
#include <sstream>
#include <string>
#include <thread>
#include <vector>

namespace StreamingTest
{

using Bytes = std::vector<std::byte>;

/// A message of floats as a packet, made by the library.
inline Bytes FloatMessage(const char* i_pAddress, const std::vector<float>& i_rValues)
{
    lo_message message = lo_message_new();
    for (const float value : i_rValues)
        lo_message_add_float(message, value);
    std::size_t size = 0;
    void* pBytes = lo_message_serialise(message, i_pAddress, nullptr, &size);
    Bytes packet(static_cast<std::byte*>(pBytes), static_cast<std::byte*>(pBytes) + size);
    std::free(pBytes);
    lo_message_free(message);
    return packet;
}

/// A time tag so many seconds after some time in this century.
inline lo_timetag TagAt(double i_Seconds)
{
    const double whole = std::floor(i_Seconds);
    return {4'000'000'000u + static_cast<std::uint32_t>(whole),
            static_cast<std::uint32_t>((i_Seconds - whole) * 4294967296.0)};
}

inline Bytes FloatBundle(lo_timetag i_Tag, const char* i_pAddress, const std::vector<float>& i_rValues)
{
    lo_message message = lo_message_new();
    for (const float value : i_rValues)
        lo_message_add_float(message, value);
    lo_bundle bundle = lo_bundle_new(i_Tag);
    lo_bundle_add_message(bundle, i_pAddress, message);
    std::size_t size = 0;
    void* pBytes = lo_bundle_serialise(bundle, nullptr, &size);
    Bytes packet(static_cast<std::byte*>(pBytes), static_cast<std::byte*>(pBytes) + size);
    std::free(pBytes);
    lo_bundle_free_recursive(bundle);
    return packet;
}

/// Asks a condition until it holds or ten seconds are over.
template <typename TCondition>
bool Eventually(const TCondition& i_rCondition)
{
    const auto deadline = std::chrono::steady_clock::now() + std::chrono::seconds(10);
    while (!i_rCondition())
    {
        if (std::chrono::steady_clock::now() > deadline)
            return false;
        std::this_thread::yield();
    }
    return true;
}

inline std::shared_ptr<Channels::VLiveContext> MakeContext(std::int64_t i_FramePeriod)
{
    Channels::VLiveContext::Options options;
    options.FramePeriod = i_FramePeriod;
    return std::make_shared<Channels::VLiveContext>("Live", std::make_shared<Channels::VSubTypeTable>(), options);
}

/// Each channel of a context on a line: its name and its rows from the context's first frame; "-" is missing.
inline std::string Describe(const Channels::VLiveContext& i_rContext)
{
    std::ostringstream text;
    for (const auto& rpChannel : *i_rContext.GetChannels())
    {
        const auto& rSamples = *rpChannel->GetSamples();
        const TQL::TickRange range = rSamples.GetRange();
        std::vector<float> values(static_cast<std::size_t>((range.Last - range.First) / rSamples.Period()) *
                                  rSamples.Components());
        EXPECT_TRUE(rSamples.ReadSamples(range, values).IsSuccess());
        text << rpChannel->GetDefinition().Name << "@" << range.First / rSamples.Period() << ":";
        for (std::size_t i = 0; i < values.size(); ++i)
        {
            text << (i % rSamples.Components() == 0 ? " " : ",");
            if (std::isnan(values[i]))
                text << "-";
            else
                text << values[i];
        }
        text << "\n";
    }
    return text.str();
}

} // namespace StreamingTest

#include "TQL/Log.h"

#include <gtest/gtest.h>

#include <string>
#include <thread>
#include <vector>

namespace
{

using TQL::ELogSeverity;

TEST(Log, FormatsOnlyWhatTheThresholdAdmits)
{
    std::vector<std::string> lines;
    auto pSink = TQL::Log::AddSink(
        [&](const TQL::LogMessage& i_rMessage)
        {
            lines.push_back(std::string(i_rMessage.Category) + ' ' +
                            std::to_string(static_cast<int>(i_rMessage.Severity)) + ' ' + std::string(i_rMessage.Text));
        });
    TQL::VLogCategory& rCategory = TQL::Log::GetCategory("LogTest");
    EXPECT_EQ(&rCategory, &TQL::Log::GetCategory("LogTest"));

    TQL::Log::Format(rCategory, ELogSeverity::Detail, "hidden %1%", 1);
    TQL::Log::Format(rCategory, ELogSeverity::Warning, "%2% after %1%", "a", 7);
    TQL::Log::Format(rCategory, ELogSeverity::Information, "[%1%]", 1, 2);
    TQL::Log::SetThreshold(rCategory, ELogSeverity::Detail);
    TQL::Log::Format(rCategory, ELogSeverity::Detail, "shown");
    EXPECT_EQ(lines, (std::vector<std::string>{"LogTest 3 7 after a", "LogTest 2 [%1%]", "LogTest 6 shown"}))
        << "a failure of formatting falls back to the bare text as an error";

    pSink.reset();
    auto pLast = std::shared_ptr<void>(nullptr, [](void*) { TQL::Log::GetCategory("LogTest"); });
    auto pOther = TQL::Log::AddSink([pOwned = std::move(pLast)](const TQL::LogMessage&) {});
    pOther.reset(); // what a sink owned may use the log as it goes
    pOther = TQL::Log::AddSink([](const TQL::LogMessage&) {});
    TQL::Log::Format(rCategory, ELogSeverity::Error, "nobody");
    EXPECT_EQ(lines.size(), 3u);
}

/// A room's own way to write, as many rooms have one.
template <typename... Args>
void Tell(const TQL::LogText& i_rFormat, const Args&... i_rArgs)
{
    TQL::Log::Format(TQL::Log::GetCategory("LogTest"), ELogSeverity::Error, i_rFormat, i_rArgs...);
}

TEST(Log, AMessageComesFromTheLineThatMakesIt)
{
    std::vector<std::string> places;
    const auto pSink = TQL::Log::AddSink(
        [&](const TQL::LogMessage& i_rMessage)
        { places.push_back(std::string(i_rMessage.Source) + ' ' + std::to_string(i_rMessage.Line)); });
    const auto here = [](std::uint_least32_t i_Before)
    {
        return "TQL/LogTest " + std::to_string(i_Before + 1);
    };
    std::uint_least32_t before = std::source_location::current().line();
    Tell("%1% %2% %3% %4%", 1u, 2.5, 'c', std::string("text"));
    EXPECT_EQ(places.back(), here(before));
    before = std::source_location::current().line();
    TQL::Log::Write(TQL::Log::GetCategory("LogTest"), ELogSeverity::Error, "bare");
    EXPECT_EQ(places.back(), here(before));
    Tell({"known by another place", {"Room/Class", 190}});
    EXPECT_EQ(places.back(), "Room/Class 190");
}

TEST(Log, SinksSeeOneMessageAtATime)
{
    int inside = 0;
    int overlaps = 0;
    int count = 0;
    const auto pSink = TQL::Log::AddSink(
        [&](const TQL::LogMessage&)
        {
            overlaps += ++inside > 1 ? 1 : 0;
            ++count;
            --inside;
        });
    const TQL::VLogCategory& rCategory = TQL::Log::GetCategory("LogTest");
    std::vector<std::jthread> threads;
    for (int t = 0; t < 4; ++t)
        threads.emplace_back(
            [&rCategory]
            {
                for (int i = 0; i < 500; ++i)
                    TQL::Log::Write(rCategory, ELogSeverity::Error, "x");
            });
    threads.clear();
    EXPECT_EQ(overlaps, 0);
    EXPECT_EQ(count, 2000);
}

} // namespace
